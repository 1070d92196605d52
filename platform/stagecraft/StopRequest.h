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
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (m_raised) return;
        m_raised = true;
        if (m_pBreakTimer) m_pBreakTimer->Start(kScriptGrace);
        m_wake.notify_all();
    }

    // Forgets requests: they were for an earlier movie, or for none.
    void Reset()
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_raised = false;
    }

    // The timer that a request raised from now on starts; null: none. A request raised before starts nothing.
    void SetBreakTimer(BreakTimer* pTimer)
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        m_pBreakTimer = pTimer;
    }

    bool Raised() const
    {
        const std::lock_guard<std::mutex> lock(m_mutex);
        return m_raised;
    }

    // Blocks until then at the latest; whether a request was raised.
    bool WaitUntil(std::chrono::steady_clock::time_point then)
    {
        std::unique_lock<std::mutex> lock(m_mutex);
        return m_wake.wait_until(lock, then, [this] { return m_raised; });
    }

private:
    // How long the script may go on after a stop request before it is broken off.
    static constexpr std::chrono::milliseconds kScriptGrace{1000};

    mutable std::mutex m_mutex;
    std::condition_variable m_wake;
    bool m_raised = false;
    BreakTimer* m_pBreakTimer = nullptr;
};
