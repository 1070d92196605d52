// What was asked, in order.
#pragma once

#include <condition_variable>
#include <mutex>

#include "Storefront.h"

class RequestLog {
public:
    void Add(LoggedRequest request);
    std::vector<LoggedRequest> All() const;
    void Clear();
    /// Until the log holds that many entries, or End was called.
    bool WaitFor(size_t count) const;
    void End();
    /// One JSON object a line.
    std::string Json() const;

private:
    mutable std::mutex m_Mutex;
    mutable std::condition_variable m_Changed;
    std::vector<LoggedRequest> m_Requests;
    unsigned long m_Count = 0;
    bool m_Ended = false;
};
