// The media player's script class as the host registers it. Its handlers are the player library's.
#include "player/ZVPlayerLibAE.h"

const char* ZVPlayerLibAE::GetClassName()
{
    return "com.orvex.ZVPlayerLibAE";
}

bool ZVPlayerLibAE::FiresEvents()
{
    return false;
}

void ZVPlayerLibAE::GetMethods(AEArray<Method>& methodArrayToFill)
{
    const auto add = [&](const char* name, auto handler) {
        methodArrayToFill.InsertAt(methodArrayToFill.size(), MakeMethod(name, Method::kMemberFunction, handler));
    };
#define ZV_METHOD(name) add(#name, &ZVPlayerLibAE::name)
    ZV_METHOD(Initialize);
    ZV_METHOD(Shutdown);
    ZV_METHOD(GetVersion);
    ZV_METHOD(CreatePlayer);
    ZV_METHOD(ReleasePlayer);
    ZV_METHOD(Play);
    ZV_METHOD(Pause);
    ZV_METHOD(Stop);
    ZV_METHOD(GetPlaybackTime);
    ZV_METHOD(GetPlaybackState);
    ZV_METHOD(GetDuration);
    ZV_METHOD(GetCurrentBandwidth);
    ZV_METHOD(RegisterEventHandler);
    ZV_METHOD(THX_ProcessContentDescriptors);
    ZV_METHOD(THX_IsSupportedOnDevice);
    ZV_METHOD(getSupported3DFormats);
    ZV_METHOD(getConfigured3DFormat);
    ZV_METHOD(set3DMode);
    ZV_METHOD(SetLogAreaIDsConfig);
#undef ZV_METHOD
}
