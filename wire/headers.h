// The device's own header block: one shape under three names, one name for each service. It follows the eight blocks of
// WS-Security and WS-Addressing, which the imports before this file put in their order.

class ZV1__StreamDeviceRequestSettings {
public:
    char* APIKey 0;
    char* DestinationUniqueID 0;
    int DestinationTypeID 1;
    char* AuthToken 0;
    @xsd__anyAttribute __anyAttribute;
};

class ZV1__DeviceSettings {
public:
    char* APIKey 0;
    char* DestinationUniqueID 0;
    int DestinationTypeID 1;
    char* AuthToken 0;
    @xsd__anyAttribute __anyAttribute;
};

class ZV1__DownloadDeviceRequestSettings {
public:
    char* APIKey 0;
    char* DestinationUniqueID 0;
    int DestinationTypeID 1;
    char* AuthToken 0;
    @xsd__anyAttribute __anyAttribute;
};

mutable struct SOAP_ENV__Header {
    mustUnderstand ZV1__StreamDeviceRequestSettings* ZV1__StreamDeviceRequestSettings_ 0;
    mustUnderstand ZV1__DeviceSettings* ZV1__DeviceSettings_ 0;
    mustUnderstand ZV1__DownloadDeviceRequestSettings* ZV1__DownloadDeviceRequestSettings_ 0;
};
