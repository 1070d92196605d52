// The process's one logger, behind the functions of Public/ZV_Log.h.
#pragma once

#include <array>
#include <atomic>

#include "ZVMutex.h"
#include "ZVString.h"
#include "ZV_Log.h"

/// ZV_LogGetFileTarget with fopen's mode: "wb", or "ab" for a file whose lines stay.
int GetFileTarget(const char* fileName, const char* mode, ZV_LogTarget* target, void** user, unsigned int maxSize,
                  bool wrap);

class ZV_Log {
public:
    static ZV_Log& GetInstance();

    int RegisterArea(const char* name, int& id) ZV_EXCLUDES(m_Mutex);
    void ActivateArea(int id, bool on);
    void SetAreaSeverityMask(int id, int mask);
    void SetTarget(ZV_LogTarget target, void* user) ZV_EXCLUDES(m_Mutex);

    bool WouldOutput(int id, int severity) const;
    void Output(int id, int severity, const char* text) ZV_EXCLUDES(m_Mutex);
    void Output(int id, int severity, const char* text, unsigned int length) ZV_EXCLUDES(m_Mutex);

    /// For signal handlers: writes out what the log file's stream holds, and from then on each line at once. Does not
    /// allocate. While a thread is writing, it is left to that thread, but in a process that is lost (`isFatal`): there
    /// this waits half a second at most for the thread, and then goes ahead.
    static void FlushInHandler(bool isFatal);

    static ZVString GetCurrentTime();

private:
    static constexpr int kMostAreas = 50;

    struct Area {
        ZVString name;  // never changes once the area counts
        std::atomic<bool> active{false};
        std::atomic<int> mask{0};
    };

    bool IsArea(int id) const { return id >= 0 && id < m_Count.load(std::memory_order_acquire); }
    void Emit(const ZVString& line, unsigned int length, int severity) ZV_EXCLUDES(m_Mutex);
    void FlushFile() ZV_REQUIRES(m_Mutex);
    ZVString LineStart(int id) const;

    ZVMutex m_Mutex;
    std::array<Area, kMostAreas> m_Areas;
    std::atomic<int> m_Count{0};
    std::atomic<bool> m_HasTarget{false};
    std::atomic<bool> m_FlushesEach{false};
    ZV_LogTarget m_Target ZV_GUARDED_BY(m_Mutex) = nullptr;
    void* m_User ZV_GUARDED_BY(m_Mutex) = nullptr;
};
