// Small whole files that must survive a crash and other writers: read within a bound, replaced in one step, one writer
// at a time.
//
// A file is replaced by renaming a flushed "<path>.new" over it, so a reader needs no lock and sees the old text or the
// new one. Writers hold the FolderLock from their read to their Replace: none overwrites what another has completed,
// and "<path>.new" is never two writers'. Whatever stands there before, what a killed writer left or a link or pipe of
// somebody else's, is removed and not used.
#pragma once

#include <sys/types.h>

#include "ZVString.h"

namespace SafeFile {

enum class ReadResult {
    kRead,        ///< An empty file too.
    kAbsent,      ///< There is no such file.
    kUnopened,    ///< There is one, or a part of the path is no folder; it cannot be opened.
    kTooLarge,    ///< Larger than the limit.
    kUnreadable,  ///< No file, or an error while reading.
};

/// Reads the file; `text` is empty unless the result is kRead. A file above `limit` bytes is not read at all.
ReadResult Read(const char* path, size_t limit, ZVString& text);

/// Replaces the file, or makes it with `mode`; an existing one's mode and owner stay, and what a symbolic link points
/// to is replaced, not the link. With `keepsOld` the old file stays as "<path>.bad", in the place of an earlier one.
/// False leaves the old file as it was. The caller holds the folder's lock.
bool Replace(const ZVString& path, const ZVString& text, mode_t mode, bool keepsOld = false);

/// The folder's exclusive lock (flock) for the life of the object, against other processes and other threads alike. The
/// kernel gives it back when its process dies; it leaves no file behind. Not recursive.
class FolderLock {
public:
    /// Locks the folder of the file at `path`. Blocks for at most 5 s while others hold it.
    explicit FolderLock(const ZVString& path);
    ~FolderLock();
    FolderLock(const FolderLock&) = delete;
    FolderLock& operator=(const FolderLock&) = delete;

    bool Held() const { return m_Held; }

private:
    int m_Folder;
    bool m_Held = false;
};

}  // namespace SafeFile
