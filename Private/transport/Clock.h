// The time of day, for what services and certificates are told and asked: players without a battery start in 1970, and
// others are hours off.
//
// The system's clock is trusted until a service shows that it is wrong: it refuses a request while its own clock, told
// over a connection whose certificates are right at that time, says something else. The difference is kept for the
// process. For certificates there is a floor: it is never earlier than this library's own making, nor than the last
// time that was known to be right (the deployment's clock_file). Nothing that plain HTTP says counts. Any thread.
#pragma once

#include <stdint.h>
#include <time.h>

#include "Deployment.h"

namespace Clock {

/// Seconds by which clocks may differ without anybody minding.
constexpr int64_t kTolerance = 240;

/// The time as it is best known.
time_t Now();

/// What was learned: seconds between that and the system's time.
int64_t Offset();

/// The time at which certificates are looked at: Now, but never before the floor.
time_t ForCertificates(const Deployment& deployment);

/// What an answer's date says about the clock.
enum class Verdict {
    Right,    ///< Within the tolerance.
    Learned,  ///< It was off when the request was made, and is not any more.
    Wrong,    ///< It is off, and that date cannot be right either: some certificate is not valid then.
};

/// When all certificates of a connection are valid together.
struct Validity {
    time_t from = 0;
    time_t to = 0;  ///< 0: not known, no time is valid.
    bool Holds(time_t time) const { return time >= from && time <= to; }
};

/// For a request that was made with that Offset and refused on a verified connection: learns from the answer's date
/// when the clock is off. One line in the log tells by how much.
Verdict Compare(time_t date, int64_t offset, const Validity& validity);

/// A certificate, looked at as of `now`, is valid only from later on: a line in the log.
void TellBehind(time_t validFrom, time_t now);

/// For a request that was not refused: remembers, for the next process, that it is at least that late when the clock
/// agrees.
void NoteGood(time_t date, const Deployment& deployment);

/// The time in a header's text ("Sun, 06 Nov 1994 08:49:37 GMT", and the two older forms that HTTP knows); 0 for
/// anything else.
time_t ParseHttpDate(const char* text);

/// Tests: seconds by which the system's clock seems to be off. Forgets what was learned.
void PretendSystemIsOff(int64_t seconds);

}  // namespace Clock
