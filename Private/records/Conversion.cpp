#include "Conversion.h"

#include <libxml/parser.h>
#include <string.h>

#include <memory>

#include "Records.h"
#include "ZVAssert.h"
#include "ZVUtilities.h"

namespace {

// One member: texts are copied to the heap, numbers, flags and enumerations keep their number.
template <class From, class To>
void Copy(const From& from, To& to)
{
    if constexpr (std::is_same_v<To, char*>) {
        to = ZVUtilities::StrDup(from);
    } else {
        to = static_cast<To>(from);
    }
}

// The text of an element with that content, without white space around it. False for anything but text.
bool TextOfXml(const char* content, ZVString& text)
{
    const ZVString whole = ZVString("<a>") + content + "</a>";
    const std::unique_ptr<xmlDoc, void (*)(xmlDoc*)> document(
        xmlReadMemory(whole.c_str(), static_cast<int>(whole.length()), nullptr, "UTF-8",
                      XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING | XML_PARSE_NOCDATA),
        xmlFreeDoc);
    if (!document) return false;
    ZVString found;
    for (const xmlNode* node = xmlDocGetRootElement(document.get())->children; node; node = node->next) {
        if (node->type == XML_TEXT_NODE) found += reinterpret_cast<const char*>(node->content);
        if (node->type == XML_ELEMENT_NODE || node->type == XML_ENTITY_REF_NODE) return false;
    }
    static const char kBlanks[] = " \t\r\n";
    const char* const begin = found.c_str() + strspn(found.c_str(), kBlanks);
    const char* end = found.c_str() + found.length();
    while (end > begin && strchr(kBlanks, end[-1]))
        --end;
    text = ZVString(begin, static_cast<size_t>(end - begin));
    return true;
}

// The elements of an array, each through its Convert; the service may send an element marked as nil, which stays empty.
template <class From, class To>
void CopyElements(int count, From* from, unsigned int& size, To*& to)
{
    Records::Allocate(size, to, from && count > 0 ? count : 0);
    for (unsigned int i = 0; from && i < size; ++i) {
        if constexpr (!Records::kIsRecord<To>) {
            Copy(from[i], to[i]);
        } else if (from[i]) {
            ZVUtilities::Convert(from[i], to[i]);
        }
    }
}

}  // namespace

namespace ZVUtilities {

bool ReadFlag(const char* xml, bool& flag)
{
    flag = false;
    ZVString text;
    if (!xml) return true;
    if (!TextOfXml(xml, text)) return false;
    flag = Str2Bool(text.c_str()) || text == "1";
    return flag || text == "false" || text == "0";
}

// A conversion's head, and a conversion that copies members of the same name.
#define ZV_CONVERT(From, To) void ZV1__##From##2ZV_WS_##To(const ZV1__##From* t, ZV_WS_##To& to)
#define ZV_CONVERT_MEMBERS(From, To, ...) \
    ZV_CONVERT(From, To)                  \
    {                                     \
        ZV_ASSERT(t != 0);                \
        ZV_COPY(__VA_ARGS__)              \
    }
// Members of the same name on both sides, in the order of the record.
#define ZV_COPY_MEMBER(name) Copy(t->name, to.name);
#define ZV_COPY(...) ZV_WS_EACH(ZV_COPY_MEMBER, __VA_ARGS__)
// An array record from the array `from`; null is an empty one.
#define ZV_COPY_ARRAY(from, to, element) \
    if (from) CopyElements((from)->__size##element, (from)->element, (to).size, (to).element)
// A record that is nothing but an array.
#define ZV_CONVERT_ARRAY(From, To, element) \
    ZV_CONVERT(From, To)                    \
    {                                       \
        ZV_ASSERT(t != 0);                  \
        ZV_COPY_ARRAY(t, to, element);      \
    }

ZV_CONVERT_MEMBERS(StandardResponse, StandardResponse, ResponseCode, ResponseMessage)
ZV_CONVERT_MEMBERS(WishListActionResponse, StandardResponse, ResponseCode, ResponseMessage)

// ---- Catalogue

ZV_CONVERT(Genre, Genre)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ID, Name, Visible)
    to.ParentID = t->ParentId;
}

ZV_CONVERT(GenreRequest, GenreArray)
{
    ZV_ASSERT(t != 0);
    ZV_COPY_ARRAY(t->Genres, to, Genre);
}

ZV_CONVERT_MEMBERS(GetGenreLabelResponse, GenreLabelResponse, ResponseCode, ResponseMessage, Label, LabelMessage)
ZV_CONVERT_MEMBERS(BonusAsset, BonusAsset, BonusAssetID, Profile, BonusType)
ZV_CONVERT_MEMBERS(AudioFile, AudioFile, AssetAudioID, FileLocation, ContainsVideo, AudioAssetProfile)

ZV_CONVERT(ProductListing, ProductListing)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(SkuID, PurchaseType, Price)
    ZV_COPY_ARRAY(t->AvailableAssets, to.AvailableAssets, FileProfile);
    ZV_COPY(ExpireDate)
    ZV_COPY_ARRAY(t->AvailableAudioProfiles, to.AvailableAudioProfiles, AudioFile);
    ZV_COPY(RentalPeriod)
}

ZV_CONVERT(TitleListing, TitleListing)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(TitleID, TitleName, BoxArtPrefix, TitlePosition, EpisodeNumber)
    ZV_COPY_ARRAY(t->BonusAssets, to.BonusAssets, BonusAsset);
    ZV_COPY(IsTvListing, MPAARating)
    ZV_COPY_ARRAY(t->AvailableProducts, to.AvailableProducts, ProductListing);
    ZV_COPY(IsTHXMediaDirectorEnabled, IsTHXMediaDirectorEnabledForTrailer, CHVRSRating, LoyaltyPointsForBuy,
            LoyaltyPointsForRent)
}

ZV_CONVERT_ARRAY(ArrayOfTitleListing, TitleListingArray, TitleListing)

ZV_CONVERT(TitleListingResponse, TitleListingResponse)
{
    ZV_ASSERT(t != 0);
    ZV1__TitleListing2ZV_WS_TitleListing(t, to);
    ZV_COPY(ResponseCode, ResponseMessage)
    Copy(t->Synopsys, to.Synopsis);
    ZV_COPY(UserRating, Directors, Actors, Writers, Producers, Copyright, RunTime, RatingReason)
}

ZV_CONVERT_ARRAY(ArrayOfTitleListingResponse, TitleListingResponseArray, TitleListingResponse)

ZV_CONVERT(GetTitlesResponse, TitlesResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage, GenreID, CurrentPageNumber, ItemsPerPage, TotalPages, TotalItems)
    ZV_COPY_ARRAY(t->Titles, to.Titles, TitleListing);
}

ZV_CONVERT(ArrayOfGetTitlesResponse, TitlesResponseArray)
{
    ZV_ASSERT(t != 0);
    CopyElements(t->__sizeGetTitlesResponse, t->GetTitlesResponse, to.size, to.TitlesResponse);
}

ZV_CONVERT_MEMBERS(TvEpisode, TvEpisode, EpisodeID, EpisodeName, EpisodeNumber)

ZV_CONVERT(TvEpisodeList, TvEpisodeListResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
    ZV_COPY_ARRAY(t->Episodes, to.Episodes, TvEpisode);
}

ZV_CONVERT(TranslateSkuIdResponse, TranslateSkuIDResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
    to.TitleID = t->TitleId;
}

ZV_CONVERT(TranslateTivoExternalIDResponse, TranslateTivoExternalIDResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
    Copy(t->TivoExternalId, to.TivoExternalID);
    to.TitleID = t->TitleId;
}

ZV_CONVERT(RecommendedTitlesResponse, RecommendedTitlesResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
    ZV_COPY_ARRAY(t->Titles, to.Titles, TitleListing);
}

// ---- The device

ZV_CONVERT(FileType, FileType)
{
    ZV_ASSERT(t != 0);
    Copy(t->File_USCOREDRMProvider, to.DRMProvider);
    Copy(t->File_USCOREAccessType, to.AccessType);
    Copy(t->File_USCOREFileProfile, to.FileProfile);
    Copy(t->File_USCOREVideoFormat, to.VideoFormat);
    Copy(t->File_USCOREFileExtension, to.FileExtension);
}

ZV_CONVERT_MEMBERS(AuthorizeDeviceResponse, AuthorizeDeviceResponse, ResponseCode, ResponseMessage, AuthToken)
ZV_CONVERT_MEMBERS(ConfigurationItemOfString, ConfigurationItem, Key, Value)

ZV_CONVERT(GetConfigResponse, ConfigResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
    if (const auto* set = t->ConfigurationSet) {
        CopyElements(set->__sizeConfiguration, set->Configuration, to.size, to.ConfigurationItem);
    }
}

ZV_CONVERT_MEMBERS(SettingsPageInfo, SettingsPageInfoResponse, ResponseCode, ResponseMessage, Account, DeviceID,
                   DeviceName)

// ---- The account

ZV_CONVERT(TitleListingPurchased, TitleListingPurchased)
{
    ZV_ASSERT(t != 0);
    ZV1__TitleListing2ZV_WS_TitleListing(t, to);
    ZV_COPY(EpisodeID, TvListingTitleID, PurchaseType, Status, RentalPeriod, PassID, PlayStatus, StartTimeSeconds)
}

ZV_CONVERT_ARRAY(ArrayOfTitleListingPurchased, TitleListingPurchasedArray, TitleListingPurchased)

ZV_CONVERT(ArrayOfTitleListingPurchasedForPass, TitleListingPurchasedArray)
{
    ZV_ASSERT(t != 0);
    CopyElements(t->__sizeTitleListingPurchasedForPass, t->TitleListingPurchasedForPass, to.size,
                 to.TitleListingPurchased);
}

// Pages of purchases and of the wish list.
template <class From>
static void CopyPage(const From* t, ZV_WS_MyVideosResponse& to)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage, CurrentPageNumber, ItemsPerPage, TotalPages, TotalItems)
    ZV_COPY_ARRAY(t->Titles, to.Titles, TitleListingPurchased);
}

ZV_CONVERT(GetMyVideosResponse, MyVideosResponse)
{
    CopyPage(t, to);
}

ZV_CONVERT(GetWishlistItemsResponse, WishlistItemsResponse)
{
    CopyPage(t, to);
    to.SortOrder = t->SortOrder;
}

ZV_CONVERT_MEMBERS(CheckRentalExpirationResponse, RentalExpirationResponse, ResponseCode, ResponseMessage,
                   ShouldDisplay, HoursRemaining)

ZV_CONVERT(CheckAdultVerificationEnabledResponse, CheckAdultVerificationEnabledResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage)
    ReadFlag(t->IsAdultVerificationEnabled, to.IsAdultVerificationEnabled);
}

ZV_CONVERT_MEMBERS(CheckAdultVerificationPinResponse, CheckAdultVerificationPinResponse, ResponseCode, ResponseMessage,
                   IsPinVerified)
ZV_CONVERT_MEMBERS(GetEmailAddressResponse, EmailAddressResponse, ResponseCode, ResponseMessage, EmailAddress)

ZV_CONVERT(BillingInfoResponse, BillingInfoResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage, CCLastFour)
    to.CCTypeID = t->CCTypeId;
    ZV_COPY(CCType)
}

ZV_CONVERT_MEMBERS(PPCardBalanceResponse, PPCardBalanceResponse, ResponseCode, ResponseMessage, Balance)

ZV_CONVERT(BillingInfoAndPPCBalanceResponse, BillingInfoAndPPCBalanceResponse)
{
    ZV_ASSERT(t != 0);
    if (t->BillingInfo) Convert(t->BillingInfo, to.BillingInfo);
    if (t->PPCardBalance) Convert(t->PPCardBalance, to.PPCardBalance);
}

ZV_CONVERT_MEMBERS(GiftCertificateResponse, GiftCertificateResponse, ResponseCode, ResponseMessage, Balance)

ZV_CONVERT(PurchaseResponse, PurchaseResponse)
{
    ZV_ASSERT(t != 0);
    ZV_COPY(ResponseCode, ResponseMessage, PassID)
    to.TransactionID = t->TransactionId;
    ZV_COPY(TransactionAuthNum)
}

ZV_CONVERT_MEMBERS(CalcOrderTaxResponse, CalcOrderTaxResponse, ResponseCode, ResponseMessage, SubTotal, TotalPrice, Tax)

// ---- Playback

ZV_CONVERT_MEMBERS(GetStreamingAssetLocationResponse, StreamingAssetLocationResponse, ResponseCode, ResponseMessage,
                   StreamingAssetLocation, AssetID, StreamID, DRMServerURL, DRMACKServerURL, Status, StartTimeSeconds,
                   HeartbeatURL, HeartbeatPollInSeconds)
ZV_CONVERT_MEMBERS(THXMediaDirectorResponse, THXMediaDirectorResponse, ResponseCode, ResponseMessage, LongFormat,
                   ShortFormat)

}  // namespace ZVUtilities
