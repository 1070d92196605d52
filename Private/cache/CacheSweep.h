// What gathers in a cache folder and nobody needs: images without a row in any database of the folder, temporary files
// that a killed process has left, and the databases of credentials that were given up.
//
// Files that somebody just writes are locked (ImageFile.h) and left alone. Each sweep ends after 50 ms; the next one
// goes on. Nothing is reported: what cannot be removed stays. Any thread.
#pragma once

#include <stdint.h>
#include <time.h>

#include <string>
#include <vector>

#include "ZVString.h"

class CacheSweep {
public:
    /// For the folder of that database, as it is before it is opened.
    explicit CacheSweep(const ZVString& database);

    /// All of it; given-up databases, those that nobody has opened for 30 days, only when this one was not used before
    /// in the same week. Notes that it was opened now.
    void AfterOpening();

    /// Images alone.
    void AfterEviction();

private:
    struct Folder {
        std::vector<std::string> images, temporaries, databases;
    };

    Folder List() const;
    bool HasTime() const;
    bool RemoveUnlocked(const std::string& name) const;
    void SweepImages(const Folder& files) const;
    void SweepDatabases(const Folder& files) const;

    const ZVString m_Database;
    const std::string m_FolderName;
    time_t m_LastUse = 0;  // 0: never
    uint64_t m_End;        // by ZVUtilities::MillisecondTime
};
