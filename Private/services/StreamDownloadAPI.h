// The account operations that both services offer, sent to the one that fits the device.
#pragma once

#include "DownloadAPI.h"
#include "StreamAPI.h"

class StreamDownloadAPI {
    // Calls `action` with the wrapper that serves the device.
    template <class Action>
    decltype(auto) Chosen(Action action)
    {
        ZV_ASSERT(m_StreamAPI != 0);
        ZV_ASSERT(m_DownloadAPI != 0);
        return m_AccessType == ACCESS_TYPE_DOWNLOAD ? action(*m_DownloadAPI) : action(*m_StreamAPI);
    }

public:
    /// Both wrappers are borrowed. Devices that download use the download service, all others (also of unknown kind)
    /// the stream service.
    void Init(StreamAPI* stream, DownloadAPI* download, ZV_WS_AccessType accessType)
    {
        ZV_ASSERT(stream != 0);
        ZV_ASSERT(download != 0);
        m_StreamAPI = stream;
        m_DownloadAPI = download;
        m_AccessType = accessType;
    }

    void SetParams(const ZV_WS_SetupParams2* params)
    {
        Chosen([&](auto& service) { service.SetParams(params); });
    }
    int Setup(const ZVString& operation)
    {
        return Chosen([&](auto& service) { return service.Setup(operation); });
    }

    /// The context that carried the last request.
    operator soap&()
    {
        return Chosen([](soap& service) -> soap& { return service; });
    }
    Transport& transport() { return Transport::Of(&static_cast<soap&>(*this)); }
    const char* ProxyName()
    {
        return Chosen([](auto& service) { return service.ProxyName(); });
    }

#define ZV_FORWARD(operation)                                                               \
    int operation(_ZV1__##operation* request, _ZV1__##operation##Response* response)        \
    {                                                                                       \
        return Chosen([&](auto& service) { return service.operation(request, response); }); \
    }
    ZV_FORWARD(authorizeDevice)
    ZV_FORWARD(deactivateDevice)
    ZV_FORWARD(doPurchaseSavedbilling)
    ZV_FORWARD(getEmailAddress)
    ZV_FORWARD(getSettingsPageInfo)
    ZV_FORWARD(getBillingInfo)
    ZV_FORWARD(getConfig)
    ZV_FORWARD(addItemToWishlist)
    ZV_FORWARD(removeItemFromWishList)
    ZV_FORWARD(getWishlistItems)
    ZV_FORWARD(removeAllItemsFromWishList)
    ZV_FORWARD(checkAdultVerificationEnabled)
    ZV_FORWARD(checkAdultVerificationPin)
    ZV_FORWARD(showPrePaidCardBalance)
    ZV_FORWARD(assignGiftCertificateToUser)
    ZV_FORWARD(checkRentalExpiration)
    ZV_FORWARD(checkAuthToken)
    ZV_FORWARD(GetCountryID)
#undef ZV_FORWARD

private:
    StreamAPI* m_StreamAPI = nullptr;
    DownloadAPI* m_DownloadAPI = nullptr;
    ZV_WS_AccessType m_AccessType = ACCESS_TYPE_UNKNOWN;
};
