// Logging: named areas, a severity mask for each, and one target for every line of the process.
//
// A line reads "[HH:MM:SS.mmm-area] text". Nothing adds a line end: texts bring their own. The time is the device's
// local one, from two readings of its clock: near the end of a second the milliseconds may be the next second's.
// Nothing is printed until a target is set (docs/logging.md tells how a movie or ZV_LOG does that). Secrets are taken
// out before a text comes here.
//
// Threads. All of it may be called from any thread; lines of several threads reach the target one after the other, each
// whole. A line that is filtered costs no lock.
//
// Failures are silent: a bad id, an inactive area, a filtered severity, exhausted memory drop the line. Names, texts
// and the pointers that take results must not be null.
#pragma once

#include <stdarg.h>

/// Severities, a bit each.
enum {
    ZV_LOG_ERROR = 1,    ///< Something failed that should not; a line tells it once.
    ZV_LOG_TRACE = 4,    ///< What happens: calls and their results, what is sent and received.
    ZV_LOG_VERBOSE = 8,  ///< Details of script methods.
};

// The areas of the program. Others may be registered.

/// The script class com.orvex.ZVWSLib: its methods and workers, fetching ahead.
#define ZVWSAELOG_AREA_NAME "ZV_WSAE"
/// The script class com.orvex.ZVCfgLib.
#define ZVWSAE_CFGLOG_AREA_NAME "ZV_WSCFGAE"
/// The library: each call's operation, result and response code; cache and clock when something is wrong with them.
#define ZVWS_SoapProxyLOG_AREA_NAME "soap_proxy"
/// All that is received, head and body, inflated, without secrets.
#define ZVWS_SoapRecvLOG_AREA_NAME "soap_recv"
/// All that is sent, head and body, without secrets.
#define ZVWS_SoapSentLOG_AREA_NAME "soap_sent"
/// Messages of the SOAP toolkit itself, of which this build makes none.
#define ZVWS_SoapTestLOG_AREA_NAME "soap_test"

/// Takes a line. `length` 0 means that the text ends at its NUL; else it may hold any bytes. `user` is what was given
/// with the target. Called by the thread that logs, one line at a time, under the log's lock: it must not log, and
/// whatever it waits for everybody else waits for who logs.
typedef void (*ZV_LogTarget)(const char* text, unsigned int length, void* user);

/// The id of the area with that name, registered now unless it was before: a new one is active with all severities, one
/// that is known stays as it is. The name is copied. 0, or 1 (and id -1) when the table of 50 areas is full. Areas and
/// ids stay for the life of the process.
int ZV_LogRegisterArea(const char* name, int* id);

/// Switches an area on or off.
void ZV_LogActivateArea(int id, bool on);

/// Lets an area's lines through whose severity has a bit in common with the mask; -1 lets all of them.
void ZV_LogSetAreaSeverityMask(int id, int mask);

/// Whether a line of that area and severity reaches a target; for callers whose text is dear to make.
bool ZV_LogWouldOutput(int id, int severity);

/// Logs a formatted text, cut at 511 bytes. The format is printf's.
void ZV_LogOutput(int id, int severity, const char* format, ...) __attribute__((format(printf, 3, 4)));

/// Logs `length` bytes as they are, however many.
void ZV_LogOutputwithLen(int id, int severity, const char* text, unsigned int length);

/// Replaces the target; null is none. The one before is not released, and not called again once this has returned, so
/// that it can be released then.
void ZV_LogSetTarget(ZV_LogTarget target, void* user);

/// The target that writes to standard output, through stdio's buffer. Always 0.
int ZV_LogGetConsoleTarget(ZV_LogTarget* target, void** user);

/// Nothing to release: for symmetry.
void ZV_LogReleaseConsoleTarget(ZV_LogTarget target, void* user);

/// A target that writes to a file, which it empties. Lines reach the disk's file when a buffer is full, when one of
/// severity 1 comes, and at the release. `maxSize` is in bytes; 0 is no limit, else a full file starts again at its
/// beginning (`wrap`), over what is there, or takes no more. 0, or 2 and two nulls when the name is null or the file
/// cannot be opened. The caller ends it with ZV_LogReleaseFileTarget, after another target was set.
int ZV_LogGetFileTarget(const char* fileName, ZV_LogTarget* target, void** user, unsigned int maxSize, bool wrap);

/// Closes the file. After another target was set, or none; a null `user` is ignored.
void ZV_LogReleaseFileTarget(ZV_LogTarget target, void* user);

/// A source file's area, registered when it is first used, again and again while the table is full. Any thread.
class ZV_LogArea {
public:
    /// The name has static storage.
    constexpr explicit ZV_LogArea(const char* name) : m_Name(name) {}

    /// -1 while the table is full.
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
