#include "ZVWSAELog.h"

#include <stdio.h>

#include "ZV_Log.h"

namespace {

struct Area {
    const char* name;
    unsigned int bit;  // in the mask of InitWSLogs
    int id;
};

Area s_Areas[] = {
    {ZVWSAELOG_AREA_NAME, 0x100, -1},         {ZVWSAE_CFGLOG_AREA_NAME, 0x200, -1},
    {ZVWS_SoapProxyLOG_AREA_NAME, 0x400, -1}, {ZVWS_SoapRecvLOG_AREA_NAME, 0x800, -1},
    {ZVWS_SoapSentLOG_AREA_NAME, 0x1000, -1}, {ZVWS_SoapTestLOG_AREA_NAME, 0x2000, -1},
};

// The file target in use, which is this file's to release.
struct FileTarget {
    ZV_LogTarget function = nullptr;
    void* user = nullptr;
};
FileTarget s_File;

void SetTarget(ZV_LogTarget function, void* user, bool isFile)
{
    ZV_LogSetTarget(function, user);
    ZV_LogReleaseFileTarget(s_File.function, s_File.user);
    s_File = isFile ? FileTarget{function, user} : FileTarget{};
}

int SetFileTarget(const char* folder)
{
    const int kCannotOpen = 2;
    char name[256];
    const char* start = folder == ZVWSAELog::kDefaultFolder ? "./" : folder;
    const int length = snprintf(name, sizeof name, "%s%s", start, "log.txt");
    if (length < 0 || static_cast<size_t>(length) >= sizeof name) return kCannotOpen;

    ZV_LogTarget function = nullptr;
    void* user = nullptr;
    const int result = ZV_LogGetFileTarget(name, &function, &user, 0, true);
    if (result == 0) SetTarget(function, user, true);
    return result == 1 ? 3 : result;
}

}  // namespace

ZVWSAELog::ZVWSAELog(const char* className, const char* methodName, int areaId)
    : m_ClassName(className), m_MethodName(methodName), m_AreaId(areaId)
{
    ZV_LogOutput(m_AreaId, ZV_LOG_TRACE, "Entering %s::%s\n", m_ClassName.c_str(), m_MethodName.c_str());
}

ZVWSAELog::~ZVWSAELog()
{
    ZV_LogOutput(m_AreaId, ZV_LOG_TRACE, "Exiting %s::%s\n", m_ClassName.c_str(), m_MethodName.c_str());
}

int ZVWSAELog::InitWSLogs(unsigned int areaMask, unsigned char target, const char* folder)
{
    for (Area& area : s_Areas) {
        ZV_LogRegisterArea(area.name, &area.id);
        ZV_LogActivateArea(area.id, (areaMask & area.bit) != 0);
    }
    if (target & kConsole) {
        ZV_LogTarget function = nullptr;
        void* user = nullptr;
        ZV_LogGetConsoleTarget(&function, &user);
        SetTarget(function, user, false);
        return 0;
    }
    return target & kFile ? SetFileTarget(folder) : 1;
}
