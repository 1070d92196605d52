// A call's way to the session's cache: service answers as compressed text, under the call's name and a key of its
// arguments. A cache that fails, or finds no memory, is a miss and never fails a call.
#pragma once

#include <memory>
#include <string>
#include <type_traits>

#include "CallGuard.h"
#include "Serializer.h"
#include "SessionCache.h"

class AnswerCache {
public:
    /// Where an answer is kept.
    struct Entry {
        ZV_WS_CacheParam::CacheData kind = {};
        const char* table = nullptr;  ///< Null: the answer is not cached.
        ZVString key;

        Entry() = default;
        template <class... Arguments>
        Entry(ZV_WS_CacheParam::CacheData kind, const char* table, const Arguments&... arguments)
            : kind(kind), table(table)
        {
            (Append(arguments), ...);
        }

    private:
        template <class Argument>
        void Append(const Argument& argument)
        {
            if (!key.empty()) key += ",";
            if constexpr (std::is_same_v<Argument, const char*>) {
                key += argument ? argument : "";
            } else {
                key += std::to_string(static_cast<int>(argument)).c_str();
            }
        }
    };

    AnswerCache(SessionImpl& session, const Entry& entry) : m_Session(session), m_Cache(session), m_Entry(entry) {}

    /// Fills the response from the cache. What it points to lives as long as this object. When there is none, or none
    /// for which `isWhole(response)`, the request is to be sent after this.
    template <class Response, class IsWhole>
    bool Find(Response& response, IsWhole isWhole)
    {
        bool found = false;
        WithinMemory([&] {
            ZVString text;
            if (!m_Entry.table || !m_Cache.Find(m_Entry.kind, m_Entry.table, m_Entry.key, text, m_Stamp)) return;
            m_Serializer = std::make_unique<Serializer>(true, false);
            found = m_Serializer->Read(text, response) && isWhole(response);
            if (!found) m_Stamp = m_Cache.Now();
        });
        return found;
    }

    template <class Response>
    void Store(const Response& response)
    {
        if (!m_Entry.table || !m_Session.Caches(m_Entry.kind)) return;
        WithinMemory([&] {
            ZVString text;
            if (Serializer(true, false).Write(response, text))
                m_Cache.Keep(m_Entry.kind, m_Entry.table, m_Entry.key, text, m_Stamp);
        });
    }

private:
    const SessionImpl& m_Session;
    SessionCache m_Cache;
    const Entry& m_Entry;
    SessionCache::Stamp m_Stamp;
    std::unique_ptr<Serializer> m_Serializer;
};
