// A session's way to its cache for everything that is the service's answer: what keeps it from showing what a change
// has made stale, or what belongs to another customer.
//
// An answer is kept only if nothing has been dropped since before its request was sent: a Stamp taken then says so.
// What could not be dropped because the database failed is not shown, and dropped when it can be. A cache that fails is
// a miss and never fails a call. Memory exhaustion is thrown (std::bad_alloc).
//
// What is kept waits to be written together with others (CacheWriter.h) and is there meanwhile. A change writes it
// first, in the same step.
//
// A view of the session on its thread; cheap to make.
#pragma once

#include <functional>

#include "SessionImpl.h"

class SessionCache {
public:
    using Stamp = CacheWriter::Stamp;

    explicit SessionCache(SessionImpl& session);

    /// An answer by the call's name and the key of its arguments. When there is none, `stamp` is that of now.
    bool Find(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, ZVString& text, Stamp& stamp);
    /// Keeps an answer to a request that was sent after the stamp was made.
    void Keep(ZV_WS_CacheParam::CacheData kind, const char* table, const ZVString& key, const ZVString& text,
              const Stamp& stamp);

    /// Whether titles are in the wish list; false when it is not known of all of them. `stamp` as above.
    bool FindFlags(const int* titleIDs, unsigned int count, bool* flags, Stamp& stamp);
    void KeepFlags(const ZVWS_IntVector& titleIDs, const ZVWS_BoolVector& flags, const Stamp& stamp);

    /// The service has changed the user's data: drops what is cached under that name, and does `more` with the cache in
    /// the same step.
    void UserDataChanged(const char* table, const std::function<bool(CacheInterface&)>& more = nullptr);

    /// The session and its duplicates belong to another customer from now on, or to none. Drops everything of the user.
    void AccountChanged(const ZVString& token);

    /// Drops the answers when the catalogue is of another time (empty: not known), marks all images for revalidation,
    /// drops everything of the user.
    void Refresh(const ZVString& loadTime, bool images, bool userData);

    Stamp Now();

private:
    bool MayUse(ZV_WS_CacheParam::CacheData kind);
    /// Writes what waits, and does `work` with it.
    bool Together(const std::function<bool()>& work);

    SessionImpl& m_Session;
    CacheInterface* const m_Cache;
    Account& m_Account;
};
