// What a session handle points to. Used by one thread at a time, but for its settings, which any thread may read once
// the session is set up.
#pragma once

#include <memory>

#include "CacheInterface.h"
#include "CacheWriter.h"
#include "Services.h"
#include "SetupParams2.h"
#include "ZVMutex.h"

struct SessionImpl : Services {
    static constexpr unsigned int kTag = 1;

    ZV_WS_SetupParams2 m_Params;
    std::unique_ptr<CacheInterface> m_Cache;  ///< Null when nothing is cached.
    /// Writes for all sessions on the file of the cache; null without a file.
    std::shared_ptr<CacheWriter> m_Writer;
    bool m_IsSetUp = false;  ///< Else no service can be asked.

    /// Whether there is a cache for that kind of data.
    bool Caches(ZV_WS_CacheParam::CacheData kind) const { return m_Cache && (m_Params.CacheData & kind) != 0; }
};

/// Held while a handle gets or loses its session, and while ZV_WS_abort, which may come from another thread, uses one.
ZVMutex& HandleMutex();

/// Ends the session behind a handle, if there is one. `handle` is a ZV_WS_Session.
void ReleaseSession(ZV_WS_Object* handle);

/// The session behind a handle; null when there is none, or one whose set-up has failed. For the thread that uses the
/// handle.
inline SessionImpl* SessionOf(const ZV_WS_Session* handle)
{
    SessionImpl* session = handle ? handle->_pSessionImpl : nullptr;
    return session && session->m_IsSetUp ? session : nullptr;
}
