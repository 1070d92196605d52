// The operations the library calls: which service carries each, and whether it must reach the service once at most,
// because it changes something there.
//
// Operation::X has the generated request and response of operation X, sends it, and finds the result in its answer. A
// row's name is the operation's name on the wire. Operation::Of, which is only declared, has the operation of a
// request.
#pragma once

#include "Services.h"

#define ZV_OPERATION(service, name, once)                                                     \
    struct name {                                                                             \
        using Request = _ZV1__##name;                                                         \
        using Response = _ZV1__##name##Response;                                              \
        static constexpr char kName[] = #name;                                                \
        static constexpr bool kOnce = once;                                                   \
        static auto& Service(Services& services) { return services.service; }                 \
        static int Send(Services& services, Request& request, Response& response)             \
        {                                                                                     \
            return services.service.name(&request, &response);                                \
        }                                                                                     \
        static const auto* Result(const Response& response) { return response.name##Result; } \
    };                                                                                        \
    name Of(const _ZV1__##name*);

namespace Operation {

// clang-format off
//           service     operation                              once
ZV_OPERATION(m_Browse,   getFileType,                           false)
ZV_OPERATION(m_Browse,   getNavigation,                         false)
ZV_OPERATION(m_Browse,   getGenreLabel,                         false)
ZV_OPERATION(m_Browse,   getTitlesByNavigation,                 false)
ZV_OPERATION(m_Browse,   getTitlesByGenreArray,                 false)
ZV_OPERATION(m_Browse,   getTitleListing,                       false)
ZV_OPERATION(m_Browse,   getTvEpisodeListing,                   false)
ZV_OPERATION(m_Browse,   getTvEpisodeListByTitleID,             false)
ZV_OPERATION(m_Browse,   getAllTvEpisodeListings,               false)
ZV_OPERATION(m_Browse,   translateSkuId,                        false)
ZV_OPERATION(m_Browse,   translateTivoExternalId,               false)
ZV_OPERATION(m_Browse,   searchForTitle,                        false)
ZV_OPERATION(m_Browse,   searchForTitleDetail,                  false)
ZV_OPERATION(m_Browse,   getRecommendedTitles,                  false)
ZV_OPERATION(m_Browse,   shouldUpdateCache,                     false)
ZV_OPERATION(m_Browse,   getLastCacheLoadTimeUTC,               false)

ZV_OPERATION(m_Facade,   authorizeDevice,                       true)
ZV_OPERATION(m_Facade,   deactivateDevice,                      true)
ZV_OPERATION(m_Facade,   checkAuthToken,                        false)
ZV_OPERATION(m_Facade,   getConfig,                             false)
ZV_OPERATION(m_Facade,   getSettingsPageInfo,                   false)
ZV_OPERATION(m_Facade,   GetCountryID,                          false)
ZV_OPERATION(m_Facade,   getEmailAddress,                       false)
ZV_OPERATION(m_Facade,   getBillingInfo,                        false)
ZV_OPERATION(m_Facade,   showPrePaidCardBalance,                false)
ZV_OPERATION(m_Facade,   assignGiftCertificateToUser,           true)
ZV_OPERATION(m_Facade,   doPurchaseSavedbilling,                true)
ZV_OPERATION(m_Facade,   checkRentalExpiration,                 false)
ZV_OPERATION(m_Facade,   getWishlistItems,                      false)
ZV_OPERATION(m_Facade,   addItemToWishlist,                     true)
ZV_OPERATION(m_Facade,   removeItemFromWishList,                true)
ZV_OPERATION(m_Facade,   removeAllItemsFromWishList,            true)
ZV_OPERATION(m_Facade,   checkAdultVerificationEnabled,         false)
ZV_OPERATION(m_Facade,   checkAdultVerificationPin,             true)   // wrong PINs may be counted

ZV_OPERATION(m_Download, getMyVideos,                           false)
ZV_OPERATION(m_Download, checkForPurchasedTitle,                false)

ZV_OPERATION(m_Stream,   getMyStreamingVideos,                  false)
ZV_OPERATION(m_Stream,   getTitleListingsPurchasedForPasses,    false)
ZV_OPERATION(m_Stream,   checkForPurchasedStream,               false)
ZV_OPERATION(m_Stream,   checkForPurchasedStreamByTitleID,      false)
ZV_OPERATION(m_Stream,   removeAllMyPurchases,                  true)
ZV_OPERATION(m_Stream,   getBillingInfoAndPPCBalance,           false)
ZV_OPERATION(m_Stream,   calcOrderTax,                          false)
ZV_OPERATION(m_Stream,   setAudioDefaultProperty,               true)
ZV_OPERATION(m_Stream,   getAudioDefaultProperty,               false)
ZV_OPERATION(m_Stream,   getStreamingAssetLocation,             true)
ZV_OPERATION(m_Stream,   getBonusAssetLocation,                 true)
ZV_OPERATION(m_Stream,   loadLastStreamingAssetLocationForPass, true)
ZV_OPERATION(m_Stream,   manageStreamInstanceStatus,            true)
ZV_OPERATION(m_Stream,   getTHXMediaDirector,                   false)
ZV_OPERATION(m_Stream,   getTHXMediaDirectorBonusAsset,         false)
ZV_OPERATION(m_Stream,   ReturnTimeout,                         true)
ZV_OPERATION(m_Stream,   ReturnError,                           true)
// clang-format on

}  // namespace Operation

#undef ZV_OPERATION
