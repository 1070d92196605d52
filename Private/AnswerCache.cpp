#include "AnswerCache.h"

bool AnswerCache::Read(ZVString& text)
{
    CacheInterface* cache = m_Session.m_Cache.get();
    if (!m_Entry.table || !cache) return false;
    const bool found = m_Entry.kind == ZV_WS_CacheParam::CacheData_Userdata
                           ? cache->ReadUserData(m_Entry.table, m_Entry.key, text)
                           : cache->ReadMetaData(m_Entry.table, m_Entry.key, text);
    return found && !text.empty();
}

void AnswerCache::Write(const ZVString& text)
{
    CacheInterface& cache = *m_Session.m_Cache;
    if (m_Entry.kind == ZV_WS_CacheParam::CacheData_Userdata) {
        cache.WriteUserData(m_Entry.table, m_Entry.key, text);
    } else {
        cache.WriteMetaData(m_Entry.table, m_Entry.key, text);
    }
}
