// A call's way to the session's cache: service answers as compressed text, under the call's name and a key of its
// arguments. A cache that fails, or finds no memory, is a miss and never fails a call.
#pragma once

#include <memory>
#include <string>
#include <type_traits>

#include "CallGuard.h"
#include "Serializer.h"
#include "SessionImpl.h"

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

    AnswerCache(SessionImpl& session, const Entry& entry) : m_Session(session), m_Entry(entry) {}

    /// Fills the response from the cache. What it points to lives as long as this object.
    template <class Response>
    bool Find(Response& response)
    {
        bool found = false;
        WithinMemory([&] {
            ZVString text;
            if (!Read(text)) return;
            m_Serializer = std::make_unique<Serializer>(true, false);
            found = m_Serializer->Read(text, response);
        });
        return found;
    }

    template <class Response>
    void Store(const Response& response)
    {
        if (!m_Entry.table || !m_Session.Caches(m_Entry.kind)) return;
        WithinMemory([&] {
            ZVString text;
            if (Serializer(true, false).Write(response, text)) Write(text);
        });
    }

private:
    bool Read(ZVString& text);
    void Write(const ZVString& text);

    SessionImpl& m_Session;
    const Entry& m_Entry;
    std::unique_ptr<Serializer> m_Serializer;
};
