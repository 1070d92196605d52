// What was asked, in order.
#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>

#include "Storefront.h"

namespace simulator {

class RequestLog {
public:
    /// Seconds since the start.
    double Now() const { return std::chrono::duration<double>(Clock::now() - m_Start).count(); }
    void Add(LoggedRequest request);
    std::vector<LoggedRequest> All() const;
    void Clear();
    /// Until the log holds that many entries, or End was called.
    bool WaitFor(size_t count) const;
    void End();
    /// One JSON object a line.
    std::string Json() const;

private:
    using Clock = std::chrono::steady_clock;
    const Clock::time_point m_Start = Clock::now();
    mutable std::mutex m_Mutex;
    mutable std::condition_variable m_Changed;
    std::vector<LoggedRequest> m_Requests;
    unsigned long m_Count = 0;
    bool m_Ended = false;
};

}  // namespace simulator
