#include "SimulatedClock.h"

#include <cstdlib>
#include <regex>

namespace simulator {

std::string HttpDate(time_t when)
{
    tm parts = {};
    char text[64];
    strftime(text, sizeof text, "%a, %d %b %Y %H:%M:%S GMT", gmtime_r(&when, &parts));
    return text;
}

bool ReadDateTime(const std::string& text, time_t& when)
{
    static const std::regex shape(R"((\d{4})-(\d\d)-(\d\d)T(\d\d):(\d\d):(\d\d)(\.\d+)?(Z|([+-])(\d\d):(\d\d)))");
    std::smatch found;
    if (!std::regex_match(text, found, shape)) return false;
    const auto number = [&](int group) { return atoi(found.str(static_cast<size_t>(group)).c_str()); };
    tm parts = {};
    parts.tm_year = number(1) - 1900;
    parts.tm_mon = number(2) - 1;
    parts.tm_mday = number(3);
    parts.tm_hour = number(4);
    parts.tm_min = number(5);
    parts.tm_sec = number(6);
    const bool isDaysEnd = parts.tm_hour == 24 && parts.tm_min == 0 && parts.tm_sec == 0;
    if (isDaysEnd) parts.tm_hour = 0;
    const tm asked = parts;
    const time_t local = timegm(&parts) + (isDaysEnd ? 24 * 3600 : 0);
    // A day or an hour that there is none of has been carried over.
    if (parts.tm_mon != asked.tm_mon || parts.tm_mday != asked.tm_mday || parts.tm_hour != asked.tm_hour ||
        parts.tm_min != asked.tm_min || parts.tm_sec != asked.tm_sec || number(10) > 14 || number(11) > 59)
        return false;
    const int zone = number(10) * 3600 + number(11) * 60;
    when = found.str(9) == "-" ? local + zone : local - zone;
    return true;
}

bool ReadSeconds(const std::string& text, long long& seconds)
{
    static const std::regex shape(R"([+-]?\d{1,10})");
    seconds = atoll(text.c_str());
    return std::regex_match(text, shape);
}

}  // namespace simulator
