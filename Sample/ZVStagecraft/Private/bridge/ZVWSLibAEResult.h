// What a worker found out, and how it becomes a script value.
//
// A Result is written by the worker, then read by the main thread; the order is kept by the flag that goes with it
// (ZVWSLibAE::ForegroundCall).
#pragma once

#include <stdint.h>

#include <type_traits>
#include <variant>

#include "ZVWSLib.h"
#include "stagecraft/ASValue.h"

enum Result_Type {
    eVoid = 0,
    eInt = 1,
    eBool = 2,
    eString = 3,
    eGenreArray = 4,
    eTitlesResponse = 5,
    eTitleListingResponse = 6,
    eAuthorizeDeviceResponse = 7,
    eMyVideosResponse = 8,
    eStandardResponse = 9,
    eRecommendedTitlesResponse = 10,
    eTranslateSkuIDResponse = 11,
    eTvEpisodeListResponse = 12,
    eTitleListingResponseArray = 13,
    eWishlistItemsResponse = 14,
    ePurchaseResponse = 15,
    eCheckAdultVerificationEnabledResponse = 16,
    eCheckAdultVerificationPinResponse = 17,
    eGiftCertificateResponse = 18,
    eRentalExpirationResponse = 19,
    eStreamingAssetLocationResponse = 20,
    eEmailAddressResponse = 21,
    eBillingInfoResponse = 22,
    ePPCardBalanceResponse = 23,
    eConfigResponse = 24,
    eSettingPageInfoResponse = 25,
    eFileType = 26,
    eTitlesInWishlist = 27,
    eOrderTaxResponse = 28,
    eTHXMediaDirectorResponse = 29,
};

/// A status and a value. Owns the record in the value; Release frees it, the destructor does not.
struct Result {
    /// The alternatives stand in the order of Result_Type. A rate in bits per second does not fit into 32 bits.
    using Value = std::variant<
        std::monostate, int64_t, bool, ZV_WS_String, ZV_WS_GenreArray, ZV_WS_TitlesResponse, ZV_WS_TitleListingResponse,
        ZV_WS_AuthorizeDeviceResponse, ZV_WS_MyVideosResponse, ZV_WS_StandardResponse, ZV_WS_RecommendedTitlesResponse,
        ZV_WS_TranslateSkuIDResponse, ZV_WS_TvEpisodeListResponse, ZV_WS_TitleListingResponseArray,
        ZV_WS_WishlistItemsResponse, ZV_WS_PurchaseResponse, ZV_WS_CheckAdultVerificationEnabledResponse,
        ZV_WS_CheckAdultVerificationPinResponse, ZV_WS_GiftCertificateResponse, ZV_WS_RentalExpirationResponse,
        ZV_WS_StreamingAssetLocationResponse, ZV_WS_EmailAddressResponse, ZV_WS_BillingInfoResponse,
        ZV_WS_PPCardBalanceResponse, ZV_WS_ConfigResponse, ZV_WS_SettingsPageInfoResponse, ZV_WS_FileType,
        ZV_WS_TitlesInWishlist, ZV_WS_CalcOrderTaxResponse, ZV_WS_THXMediaDirectorResponse>;

    Result_Type type() const { return static_cast<Result_Type>(value.index()); }

    /// Takes over a record; the one before must have been released.
    template <class Output>
    void Set(const Output& output, ZV_WS_Status status)
    {
        if constexpr (!std::is_same_v<Output, bool> && !std::is_class_v<Output>) {
            value = static_cast<int64_t>(output);
        } else {
            value = output;
        }
        retCode = status;
    }

    void Release();

    Value value;
    ZV_WS_Status retCode = ZV_WS_Status_ok;
};

static_assert(std::variant_size_v<Result::Value> == eTHXMediaDirectorResponse + 1);
static_assert(std::is_same_v<std::variant_alternative_t<eStandardResponse, Result::Value>, ZV_WS_StandardResponse>);
static_assert(std::is_same_v<std::variant_alternative_t<ePurchaseResponse, Result::Value>, ZV_WS_PurchaseResponse>);
static_assert(std::is_same_v<std::variant_alternative_t<eFileType, Result::Value>, ZV_WS_FileType>);

/// Main thread, all of it. Objects are made in the movie to which the given object belongs. Null texts become null, a
/// record an object with its members' names, an array record an Array. After the movie was broken off nothing is set.
namespace ZVWSLib {

/// `value` becomes the result's script value, undefined for eVoid. The result keeps its record.
void SetResult(const Result& result, ae::stagecraft::ASValue& value, ae::stagecraft::ASObject& callback);

void ZV_WS_TitleListing2ASObject(const ZV_WS_TitleListing& record, ae::stagecraft::ASObject& object);
void ZV_WS_TitleListingResponse2ASObject(const ZV_WS_TitleListingResponse& record, ae::stagecraft::ASObject& object);
void ZV_WS_MyVideosResponse2ASObject(const ZV_WS_MyVideosResponse& record, ae::stagecraft::ASObject& object);

}  // namespace ZVWSLib
