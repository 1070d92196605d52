// A session's own copy of its settings, which stay as they are once it is set up, and what it shares with its
// duplicates.
#pragma once

#include <memory>

#include "Account.h"
#include "ZVString.h"
#include "ZVWSLib.h"

struct ZV_WS_SetupParams2 {
    ZVString APIKey;
    /// Shared by a session and its duplicates: the authorisation token, the bandwidth address.
    std::shared_ptr<Account> Customer = std::make_shared<Account>();
    ZVString DestinationUniqueID;
    int DestinationTypeID = 0;
    ZVString UserName;
    ZVString Password;
    ZVString ServiceBaseURL;  ///< From discovery, never from the caller.
    ZV_WS_EnvID EnvID = ENVID_APISTG;
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
