// What a session and its duplicates know together of the customer's account. Any thread; sessions share it by
// reference.
#pragma once

#include <stdint.h>

#include "ZVMutex.h"
#include "ZVString.h"

class Account {
public:
    /// The device's authorisation; empty when it has none. A request takes it anew.
    ZVString Token() const ZV_EXCLUDES(m_Mutex);

    /// Another customer's token, or none. Everything asked or cached for the one before is stale from then on: the
    /// generation that says so.
    uint64_t ChangeToken(ZVString token) ZV_EXCLUDES(m_Mutex);

    /// How many changes have made the user's data of before them stale.
    uint64_t Generation() const ZV_EXCLUDES(m_Mutex);
    uint64_t RaiseGeneration() ZV_EXCLUDES(m_Mutex);

    /// Whether the sessions' cache has been rid of everything that is stale. When it could not be, what it holds of the
    /// user must not be shown.
    bool IsPurged() const ZV_EXCLUDES(m_Mutex);
    /// The cache was rid of what that one generation made stale.
    void Purged(uint64_t generation) ZV_EXCLUDES(m_Mutex);
    /// The cache was rid of all that was stale at that generation.
    void PurgedAll(uint64_t generation) ZV_EXCLUDES(m_Mutex);

    /// Where the service wants bandwidth to be measured; empty until a session has learnt it.
    ZVString BandwidthCheckURL() const ZV_EXCLUDES(m_Mutex);
    void SetBandwidthCheckURL(ZVString url) ZV_EXCLUDES(m_Mutex);

private:
    mutable ZVMutex m_Mutex;
    ZVString m_Token ZV_GUARDED_BY(m_Mutex);
    uint64_t m_Generation ZV_GUARDED_BY(m_Mutex) = 0;
    uint64_t m_Purged ZV_GUARDED_BY(m_Mutex) = 0;  // up to which generation
    ZVString m_BandwidthCheckURL ZV_GUARDED_BY(m_Mutex);
};
