// A session's own copy of its settings.
#pragma once

#include "ZVString.h"
#include "ZVWSLib.h"

struct ZV_WS_SetupParams2 {
    ZVString APIKey;
    ZVString AuthToken;
    ZVString DestinationUniqueID;
    int DestinationTypeID = 0;
    ZVString UserName;
    ZVString Password;
    ZVString ServiceBaseURL;  ///< From discovery, never from the caller.
    ZV_WS_EnvID EnvID = ENVID_APISTG;
    ZVString BandwidthCheckURL;  ///< Empty until the first bandwidth check has learnt it.
    CacheType CacheKind = CacheType_None;
    unsigned int CacheData = 0;
    unsigned int CacheLimit = 0;
    ZVString CachePath;  ///< The database file.
    ZVString ProxyHost;
    int ProxyPort = 0;
    ZVString ProxyUserName;
    ZVString ProxyPassword;
    int SendTimeout = 30;     ///< Seconds, also to connect.
    int ReceiveTimeout = 88;  ///< Seconds.
    ZV_WS_AccessType AccessType = ACCESS_TYPE_UNKNOWN;
    ZVString ApplicationRevision;
    ZVString FirmwareRevision;
    ZVString UserAgent;
    ZVString ModelCode;
};
