// The device at the service: what it may play, its activation and its settings.
#include "ServiceCall.h"

ZV_WS_Status ZV_WS_getFileType(ZV_WS_Session* handle, ZV_WS_FileType* fileType)
{
    return Ask<Operation::getFileType>(__func__, handle, fileType);
}

ZV_WS_Status ZV_WS_authorizeDevice(ZV_WS_Session* handle, const char* pin, ZV_WS_AuthorizeDeviceResponse* answer)
{
    ServiceCall<Operation::authorizeDevice> call(__func__, handle, answer);
    if (!call.Accepts(pin && *pin)) return call.Refusal();
    call->PIN = Text(pin);
    const ZV_WS_Status status = call.Into(answer);
    if (status != ZV_WS_Status_ok || !answer->AuthToken) return status;
    return GuardCall([&] {
        call.session().m_Params.AuthToken = answer->AuthToken;
        return status;
    });
}

ZV_WS_Status ZV_WS_deactivateDevice(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer)
{
    return Ask<Operation::deactivateDevice>(__func__, handle, answer);
}

ZV_WS_Status ZV_WS_checkAuthToken(ZV_WS_Session* handle, bool* isValid)
{
    ServiceCall<Operation::checkAuthToken> call(__func__, handle, isValid);
    if (!call.Accepts()) return call.Refusal();
    call->AuthToken = Text(call.session().m_Params.AuthToken.c_str());
    return LogAnswer(__func__, call.Into(isValid), *isValid);
}

ZV_WS_Status ZV_WS_getConfig(ZV_WS_Session* handle, ZV_WS_ConfigResponse* config)
{
    return Ask<Operation::getConfig>(__func__, handle, config);
}

ZV_WS_Status ZV_WS_getSettingsPageInfo(ZV_WS_Session* handle, ZV_WS_SettingsPageInfoResponse* info)
{
    return Ask<Operation::getSettingsPageInfo>(__func__, handle, info, ZV_WS_CacheParam::CacheData_Userdata,
                                               "getSettingsPageInfo");
}

ZV_WS_Status ZV_WS_getCountryID(ZV_WS_Session* handle, int* countryID)
{
    return Ask<Operation::GetCountryID>(__func__, handle, countryID);
}

ZV_WS_Status ZV_WS_setAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile profile,
                                           ZV_WS_StandardResponse* answer)
{
    ServiceCall<Operation::setAudioDefaultProperty> call(__func__, handle, answer);
    if (!call.Accepts()) return call.Refusal();
    SetEnum(call->AudioSetting, profile);
    return call.Into(answer);
}

ZV_WS_Status ZV_WS_getAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile* profile)
{
    return Ask<Operation::getAudioDefaultProperty>(__func__, handle, profile);
}
