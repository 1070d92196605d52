// The text of a Date header.
#include "Clock.h"
#include "Target.h"

void TestInput(std::string_view input)
{
    const std::string text(input);
    const time_t time = Clock::ParseHttpDate(text.c_str());
    Require(time >= 0, "no time is before the epoch");
    if (time == 0) return;
    char again[64];
    tm parts = {};
    strftime(again, sizeof again, "%a, %d %b %Y %H:%M:%S GMT", gmtime_r(&time, &parts));
    Require(Clock::ParseHttpDate(again) == time, "a time is read as it is written");
}
