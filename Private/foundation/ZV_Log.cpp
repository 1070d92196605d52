#include <stdio.h>
#include <string.h>
#include <sys/time.h>
#include <time.h>

#include <algorithm>
#include <memory>
#include <new>

#include "CallGuard.h"
#include "ZV_LogImpl.h"

namespace {

constexpr size_t kMessageSize = 512;

std::atomic<ZV_Log*> s_Log{nullptr};  // for handlers, which must not make it

}  // namespace

ZV_Log& ZV_Log::GetInstance()
{
    static ZV_Log& log = *(s_Log = new ZV_Log);  // threads that still run at exit may log
    return log;
}

int ZV_Log::RegisterArea(const char* name, int& id)
{
    id = -1;
    ZVMutexLock lock(m_Mutex);
    const int count = m_Count;
    for (int i = 0; i < count; ++i) {
        if (m_Areas[i].name == name) {
            id = i;
            return 0;
        }
    }
    if (count == kMostAreas) return 1;
    id = count;
    Area& area = m_Areas[id];
    area.name = name;
    area.mask = -1;
    area.active = true;
    m_Count.store(count + 1, std::memory_order_release);
    return 0;
}

void ZV_Log::ActivateArea(int id, bool on)
{
    if (IsArea(id)) m_Areas[id].active = on;
}

void ZV_Log::SetAreaSeverityMask(int id, int mask)
{
    if (IsArea(id)) m_Areas[id].mask = mask;
}

void ZV_Log::SetTarget(ZV_LogTarget target, void* user)
{
    ZVMutexLock lock(m_Mutex);
    m_Target = target;
    m_User = user;
    m_HasTarget = target != nullptr;
}

bool ZV_Log::WouldOutput(int id, int severity) const
{
    return m_HasTarget && IsArea(id) && m_Areas[id].active && (severity & m_Areas[id].mask) != 0;
}

ZVString ZV_Log::GetCurrentTime()
{
    // Two readings of the clock: near the end of a second the milliseconds may be the next second's.
    const time_t seconds = time(nullptr);
    tm local;
    char clock[11];
    clock[0] = '\0';
    strftime(clock, sizeof clock, "%X", localtime_r(&seconds, &local));
    timeval now;
    gettimeofday(&now, nullptr);
    char text[32];
    snprintf(text, sizeof text, "%s.%03lu", clock, static_cast<unsigned long>(now.tv_usec / 1000));
    return text;
}

ZVString ZV_Log::LineStart(int id) const
{
    return ZVString("[") + GetCurrentTime() + "-" + m_Areas[id].name + "] ";
}

// An error may be the last thing that the process says.
void ZV_Log::Emit(const ZVString& line, unsigned int length, int severity)
{
    ZVMutexLock lock(m_Mutex);
    if (!m_Target) return;
    m_Target(line.c_str(), length, m_User);
    if ((severity & ZV_LOG_ERROR) || m_FlushesEach) FlushFile();
}

// A line for which there is no memory is dropped, like every line that cannot be written.
void ZV_Log::Output(int id, int severity, const char* text)
{
    if (!WouldOutput(id, severity)) return;
    WithinMemory([&] { Emit(LineStart(id) + text, 0, severity); });
}

void ZV_Log::Output(int id, int severity, const char* text, unsigned int length)
{
    if (!WouldOutput(id, severity)) return;
    WithinMemory([&] {
        ZVString line = LineStart(id);
        line.append(text, length);
        Emit(line, static_cast<unsigned int>(line.length()), severity);
    });
}

// ---- Targets

namespace {

struct FileTarget {
    FILE* file;
    unsigned int maxSize;  // 0: no limit
    unsigned int written;
    bool wrap;
};

void ConsoleOutput(const char* text, unsigned int length, void*)
{
    fwrite(text, 1, length ? length : strlen(text), stdout);
}

void FileOutput(const char* text, unsigned int length, void* user)
{
    auto* target = static_cast<FileTarget*>(user);
    if (!target || !target->file) return;
    if (length == 0) length = static_cast<unsigned int>(strlen(text));
    if (target->maxSize != 0) {
        if (target->wrap && length > target->maxSize - target->written) {
            rewind(target->file);
            target->written = 0;
        }
        length = std::min(length, target->maxSize - target->written);
        target->written += length;
    }
    fwrite(text, 1, length, target->file);
}

}  // namespace

// Whoever writes to the file of the target holds the mutex: the stream needs no lock of its own.
void ZV_Log::FlushFile()
{
    if (m_Target == FileOutput && m_User) fflush_unlocked(static_cast<FileTarget*>(m_User)->file);
}

ZV_THREAD_ATTRIBUTE(no_thread_safety_analysis) void ZV_Log::FlushInHandler(bool isFatal)
{
    static std::atomic_flag s_Flushing = ATOMIC_FLAG_INIT;  // the stream may be what is broken
    ZV_Log* log = s_Log;
    if (!log || s_Flushing.test_and_set()) return;
    log->m_FlushesEach = true;
    const timespec aMillisecond = {0, 1000000};
    bool locked = log->m_Mutex.try_lock();
    for (int i = 0; isFatal && !locked && i < 500; ++i) {
        nanosleep(&aMillisecond, nullptr);
        locked = log->m_Mutex.try_lock();
    }
    if (locked || isFatal) log->FlushFile();
    if (locked) log->m_Mutex.unlock();
    s_Flushing.clear();
}

int ZV_LogGetConsoleTarget(ZV_LogTarget* target, void** user)
{
    *target = ConsoleOutput;
    *user = nullptr;
    return 0;
}

void ZV_LogReleaseConsoleTarget(ZV_LogTarget, void*) {}

int GetFileTarget(const char* fileName, const char* mode, ZV_LogTarget* target, void** user, unsigned int maxSize,
                  bool wrap)
{
    *target = nullptr;
    *user = nullptr;
    FILE* file = fileName ? fopen(fileName, mode) : nullptr;
    if (!file) return 2;
    *target = FileOutput;
    *user = new FileTarget{file, maxSize, 0, wrap};
    return 0;
}

int ZV_LogGetFileTarget(const char* fileName, ZV_LogTarget* target, void** user, unsigned int maxSize, bool wrap)
{
    return GetFileTarget(fileName, "wb", target, user, maxSize, wrap);
}

void ZV_LogReleaseFileTarget(ZV_LogTarget, void* user)
{
    const std::unique_ptr<FileTarget> target(static_cast<FileTarget*>(user));
    if (target && target->file) fclose(target->file);
}

// ---- Functions

int ZV_LogRegisterArea(const char* name, int* id)
{
    return ZV_Log::GetInstance().RegisterArea(name, *id);
}

void ZV_LogActivateArea(int id, bool on)
{
    ZV_Log::GetInstance().ActivateArea(id, on);
}

void ZV_LogSetAreaSeverityMask(int id, int mask)
{
    ZV_Log::GetInstance().SetAreaSeverityMask(id, mask);
}

bool ZV_LogWouldOutput(int id, int severity)
{
    return ZV_Log::GetInstance().WouldOutput(id, severity);
}

void ZV_LogOutput(int id, int severity, const char* format, ...)
{
    ZV_Log& log = ZV_Log::GetInstance();
    if (!log.WouldOutput(id, severity)) return;
    char message[kMessageSize] = {};
    va_list arguments;
    va_start(arguments, format);
    vsnprintf(message, sizeof message, format, arguments);
    va_end(arguments);
    log.Output(id, severity, message);
}

void ZV_LogOutputwithLen(int id, int severity, const char* text, unsigned int length)
{
    ZV_Log::GetInstance().Output(id, severity, text, length);
}

void ZV_LogSetTarget(ZV_LogTarget target, void* user)
{
    ZV_Log::GetInstance().SetTarget(target, user);
}
