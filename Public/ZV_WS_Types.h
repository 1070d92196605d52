// What the calls of ZVWSLib.h take and hand out: enumerations, set-up, records. Plain data, any thread.
//
// Enumerations. Every one has int behind it, and a number that is not in its list is a value like others: services know
// more protections than are listed here, and discovery may send any digit. Show what you do not know in a neutral way.
// As an argument of a request only listed numbers can be sent; a call refuses the others (ZV_WS_Status_invalid_param).
//
// Records. Everything derived from ZV_WS_Object. The rules for all of them:
//  1. Who owns them: the caller, from the call's return on, whatever its status. ZV_WS_release frees what
//     they point to.
//  2. char* members are UTF-8 texts with a terminator, owned by the record; null when the service sent none, "" when it
//     sent an empty one.
//  3. Arrays are `size` elements behind a pointer, which is null when `size` is 0. They are owned by the record, too,
//     and freed with it: nobody releases an element or an embedded record by itself.
//  4. Numbers, booleans and enumerations that the service did not send are 0, false and the enumeration's 0.
//  5. Copying one copies pointers: one of the two copies is released, and the other forgotten.
#pragma once

// ---- What titles are sold, played and sorted by

/// How a product is paid. ANY is for requests: whatever way there is.
enum ZV_WS_PurchaseType : int { PURCHASE_TYPE_RENT = 0, PURCHASE_TYPE_BUY = 1, PURCHASE_TYPE_ANY = 2 };

/// Which titles of a listing are wanted.
enum ZV_WS_TitleTypeFilter : int { TITLE_TYPE_FILTER_ANY = 0, TITLE_TYPE_FILTER_TV = 1, TITLE_TYPE_FILTER_MOVIE = 2 };

/// Picture size and shape of a film's file.
enum ZV_WS_FileProfile : int {
    FILE_PROFILE_UNKNOWN = 0,
    FILE_PROFILE_STANDARD = 1,
    FILE_PROFILE_HIGHDEFINITION = 2,
    FILE_PROFILE_PORTABLE = 3,
    FILE_PROFILE_PORTABLE_STANDARD = 4,
    FILE_PROFILE_TEMP5 = 5,
    FILE_PROFILE_PORTABLE_WIDE = 6,
    FILE_PROFILE_STANDARD_DEFINITION_3D = 7,
    FILE_PROFILE_HIGH_DEFINITION_3D = 8,
    FILE_PROFILE_STANDARD_DEFINITION_REALD_3D = 9,
    FILE_PROFILE_HIGH_DEFINITION_REALD_3D = 10,
};

/// Coding and channels of a film's sound.
enum ZV_WS_AudioProfile : int {
    AUDIO_PROFILE_STEREO_STANDARD = 0,
    AUDIO_PROFILE_DOLBY_STEREO_AC3 = 1,
    AUDIO_PROFILE_DOLBY_DIGITAL_PLUS_STEREO = 2,
    AUDIO_PROFILE_DOLBY_DIGITAL_PLUS_51 = 3,
    AUDIO_PROFILE_DTS_EXPRESS_STEREO = 4,
    AUDIO_PROFILE_DTS_EXPRESS_51 = 5,
};

/// What comes with a title.
enum ZV_WS_BonusAssetType : int { BONUS_ASSET_TYPE_TRAILER = 0 };

/// Whether a purchase can be watched; also the filter of ZV_WS_getMyVideos.
enum ZV_WS_WatchStatus : int {
    WATCH_STATUS_WATCHNOW = 0,
    WATCH_STATUS_RENTAGAIN = 1,  ///< The rental has run out.
    WATCH_STATUS_NOTAVAILABLE = 2,
    WATCH_STATUS_UNDEFINED = 3,  ///< As a filter: all of them.
};

/// What a playback is doing, or did last.
enum ZV_WS_StreamStatus : int {
    STREAM_STATUS_PLAY = 0,
    STREAM_STATUS_STOPPED = 1,
    STREAM_STATUS_PAUSED = 2,
    STREAM_STATUS_RESUMEPLAY = 3,
    STREAM_STATUS_ERRORINPLAYBACK = 4,
};

/// By what a wish list is sorted.
enum ZV_WS_SortOrder : int {
    SORT_ORDER_DATEADDED = 0,
    SORT_ORDER_TITLENAME = 1,
    SORT_ORDER_RATING = 2,      ///< The age that a title is for.
    SORT_ORDER_USERRATING = 3,  ///< The customers' stars.
};

// ---- The form in which the service has films for a type of device (ZV_WS_getFileType)

/// What protects a film. Services know more than these.
enum ZV_WS_DRMProvider : int {
    DRM_PROVIDER_UNKNOWN = 0,
    DRM_PROVIDER_WMDRM10 = 1,
    DRM_PROVIDER_TIVODRM = 2,
    DRM_PROVIDER_WIDEVINE = 3,
    DRM_PROVIDER_WMDRM7 = 4,
    DRM_PROVIDER_WMDRM9 = 5,
    DRM_PROVIDER_FLUX = 6,
    DRM_PROVIDER_DIVX = 7,
};

/// Whether films are downloaded or streamed. It decides which service has a session's account: the download service for
/// DOWNLOAD, the stream service for everything else.
enum ZV_WS_AccessType : int { ACCESS_TYPE_UNKNOWN = 0, ACCESS_TYPE_DOWNLOAD = 1, ACCESS_TYPE_STREAM = 2 };

/// How the picture is coded.
enum ZV_WS_VideoFormat : int {
    VIDEO_FORMAT_UNKNOWN = 0,
    VIDEO_FORMAT_WMV9 = 1,
    VIDEO_FORMAT_MPEG2_TIVO = 2,
    VIDEO_FORMAT_MPEG2_STANDARD = 3,
    VIDEO_FORMAT_VC1 = 4,
    VIDEO_FORMAT_DIVX = 5,
    VIDEO_FORMAT_H264 = 6,
    VIDEO_FORMAT_FLUX = 7,
};

/// The container, by the ending of a file's name. AUTOPOPULATE leaves it to the player.
enum ZV_WS_FileExtension : int {
    FILE_EXTENSION_AUTOPOPULATE = 0,
    FILE_EXTENSION_UNKNOWN = 1,
    FILE_EXTENSION_WMV = 2,
    FILE_EXTENSION_MPEG = 3,
    FILE_EXTENSION_MP4 = 4,
    FILE_EXTENSION_FLUX = 5,
    FILE_EXTENSION_AVI = 6,
    FILE_EXTENSION_QT = 7,
    FILE_EXTENSION_FLV = 8,
    FILE_EXTENSION_RM = 9,
    FILE_EXTENSION_DIVX = 10,
};

/// The sizes of box art, by the width in pixels. Not sorted by size: the numbers are stored in cache files and stay as
/// they are. 135S alone has another name on the image host ("135s") than in a file's name ("135").
enum ZV_WS_BoxArtSize : int {
    BOX_ART_SIZE_95 = 0,
    BOX_ART_SIZE_175 = 1,
    BOX_ART_SIZE_65 = 2,
    BOX_ART_SIZE_77 = 3,
    BOX_ART_SIZE_102 = 4,
    BOX_ART_SIZE_126 = 5,
    BOX_ART_SIZE_135S = 6,
    BOX_ART_SIZE_137 = 7,
    BOX_ART_SIZE_153 = 8,
    BOX_ART_SIZE_177 = 9,
    BOX_ART_SIZE_203 = 10,
    BOX_ART_SIZE_269 = 11,
    BOX_ART_SIZE_321 = 12,
};

// ---- Environments: the storefront that customers see, and two for those who build it

/// The environment that a session works in. Discovery stores the digit that the service sent, also one outside of this
/// list, which has PRODUCTION's addresses.
enum ZV_WS_EnvID : int { ENVID_APISTG = 0, ENVID_INTERNALSTG = 1, ENVID_PRODUCTION = 2 };

/// The environment asked for at set-up; ENVNUM_DEFAULT, and every other number outside of the first three,
/// asks the service.
enum ZV_WS_EnvNum : int { ENVNUM_APISTG = 0, ENVNUM_INTERNALSTG = 1, ENVNUM_PRODUCTION = 2, ENVNUM_DEFAULT = 3 };

/// The general catalogue or the one for adults, which has addresses of its own.
enum ContentType : int { ContentType_ZV = 0, ContentType_KAC = 1 };

/// Where a session keeps what it has asked for: nowhere, in its own memory as long as it lives, or in files that
/// outlast the process and are shared with others (docs/cache.md).
enum CacheType : int { CacheType_None = 0, CacheType_Memory = 1, CacheType_File = 2 };

// ---- Set-up, filled by the caller. Texts are borrowed for the call: nothing of them is kept. A null text is one that
// is not given, and so is "" unless something else is said.

/// What a session keeps of its answers, and where (docs/cache.md).
struct ZV_WS_CacheParam {
    /// Which kinds of answer are cached: bits of `Data`. The last three are the cache's own names of the same bits.
    enum CacheData : unsigned int {
        CacheData_Metadata = 1,     ///< The catalogue's answers.
        CacheData_BoxArtImage = 2,  ///< Images.
        CacheData_Userdata = 4,     ///< The customer's answers, and what is known of the wish list.
        CacheData_Service = CacheData_Metadata,
        CacheData_BoxArt = CacheData_BoxArtImage,
        CacheData_UserData = CacheData_Userdata,
    };

    CacheType Type = CacheType_None;
    unsigned int Data = 0;
    /// Bytes for everything cached; 0 is no limit, else at least 358400 (350 KiB). Shared out between the
    /// kinds in `Data`.
    unsigned int Limit = 0;
    /// Cache folder of CacheType_File, which needs one; "" is the current folder. Made when absent, with the folders
    /// above it, for the owner alone. The folder is the cache's own: images in it of which no cache knows are removed,
    /// and caches that nobody has used for 30 days.
    const char* Path = nullptr;
};

/// Proxy for all connections of the session; none when Host is not given. TLS goes through it by CONNECT. A proxy that
/// refuses is a status of the HTTP family (407: ask for other credentials).
struct ZV_WS_ProxyParam {
    const char* Host = nullptr;      ///< A name or an address.
    int Port = 0;                    ///< Not looked at by set-up: with a wrong one no connection comes about.
    const char* UserName = nullptr;  ///< Null or empty: the proxy is shown no credentials.
    const char* Password =
        nullptr;  ///< Sent to the proxy as HTTP's basic scheme has it, which anybody on the way reads.
};

/// All that a session needs. APIKey, AuthToken, identifier and UserName are sent, and hold nothing that XML cannot.
struct ZV_WS_SetupParams {
    const char* APIKey = nullptr;               ///< Required. Which application this is, for the service.
    const char* AuthToken = nullptr;            ///< What ZV_WS_authorizeDevice answered last; not given before that.
    const char* DestinationUniqueID = nullptr;  ///< Required; the device's identifier, at most 350 bytes.
    int DestinationTypeID = 0;                  ///< The service's number of this type of device.
    const char* UserName = nullptr;             ///< Required; with Password, what every request is signed with.
    const char* Password = nullptr;             ///< Required. Never sent itself, only as part of a digest.
    const char* ServiceBaseURL = nullptr;       ///< Not used: discovery decides.
    ContentType Type = ContentType_ZV;          ///< Which catalogue's addresses the session uses.
    ZV_WS_EnvNum EnvNum = ENVNUM_DEFAULT;       ///< Default: the service is asked for the environment.
    ZV_WS_CacheParam CacheParam;
    ZV_WS_ProxyParam ProxyParam;
    ZV_WS_AccessType AccessType = ACCESS_TYPE_UNKNOWN;  ///< Unknown: the service is asked (ZV_WS_getFileType).
    /// These three make the user agent of every request (ZV_WS_getUserAgent). No control characters.
    const char* ApplicationRevision = nullptr;
    const char* FirmwareRevision = nullptr;
    const char* ModelCode = nullptr;
};

/// A page of a listing. The service decides what it makes of numbers that the listing does not have.
struct ZV_WS_Pagination {
    unsigned int CurrentPageNumber = 1;  ///< The first page is 1.
    unsigned int ItemsPerPage = 0;
};

/// An environment that can be chosen at set-up.
struct ZV_WS_Environment {
    ZV_WS_EnvNum envNum;   ///< For ZV_WS_SetupParams.
    const char* endpoint;  ///< Name to show, such as "production".
};

/// Points at a static table: nothing to release.
struct ZV_WS_EnvironmentLists {
    unsigned int size = 0;
    const ZV_WS_Environment* env = nullptr;
};

// ---- Records. ZV_WS_Records.h tells tag and members of each as data, for code that treats them alike.

/// Base of every record. `_pImpl` points to the record's type tag; null means empty.
struct ZV_WS_Object {
    unsigned int* _pImpl = nullptr;
};

struct SessionImpl;

/// A session: what nearly every call takes. Not to be copied.
struct ZV_WS_Session : ZV_WS_Object {
    SessionImpl* _pSessionImpl = nullptr;  ///< The library's own; null when there is no session.
};

/// A text that a call hands out by itself.
struct ZV_WS_String : ZV_WS_Object {
    unsigned int size = 0;  ///< Bytes, without the terminator.
    char* data = nullptr;
};

/// Bytes of a JPEG file.
struct ZV_WS_Image : ZV_WS_Object {
    unsigned int size = 0;
    unsigned char* data = nullptr;
};

/// A version MAJOR.MINOR.REVISION.
struct ZV_WS_VersionInfo : ZV_WS_Object {
    int Major = 0;
    int Minor = 0;
    int Revision = 0;
};

/// Base of most answers.
struct ZV_WS_StandardResponse : ZV_WS_Object {
    int ResponseCode = 0;             ///< The service's own: 0 success, else what the operation defines.
    char* ResponseMessage = nullptr;  ///< The service's own words, for a log. No player decides anything by them.
};

// ---- The catalogue

struct ZV_WS_Genre : ZV_WS_Object {
    int ID = 0;
    char* Name = nullptr;
    bool Visible = false;  ///< Whether the service wants it shown.
    int ParentID = 0;      ///< The genre above it; 0 at the top.
};

/// The genre tree, flat: each genre names its parent.
struct ZV_WS_GenreArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_Genre* Genre = nullptr;
};

/// Texts for the head of a genre's pages.
struct ZV_WS_GenreLabelResponse : ZV_WS_StandardResponse {
    char* Label = nullptr;
    char* LabelMessage = nullptr;  ///< Explains the label.
};

/// A trailer, or what else comes with a title.
struct ZV_WS_BonusAsset : ZV_WS_Object {
    int BonusAssetID = 0;  ///< For ZV_WS_getStreamingBonusAssetLocation.
    ZV_WS_FileProfile Profile = FILE_PROFILE_UNKNOWN;
    ZV_WS_BonusAssetType BonusType = BONUS_ASSET_TYPE_TRAILER;
};

struct ZV_WS_BonusAssetArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_BonusAsset* BonusAsset = nullptr;
};

struct ZV_WS_FileProfileArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_FileProfile* FileProfile = nullptr;
};

/// One of the sounds that there are of a film.
struct ZV_WS_AudioFile : ZV_WS_Object {
    int AssetAudioID = 0;
    char* FileLocation = nullptr;  ///< As the service names it.
    bool ContainsVideo = false;
    ZV_WS_AudioProfile AudioAssetProfile = AUDIO_PROFILE_STEREO_STANDARD;
};

struct ZV_WS_AudioFileArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_AudioFile* AudioFile = nullptr;
};

/// One way to buy or rent a title.
struct ZV_WS_ProductListing : ZV_WS_Object {
    int SkuID = 0;  ///< What ZV_WS_doPurchaseSavedBilling buys.
    ZV_WS_PurchaseType PurchaseType = PURCHASE_TYPE_RENT;
    char* Price = nullptr;                   ///< Decimal text as the service sent it, without currency: "12.99".
    ZV_WS_FileProfileArray AvailableAssets;  ///< The pictures that there are of it.
    char* ExpireDate = nullptr;              ///< "YYYY/MM/DD HH:MM:SS", in the customer's time. Anything else: no date.
    ZV_WS_AudioFileArray AvailableAudioProfiles;  ///< The sounds likewise.
    int RentalPeriod = 0;                         ///< As the service counts it; players show it.
};

struct ZV_WS_ProductListingArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_ProductListing* ProductListing = nullptr;
};

/// A title as listings show it.
struct ZV_WS_TitleListing : ZV_WS_Object {
    int TitleID = 0;
    char* TitleName = nullptr;
    char* BoxArtPrefix = nullptr;       ///< For ZV_WS_getBoxArtImage.
    short TitlePosition = 0;            ///< Its place in the whole listing; the first is 1.
    int EpisodeNumber = 0;              ///< Of an episode, within its season.
    ZV_WS_BonusAssetArray BonusAssets;  ///< Trailers.
    bool IsTvListing = false;           ///< A season, whose episodes are titles of their own.
    char* MPAARating = nullptr;  ///< The ages that it is for, by the scale of the United States; CHVRS: of Canada.
    ZV_WS_ProductListingArray AvailableProducts;       ///< The ways to buy or rent it.
    bool IsTHXMediaDirectorEnabled = false;            ///< Whether ZV_WS_getTHXMediaDirector has something for it.
    bool IsTHXMediaDirectorEnabledForTrailer = false;  ///< Likewise ZV_WS_getTHXMediaDirectorBonusAsset.
    char* CHVRSRating = nullptr;
    char* LoyaltyPointsForBuy = nullptr;  ///< Texts to show.
    char* LoyaltyPointsForRent = nullptr;
};

struct ZV_WS_TitleListingArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitleListing* TitleListing = nullptr;
};

/// A title's details. Not derived from ZV_WS_StandardResponse, but with its two members. Names of people are one text
/// each, as the service joined them.
struct ZV_WS_TitleListingResponse : ZV_WS_TitleListing {
    int ResponseCode = 0;
    char* ResponseMessage = nullptr;
    char* Synopsis = nullptr;
    int UserRating = 0;  ///< The customers' stars.
    char* Directors = nullptr;
    char* Actors = nullptr;
    char* Writers = nullptr;
    char* Producers = nullptr;
    char* Copyright = nullptr;
    char* RunTime = nullptr;       ///< Text to show.
    char* RatingReason = nullptr;  ///< Why it is for that age.
};

struct ZV_WS_TitleListingResponseArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitleListingResponse* TitleListingResponse = nullptr;
};

/// A page of titles.
struct ZV_WS_TitlesResponse : ZV_WS_StandardResponse {
    int GenreID = 0;  ///< 0 for what is no genre's page.
    short CurrentPageNumber = 0;
    short ItemsPerPage = 0;
    short TotalPages = 0;
    short TotalItems = 0;  ///< Of the whole listing.
    ZV_WS_TitleListingArray Titles;
};

/// One page for each genre asked, each with a response code of its own.
struct ZV_WS_TitlesResponseArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitlesResponse* TitlesResponse = nullptr;
};

/// An episode by name and number; ZV_WS_getTvEpisodeListing tells the rest.
struct ZV_WS_TvEpisode : ZV_WS_Object {
    int EpisodeID = 0;  ///< For ZV_WS_getTvEpisodeListing.
    char* EpisodeName = nullptr;
    int EpisodeNumber = 0;
};

struct ZV_WS_TvEpisodeArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TvEpisode* TvEpisode = nullptr;
};

/// The episodes of a season.
struct ZV_WS_TvEpisodeListResponse : ZV_WS_StandardResponse {
    ZV_WS_TvEpisodeArray Episodes;
};

/// The title that a product belongs to.
struct ZV_WS_TranslateSkuIDResponse : ZV_WS_StandardResponse {
    int TitleID = 0;
};

/// The title that another guide knows by an identifier of its own.
struct ZV_WS_TranslateTivoExternalIDResponse : ZV_WS_StandardResponse {
    char* TivoExternalID = nullptr;  ///< The one asked about.
    int TitleID = 0;
};

/// Titles like another one, all on one page.
struct ZV_WS_RecommendedTitlesResponse : ZV_WS_StandardResponse {
    ZV_WS_TitleListingArray Titles;
};

// ---- The customer's account

/// A title the account has bought or rented (or, in a wish list, wishes for: the members that tell of a purchase are
/// then 0, and Status is WATCH_STATUS_UNDEFINED).
struct ZV_WS_TitleListingPurchased : ZV_WS_TitleListing {
    int EpisodeID = 0;         ///< Of an episode; else 0.
    int TvListingTitleID = 0;  ///< An episode's season; else 0.
    ZV_WS_PurchaseType PurchaseType = PURCHASE_TYPE_RENT;
    ZV_WS_WatchStatus Status = WATCH_STATUS_WATCHNOW;
    char* RentalPeriod = nullptr;  ///< Text to show, such as "48 hours".
    int PassID = 0;                ///< What the playback calls take: the right to play this purchase.
    ZV_WS_StreamStatus PlayStatus = STREAM_STATUS_PLAY;
    int StartTimeSeconds = 0;  ///< Where playback resumes.
};

struct ZV_WS_TitleListingPurchasedArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitleListingPurchased* TitleListingPurchased = nullptr;
};

/// A page of purchases; counted like ZV_WS_TitlesResponse.
struct ZV_WS_MyVideosResponse : ZV_WS_StandardResponse {
    short CurrentPageNumber = 0;
    short ItemsPerPage = 0;
    short TotalPages = 0;
    short TotalItems = 0;
    ZV_WS_TitleListingPurchasedArray Titles;
};

/// A page of the wish list.
struct ZV_WS_WishlistItemsResponse : ZV_WS_MyVideosResponse {
    int SortOrder = 0;  ///< A ZV_WS_SortOrder.
};

/// One value for each title asked, in the order asked.
struct ZV_WS_TitlesInWishlist : ZV_WS_Object {
    unsigned int size = 0;
    bool* IsAvailInUserWishlist = nullptr;
};

/// What a gift code has made of the prepaid money.
struct ZV_WS_GiftCertificateResponse : ZV_WS_StandardResponse {
    int Balance = 0;  ///< Prepaid money in cents, with the gift.
};

struct ZV_WS_CheckAdultVerificationEnabledResponse : ZV_WS_StandardResponse {
    bool IsAdultVerificationEnabled = false;  ///< Whether a PIN has to be asked before adult titles.
};

struct ZV_WS_CheckAdultVerificationPinResponse : ZV_WS_StandardResponse {
    bool IsPinVerified = false;  ///< false: the PIN is wrong, which is no failure of the call.
};

/// What a purchase has given the customer.
struct ZV_WS_PurchaseResponse : ZV_WS_StandardResponse {
    int PassID = 0;                      ///< For the playback calls.
    int TransactionID = 0;               ///< The payment's, for questions to the service.
    char* TransactionAuthNum = nullptr;  ///< Likewise, as text.
};

struct ZV_WS_PPCardBalanceResponse : ZV_WS_StandardResponse {
    int Balance = 0;  ///< Prepaid money in cents.
};

/// The card on file, as far as it may be shown.
struct ZV_WS_BillingInfoResponse : ZV_WS_StandardResponse {
    char* CCLastFour = nullptr;  ///< The last four digits of the card on file.
    int CCTypeID = 0;            ///< The kind of card, by the service's number.
    char* CCType = nullptr;      ///< Name to show.
};

/// Each of the two has a response code of its own.
struct ZV_WS_BillingInfoAndPPCBalanceResponse : ZV_WS_Object {
    ZV_WS_BillingInfoResponse BillingInfo;
    ZV_WS_PPCardBalanceResponse PPCardBalance;
};

struct ZV_WS_EmailAddressResponse : ZV_WS_StandardResponse {
    char* EmailAddress = nullptr;
};

/// Decimal texts as the service sent them, like ZV_WS_ProductListing::Price.
struct ZV_WS_CalcOrderTaxResponse : ZV_WS_StandardResponse {
    char* SubTotal = nullptr;
    char* TotalPrice = nullptr;
    char* Tax = nullptr;
};

/// How long a rental lasts.
struct ZV_WS_RentalExpirationResponse : ZV_WS_StandardResponse {
    bool ShouldDisplay = false;  ///< Whether to warn the customer.
    int HoursRemaining = 0;
};

// ---- The device

/// One of the service's values for its players; what a key means is between service and player.
struct ZV_WS_ConfigurationItem : ZV_WS_Object {
    char* Key = nullptr;
    char* Value = nullptr;
};

/// Values that the service gives its players, by keys of its own.
struct ZV_WS_ConfigResponse : ZV_WS_StandardResponse {
    unsigned int size = 0;
    ZV_WS_ConfigurationItem* ConfigurationItem = nullptr;
};

/// Texts for a settings page.
struct ZV_WS_SettingsPageInfoResponse : ZV_WS_StandardResponse {
    char* Account = nullptr;
    char* DeviceID = nullptr;
    char* DeviceName = nullptr;
};

/// What the device can play, as the service knows it.
struct ZV_WS_FileType : ZV_WS_Object {
    ZV_WS_DRMProvider DRMProvider = DRM_PROVIDER_UNKNOWN;
    ZV_WS_AccessType AccessType = ACCESS_TYPE_UNKNOWN;
    ZV_WS_FileProfile FileProfile = FILE_PROFILE_UNKNOWN;
    ZV_WS_VideoFormat VideoFormat = VIDEO_FORMAT_UNKNOWN;
    ZV_WS_FileExtension FileExtension = FILE_EXTENSION_AUTOPOPULATE;
};

struct ZV_WS_AuthorizeDeviceResponse : ZV_WS_StandardResponse {
    char* AuthToken = nullptr;  ///< A secret: to be kept for the next set-up where nobody else can read it.
};

// ---- Playback

/// Where a film plays from, and what belongs to playing it.
struct ZV_WS_StreamingAssetLocationResponse : ZV_WS_StandardResponse {
    char* StreamingAssetLocation = nullptr;  ///< The stream's address.
    int AssetID = 0;
    char* StreamID = nullptr;                        ///< Names this playback in ZV_WS_manageStreamingInstanceStatus.
    char* DRMServerURL = nullptr;                    ///< Where the player gets its licence,
    char* DRMACKServerURL = nullptr;                 ///< and where it says that it has it.
    ZV_WS_StreamStatus Status = STREAM_STATUS_PLAY;  ///< How the last playback ended.
    int StartTimeSeconds = 0;                        ///< Where it did, to resume there.
    char* HeartbeatURL = nullptr;                    ///< What the player fetches while it plays,
    int HeartbeatPollInSeconds = 0;                  ///< and how often.
};

/// Set-up texts for the sound and picture of a film; what is in them is between service and player.
struct ZV_WS_THXMediaDirectorResponse : ZV_WS_StandardResponse {
    char* LongFormat = nullptr;
    char* ShortFormat = nullptr;
};
