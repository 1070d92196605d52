// When a service that failed is asked again: after pauses that grow while it fails, each of a random length, so that a
// million players that saw it fail in the same second do not return in the same second.
#pragma once

#include <stdint.h>

#include <algorithm>

/// Of one player. Has neither a clock nor a source of random numbers: a caller gives the time in milliseconds, by a
/// clock that only goes forward, and a number drawn evenly from all that the type holds. One thread at a time.
///
/// What begins a pause: a failure. Its length is drawn evenly between nothing and a limit, kBase for the first in a
/// row, twice as much for each further one up to kCap ("full jitter": what is the same for all players spreads
/// nothing). A Retry-After is waited for first. It is the same for all, so that the limit of what is drawn on top is at
/// least as long.
///
/// A failure while a pause is on tells nothing new: others were asking at the same time. It only lengthens the pause to
/// its own Retry-After.
///
/// What ends it: its time. An answer of the service in between, to the customer's own call, tells that the service is
/// back, but tells so to all players within the same minute. It brings the end forward to a moment that is drawn
/// between now (or the end of the Retry-After) and kReturn later, once in a pause. So a player whose own network was
/// gone for an hour does not wait for its long pause, and the others do not return together.
///
/// What makes pauses short again: kAnswersToRecover answers in a row. One alone does not: a service that is overloaded
/// answers some.
class Backoff {
public:
    static constexpr uint64_t kBase = 30 * 1000;                      ///< Milliseconds: the longest first pause.
    static constexpr uint64_t kCap = 15 * 60 * 1000;                  ///< Milliseconds: the longest pause.
    static constexpr uint64_t kReturn = 4 * 60 * 1000;                ///< Milliseconds: see above.
    static constexpr unsigned int kAnswersToRecover = 8;              ///< Answers.
    static constexpr unsigned int kLongestRetryAfter = 24 * 60 * 60;  ///< Seconds: what asks for more is a mistake.

    bool IsOver(uint64_t now) const { return now >= m_End; }
    /// Milliseconds.
    uint64_t Remaining(uint64_t now) const { return IsOver(now) ? 0 : m_End - now; }

    /// The service failed. `retryAfter`: the seconds that it asked for; 0: it did not.
    void Failed(uint64_t now, uint32_t random, unsigned int retryAfter = 0)
    {
        m_Answers = 0;
        const bool isFirst = IsOver(now);
        if (isFirst) {
            ++m_Failures;
            m_WasShortened = false;
        } else if (retryAfter == 0) {
            return;
        }
        const uint64_t asked = 1000ull * std::min(retryAfter, kLongestRetryAfter);
        m_Earliest = isFirst ? now + asked : std::max(m_Earliest, now + asked);
        m_End = std::max(m_End, now + asked + Draw(random, std::max(Limit(), std::min(asked, kCap))));
    }

    /// The service itself answered.
    void Answered(uint64_t now, uint32_t random)
    {
        if (++m_Answers >= kAnswersToRecover) m_Failures = 0;
        if (IsOver(now) || m_WasShortened) return;
        m_WasShortened = true;
        m_End = std::min(m_End, std::max(now, m_Earliest) + Draw(random, kReturn));
    }

private:
    static uint64_t Draw(uint32_t random, uint64_t most) { return (random * (most + 1)) >> 32; }

    uint64_t Limit() const
    {
        uint64_t limit = kBase;
        for (unsigned int i = 1; i < m_Failures && limit < kCap; ++i)
            limit *= 2;
        return std::min(limit, kCap);
    }

    uint64_t m_End = 0;       // of the last pause
    uint64_t m_Earliest = 0;  // what no answer brings its end before
    bool m_WasShortened = false;
    unsigned int m_Failures = 0;  // that began pauses, since the last recovery
    unsigned int m_Answers = 0;   // since the last failure
};
