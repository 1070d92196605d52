// Refreshing and clearing the local cache.
#include "CacheMgr.h"
#include "ServiceCall.h"
#include "ZVFile.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

namespace {

// Drops the catalogue's answers when the service has loaded a new catalogue.
void RefreshMetadata(ZV_WS_Session* handle, CacheInterface& cache)
{
    ZV_WS_String time;
    if (ZV_WS_getLastCacheLoadTimeUTC(handle, &time) == ZV_WS_Status_ok && time.data) {
        cache.UpdateLastCacheLoadTime(time.data);
    }
    ZV_WS_release(&time);
}

}  // namespace

ZV_WS_Status ZV_WS_shouldUpdateCache(ZV_WS_Session* handle, const char* utcTime, bool* should)
{
    ServiceCall<Operation::shouldUpdateCache> call(__func__, handle, should);
    if (!call.Accepts(utcTime && *utcTime)) return call.Refusal();
    call->UTCTime = Text(utcTime);
    const ZV_WS_Status status = call.Into([&](const int* answer) { *should = *answer == 1; });
    return LogAnswer(__func__, status, *should);
}

ZV_WS_Status ZV_WS_getLastCacheLoadTimeUTC(ZV_WS_Session* handle, ZV_WS_String* utcTime)
{
    ServiceCall<Operation::getLastCacheLoadTimeUTC> call(__func__, handle, utcTime);
    if (!call.Accepts()) return call.Refusal();
    const ZV_WS_Status status = call.Into([&](const char* text) { ZVUtilities::SetText(*utcTime, text); });
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "%s, ret:%d,utctime:%s\n", __func__, status,
                 utcTime->data ? utcTime->data : "");
    return status;
}

ZV_WS_Status ZV_WS_updateLocalCache(ZV_WS_Session* handle, unsigned int operations)
{
    if (!SessionOf(handle)) return ZV_WS_Status_invalid_param;
    const SessionImpl& session = *handle->_pSessionImpl;
    const auto wanted = [&](ZV_WS_CacheParam::CacheData kind) {
        return (operations & kind) != 0 && session.Caches(kind);
    };
    return GuardCall([&] {
        if (wanted(ZV_WS_CacheParam::CacheData_Metadata)) RefreshMetadata(handle, *session.m_Cache);
        if (wanted(ZV_WS_CacheParam::CacheData_BoxArtImage)) session.m_Cache->SetBoxArtNeedUpdate();
        if (wanted(ZV_WS_CacheParam::CacheData_Userdata)) session.m_Cache->PurgeUserData("");
        return ZV_WS_Status_ok;
    });
}

ZV_WS_Status ZV_WS_clearLocalCache(const char* folder)
{
    if (!folder || !*folder) return ZV_WS_Status_invalid_param;
    return GuardCall([&] {
        ZVString path = folder;
        if (path[path.length() - 1] != ZVFile::PATH_SEPERATOR) path += "/";
        CacheMgr::CountDrop();
        for (const char* pattern : {"*.jpg", "*.zv", "zvws*"}) {
            if (!ZVFile::RemoveWithWildcard((path + pattern).c_str())) return ZV_WS_Status_file_operation_error;
        }
        return ZV_WS_Status_ok;
    });
}
