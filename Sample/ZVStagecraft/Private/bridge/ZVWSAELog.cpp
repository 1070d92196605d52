#include "ZVWSAELog.h"

#include <stdio.h>
#include <sys/stat.h>

#include <algorithm>
#include <vector>

#include "ZV_LogImpl.h"

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

// What a file is, whatever its name.
struct FileId {
    dev_t device = 0;
    ino_t number = 0;

    bool operator==(const FileId& other) const { return device == other.device && number == other.number; }
};

// The file target in use, which is this file's to release.
struct FileTarget {
    ZV_LogTarget function = nullptr;
    void* user = nullptr;
    FileId id;
};
FileTarget s_File;

// The files to which this process has logged. The first set-up empties a file, the next ones keep its lines.
std::vector<FileId> s_Known;

bool IsKnown(const FileId& id)
{
    return std::find(s_Known.begin(), s_Known.end(), id) != s_Known.end();
}

// false when there is no such file.
bool Identify(const char* name, FileId& id)
{
    struct stat status;
    if (stat(name, &status) != 0) return false;
    id = {status.st_dev, status.st_ino};
    return true;
}

void SetTarget(const FileTarget& target)
{
    ZV_LogSetTarget(target.function, target.user);
    ZV_LogReleaseFileTarget(s_File.function, s_File.user);
    s_File = target;
}

void SetConsoleTarget()
{
    ZV_LogTarget function = nullptr;
    void* user = nullptr;
    ZV_LogGetConsoleTarget(&function, &user);
    SetTarget({function, user, {}});
}

int SetFileTarget(const char* folder)
{
    const int kCannotOpen = 2;
    char name[256];
    const char* start = folder == ZVWSAELog::kDefaultFolder ? "./" : folder;
    const int length = snprintf(name, sizeof name, "%s%s", start, "log.txt");
    if (length < 0 || static_cast<size_t>(length) >= sizeof name) return kCannotOpen;

    FileTarget target;
    const bool exists = Identify(name, target.id);
    if (exists && s_File.user && target.id == s_File.id) {
        // A second stream would write over what the first one has not written yet.
        ZV_LogSetTarget(s_File.function, s_File.user);
        return 0;
    }
    const char* mode = exists && IsKnown(target.id) ? "ab" : "wb";
    const int result = GetFileTarget(name, mode, &target.function, &target.user, 0, true);
    if (result != 0) return result == 1 ? 3 : result;
    if (Identify(name, target.id) && !IsKnown(target.id)) s_Known.push_back(target.id);
    SetTarget(target);
    return 0;
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
        SetConsoleTarget();
        return 0;
    }
    return target & kFile ? SetFileTarget(folder) : 1;
}
