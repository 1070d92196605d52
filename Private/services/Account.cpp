#include "Account.h"

#include <algorithm>
#include <utility>

ZVString Account::Token() const
{
    ZVMutexLock lock(m_Mutex);
    return m_Token;
}

uint64_t Account::ChangeToken(ZVString token)
{
    ZVMutexLock lock(m_Mutex);
    std::swap(m_Token, token);
    return ++m_Generation;
}

uint64_t Account::Generation() const
{
    ZVMutexLock lock(m_Mutex);
    return m_Generation;
}

uint64_t Account::RaiseGeneration()
{
    ZVMutexLock lock(m_Mutex);
    return ++m_Generation;
}

bool Account::IsPurged() const
{
    ZVMutexLock lock(m_Mutex);
    return m_Purged == m_Generation;
}

// One that was left out before stays owed.
void Account::Purged(uint64_t generation)
{
    ZVMutexLock lock(m_Mutex);
    if (m_Purged + 1 == generation) m_Purged = generation;
}

void Account::PurgedAll(uint64_t generation)
{
    ZVMutexLock lock(m_Mutex);
    m_Purged = std::max(m_Purged, generation);
}

ZVString Account::BandwidthCheckURL() const
{
    ZVMutexLock lock(m_Mutex);
    return m_BandwidthCheckURL;
}

void Account::SetBandwidthCheckURL(ZVString url)
{
    ZVMutexLock lock(m_Mutex);
    std::swap(m_BandwidthCheckURL, url);
}
