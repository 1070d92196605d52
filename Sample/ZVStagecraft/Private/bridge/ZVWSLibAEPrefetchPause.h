// When nothing is fetched ahead since the service is in trouble. One for the instances of a player that share their
// state
// ("clone"): what one of them meets concerns all.
#pragma once

#include <stdint.h>

#include "Backoff.h"
#include "RetryAfter.h"
#include "ZVMutex.h"
#include "ZV_WS_Status.h"

/// Any thread.
class PrefetchPause {
public:
    using Clock = uint64_t (*)();   ///< Milliseconds, forward only.
    using Random = uint32_t (*)();  ///< Drawn evenly from all numbers.

    /// The standard ones are the system's.
    PrefetchPause();
    PrefetchPause(Clock clock, Random random) : m_Clock(clock), m_Random(random) {}

    bool IsOver() ZV_EXCLUDES(m_Mutex);
    /// The answers so far that tell that the service works.
    uint64_t Answers() ZV_EXCLUDES(m_Mutex);

    /// Whether that end of a call tells of trouble: the connection, TLS or the exchange failed, or the service was
    /// unavailable. A refusal, which has a response code, is an answer like others.
    static bool IsTrouble(ZV_WS_Status status, const RetryAfter::Heard& heard);

    /// Takes note of how a call ended, and of what was heard in it. Returns IsTrouble.
    bool Note(ZV_WS_Status status, const RetryAfter::Heard& heard) ZV_EXCLUDES(m_Mutex);

private:
    const Clock m_Clock;
    const Random m_Random;
    ZVMutex m_Mutex;
    Backoff m_Backoff ZV_GUARDED_BY(m_Mutex);
    uint64_t m_Answers ZV_GUARDED_BY(m_Mutex) = 0;
};
