#include "Records.h"

#include <algorithm>
#include <iterator>
#include <sstream>

namespace simulator {

namespace {

// RECORD [< RECORD whose children come first] = TYPE CHILD ...; "?" behind a type: may be left out, "*": any number of
// times, "@": an attribute.
const char kRecords[] = R"(
StandardResponse = int ResponseCode string? ResponseMessage
Genre = int ID string? Name boolean Visible int ParentId
ArrayOfGenre = Genre* Genre
GenreRequest = ArrayOfGenre? Genres
GetGenreLabelResponse < StandardResponse = string? Label string? LabelMessage
BonusAsset = int@ BonusAssetID FileProfile@ Profile BonusAssetType@ BonusType
ArrayOfBonusAsset = BonusAsset* BonusAsset
AudioFile = int AssetAudioID string? FileLocation boolean ContainsVideo AudioProfile AudioAssetProfile
ArrayOfAudioFile = AudioFile* AudioFile
ArrayOfFileProfile = FileProfile* FileProfile
ProductListing = int SkuID StreamAPIPurchaseType PurchaseType decimal? Price ArrayOfFileProfile? AvailableAssets
    string? ExpireDate ArrayOfAudioFile? AvailableAudioProfiles int RentalPeriod
ArrayOfProductListing = ProductListing* ProductListing
TitleListing = int TitleID string? TitleName string? BoxArtPrefix short TitlePosition int EpisodeNumber
    ArrayOfBonusAsset? BonusAssets boolean IsTvListing string? MPAARating ArrayOfProductListing? AvailableProducts
    boolean IsTHXMediaDirectorEnabled boolean IsTHXMediaDirectorEnabledForTrailer string? CHVRSRating
    string? LoyaltyPointsForBuy string? LoyaltyPointsForRent
ArrayOfTitleListing = TitleListing* TitleListing
TitleListingResponse < TitleListing = int ResponseCode string? ResponseMessage string? Synopsys int UserRating
    string? Directors string? Actors string? Writers string? Producers string? Copyright string? RunTime
    boolean IsAvailInUserWishList string? RatingReason
ArrayOfTitleListingResponse = TitleListingResponse* TitleListingResponse
GetTitlesResponse < StandardResponse = int GenreID short CurrentPageNumber short ItemsPerPage short TotalPages
    short TotalItems ArrayOfTitleListing? Titles
ArrayOfGetTitlesResponse = GetTitlesResponse* GetTitlesResponse
TvEpisode = int EpisodeID string? EpisodeName int EpisodeNumber
ArrayOfTvEpisode = TvEpisode* TvEpisode
TvEpisodeList < StandardResponse = ArrayOfTvEpisode? Episodes
RecommendedTitlesResponse < StandardResponse = ArrayOfTitleListing? Titles
TranslateSkuIdResponse < StandardResponse = int TitleId
TranslatedTivoExternalIdResponse < StandardResponse = string? TivoExternalId int TitleId
FileType = DRMProvider File_DRMProvider AccessType File_AccessType FileProfile File_FileProfile
    VideoFormat File_VideoFormat FileExtension File_FileExtension
TitleListingPurchased < TitleListing = int EpisodeID int TvListingTitleID StreamAPIPurchaseType PurchaseType
    WatchStatus Status string? RentalPeriod int PassID StreamStatus PlayStatus int StartTimeSeconds
ArrayOfTitleListingPurchased = TitleListingPurchased* TitleListingPurchased
TitleListingPurchasedForPass < TitleListingPurchased = int ResponseCode string? ResponseMessage
ArrayOfTitleListingPurchasedForPass = TitleListingPurchasedForPass* TitleListingPurchasedForPass
GetMyVideosResponse < StandardResponse = ArrayOfTitleListingPurchased? Titles short CurrentPageNumber
    short ItemsPerPage short TotalPages short TotalItems
GetWishlistItemsResponse < GetMyVideosResponse = int SortOrder
WishListActionResponse < StandardResponse =
ConfigurationItemOfString = string@ Key string? Value
ArrayOfConfigurationItemOfString = ConfigurationItemOfString* Configuration
GetConfigResponse < StandardResponse = ArrayOfConfigurationItemOfString? ConfigurationSet
SettingsPageInfo < StandardResponse = string? Account string? DeviceID string? DeviceName
GetEmailAddressResponse < StandardResponse = string? EmailAddress
BillingInfoResponse < StandardResponse = string? CCLastFour int CCTypeId string? CCType
PPCardBalanceResponse < StandardResponse = int Balance
BillingInfoAndPPCBalanceResponse = BillingInfoResponse? BillingInfo PPCardBalanceResponse? PPCardBalance
GiftCertificateResponse < StandardResponse = int Balance
CalcOrderTaxResponse < StandardResponse = decimal? SubTotal decimal? TotalPrice decimal? Tax
PurchaseResponse < StandardResponse = int PassID int TransactionId string? TransactionAuthNum
CheckRentalExpirationResponse < StandardResponse = boolean ShouldDisplay int HoursRemaining
CheckAdultVerificationEnabledResponse < StandardResponse = anyType? IsAdultVerificationEnabled
CheckAdultVerificationPinResponse < StandardResponse = boolean IsPinVerified
AuthorizeDeviceResponse < StandardResponse = string? AuthToken
GetStreamingAssetLocationResponse < StandardResponse = string? StreamingAssetLocation int AssetID string? StreamID
    string? DRMServerURL string? DRMACKServerURL StreamStatus Status int StartTimeSeconds string? HeartbeatURL
    int HeartbeatPollInSeconds
THXMediaDirectorResponse < StandardResponse = string? LongFormat string? ShortFormat
)";

// TYPE of the result = OPERATION ...
const char kResults[] = R"(
int = shouldUpdateCache GetCountryID
boolean = checkForPurchasedTitle checkForPurchasedStream checkForPurchasedStreamByTitleID checkAuthToken
string = getLastCacheLoadTimeUTC
AudioProfile = getAudioDefaultProperty
FileType = getFileType
GenreRequest = getNavigation
GetGenreLabelResponse = getGenreLabel
TitleListingResponse = getTitleListing getTvEpisodeListing
ArrayOfTitleListingResponse = getAllTvEpisodeListings
TvEpisodeList = getTvEpisodeListByTitleID
GetTitlesResponse = getTitlesByNavigation searchForTitle searchForTitleDetail
ArrayOfGetTitlesResponse = getTitlesByGenreArray
RecommendedTitlesResponse = getRecommendedTitles
TranslateSkuIdResponse = translateSkuId
TranslatedTivoExternalIdResponse = translateTivoExternalId
CheckRentalExpirationResponse = checkRentalExpiration
GetConfigResponse = getConfig
CheckAdultVerificationPinResponse = checkAdultVerificationPin
CheckAdultVerificationEnabledResponse = checkAdultVerificationEnabled
WishListActionResponse = addItemToWishlist removeItemFromWishList removeAllItemsFromWishList
GetWishlistItemsResponse = getWishlistItems
GiftCertificateResponse = assignGiftCertificateToUser
SettingsPageInfo = getSettingsPageInfo
GetEmailAddressResponse = getEmailAddress
PPCardBalanceResponse = showPrePaidCardBalance
BillingInfoResponse = getBillingInfo
BillingInfoAndPPCBalanceResponse = getBillingInfoAndPPCBalance
GetMyVideosResponse = getMyVideos getMyStreamingVideos
PurchaseResponse = doPurchaseSavedbilling
AuthorizeDeviceResponse = authorizeDevice
StandardResponse = deactivateDevice setAudioDefaultProperty ReturnTimeout ReturnError removeAllMyPurchases
    manageStreamInstanceStatus
CalcOrderTaxResponse = calcOrderTax
GetStreamingAssetLocationResponse = getStreamingAssetLocation loadLastStreamingAssetLocationForPass getBonusAssetLocation
THXMediaDirectorResponse = getTHXMediaDirector getTHXMediaDirectorBonusAsset
ArrayOfTitleListingPurchasedForPass = getTitleListingsPurchasedForPasses
)";

// The words of each entry; a line that begins with a blank goes on with the one before.
std::vector<std::vector<std::string>> ReadTable(const char* text)
{
    std::vector<std::vector<std::string>> entries;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);) {
        if (line.empty()) continue;
        if (line[0] != ' ') entries.emplace_back();
        std::istringstream words(line);
        entries.back().insert(entries.back().end(), std::istream_iterator<std::string>(words), {});
    }
    return entries;
}

std::map<std::string, Fields> ReadRecords()
{
    std::map<std::string, Fields> records;
    for (const auto& words : ReadTable(kRecords)) {
        const size_t start = words[1] == "<" ? 4 : 2;
        Fields& fields = records[words[0]];
        if (start == 4) fields = records[words[2]];
        for (size_t i = start; i + 1 < words.size(); i += 2) {
            const char mark = words[i].back();
            const bool marked = mark == '?' || mark == '*' || mark == '@';
            fields.push_back({words[i + 1], words[i].substr(0, words[i].size() - marked), marked ? mark : '1'});
        }
    }
    for (const auto& words : ReadTable(kResults)) {
        for (size_t i = 2; i < words.size(); ++i)
            records["_" + words[i] + "Response"] = {{words[i] + "Result", words[0], '?'}};
    }
    return records;
}

}  // namespace

const std::map<std::string, Fields>& Records()
{
    static const std::map<std::string, Fields> records = ReadRecords();
    return records;
}

const Fields* FindRecord(const std::string& type)
{
    const auto found = Records().find(type);
    return found == Records().end() ? nullptr : &found->second;
}

bool IsArray(const std::string& type)
{
    const Fields* fields = FindRecord(type);
    return fields && fields->size() == 1 && fields->front().occurs == '*';
}

bool IsXsdType(const std::string& type)
{
    static const char* const kTypes[] = {"int", "short", "boolean", "string", "decimal", "anyType"};
    return std::find(std::begin(kTypes), std::end(kTypes), type) != std::end(kTypes);
}

bool IsEnumeration(const std::string& type)
{
    return !FindRecord(type) && !IsXsdType(type);
}

}  // namespace simulator
