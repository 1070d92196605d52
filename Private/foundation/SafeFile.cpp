#include "SafeFile.h"

#include <errno.h>
#include <fcntl.h>
#include <limits.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include "ZVFile.h"
#include "ZVUtilities.h"

namespace {

constexpr uint64_t kLockPatience = 5000;  // milliseconds; a writer holds the lock for one small file
constexpr useconds_t kLockPause = 1000;   // microseconds; flock itself cannot wait for a limited time

ZVString Target(const ZVString& path)
{
    char real[PATH_MAX];
    return realpath(path.c_str(), real) ? ZVString(real) : path;
}

int OpenFolderOf(const ZVString& path)
{
    const char* slash = strrchr(path.c_str(), ZVFile::PATH_SEPERATOR);
    const ZVString folder = slash ? path.substr(0, slash - path.c_str() + 1) : ZVString(".");
    return open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
}

bool WriteAll(int file, const ZVString& text)
{
    size_t done = 0;
    while (done < text.length()) {
        const ssize_t count = write(file, text.c_str() + done, text.length() - done);
        if (count < 0 && errno != EINTR) return false;
        if (count > 0) done += static_cast<size_t>(count);
    }
    return true;
}

// Only root may give files away; for others the owner changes with the replacement.
bool TakeOver(int file, const char* original, mode_t modeOfNew)
{
    struct stat old;
    if (stat(original, &old) != 0) return errno == ENOENT && fchmod(file, modeOfNew) == 0;
    if (fchown(file, old.st_uid, old.st_gid) != 0 && errno != EPERM) return false;
    return fchmod(file, old.st_mode & 0777) == 0;
}

// A file that nobody else has, or had, open.
int MakeFile(const char* path)
{
    if (remove(path) != 0 && errno != ENOENT) return -1;
    return open(path, O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600);
}

bool WriteFlushed(const char* path, const ZVString& text, mode_t mode, const char* original)
{
    const int file = MakeFile(path);
    if (file < 0) return false;
    const bool written = TakeOver(file, original, mode) && WriteAll(file, text) && fsync(file) == 0;
    return close(file) == 0 && written;
}

// Between the two renames there is no file, which is as good as one that cannot be used.
bool MoveInPlace(const char* fresh, const char* target, const char* aside)
{
    if (aside && rename(target, aside) != 0) return false;
    if (rename(fresh, target) == 0) return true;
    if (aside) rename(aside, target);
    return false;
}

}  // namespace

SafeFile::ReadResult SafeFile::Read(const char* path, size_t limit, ZVString& text)
{
    text = ZVString();
    const int file = open(path, O_RDONLY | O_NONBLOCK | O_CLOEXEC);  // a pipe would block otherwise
    if (file < 0) return errno == ENOENT ? ReadResult::kAbsent : ReadResult::kUnopened;
    struct stat entry;
    const bool isFile = fstat(file, &entry) == 0 && S_ISREG(entry.st_mode);
    const bool fits = isFile && entry.st_size <= static_cast<off_t>(limit);
    bool whole = fits;
    for (off_t left = whole ? entry.st_size : 0; left > 0 && whole;) {
        char block[4096];
        const ssize_t count = read(file, block, left < static_cast<off_t>(sizeof block) ? left : sizeof block);
        if (count < 0 && errno == EINTR) continue;
        whole = count > 0;
        if (!whole) break;
        text.append(block, static_cast<size_t>(count));
        left -= count;
    }
    close(file);
    if (whole) return ReadResult::kRead;
    text = ZVString();
    return isFile && !fits ? ReadResult::kTooLarge : ReadResult::kUnreadable;
}

bool SafeFile::Replace(const ZVString& path, const ZVString& text, mode_t mode, bool keepsOld)
{
    const ZVString target = Target(path);
    const ZVString fresh = target + ".new", aside = target + ".bad";
    const int folder = OpenFolderOf(target);  // before the rename: a failure leaves the old file
    const bool replaced = WriteFlushed(fresh.c_str(), text, mode, target.c_str()) &&
                          MoveInPlace(fresh.c_str(), target.c_str(), keepsOld ? aside.c_str() : nullptr);
    if (!replaced) unlink(fresh.c_str());
    // The rename reaches the disk with the folder. Where a folder cannot be flushed, the file system sees to it.
    if (replaced && folder >= 0) fsync(folder);
    if (folder >= 0) close(folder);
    return replaced;
}

SafeFile::FolderLock::FolderLock(const ZVString& path) : m_Folder(OpenFolderOf(Target(path)))
{
    const uint64_t end = ZVUtilities::MillisecondTime() + kLockPatience;
    while (m_Folder >= 0 && !m_Held) {
        m_Held = flock(m_Folder, LOCK_EX | LOCK_NB) == 0;
        if (m_Held || (errno != EWOULDBLOCK && errno != EINTR) || ZVUtilities::MillisecondTime() >= end) return;
        usleep(kLockPause);
    }
}

SafeFile::FolderLock::~FolderLock()
{
    if (m_Folder >= 0) close(m_Folder);
}
