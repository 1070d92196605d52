#include "Timers.h"

#include <algorithm>
#include <tuple>

using ae::stagecraft::ASValue;
using ae::stagecraft::ASValueArray;

uint32_t Timers::Add(Clock::time_point now, double delayMilliseconds, bool repeats, ASValue function,
                     ASValueArray arguments)
{
    constexpr double kLongest = 2147483647.0;
    const double bounded = delayMilliseconds > 0 ? std::min(delayMilliseconds, kLongest) : 0;  // NaN too
    const std::chrono::milliseconds delay(static_cast<int64_t>(bounded));
    m_Timers.push_back(Timer{++m_LastNumber, now + delay, delay, repeats, std::move(function), std::move(arguments)});
    return m_LastNumber;
}

std::vector<Timers::Timer>::iterator Timers::Find(uint32_t number)
{
    return std::find_if(m_Timers.begin(), m_Timers.end(), [=](const Timer& timer) { return timer.number == number; });
}

void Timers::Remove(uint32_t number)
{
    const auto found = Find(number);
    if (found == m_Timers.end()) return;
    const Timer removed = std::move(*found);  // what it held goes after the list is in order again
    m_Timers.erase(found);
}

void Timers::RunDue(Clock::time_point now, const Caller& call)
{
    std::vector<std::pair<Clock::time_point, uint32_t>> due;
    for (const Timer& timer : m_Timers) {
        if (timer.due <= now) due.emplace_back(timer.due, timer.number);
    }
    std::sort(due.begin(), due.end());
    for (const auto& entry : due) {
        const auto found = Find(entry.second);
        if (found == m_Timers.end()) continue;  // a call before it removed it
        const ASValue function = found->function;
        const ASValueArray arguments = found->arguments;
        if (found->repeats) {
            found->due = std::max(found->due + found->interval, now);
        } else {
            Remove(entry.second);
        }
        call(function, arguments);
    }
}
