// The records of ZV_WS_Types.h as data: tag, base, members in order.
//
// For code that treats records alike, such as releasing them or turning them into script objects. Header
// only; any thread.
//
//   ZV_WS_RecordTraits<Record>::kTag          the number behind `_pImpl`
//   ZV_WS_RecordTraits<Record>::Base          the record it extends, ZV_WS_Object at the root
//   ZV_WS_RecordTraits<Record>::Visit(r, v)   for its own members, not the base's, in order: v.Member("Name", r.Name);
//                                             v.Elements("Name", r.size, r.Name) for the array of an array record
//
// A visitor has a Member for each kind of member that it wants to see (bool, numbers, enumerations, char*, embedded
// records) and an Elements for arrays, both usually templates. Embedded records come as members, and it is the visitor
// that goes on into them; so it does with the base:
//
//     template <class Record, class Visitor>
//     void VisitAll(Record& record, Visitor& visitor)
//     {
//         if constexpr (!std::is_same_v<Record, ZV_WS_Object>) {
//             VisitAll<typename ZV_WS_RecordTraits<Record>::Base>(record, visitor);
//             ZV_WS_RecordTraits<Record>::Visit(record, visitor);
//         }
//     }
//
// Tags are stored behind `_pImpl` of every record that is handed out: a tag is never given to another record. 1 is the
// session's; 48, 49 and 51 to 54 belong to nothing, and releasing such a record frees its tag alone.
#pragma once

#include <tuple>
#include <utility>

#include "ZVWSLib.h"

template <class Record>
struct ZV_WS_RecordTraits;

/// Tags are below it.
constexpr unsigned int ZV_WS_kTagCount = 56;

/// The record of a tag, in a tuple that is empty when it has none. A row makes both, so that two rows with one tag are
/// an error.
template <unsigned int tag>
struct ZV_WS_RecordOfTag {
    using Type = std::tuple<>;
};

/// The records of several tags.
template <class Tags>
struct ZV_WS_RecordsOfTags;
template <unsigned int... tags>
struct ZV_WS_RecordsOfTags<std::integer_sequence<unsigned int, tags...>> {
    using Type = decltype(std::tuple_cat(std::declval<typename ZV_WS_RecordOfTag<tags>::Type>()...));
};

#define ZV_WS_EACH_1(DO, x) DO(x)
#define ZV_WS_EACH_2(DO, x, ...) DO(x) ZV_WS_EACH_1(DO, __VA_ARGS__)
#define ZV_WS_EACH_3(DO, x, ...) DO(x) ZV_WS_EACH_2(DO, __VA_ARGS__)
#define ZV_WS_EACH_4(DO, x, ...) DO(x) ZV_WS_EACH_3(DO, __VA_ARGS__)
#define ZV_WS_EACH_5(DO, x, ...) DO(x) ZV_WS_EACH_4(DO, __VA_ARGS__)
#define ZV_WS_EACH_6(DO, x, ...) DO(x) ZV_WS_EACH_5(DO, __VA_ARGS__)
#define ZV_WS_EACH_7(DO, x, ...) DO(x) ZV_WS_EACH_6(DO, __VA_ARGS__)
#define ZV_WS_EACH_8(DO, x, ...) DO(x) ZV_WS_EACH_7(DO, __VA_ARGS__)
#define ZV_WS_EACH_9(DO, x, ...) DO(x) ZV_WS_EACH_8(DO, __VA_ARGS__)
#define ZV_WS_EACH_10(DO, x, ...) DO(x) ZV_WS_EACH_9(DO, __VA_ARGS__)
#define ZV_WS_EACH_11(DO, x, ...) DO(x) ZV_WS_EACH_10(DO, __VA_ARGS__)
#define ZV_WS_EACH_12(DO, x, ...) DO(x) ZV_WS_EACH_11(DO, __VA_ARGS__)
#define ZV_WS_EACH_13(DO, x, ...) DO(x) ZV_WS_EACH_12(DO, __VA_ARGS__)
#define ZV_WS_EACH_14(DO, x, ...) DO(x) ZV_WS_EACH_13(DO, __VA_ARGS__)
#define ZV_WS_EACH_PICK(_1, _2, _3, _4, _5, _6, _7, _8, _9, _10, _11, _12, _13, _14, NAME, ...) NAME
/// DO(x) for each of one to fourteen arguments.
#define ZV_WS_EACH(DO, ...)                                                                                           \
    ZV_WS_EACH_PICK(__VA_ARGS__, ZV_WS_EACH_14, ZV_WS_EACH_13, ZV_WS_EACH_12, ZV_WS_EACH_11, ZV_WS_EACH_10,           \
                    ZV_WS_EACH_9, ZV_WS_EACH_8, ZV_WS_EACH_7, ZV_WS_EACH_6, ZV_WS_EACH_5, ZV_WS_EACH_4, ZV_WS_EACH_3, \
                    ZV_WS_EACH_2, ZV_WS_EACH_1, )                                                                     \
    (DO, __VA_ARGS__)

#define ZV_WS_VISIT_MEMBER(name) v.Member(#name, r.name);

#define ZV_WS_RECORD_TRAITS(Record, base, tag, visits) \
    template <>                                        \
    struct ZV_WS_RecordTraits<Record> {                \
        using Base = base;                             \
        static constexpr unsigned int kTag = tag;      \
        static_assert(tag < ZV_WS_kTagCount);          \
        template <class R, class V>                    \
        static void Visit(R& r, V&& v)                 \
        {                                              \
            visits                                     \
        }                                              \
    };                                                 \
    template <>                                        \
    struct ZV_WS_RecordOfTag<tag> {                    \
        using Type = std::tuple<Record>;               \
    };

/// One row: a record, the record it extends, its tag, its own members in the order of the struct.
#define ZV_WS_RECORD(Record, base, tag, ...) \
    ZV_WS_RECORD_TRAITS(Record, base, tag, ZV_WS_EACH(ZV_WS_VISIT_MEMBER, __VA_ARGS__))

/// One row: a record with an array of `size` elements behind the pointer `elements`, and no other member of its own.
#define ZV_WS_ARRAY_RECORD(Record, base, tag, elements) \
    ZV_WS_RECORD_TRAITS(Record, base, tag, v.Elements(#elements, r.size, r.elements);)

// clang-format off
ZV_WS_ARRAY_RECORD(ZV_WS_String, ZV_WS_Object, 2, data)
ZV_WS_RECORD(ZV_WS_StandardResponse, ZV_WS_Object, 3, ResponseCode, ResponseMessage)
ZV_WS_RECORD(ZV_WS_Genre, ZV_WS_Object, 4, ID, Name, Visible, ParentID)
ZV_WS_ARRAY_RECORD(ZV_WS_GenreArray, ZV_WS_Object, 5, Genre)
ZV_WS_RECORD(ZV_WS_BonusAsset, ZV_WS_Object, 6, BonusAssetID, Profile, BonusType)
ZV_WS_ARRAY_RECORD(ZV_WS_BonusAssetArray, ZV_WS_Object, 7, BonusAsset)
ZV_WS_ARRAY_RECORD(ZV_WS_FileProfileArray, ZV_WS_Object, 8, FileProfile)
ZV_WS_RECORD(ZV_WS_AudioFile, ZV_WS_Object, 9, AssetAudioID, FileLocation, ContainsVideo, AudioAssetProfile)
ZV_WS_ARRAY_RECORD(ZV_WS_AudioFileArray, ZV_WS_Object, 10, AudioFile)
ZV_WS_RECORD(ZV_WS_ProductListing, ZV_WS_Object, 11, SkuID, PurchaseType, Price, AvailableAssets, ExpireDate,
             AvailableAudioProfiles, RentalPeriod)
ZV_WS_ARRAY_RECORD(ZV_WS_ProductListingArray, ZV_WS_Object, 12, ProductListing)
ZV_WS_RECORD(ZV_WS_GenreLabelResponse, ZV_WS_StandardResponse, 13, Label, LabelMessage)
ZV_WS_RECORD(ZV_WS_TitleListing, ZV_WS_Object, 14, TitleID, TitleName, BoxArtPrefix, TitlePosition, EpisodeNumber,
             BonusAssets, IsTvListing, MPAARating, AvailableProducts, IsTHXMediaDirectorEnabled,
             IsTHXMediaDirectorEnabledForTrailer, CHVRSRating, LoyaltyPointsForBuy, LoyaltyPointsForRent)
ZV_WS_ARRAY_RECORD(ZV_WS_TitleListingArray, ZV_WS_Object, 15, TitleListing)
ZV_WS_RECORD(ZV_WS_TitleListingResponse, ZV_WS_TitleListing, 16, ResponseCode, ResponseMessage, Synopsis, UserRating,
             Directors, Actors, Writers, Producers, Copyright, RunTime, RatingReason)
ZV_WS_ARRAY_RECORD(ZV_WS_TitleListingResponseArray, ZV_WS_Object, 17, TitleListingResponse)
ZV_WS_RECORD(ZV_WS_TitlesResponse, ZV_WS_StandardResponse, 18, GenreID, CurrentPageNumber, ItemsPerPage, TotalPages,
             TotalItems, Titles)
ZV_WS_ARRAY_RECORD(ZV_WS_TitlesResponseArray, ZV_WS_Object, 19, TitlesResponse)
ZV_WS_RECORD(ZV_WS_TvEpisode, ZV_WS_Object, 20, EpisodeID, EpisodeName, EpisodeNumber)
ZV_WS_ARRAY_RECORD(ZV_WS_TvEpisodeArray, ZV_WS_Object, 21, TvEpisode)
ZV_WS_RECORD(ZV_WS_TvEpisodeListResponse, ZV_WS_StandardResponse, 22, Episodes)
ZV_WS_RECORD(ZV_WS_TranslateSkuIDResponse, ZV_WS_StandardResponse, 23, TitleID)
ZV_WS_RECORD(ZV_WS_TranslateTivoExternalIDResponse, ZV_WS_StandardResponse, 24, TivoExternalID, TitleID)
ZV_WS_RECORD(ZV_WS_RecommendedTitlesResponse, ZV_WS_StandardResponse, 25, Titles)
ZV_WS_RECORD(ZV_WS_TitleListingPurchased, ZV_WS_TitleListing, 26, EpisodeID, TvListingTitleID, PurchaseType, Status,
             RentalPeriod, PassID, PlayStatus, StartTimeSeconds)
ZV_WS_ARRAY_RECORD(ZV_WS_TitleListingPurchasedArray, ZV_WS_Object, 27, TitleListingPurchased)
ZV_WS_RECORD(ZV_WS_MyVideosResponse, ZV_WS_StandardResponse, 28, CurrentPageNumber, ItemsPerPage, TotalPages,
             TotalItems, Titles)
ZV_WS_RECORD(ZV_WS_WishlistItemsResponse, ZV_WS_MyVideosResponse, 29, SortOrder)
ZV_WS_ARRAY_RECORD(ZV_WS_TitlesInWishlist, ZV_WS_Object, 30, IsAvailInUserWishlist)
ZV_WS_RECORD(ZV_WS_PurchaseResponse, ZV_WS_StandardResponse, 31, PassID, TransactionID, TransactionAuthNum)
ZV_WS_RECORD(ZV_WS_StreamingAssetLocationResponse, ZV_WS_StandardResponse, 32, StreamingAssetLocation, AssetID, StreamID,
             DRMServerURL, DRMACKServerURL, Status, StartTimeSeconds, HeartbeatURL, HeartbeatPollInSeconds)
ZV_WS_RECORD(ZV_WS_GiftCertificateResponse, ZV_WS_StandardResponse, 33, Balance)
ZV_WS_RECORD(ZV_WS_CheckAdultVerificationEnabledResponse, ZV_WS_StandardResponse, 34, IsAdultVerificationEnabled)
ZV_WS_RECORD(ZV_WS_CheckAdultVerificationPinResponse, ZV_WS_StandardResponse, 35, IsPinVerified)
ZV_WS_RECORD(ZV_WS_RentalExpirationResponse, ZV_WS_StandardResponse, 36, ShouldDisplay, HoursRemaining)
ZV_WS_RECORD(ZV_WS_PPCardBalanceResponse, ZV_WS_StandardResponse, 37, Balance)
ZV_WS_RECORD(ZV_WS_ConfigurationItem, ZV_WS_Object, 38, Key, Value)
ZV_WS_ARRAY_RECORD(ZV_WS_ConfigResponse, ZV_WS_StandardResponse, 39, ConfigurationItem)
ZV_WS_RECORD(ZV_WS_BillingInfoResponse, ZV_WS_StandardResponse, 40, CCLastFour, CCTypeID, CCType)
ZV_WS_RECORD(ZV_WS_BillingInfoAndPPCBalanceResponse, ZV_WS_Object, 41, BillingInfo, PPCardBalance)
ZV_WS_RECORD(ZV_WS_SettingsPageInfoResponse, ZV_WS_StandardResponse, 42, Account, DeviceID, DeviceName)
ZV_WS_RECORD(ZV_WS_EmailAddressResponse, ZV_WS_StandardResponse, 43, EmailAddress)
ZV_WS_RECORD(ZV_WS_CalcOrderTaxResponse, ZV_WS_StandardResponse, 44, SubTotal, TotalPrice, Tax)
ZV_WS_RECORD(ZV_WS_FileType, ZV_WS_Object, 45, DRMProvider, AccessType, FileProfile, VideoFormat, FileExtension)
ZV_WS_RECORD(ZV_WS_AuthorizeDeviceResponse, ZV_WS_StandardResponse, 46, AuthToken)
ZV_WS_ARRAY_RECORD(ZV_WS_Image, ZV_WS_Object, 47, data)
ZV_WS_RECORD(ZV_WS_VersionInfo, ZV_WS_Object, 50, Major, Minor, Revision)
ZV_WS_RECORD(ZV_WS_THXMediaDirectorResponse, ZV_WS_StandardResponse, 55, LongFormat, ShortFormat)
// clang-format on

/// Every record but the session (tag 1), whose parts the library alone knows: those of all rows, by tag.
using ZV_WS_AllRecords = ZV_WS_RecordsOfTags<std::make_integer_sequence<unsigned int, ZV_WS_kTagCount>>::Type;
