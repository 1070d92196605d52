// Logging: named areas, a severity mask for each, and one target for every line of the process.
//
// A line reads "[HH:MM:SS.mmm-area] text". Nothing adds a line end: texts bring their own. Nothing is printed until a
// target is set. All of it may be called from any thread; lines of several threads reach the target one after the
// other. All failures are silent: a bad id, an inactive area or a filtered severity drops the line.
#pragma once

#include <stdarg.h>

/// Severities, a bit each.
enum { ZV_LOG_ERROR = 1, ZV_LOG_TRACE = 4, ZV_LOG_VERBOSE = 8 };

#define ZVWSAELOG_AREA_NAME "ZV_WSAE"
#define ZVWSAE_CFGLOG_AREA_NAME "ZV_WSCFGAE"
#define ZVWS_SoapProxyLOG_AREA_NAME "soap_proxy"
#define ZVWS_SoapRecvLOG_AREA_NAME "soap_recv"
#define ZVWS_SoapSentLOG_AREA_NAME "soap_sent"
#define ZVWS_SoapTestLOG_AREA_NAME "soap_test"

/// Takes a line. `length` 0 means that the text ends at its NUL. Called by the thread that logs, one line at a time;
/// must not log.
typedef void (*ZV_LogTarget)(const char* text, unsigned int length, void* user);

/// The id of the area with that name, registered now unless it was before: a new one is active with all severities. 0,
/// or 1 (and id -1) when the table of 50 areas is full.
int ZV_LogRegisterArea(const char* name, int* id);
void ZV_LogActivateArea(int id, bool on);
void ZV_LogSetAreaSeverityMask(int id, int mask);

/// Whether a line of that area and severity reaches a target; for callers whose text is dear to make.
bool ZV_LogWouldOutput(int id, int severity);

/// Logs a formatted text, cut at 511 bytes.
void ZV_LogOutput(int id, int severity, const char* format, ...) __attribute__((format(printf, 3, 4)));

/// Logs `length` bytes as they are.
void ZV_LogOutputwithLen(int id, int severity, const char* text, unsigned int length);

/// Replaces the target. The one before is neither released nor called again once this has returned.
void ZV_LogSetTarget(ZV_LogTarget target, void* user);

/// The target that writes to standard output. Always 0.
int ZV_LogGetConsoleTarget(ZV_LogTarget* target, void** user);
void ZV_LogReleaseConsoleTarget(ZV_LogTarget target, void* user);

/// A target that writes to a file, which it empties. Lines reach the disk's file when a buffer is full, when one of
/// severity 1 comes, and at the release. `maxSize` 0 is no limit; else a full file starts again at its beginning
/// (`wrap`), or takes no more. 0, or 2 and two nulls when the name is null or the file cannot be opened. Ends with
/// ZV_LogReleaseFileTarget, after another target was set.
int ZV_LogGetFileTarget(const char* fileName, ZV_LogTarget* target, void** user, unsigned int maxSize, bool wrap);
void ZV_LogReleaseFileTarget(ZV_LogTarget target, void* user);

/// A source file's area, registered when it is first used, again and again while the table is full.
class ZV_LogArea {
public:
    /// Static storage.
    constexpr explicit ZV_LogArea(const char* name) : m_Name(name) {}

    int Id()
    {
        int id = __atomic_load_n(&m_Id, __ATOMIC_RELAXED);
        if (id < 0 && ZV_LogRegisterArea(m_Name, &id) == 0) __atomic_store_n(&m_Id, id, __ATOMIC_RELAXED);
        return id;
    }

private:
    const char* m_Name;
    int m_Id = -1;
};

/// Gives a source file its own GetZV_LogAreaID().
#define ZV_LOG_AREA(name)               \
    static int GetZV_LogAreaID()        \
    {                                   \
        static ZV_LogArea s_Area(name); \
        return s_Area.Id();             \
    }
