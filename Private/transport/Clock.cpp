#include "Clock.h"

#include <fcntl.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>

#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

namespace {

constexpr time_t kMade = ZV_BUILD_TIME;
constexpr time_t kNoteEvery = 3600;

std::atomic<int64_t> s_Pretended{0};
std::atomic<int64_t> s_Learned{0};
std::atomic<time_t> s_Noted{0};

time_t System()
{
    return time(nullptr) + static_cast<time_t>(s_Pretended);
}

int64_t Differ(time_t one, time_t other)
{
    return std::llabs(static_cast<int64_t>(one) - static_cast<int64_t>(other));
}

void Tell(const char* least, time_t theirs, time_t own, const char* what)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "the clock is %s%lld s %s the service's, %s\n", least,
                 static_cast<long long>(Differ(theirs, own)), theirs > own ? "behind" : "ahead of", what);
}

// The file's own time: it has no content.
time_t LastGood(const Deployment& deployment)
{
    struct stat file;
    const bool known = !deployment.clock_file.empty() && stat(deployment.clock_file.c_str(), &file) == 0;
    return known ? file.st_mtime : 0;
}

}  // namespace

time_t Clock::Now()
{
    return System() + static_cast<time_t>(s_Learned);
}

int64_t Clock::Offset()
{
    return s_Learned;
}

time_t Clock::ForCertificates(const Deployment& deployment)
{
    return std::max({Now(), kMade, LastGood(deployment)});
}

Clock::Verdict Clock::Compare(time_t date, int64_t offset, const Validity& validity)
{
    if (Differ(date, System() + offset) <= kTolerance) return Verdict::Right;
    const int64_t learned = s_Learned;
    // Another thread has learned it meanwhile.
    if (learned != offset && Differ(date, System() + learned) <= kTolerance) return Verdict::Learned;
    const bool isPossible = validity.Holds(date);
    if (isPossible) s_Learned = static_cast<int64_t>(date) - System();
    Tell("", date, System() + offset,
         isPossible ? "which is used from now on" : "whose certificates are not valid at that time");
    return isPossible ? Verdict::Learned : Verdict::Wrong;
}

void Clock::TellBehind(time_t validFrom, time_t now)
{
    Tell("at least ", validFrom, now, "whose certificate is not valid yet");
}

void Clock::NoteGood(time_t date, const Deployment& deployment)
{
    if (deployment.clock_file.empty() || Differ(date, Now()) > kTolerance) return;
    if (date - s_Noted < kNoteEvery || date - LastGood(deployment) < kNoteEvery) return;
    s_Noted = date;
    const char* path = deployment.clock_file.c_str();
    const int file = open(path, O_WRONLY | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC, 0600);
    if (file < 0) return;
    const timespec times[2] = {{date, 0}, {date, 0}};
    futimens(file, times);
    close(file);
}

time_t Clock::ParseHttpDate(const char* text)
{
    static const char kMonths[] = "JanFebMarAprMayJunJulAugSepOctNovDec";
    tm parts = {};
    char month[4] = "", zone[4] = "";
    int year = 0;
    const auto reads = [&](int count, const char* format, auto*... fields) {
        return sscanf(text, format, fields...) == count;
    };
    const bool isNow = reads(7, "%*3[A-Za-z], %2d %3[A-Za-z] %4d %2d:%2d:%2d %3s", &parts.tm_mday, month, &year,
                             &parts.tm_hour, &parts.tm_min, &parts.tm_sec, zone);
    const bool isOld = !isNow && reads(7, "%*9[A-Za-z], %2d-%3[A-Za-z]-%2d %2d:%2d:%2d %3s", &parts.tm_mday, month,
                                       &year, &parts.tm_hour, &parts.tm_min, &parts.tm_sec, zone);
    const bool isOldest = !isNow && !isOld &&
                          reads(6, "%*3[A-Za-z] %3[A-Za-z] %2d %2d:%2d:%2d %4d", month, &parts.tm_mday, &parts.tm_hour,
                                &parts.tm_min, &parts.tm_sec, &year);
    if (isOld) year += year < 70 ? 2000 : 1900;
    const char* found = strlen(month) == 3 ? strstr(kMonths, month) : nullptr;
    const bool isGmt = isOldest || strcmp(zone, "GMT") == 0;
    if (!(isNow || isOld || isOldest) || !isGmt || !found || (found - kMonths) % 3 != 0 || year < 1970) return 0;
    parts.tm_mon = static_cast<int>(found - kMonths) / 3;
    parts.tm_year = year - 1900;
    const auto isIn = [](int value, int from, int to) { return value >= from && value <= to; };
    const bool isDate = isIn(parts.tm_mday, 1, 31) && isIn(parts.tm_hour, 0, 23) && isIn(parts.tm_min, 0, 59) &&
                        isIn(parts.tm_sec, 0, 60);
    return isDate ? timegm(&parts) : 0;
}

void Clock::PretendSystemIsOff(int64_t seconds)
{
    s_Pretended = seconds;
    s_Learned = 0;
    s_Noted = 0;
}
