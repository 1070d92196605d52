#include "SimulatedClock.h"

#include <algorithm>
#include <cstdlib>

namespace simulator {

std::string HttpDate(time_t when)
{
    tm parts = {};
    char text[64];
    strftime(text, sizeof text, "%a, %d %b %Y %H:%M:%S GMT", gmtime_r(&when, &parts));
    return text;
}

namespace {

bool IsDigits(const std::string& text)
{
    return !text.empty() && text.find_first_not_of("0123456789") == std::string::npos;
}

// Whether the text is of that shape, in which a "9" stands for any digit.
bool HasShape(std::string text, const char* shape)
{
    for (char& c : text)
        c = c >= '0' && c <= '9' ? '9' : c;
    return text == shape;
}

// "Z", "+02:00": the seconds by which the zone is ahead.
bool ReadZone(const std::string& zone, int& seconds)
{
    seconds = 0;
    if (zone == "Z") return true;
    if (!HasShape(zone, "+99:99") && !HasShape(zone, "-99:99")) return false;
    const int hours = atoi(zone.substr(1, 2).c_str());
    const int minutes = atoi(zone.substr(4).c_str());
    seconds = (hours * 3600 + minutes * 60) * (zone[0] == '-' ? -1 : 1);
    return hours <= 14 && minutes < 60;
}

}  // namespace

bool ReadDateTime(const std::string& text, time_t& when)
{
    constexpr size_t kSeconds = sizeof "9999-99-99T99:99:99" - 1;
    const size_t zone = std::min(text.find_first_of("Z+-", kSeconds), text.size());
    const std::string fraction = text.substr(std::min(kSeconds, zone), zone - std::min(kSeconds, zone));
    int ahead = 0;
    if (!HasShape(text.substr(0, kSeconds), "9999-99-99T99:99:99") || !ReadZone(text.substr(zone), ahead)) return false;
    if (!fraction.empty() && (fraction[0] != '.' || !IsDigits(fraction.substr(1)))) return false;
    const auto number = [&](size_t at, size_t size) { return atoi(text.substr(at, size).c_str()); };
    tm parts = {};
    parts.tm_year = number(0, 4) - 1900;
    parts.tm_mon = number(5, 2) - 1;
    parts.tm_mday = number(8, 2);
    parts.tm_hour = number(11, 2);
    parts.tm_min = number(14, 2);
    parts.tm_sec = number(17, 2);
    const bool isDaysEnd = parts.tm_hour == 24 && parts.tm_min == 0 && parts.tm_sec == 0;
    if (isDaysEnd) parts.tm_hour = 0;
    const tm asked = parts;
    when = timegm(&parts) + (isDaysEnd ? 24 * 3600 : 0) - ahead;
    // A day or an hour that there is none of has been carried over.
    return parts.tm_mon == asked.tm_mon && parts.tm_mday == asked.tm_mday && parts.tm_hour == asked.tm_hour &&
           parts.tm_min == asked.tm_min && parts.tm_sec == asked.tm_sec;
}

bool ReadSeconds(const std::string& text, long long& seconds)
{
    seconds = atoll(text.c_str());
    const size_t sign = !text.empty() && (text[0] == '-' || text[0] == '+');
    return text.size() - sign <= 10 && IsDigits(text.substr(sign));
}

}  // namespace simulator
