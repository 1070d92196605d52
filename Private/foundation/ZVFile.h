// A stdio file, and the folder operations that caches and settings need. Null texts and buffers are assertion failures;
// what fails at run time is false, 0 or -1, and is not logged. The static operations may be called from any thread.
#pragma once

#include <stdint.h>
#include <stdio.h>
#include <sys/types.h>

#include "ZVString.h"

typedef int64_t zv_int64;

class ZVFile {
public:
    static constexpr char PATH_SEPERATOR = '/';

    ZVFile() = default;
    ~ZVFile() { Close(); }
    ZVFile(const ZVFile&) = delete;
    ZVFile& operator=(const ZVFile&) = delete;

    /// Closes what was open, then opens with fopen's mode.
    bool Open(const char* filename, const char* mode);
    /// Closes what was open, then makes a file as CreateTempFileName does and keeps it open for writing: what its name
    /// may stand for a moment later is not looked at. `name` is empty on failure.
    bool OpenTemporary(const char* path, ZVString& name);
    void Close();

    /// Reads until the size is reached or the file ends; the bytes read.
    zv_int64 Read(void* buffer, zv_int64 size);
    /// Writes all; less only after a failure. The bytes written.
    zv_int64 Write(const void* buffer, zv_int64 size);
    bool Flush();
    /// The same, and what was written is on the disk.
    bool Sync();

    /// Keeps the file for this object, as long as it is open (flock). False when another object, of this process or
    /// another, has it. Nobody is kept from reading or writing it.
    bool TryLock();
    /// Whether the open file still has a name in some folder.
    bool IsLinked() const;

    /// The position stays.
    zv_int64 GetSize();
    bool Seek(zv_int64 offset, int whence);
    /// -1 when nothing is open.
    zv_int64 Position();

    /// 0 for a file that cannot be opened.
    static zv_int64 GetSize(const char* filename);
    /// Whether it can be opened for reading; true for folders.
    static bool Exist(const char* filename);
    static bool Remove(const char* filename);
    static bool Rename(const char* oldname, const char* newname);
    static bool FolderExist(const char* path);
    /// Makes every missing folder of the path, mode 0755, and the last one with `mode`.
    static bool CreateFolder(const char* path, mode_t mode = 0755);

    /// Up to and including the last "/". A bare name is taken for a folder: "b.txt/"; an empty path is "./".
    static ZVString GetFolderName(const char* path);
    /// What follows the last "/", or all of it.
    static ZVString GetFileName(const char* path);

    /// Removes the files of one folder whose names match "?" and "*"; stops at the first that cannot be removed. The
    /// path must hold a wildcard.
    static bool RemoveWithWildcard(const char* filename);

    /// Makes an empty file "zvws......" in the path's folder and returns its name; "" when it cannot. The caller
    /// removes it.
    static ZVString CreateTempFileName(const char* path);

    /// True when both files could be opened: write errors go unreported. A file copied onto itself, by whatever names,
    /// stays as it is.
    static bool CopyFile(const char* oldname, const char* newname);

private:
    FILE* m_File = nullptr;
};
