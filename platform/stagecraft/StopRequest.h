// The request to end the movie: raised on any thread, awaited and read on the main thread.
#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>

#include "ScriptBreak.h"

class StopRequest {
public:
    void Raise()
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        if (m_Raised) return;
        m_Raised = true;
        if (m_PBreakTimer) m_PBreakTimer->Start(kScriptGrace);
        m_Wake.notify_all();
    }

    // Forgets requests: they were for an earlier movie, or for none.
    void Reset()
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        m_Raised = false;
    }

    // The timer that a request raised from now on starts; null: none. A request raised before starts nothing.
    void SetBreakTimer(BreakTimer* pTimer)
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        m_PBreakTimer = pTimer;
    }

    bool Raised() const
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        return m_Raised;
    }

    // Blocks until then at the latest; whether a request was raised.
    bool WaitUntil(std::chrono::steady_clock::time_point then)
    {
        std::unique_lock<std::mutex> lock(m_Mutex);
        return m_Wake.wait_until(lock, then, [this] { return m_Raised; });
    }

private:
    // How long the script may go on after a stop request before it is broken off.
    static constexpr std::chrono::milliseconds kScriptGrace{1000};

    mutable std::mutex m_Mutex;
    std::condition_variable m_Wake;
    bool m_Raised = false;
    BreakTimer* m_PBreakTimer = nullptr;
};
