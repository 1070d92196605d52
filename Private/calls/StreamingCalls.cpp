// Playback: where a stream is, what became of it, and the calibration data that goes with it.
#include "ServiceCall.h"

namespace {

template <class Op>
ZV_WS_Status LocatePass(const char* function, ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                        ZV_WS_StreamingAssetLocationResponse* location)
{
    ServiceCall<Op> call(function, handle, location);
    call->PassID = passID;
    call.SetEnum(call->FileProfile, fileProfile);
    return call.Into(location);
}

}  // namespace

ZV_WS_Status ZV_WS_getStreamingAssetLocation(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                             ZV_WS_StreamingAssetLocationResponse* location)
{
    return LocatePass<Operation::getStreamingAssetLocation>(__func__, handle, passID, fileProfile, location);
}

ZV_WS_Status ZV_WS_loadLastStreamingAssetLocation(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                                  ZV_WS_StreamingAssetLocationResponse* location)
{
    return LocatePass<Operation::loadLastStreamingAssetLocationForPass>(__func__, handle, passID, fileProfile,
                                                                        location);
}

ZV_WS_Status ZV_WS_getStreamingBonusAssetLocation(ZV_WS_Session* handle, int bonusAssetID,
                                                  ZV_WS_StreamingAssetLocationResponse* location)
{
    return AskAbout(&_ZV1__getBonusAssetLocation::BonusAssetID, bonusAssetID, __func__, handle, location);
}

ZV_WS_Status ZV_WS_manageStreamingInstanceStatus(ZV_WS_Session* handle, const char* streamID, ZV_WS_StreamStatus status,
                                                 int stopTime, ZV_WS_StandardResponse* answer)
{
    ServiceCall<Operation::manageStreamInstanceStatus> call(__func__, handle, answer);
    if (!call.Accepts(streamID && *streamID)) return call.Refusal();
    call.SetText(call->StreamID, streamID);
    call.SetEnum(call->Status, status);
    call->StopTimeSeconds = stopTime;
    return call.Into(answer);
}

ZV_WS_Status ZV_WS_getTHXMediaDirector(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                       ZV_WS_AudioProfile audioProfile, ZV_WS_THXMediaDirectorResponse* data)
{
    ServiceCall<Operation::getTHXMediaDirector> call(__func__, handle, data);
    call.IgnoreResponseCode();
    call->PassID = passID;
    call.SetEnum(call->FileProfile, fileProfile);
    call.SetEnum(call->AudioSetting, audioProfile);
    return call.Into(data);
}

ZV_WS_Status ZV_WS_getTHXMediaDirectorBonusAsset(ZV_WS_Session* handle, int bonusAssetID, ZV_WS_FileProfile fileProfile,
                                                 ZV_WS_BonusAssetType bonusAssetType,
                                                 ZV_WS_THXMediaDirectorResponse* data)
{
    ServiceCall<Operation::getTHXMediaDirectorBonusAsset> call(__func__, handle, data);
    call.IgnoreResponseCode();
    call->BonusAssetID = bonusAssetID;
    call.SetEnum(call->FileProfile, fileProfile);
    call.SetEnum(call->BonusAssetType, bonusAssetType);
    return call.Into(data);
}

ZV_WS_Status ZV_WS_returnTimeout(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer)
{
    return Ask<Operation::ReturnTimeout>(__func__, handle, answer);
}

ZV_WS_Status ZV_WS_returnError(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer)
{
    return Ask<Operation::ReturnError>(__func__, handle, answer);
}
