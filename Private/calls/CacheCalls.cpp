// Refreshing and clearing the local cache.
#include "CacheMgr.h"
#include "ServiceCall.h"
#include "ZVFile.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

namespace {

// When the service loaded its catalogue last; empty when it does not say.
ZVString LoadTime(ZV_WS_Session* handle)
{
    ZV_WS_String time;
    const ZV_WS_Status status = ZV_WS_getLastCacheLoadTimeUTC(handle, &time);
    ZVString text;
    WithinMemory([&] { text = status == ZV_WS_Status_ok && time.data ? time.data : ""; });
    ZV_WS_release(&time);
    return text;
}

}  // namespace

ZV_WS_Status ZV_WS_shouldUpdateCache(ZV_WS_Session* handle, const char* utcTime, bool* should)
{
    ServiceCall<Operation::shouldUpdateCache> call(__func__, handle, should);
    if (!call.Accepts(utcTime && *utcTime)) return call.Refusal();
    call.SetText(call->UTCTime, utcTime);
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
    SessionImpl& session = *handle->_pSessionImpl;
    const auto wanted = [&](ZV_WS_CacheParam::CacheData kind) {
        return (operations & kind) != 0 && session.Caches(kind);
    };
    const bool metadata = wanted(ZV_WS_CacheParam::CacheData_Metadata);
    const bool images = wanted(ZV_WS_CacheParam::CacheData_BoxArtImage);
    const bool userData = wanted(ZV_WS_CacheParam::CacheData_Userdata);
    if (!metadata && !images && !userData) return ZV_WS_Status_ok;
    return GuardCall([&] {
        SessionCache(session).Refresh(metadata ? LoadTime(handle) : ZVString(), images, userData);
        return ZV_WS_Status_ok;
    });
}

ZV_WS_Status ZV_WS_clearLocalCache(const char* folder)
{
    if (!folder || !*folder) return ZV_WS_Status_invalid_param;
    return GuardCall([&] {
        ZVString path = folder;
        if (path[path.length() - 1] != ZVFile::PATH_SEPERATOR) path += "/";
        bool removed = true;
        for (const char* pattern : {"*.jpg", "*.zv", "zvws*"})
            removed = removed && ZVFile::RemoveWithWildcard((path + pattern).c_str());
        CacheMgr::CountDrop();
        return removed ? ZV_WS_Status_ok : ZV_WS_Status_file_operation_error;
    });
}
