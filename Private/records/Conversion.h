// From the services' records to the library's, each function named after both.
//
// The first argument is borrowed and must not be null, the second is a tagged, empty record. What the service left out
// becomes 0, false, null or an empty array. Memory exhaustion is thrown (std::bad_alloc) and leaves a record that can
// be released.
#pragma once

#include "ZVWSLib.h"
#include "soapStub.h"

namespace ZVUtilities {

// Declares ZV1__From2ZV_WS_To, and Convert, which is all of them under one name.
#define ZV_CONVERSION(From, To)                                          \
    void ZV1__##From##2ZV_WS_##To(const ZV1__##From* t, ZV_WS_##To& to); \
    inline void Convert(const ZV1__##From* t, ZV_WS_##To& to)            \
    {                                                                    \
        ZV1__##From##2ZV_WS_##To(t, to);                                 \
    }

ZV_CONVERSION(StandardResponse, StandardResponse)
ZV_CONVERSION(WishListActionResponse, StandardResponse)

ZV_CONVERSION(Genre, Genre)
ZV_CONVERSION(GenreRequest, GenreArray)
ZV_CONVERSION(GetGenreLabelResponse, GenreLabelResponse)
ZV_CONVERSION(BonusAsset, BonusAsset)
ZV_CONVERSION(AudioFile, AudioFile)
ZV_CONVERSION(ProductListing, ProductListing)
ZV_CONVERSION(TitleListing, TitleListing)
ZV_CONVERSION(ArrayOfTitleListing, TitleListingArray)
ZV_CONVERSION(TitleListingResponse, TitleListingResponse)
ZV_CONVERSION(ArrayOfTitleListingResponse, TitleListingResponseArray)
ZV_CONVERSION(GetTitlesResponse, TitlesResponse)
ZV_CONVERSION(ArrayOfGetTitlesResponse, TitlesResponseArray)
ZV_CONVERSION(TvEpisode, TvEpisode)
ZV_CONVERSION(TvEpisodeList, TvEpisodeListResponse)
ZV_CONVERSION(TranslateSkuIdResponse, TranslateSkuIDResponse)
using ZV1__TranslateTivoExternalIDResponse = ZV1__TranslatedTivoExternalIdResponse;
ZV_CONVERSION(TranslateTivoExternalIDResponse, TranslateTivoExternalIDResponse)
ZV_CONVERSION(RecommendedTitlesResponse, RecommendedTitlesResponse)

ZV_CONVERSION(FileType, FileType)
ZV_CONVERSION(AuthorizeDeviceResponse, AuthorizeDeviceResponse)
ZV_CONVERSION(ConfigurationItemOfString, ConfigurationItem)
ZV_CONVERSION(GetConfigResponse, ConfigResponse)
ZV_CONVERSION(SettingsPageInfo, SettingsPageInfoResponse)

ZV_CONVERSION(TitleListingPurchased, TitleListingPurchased)
ZV_CONVERSION(ArrayOfTitleListingPurchased, TitleListingPurchasedArray)
ZV_CONVERSION(ArrayOfTitleListingPurchasedForPass, TitleListingPurchasedArray)
ZV_CONVERSION(GetMyVideosResponse, MyVideosResponse)
ZV_CONVERSION(GetWishlistItemsResponse, WishlistItemsResponse)
ZV_CONVERSION(CheckRentalExpirationResponse, RentalExpirationResponse)
ZV_CONVERSION(CheckAdultVerificationEnabledResponse, CheckAdultVerificationEnabledResponse)
ZV_CONVERSION(CheckAdultVerificationPinResponse, CheckAdultVerificationPinResponse)
ZV_CONVERSION(GetEmailAddressResponse, EmailAddressResponse)
ZV_CONVERSION(BillingInfoResponse, BillingInfoResponse)
ZV_CONVERSION(PPCardBalanceResponse, PPCardBalanceResponse)
ZV_CONVERSION(BillingInfoAndPPCBalanceResponse, BillingInfoAndPPCBalanceResponse)
ZV_CONVERSION(GiftCertificateResponse, GiftCertificateResponse)
ZV_CONVERSION(PurchaseResponse, PurchaseResponse)
ZV_CONVERSION(CalcOrderTaxResponse, CalcOrderTaxResponse)

ZV_CONVERSION(GetStreamingAssetLocationResponse, StreamingAssetLocationResponse)
ZV_CONVERSION(THXMediaDirectorResponse, THXMediaDirectorResponse)

#undef ZV_CONVERSION

/// A flag that came as XML of any content (null: none came, which is false). False when it says neither yes nor no.
bool ReadFlag(const char* xml, bool& flag);

/// Answers that are a bare number, flag or enumeration.
inline void Convert(const bool* t, bool& to)
{
    to = *t;
}
inline void Convert(const int* t, int& to)
{
    to = *t;
}
inline void Convert(const ZV1__AudioProfile* t, ZV_WS_AudioProfile& to)
{
    to = static_cast<ZV_WS_AudioProfile>(*t);
}

}  // namespace ZVUtilities
