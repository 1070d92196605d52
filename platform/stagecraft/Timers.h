// The script's timers. Main thread only.
#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <vector>

#include "stagecraft/ASValue.h"

class Timers {
public:
    using Clock = std::chrono::steady_clock;
    using Caller =
        std::function<void(const ae::stagecraft::ASValue& function, const ae::stagecraft::ASValueArray& arguments)>;

    // Returns the timer's number, from 1 on. A delay that is no number or negative is 0, the longest is 2^31 - 1 ms.
    uint32_t Add(Clock::time_point now, double delayMilliseconds, bool repeats, ae::stagecraft::ASValue function,
                 ae::stagecraft::ASValueArray arguments);
    // A number that stands for no timer does nothing.
    void Remove(uint32_t number);
    bool empty() const { return m_Timers.empty(); }

    // Calls what is due, the earliest first, at equal times in the order of creation. Timers that these calls start
    // wait for the next run; an interval is called once however late the run is.
    void RunDue(Clock::time_point now, const Caller& call);

private:
    struct Timer {
        uint32_t number;
        Clock::time_point due;
        std::chrono::milliseconds interval;
        bool repeats;
        ae::stagecraft::ASValue function;
        ae::stagecraft::ASValueArray arguments;
    };
    std::vector<Timer>::iterator Find(uint32_t number);

    std::vector<Timer> m_Timers;
    uint32_t m_LastNumber = 0;
};
