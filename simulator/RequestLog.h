// What was asked, in order.
#pragma once

#include <chrono>
#include <condition_variable>
#include <deque>
#include <mutex>

#include "LoggedRequest.h"

namespace simulator {

class RequestLog {
public:
    /// Keeps the last `most` entries; of each, the first 4 KiB of a text and the first hundred of a list.
    explicit RequestLog(size_t most) : m_Most(most) {}

    /// Seconds since the start.
    double Now() const { return std::chrono::duration<double>(Clock::now() - m_Start).count(); }
    void Add(LoggedRequest request);
    std::vector<LoggedRequest> All() const;
    void Clear();
    /// Until that many entries have been added since it was cleared, or End was called.
    bool WaitFor(size_t count) const;
    void End();
    /// One JSON object a line.
    std::string Json() const;

private:
    using Clock = std::chrono::steady_clock;
    const Clock::time_point m_Start = Clock::now();
    const size_t m_Most;
    mutable std::mutex m_Mutex;
    mutable std::condition_variable m_Changed;
    std::deque<LoggedRequest> m_Requests;
    unsigned long m_Count = 0;
    unsigned long m_Cleared = 0;  // the count when it was cleared
    bool m_Ended = false;
};

}  // namespace simulator
