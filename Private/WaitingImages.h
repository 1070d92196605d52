// Rows of images whose files are in their places already, on their way into the database: flash is written in batches,
// and with whatever else is written. What is lost of them with the power costs a download each.
//
// All sessions of the process on one database share them, so that what one has fetched is there for all. Any thread.
#pragma once

#include <memory>
#include <vector>

#include "CacheInterface.h"
#include "ImageFile.h"
#include "ZVMutex.h"

class WaitingImages {
    struct Waiting {
        ZV_BoxArtRow row;
        std::unique_ptr<ImageFile> file;  // keeps it locked; null when the file was there before
        uint64_t since;                   // by ZVUtilities::MillisecondTime
        bool isClaimed = false;           // on its way into the database
    };

public:
    /// Those of that database.
    static std::shared_ptr<WaitingImages> Of(const ZVString& database);

    /// Rows taken to be written. They wait again after the claim's end unless it was settled.
    class Claim {
    public:
        /// Of all that wait and are not on their way. Null waiting images have none.
        explicit Claim(WaitingImages* images);
        ~Claim();
        Claim(const Claim&) = delete;
        Claim& operator=(const Claim&) = delete;

        const std::vector<ZV_BoxArtRow>& rows() const { return m_Rows; }
        /// They were written, or never can be.
        void Settle();

    private:
        WaitingImages* m_Images;
        std::vector<std::shared_ptr<Waiting>> m_Claimed;
        std::vector<ZV_BoxArtRow> m_Rows;
    };

    bool Find(const ZVString& prefix, ZV_WS_BoxArtSize dim, ZV_BoxArtRow& row) const ZV_EXCLUDES(m_Mutex);

    /// In place of what waited for the same image.
    void Add(const ZV_BoxArtRow& row, std::unique_ptr<ImageFile> file) ZV_EXCLUDES(m_Mutex);

    /// Whether enough of them wait, or one has waited long enough.
    bool AreDue() const ZV_EXCLUDES(m_Mutex);

private:
    mutable ZVMutex m_Mutex;
    std::vector<std::shared_ptr<Waiting>> m_Waiting ZV_GUARDED_BY(m_Mutex);
};
