// The browse service: the catalogue.
#pragma once

#include "ServiceWrapper.h"
#include "soapRealTimeBrowseSoap12Proxy.h"

class RealTimeBrowse final
    : public ServiceWrapper<RealTimeBrowseSoap12Proxy, ZV1__DeviceSettings, &SOAP_ENV__Header::ZV1__DeviceSettings_> {
public:
    RealTimeBrowse() : ServiceWrapper("RealTimeBrowseSoap12Proxy", "RealTimeBrowse.asmx") {}
};
