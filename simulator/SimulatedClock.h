// The time as the simulator has it, and times as texts.
#pragma once

#include <atomic>
#include <ctime>
#include <string>

namespace simulator {

/// The machine's time and an offset, which may change at any moment.
class SimulatedClock {
public:
    explicit SimulatedClock(long long offset) : m_Offset(offset) {}
    time_t Now() const { return time(nullptr) + static_cast<time_t>(m_Offset); }
    long long Offset() const { return m_Offset; }
    void SetOffset(long long seconds) { m_Offset = seconds; }

private:
    std::atomic<long long> m_Offset;
};

/// "Sun, 06 Nov 1994 08:49:37 GMT".
std::string HttpDate(time_t when);

/// Reads an xsd:dateTime with a time zone, such as "2026-11-22T06:30:05.25+02:00"; fractions of a second are dropped.
/// False when the text is none.
bool ReadDateTime(const std::string& text, time_t& when);

/// Reads a whole number of at most ten digits, with or without a sign. False when the text is none.
bool ReadSeconds(const std::string& text, long long& seconds);

}  // namespace simulator
