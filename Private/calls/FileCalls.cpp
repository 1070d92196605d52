// The file operations that scripts may use.
#include "CallGuard.h"
#include "Records.h"
#include "ZVAssert.h"
#include "ZVFile.h"
#include "ZVUtilities.h"

namespace {

ZV_WS_Status Done(bool succeeded)
{
    return succeeded ? ZV_WS_Status_ok : ZV_WS_Status_file_operation_error;
}

ZV_WS_Status Look(const char* path, bool* flag, bool (*look)(const char*))
{
    ZV_ASSERT(flag != 0);
    *flag = false;
    if (!path) return ZV_WS_Status_invalid_param;
    *flag = look(path);
    return ZV_WS_Status_ok;
}

}  // namespace

ZV_WS_Status ZV_WS_removeFile(const char* path)
{
    if (!path) return ZV_WS_Status_invalid_param;
    return Done(!ZVFile::Exist(path) || ZVFile::Remove(path));
}

ZV_WS_Status ZV_WS_copyFile(const char* source, const char* target)
{
    if (!source || !target) return ZV_WS_Status_invalid_param;
    return Done(ZVFile::CopyFile(source, target));
}

ZV_WS_Status ZV_WS_getFolderName(const char* path, ZV_WS_String* folder)
{
    ZV_ASSERT(folder != 0);
    return Records::Fill(*folder, [&] {
        if (!path) return ZV_WS_Status_invalid_param;
        ZVUtilities::SetText(*folder, ZVFile::GetFolderName(path));
        return ZV_WS_Status_ok;
    });
}

ZV_WS_Status ZV_WS_folderExist(const char* path, bool* exists)
{
    return Look(path, exists, ZVFile::FolderExist);
}

ZV_WS_Status ZV_WS_createFolder(const char* path)
{
    if (!path) return ZV_WS_Status_invalid_param;
    return GuardCall([&] { return Done(ZVFile::CreateFolder(path)); });
}

ZV_WS_Status ZV_WS_fileExist(const char* path, bool* exists)
{
    return Look(path, exists, ZVFile::Exist);
}
