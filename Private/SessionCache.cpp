#include "SessionCache.h"

#include <algorithm>

#include "CacheSweep.h"

static constexpr auto kUserData = ZV_WS_CacheParam::CacheData_Userdata;

SessionCache::SessionCache(SessionImpl& session)
    : m_Session(session), m_Cache(session.m_Cache.get()), m_Account(*session.m_Params.Customer)
{}

// Whether answers of that kind may be looked for: what a session could not purge, perhaps a duplicate without a cache
// of its own, is purged before anything of the user is shown. Kinds that are not cached are the cache's to refuse.
bool SessionCache::MayUse(ZV_WS_CacheParam::CacheData kind)
{
    if (!m_Cache) return false;
    if (kind != kUserData || m_Account.IsPurged()) return true;
    const uint64_t generation = m_Account.Generation();
    if (!m_Cache->PurgeUserData("")) return false;
    m_Account.PurgedAll(generation);
    return true;
}

SessionCache::Stamp SessionCache::Now()
{
    Stamp stamp;
    stamp.account = m_Account.Generation();
    if (m_Cache) stamp.stored = m_Cache->Generation();
    return stamp;
}

// ---- Answers

bool SessionCache::Find(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, ZVString& text,
                        Stamp& stamp)
{
    if (!MayUse(kind)) return false;
    bool found = false;
    m_Cache->Look([&] {
        found = kind == kUserData ? m_Cache->ReadUserData(table, key, text) : m_Cache->ReadMetaData(table, key, text);
        if (!found) stamp = Now();
        return true;
    });
    return found && !text.empty();
}

void SessionCache::Keep(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, const ZVString& text,
                        const Stamp& stamp)
{
    if (!m_Session.Caches(kind)) return;
    KeepIf(stamp, [&] {
        return kind == kUserData ? m_Cache->WriteUserData(table, key, text) : m_Cache->WriteMetaData(table, key, text);
    });
}

// Images whose rows wait go with it: their flushes are the same.
bool SessionCache::KeepIf(const Stamp& stamp, const std::function<bool()>& keep)
{
    if (stamp.stored == 0 || stamp.account != m_Account.Generation()) return false;
    WaitingImages::Claim images(m_Session.m_WaitingImages.get());
    bool evicted = false;
    const bool kept = m_Cache->Together([&] {
        return m_Cache->Generation() == stamp.stored && keep() &&
               (images.rows().empty() || m_Cache->WriteBoxArts(images.rows(), evicted));
    });
    if (kept) images.Settle();
    if (kept && evicted) CacheSweep(m_Session.m_Params.CachePath).AfterEviction();
    return kept;
}

// ---- Wish-list flags

bool SessionCache::FindFlags(const int* titleIDs, unsigned int count, bool* flags, Stamp& stamp)
{
    if (!MayUse(kUserData)) return false;
    bool found = false;
    m_Cache->Look([&] {
        found = true;
        for (unsigned int i = 0; found && i < count; ++i)
            found = m_Cache->ReadWishlistFlag(titleIDs[i], flags[i]);
        if (!found) stamp = Now();
        return true;
    });
    return found;
}

void SessionCache::KeepFlags(const ZVWS_IntVector& titleIDs, const ZVWS_BoolVector& flags, const Stamp& stamp)
{
    if (!m_Session.Caches(kUserData)) return;
    KeepIf(stamp, [&] { return m_Cache->WriteWishlistFlags(titleIDs, flags); });
}

// ---- Changes

void SessionCache::UserDataChanged(const char* table, const std::function<bool(CacheInterface&)>& more)
{
    const uint64_t generation = m_Account.RaiseGeneration();
    if (!m_Session.Caches(kUserData)) return;
    if (m_Cache->Together([&] { return m_Cache->PurgeUserData(table) && (!more || more(*m_Cache)); }))
        m_Account.Purged(generation);
}

void SessionCache::AccountChanged(const ZVString& token)
{
    const uint64_t generation = m_Account.ChangeToken(token);
    if (m_Session.Caches(kUserData) && m_Cache->PurgeUserData("")) m_Account.PurgedAll(generation);
}

void SessionCache::Refresh(const ZVString& loadTime, bool images, bool userData)
{
    const uint64_t generation = userData ? m_Account.RaiseGeneration() : 0;
    WaitingImages::Claim waiting(m_Session.m_WaitingImages.get());
    bool evicted = false;
    const bool done = m_Cache->Together([&] {
        return (loadTime.empty() || m_Cache->UpdateLastCacheLoadTime(loadTime)) &&
               (!images || ((waiting.rows().empty() || m_Cache->WriteBoxArts(waiting.rows(), evicted)) &&
                            m_Cache->SetBoxArtNeedUpdate())) &&
               (!userData || m_Cache->PurgeUserData(""));
    });
    if (!done) return;
    if (images) waiting.Settle();
    if (userData) m_Account.PurgedAll(generation);
    if (evicted) CacheSweep(m_Session.m_Params.CachePath).AfterEviction();
}
