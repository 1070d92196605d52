#include "SessionCache.h"

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
    stamp.account = m_Session.m_Params.Customer;
    stamp.generation = m_Account.Generation();
    if (m_Cache) stamp.stored = m_Cache->Generation();
    return stamp;
}

bool SessionCache::Together(const std::function<bool()>& work)
{
    CacheWriter::Batch waiting(m_Session.m_Writer.get());
    if (!m_Cache->Together([&] { return waiting.Write(*m_Cache) && work(); })) return false;
    waiting.Settle();
    return true;
}

// ---- Answers

bool SessionCache::Find(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, ZVString& text,
                        Stamp& stamp)
{
    if (!MayUse(kind)) return false;
    CacheWriter::Answer waiting;
    const bool waits = m_Session.m_Writer && m_Session.m_Writer->Find(kind, table, key, waiting);
    bool found = false;
    m_Cache->Look([&] {
        found = waits && waiting.stamp.Holds(kind, m_Cache->Generation());
        if (found) {
            text = waiting.text;
        } else {
            found =
                kind == kUserData ? m_Cache->ReadUserData(table, key, text) : m_Cache->ReadMetaData(table, key, text);
        }
        found = found && !text.empty();
        if (!found) stamp = Now();
        return true;
    });
    return found;
}

void SessionCache::Keep(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, const ZVString& text,
                        const Stamp& stamp)
{
    if (!m_Session.Caches(kind) || stamp.stored == 0) return;
    CacheWriter::Answer answer;
    answer.kind = kind;
    answer.table = table;
    answer.key = key;
    answer.text = text;
    answer.stamp = stamp;
    if (m_Session.m_Writer) {
        m_Session.m_Writer->Add(answer);
    } else {
        Together([&] { return stamp.Holds(kind, m_Cache->Generation()) && answer.Write(*m_Cache); });
    }
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
    if (!m_Session.Caches(kUserData) || stamp.stored == 0) return;
    Together(
        [&] { return stamp.Holds(kUserData, m_Cache->Generation()) && m_Cache->WriteWishlistFlags(titleIDs, flags); });
}

// ---- Changes

void SessionCache::UserDataChanged(const char* table, const std::function<bool(CacheInterface&)>& more)
{
    uint64_t generation = 0;  // raised once, after what waits from before it was written
    const auto raise = [&] {
        if (generation == 0) generation = m_Account.RaiseGeneration();
    };
    const bool purged = m_Session.Caches(kUserData) && Together([&] {
                            raise();
                            return m_Cache->PurgeUserData(table) && (!more || more(*m_Cache));
                        });
    raise();
    if (purged) m_Account.Purged(generation);
}

void SessionCache::AccountChanged(const ZVString& token)
{
    const uint64_t generation = m_Account.ChangeToken(token);
    if (m_Session.Caches(kUserData) && Together([&] { return m_Cache->PurgeUserData(""); }))
        m_Account.PurgedAll(generation);
}

void SessionCache::Refresh(const ZVString& loadTime, bool images, bool userData)
{
    const uint64_t generation = userData ? m_Account.RaiseGeneration() : 0;
    const bool done = Together([&] {
        return (loadTime.empty() || m_Cache->UpdateLastCacheLoadTime(loadTime)) &&
               (!images || m_Cache->SetBoxArtNeedUpdate()) && (!userData || m_Cache->PurgeUserData(""));
    });
    if (done && userData) m_Account.PurgedAll(generation);
}
