// The stream service: playback, and the account operations for streaming devices.
#pragma once

#include "ServiceWrapper.h"
#include "soapStreamAPISoap12Proxy.h"

class StreamAPI final : public ServiceWrapper<StreamAPISoap12Proxy, ZV1__StreamDeviceRequestSettings,
                                              &SOAP_ENV__Header::ZV1__StreamDeviceRequestSettings_> {
public:
    StreamAPI() : ServiceWrapper("StreamAPISoap12Proxy", "StreamAPI.asmx") {}
};
