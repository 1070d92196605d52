#include "ZVFile.h"

#include <dirent.h>
#include <errno.h>
#include <fcntl.h>
#include <fnmatch.h>
#include <stdlib.h>
#include <string.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <memory>

namespace {

constexpr mode_t kFolderMode = 0755;
constexpr size_t kCopyBlock = 1024;

bool IsFolder(const char* path)
{
    struct stat entry;
    return stat(path, &entry) == 0 && S_ISDIR(entry.st_mode);
}

bool Exists(const char* path)
{
    struct stat entry;
    return stat(path, &entry) == 0;
}

// Or another process has just made it.
bool MakeFolder(const char* path, mode_t mode)
{
    return mkdir(path, mode) == 0 || (errno == EEXIST && IsFolder(path));
}

bool AreOneFile(const char* one, const char* other)
{
    struct stat first, second;
    return stat(one, &first) == 0 && stat(other, &second) == 0 && first.st_dev == second.st_dev &&
           first.st_ino == second.st_ino;
}

bool EndsIn(const ZVString& text, const char* end)
{
    const size_t length = strlen(end);
    return text.length() >= length && strcmp(text.c_str() + text.length() - length, end) == 0;
}

// Repeats fread or fwrite until everything is done, or one call does nothing for another reason than a signal.
template <class Transfer>
zv_int64 TransferAll(zv_int64 size, Transfer transfer)
{
    zv_int64 done = 0;
    while (done < size) {
        errno = 0;
        const size_t count = transfer(done, static_cast<size_t>(size - done));
        if (count == 0 && errno != EINTR) break;
        done += static_cast<zv_int64>(count);
    }
    return done;
}

}  // namespace

bool ZVFile::Open(const char* filename, const char* mode)
{
    ZV_ASSERT(filename != 0);
    ZV_ASSERT(mode != 0);
    Close();
    m_File = fopen(filename, mode);
    return m_File != nullptr;
}

bool ZVFile::OpenTemporary(const char* path, ZVString& name)
{
    Close();
    name = GetFolderName(path) + "zvwsXXXXXX";
    const int descriptor = mkostemp(&name[0], O_CLOEXEC);
    m_File = descriptor < 0 ? nullptr : fdopen(descriptor, "wb");
    if (m_File) return true;
    if (descriptor >= 0) {
        close(descriptor);
        unlink(name.c_str());
    }
    name = ZVString();
    return false;
}

void ZVFile::Close()
{
    if (m_File) fclose(m_File);
    m_File = nullptr;
}

zv_int64 ZVFile::Read(void* buffer, zv_int64 size)
{
    ZV_ASSERT(buffer != 0);
    if (!m_File) return 0;
    return TransferAll(size, [&](zv_int64 done, size_t rest) {
        const size_t count = fread(static_cast<char*>(buffer) + done, 1, rest, m_File);
        if (ferror(m_File) && errno == EINTR) clearerr(m_File);
        return count;
    });
}

zv_int64 ZVFile::Write(const void* buffer, zv_int64 size)
{
    ZV_ASSERT(buffer != 0);
    if (!m_File) return 0;
    return TransferAll(size, [&](zv_int64 done, size_t rest) {
        return fwrite(static_cast<const char*>(buffer) + done, 1, rest, m_File);
    });
}

bool ZVFile::Flush()
{
    return m_File && fflush(m_File) == 0;
}

bool ZVFile::Sync()
{
    return Flush() && fdatasync(fileno(m_File)) == 0;
}

bool ZVFile::TryLock()
{
    return m_File && flock(fileno(m_File), LOCK_EX | LOCK_NB) == 0;
}

bool ZVFile::IsLinked() const
{
    struct stat entry;
    return m_File && fstat(fileno(m_File), &entry) == 0 && entry.st_nlink > 0;
}

zv_int64 ZVFile::GetSize()
{
    if (!m_File) return 0;
    const zv_int64 position = Position();
    Seek(0, SEEK_END);
    const zv_int64 size = Position();
    Seek(position, SEEK_SET);
    return size;
}

bool ZVFile::Seek(zv_int64 offset, int whence)
{
    return m_File && fseek(m_File, static_cast<long>(offset), whence) == 0;
}

zv_int64 ZVFile::Position()
{
    return m_File ? ftell(m_File) : -1;
}

zv_int64 ZVFile::GetSize(const char* filename)
{
    ZVFile file;
    return file.Open(filename, "r") ? file.GetSize() : 0;
}

bool ZVFile::Exist(const char* filename)
{
    ZVFile file;
    return file.Open(filename, "r");
}

bool ZVFile::Remove(const char* filename)
{
    ZV_ASSERT(filename != 0);
    return remove(filename) == 0;
}

bool ZVFile::Rename(const char* oldname, const char* newname)
{
    ZV_ASSERT(oldname != 0);
    ZV_ASSERT(newname != 0);
    return rename(oldname, newname) == 0;
}

bool ZVFile::FolderExist(const char* path)
{
    ZV_ASSERT(path != 0);
    return IsFolder(path);
}

bool ZVFile::CreateFolder(const char* path, mode_t mode)
{
    ZV_ASSERT(path != 0);
    ZVString copy = path;
    for (size_t i = 1; i < copy.length(); ++i) {
        if (copy[i] != PATH_SEPERATOR) continue;
        copy[i] = '\0';
        const bool isLast = path[i + strspn(path + i, "/")] == '\0';
        const bool there =
            Exists(copy.c_str()) ? IsFolder(copy.c_str()) : MakeFolder(copy.c_str(), isLast ? mode : kFolderMode);
        if (!there) return false;
        copy[i] = PATH_SEPERATOR;
    }
    return Exists(path) || MakeFolder(path, mode);
}

ZVString ZVFile::GetFolderName(const char* path)
{
    ZV_ASSERT(path != 0);
    if (!*path) return "./";
    const char* separator = strrchr(path, PATH_SEPERATOR);
    return separator ? ZVString(path, separator - path + 1) : ZVString(path) + "/";
}

ZVString ZVFile::GetFileName(const char* path)
{
    ZV_ASSERT(path != 0);
    const char* separator = strrchr(path, PATH_SEPERATOR);
    return separator ? separator + 1 : path;
}

bool ZVFile::RemoveWithWildcard(const char* filename)
{
    ZV_ASSERT(filename != 0);
    ZV_ASSERT((strchr(filename, '?') != 0) || (strchr(filename, '*') != 0));
    const ZVString folder = GetFolderName(filename);
    const ZVString pattern = GetFileName(filename);
    const std::unique_ptr<DIR, int (*)(DIR*)> entries(opendir(folder.c_str()), closedir);
    if (!entries) return false;
    bool any = false;
    while (const dirent* entry = readdir(entries.get())) {
        any = true;
        if (fnmatch(pattern.c_str(), entry->d_name, FNM_PATHNAME | FNM_NOESCAPE) != 0) continue;
        const ZVString name = folder + entry->d_name;
        if (EndsIn(name, "/.") || EndsIn(name, "/..")) continue;
        if (!Remove(name.c_str())) return false;
    }
    return any;
}

ZVString ZVFile::CreateTempFileName(const char* path)
{
    ZVString name;
    ZVFile().OpenTemporary(path, name);
    return name;
}

bool ZVFile::CopyFile(const char* oldname, const char* newname)
{
    ZV_ASSERT(oldname != 0);
    ZV_ASSERT(newname != 0);
    ZVFile source, target;
    if (!source.Open(oldname, "rb")) return false;
    if (AreOneFile(oldname, newname)) return true;
    if (!target.Open(newname, "wb")) return false;
    char block[kCopyBlock];
    for (zv_int64 count; (count = source.Read(block, sizeof block)) >= 1;)
        target.Write(block, count);
    return true;
}
