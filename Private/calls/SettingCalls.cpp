// The settings file and the environment file, as the library's users reach them.
#include <stdio.h>

#include "CallGuard.h"
#include "CfgXMLFile.h"
#include "Records.h"
#include "ZVAssert.h"
#include "ZVUtilities.h"

namespace {

constexpr char kEnvNumKey[] = "EnvNum";

ZV_WS_Status To_ZV_WS_Status(unsigned int result, ZV_WS_Status whenNotFound)
{
    switch (result) {
        case CfgXMLFile::kOk:
            return ZV_WS_Status_ok;
        case CfgXMLFile::kEmptyKey:
            return ZV_WS_Status_invalid_param;
        case CfgXMLFile::kNotFound:
            return whenNotFound;
        case CfgXMLFile::kInvalidValue:
            return ZV_WS_Status_setting_invalid_value;
        default:
            return ZV_WS_Status_file_operation_error;
    }
}

bool IsPath(const char* path)
{
    return path && *path;
}

}  // namespace

ZV_WS_Status ZV_WS_readSetting(const char* path, const char* key, bool protectedValue, ZV_WS_String* value)
{
    ZV_ASSERT(value != 0);
    return Records::Fill(*value, [&] {
        if (!IsPath(path) || !key) return ZV_WS_Status_invalid_param;
        ZVString text;
        const unsigned int result = CfgXMLFile(path).Read(key, text, protectedValue);
        if (result == CfgXMLFile::kOk) ZVUtilities::SetText(*value, text);
        return To_ZV_WS_Status(result, ZV_WS_Status_setting_key_not_found);
    });
}

ZV_WS_Status ZV_WS_writeSetting(const char* path, const char* key, const char* value, bool protectedValue)
{
    if (!IsPath(path) || !key || !value) return ZV_WS_Status_invalid_param;
    return GuardCall([&] {
        return To_ZV_WS_Status(CfgXMLFile(path).Write(key, value, protectedValue), ZV_WS_Status_file_operation_error);
    });
}

ZV_WS_Status ZV_WS_createEnvXML(const char* path, ZV_WS_EnvNum envNum)
{
    if (envNum < ENVNUM_APISTG || envNum > ENVNUM_DEFAULT) return ZV_WS_Status_setting_invalid_value;
    char number[16];
    snprintf(number, sizeof number, "%d", static_cast<int>(envNum));
    return ZV_WS_writeSetting(path, kEnvNumKey, number, false);
}

ZV_WS_Status ZV_WS_deleteEnvXML(const char* path)
{
    return IsPath(path) ? ZV_WS_removeFile(path) : ZV_WS_Status_invalid_param;
}
