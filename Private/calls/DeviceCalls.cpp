// The device at the service: what it may play, its activation and its settings.
#include "ServiceCall.h"

namespace {

// The session and its duplicates are another customer's from now on, or nobody's.
ZV_WS_Status ChangeAccount(SessionImpl& session, const char* token)
{
    return GuardCall([&] {
        SessionCache(session).AccountChanged(token);
        return ZV_WS_Status_ok;
    });
}

}  // namespace

ZV_WS_Status ZV_WS_getFileType(ZV_WS_Session* handle, ZV_WS_FileType* fileType)
{
    return Ask<Operation::getFileType>(__func__, handle, fileType);
}

ZV_WS_Status ZV_WS_authorizeDevice(ZV_WS_Session* handle, const char* pin, ZV_WS_AuthorizeDeviceResponse* answer)
{
    ServiceCall<Operation::authorizeDevice> call(__func__, handle, answer);
    if (!call.Accepts(pin && *pin)) return call.Refusal();
    call.SetText(call->PIN, pin);
    const ZV_WS_Status status = call.Into(answer);
    if (status != ZV_WS_Status_ok) return status;
    return ChangeAccount(call.session(), answer->AuthToken ? answer->AuthToken : "");
}

ZV_WS_Status ZV_WS_deactivateDevice(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer)
{
    const ZV_WS_Status status = Ask<Operation::deactivateDevice>(__func__, handle, answer);
    return status == ZV_WS_Status_ok ? ChangeAccount(*handle->_pSessionImpl, "") : status;
}

ZV_WS_Status ZV_WS_checkAuthToken(ZV_WS_Session* handle, bool* isValid)
{
    ServiceCall<Operation::checkAuthToken> call(__func__, handle, isValid);
    if (!call.Accepts()) return call.Refusal();
    ZVString token;
    if (!WithinMemory([&] { token = call.session().m_Params.Customer->Token(); })) return ZV_WS_Status_general_error;
    call.SetText(call->AuthToken, token.c_str());
    return LogAnswer(__func__, call.Into(isValid), *isValid);
}

ZV_WS_Status ZV_WS_getConfig(ZV_WS_Session* handle, ZV_WS_ConfigResponse* config)
{
    return Ask<Operation::getConfig>(__func__, handle, config);
}

ZV_WS_Status ZV_WS_getSettingsPageInfo(ZV_WS_Session* handle, ZV_WS_SettingsPageInfoResponse* info)
{
    return Ask<Operation::getSettingsPageInfo>(__func__, handle, info, ZV_WS_CacheParam::CacheData_Userdata);
}

ZV_WS_Status ZV_WS_getCountryID(ZV_WS_Session* handle, int* countryID)
{
    return Ask<Operation::GetCountryID>(__func__, handle, countryID);
}

ZV_WS_Status ZV_WS_setAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile profile,
                                           ZV_WS_StandardResponse* answer)
{
    ServiceCall<Operation::setAudioDefaultProperty> call(__func__, handle, answer);
    call.SetEnum(call->AudioSetting, profile);
    return call.Into(answer);
}

ZV_WS_Status ZV_WS_getAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile* profile)
{
    return Ask<Operation::getAudioDefaultProperty>(__func__, handle, profile);
}
