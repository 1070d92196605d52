// The download and account service.
#pragma once

#include "ServiceWrapper.h"
#include "soapDownloadAPISoap12Proxy.h"

class DownloadAPI final : public ServiceWrapper<DownloadAPISoap12Proxy, ZV1__DownloadDeviceRequestSettings,
                                                &SOAP_ENV__Header::ZV1__DownloadDeviceRequestSettings_> {
public:
    DownloadAPI() : ServiceWrapper("DownloadAPISoap12Proxy", "DownloadAPI.asmx") {}
};
