// The web-service library: a flat interface over the storefront's browse, account and stream services.
//
// Sessions. ZV_WS_initialize makes a session, ZV_WS_duplicate makes a further one with the same settings, ZV_WS_release
// ends either. A session serves one thread at a time; threads that work at once take a session each. Calls without a
// session may be made from any thread.
//
// Records. Everything a call hands out is a record derived from ZV_WS_Object. The rules for all of them:
//  1. A call empties and tags its output before anything else, without looking at what it held: release a record before
//     using it for another call.
//  2. Whatever the status, the caller owns the output afterwards and frees it with ZV_WS_release, which also takes
//  records
//     that a failed call left empty, and records released before.
//  3. char* members are UTF-8 texts owned by the record; null when the service sent none. Arrays are `size` elements
//  behind a
//     pointer that is null when size is 0. Absent numbers are 0, absent booleans false.
//
// Results. Every call returns a ZV_WS_Status (ZV_WS_Status.h) and throws nothing. For calls that ask a service:
//  - ZV_WS_Status_invalid_param: the handle has no session, or an argument is null or empty where that is not allowed;
//  nothing
//    was sent.
//  - -2011, -2012, -4xxx, -5030, -6xxx: the transport failed; the output is empty. A later call may succeed.
//  - other values: the service refused. Records that extend ZV_WS_StandardResponse hold its code and message.
//  - ZV_WS_Status_general_error is also an answer without its result element, and memory exhaustion.
// An output pointer must not be null (assertion).
//
// Blocking. A call that asks a service blocks until the answer is there, at most for the session's timeouts (30 s to
// connect or send, 88 s to receive). No other call blocks on the network unless its comment says so.
#pragma once

#include <time.h>

#include "ZV_WS_Status.h"

// ---- Enumerations. Numbers outside of the lists occur (a service may know more) and are values like others.

enum ZV_WS_PurchaseType : int { PURCHASE_TYPE_RENT = 0, PURCHASE_TYPE_BUY = 1, PURCHASE_TYPE_ANY = 2 };

enum ZV_WS_TitleTypeFilter : int { TITLE_TYPE_FILTER_ANY = 0, TITLE_TYPE_FILTER_TV = 1, TITLE_TYPE_FILTER_MOVIE = 2 };

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

enum ZV_WS_AudioProfile : int {
    AUDIO_PROFILE_STEREO_STANDARD = 0,
    AUDIO_PROFILE_DOLBY_STEREO_AC3 = 1,
    AUDIO_PROFILE_DOLBY_DIGITAL_PLUS_STEREO = 2,
    AUDIO_PROFILE_DOLBY_DIGITAL_PLUS_51 = 3,
    AUDIO_PROFILE_DTS_EXPRESS_STEREO = 4,
    AUDIO_PROFILE_DTS_EXPRESS_51 = 5,
};

enum ZV_WS_BonusAssetType : int { BONUS_ASSET_TYPE_TRAILER = 0 };

enum ZV_WS_WatchStatus : int {
    WATCH_STATUS_WATCHNOW = 0,
    WATCH_STATUS_RENTAGAIN = 1,
    WATCH_STATUS_NOTAVAILABLE = 2,
    WATCH_STATUS_UNDEFINED = 3,
};

enum ZV_WS_StreamStatus : int {
    STREAM_STATUS_PLAY = 0,
    STREAM_STATUS_STOPPED = 1,
    STREAM_STATUS_PAUSED = 2,
    STREAM_STATUS_RESUMEPLAY = 3,
    STREAM_STATUS_ERRORINPLAYBACK = 4,
};

enum ZV_WS_SortOrder : int {
    SORT_ORDER_DATEADDED = 0,
    SORT_ORDER_TITLENAME = 1,
    SORT_ORDER_RATING = 2,
    SORT_ORDER_USERRATING = 3,
};

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

enum ZV_WS_AccessType : int { ACCESS_TYPE_UNKNOWN = 0, ACCESS_TYPE_DOWNLOAD = 1, ACCESS_TYPE_STREAM = 2 };

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

/// Not sorted by size: the numbers are stored in cache files and stay as they are.
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

/// The environment a session works in. Discovery stores the digit the service sent, also one outside of this list.
enum ZV_WS_EnvID : int { ENVID_APISTG = 0, ENVID_INTERNALSTG = 1, ENVID_PRODUCTION = 2 };

/// The environment asked for at set-up; ENVNUM_DEFAULT (and anything larger) asks the service.
enum ZV_WS_EnvNum : int { ENVNUM_APISTG = 0, ENVNUM_INTERNALSTG = 1, ENVNUM_PRODUCTION = 2, ENVNUM_DEFAULT = 3 };

/// General or adult catalogue.
enum ContentType : int { ContentType_ZV = 0, ContentType_KAC = 1 };

enum CacheType : int { CacheType_None = 0, CacheType_Memory = 1, CacheType_File = 2 };

// ---- Set-up, filled by the caller. Texts are borrowed for the call; nothing of them is kept.

struct ZV_WS_CacheParam {
    /// Which kinds of answer are cached: bits of `Data`. The last three are the cache's own names of the same bits.
    enum CacheData : unsigned int {
        CacheData_Metadata = 1,
        CacheData_BoxArtImage = 2,
        CacheData_Userdata = 4,
        CacheData_Service = CacheData_Metadata,
        CacheData_BoxArt = CacheData_BoxArtImage,
        CacheData_UserData = CacheData_Userdata,
    };

    CacheType Type = CacheType_None;
    unsigned int Data = 0;
    unsigned int Limit = 0;  ///< Bytes for everything cached; 0 is no limit, else at least 358400.
    /// Cache folder, made when absent, for the owner alone. Needed for CacheType_File; "" is the current folder. The
    /// folder is the cache's own: images in it of which no cache knows are removed, and caches that nobody has used for
    /// 30 days.
    const char* Path = nullptr;
};

/// Proxy for all connections of the session; none when Host is null or empty.
struct ZV_WS_ProxyParam {
    const char* Host = nullptr;
    int Port = 0;
    const char* UserName = nullptr;
    const char* Password = nullptr;
};

struct ZV_WS_SetupParams {
    const char* APIKey = nullptr;               ///< Required.
    const char* AuthToken = nullptr;            ///< Null until the device is authorised.
    const char* DestinationUniqueID = nullptr;  ///< Required; the device's identifier, at most 350 characters.
    int DestinationTypeID = 0;
    const char* UserName = nullptr;        ///< Required.
    const char* Password = nullptr;        ///< Required.
    const char* ServiceBaseURL = nullptr;  ///< Not used: discovery decides.
    ContentType Type = ContentType_ZV;
    ZV_WS_EnvNum EnvNum = ENVNUM_DEFAULT;
    ZV_WS_CacheParam CacheParam;
    ZV_WS_ProxyParam ProxyParam;
    ZV_WS_AccessType AccessType = ACCESS_TYPE_UNKNOWN;  ///< Unknown: the service is asked (getFileType).
    const char* ApplicationRevision = nullptr;
    const char* FirmwareRevision = nullptr;
    const char* ModelCode = nullptr;
};

struct ZV_WS_Pagination {
    unsigned int CurrentPageNumber = 1;  ///< The first page is 1.
    unsigned int ItemsPerPage = 0;
};

struct ZV_WS_Environment {
    ZV_WS_EnvNum envNum;
    const char* endpoint;  ///< Display name.
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

struct ZV_WS_Session : ZV_WS_Object {
    SessionImpl* _pSessionImpl = nullptr;
};

struct ZV_WS_String : ZV_WS_Object {
    unsigned int size = 0;  ///< Bytes, without the terminator.
    char* data = nullptr;
};

/// Bytes of a JPEG file.
struct ZV_WS_Image : ZV_WS_Object {
    unsigned int size = 0;
    unsigned char* data = nullptr;
};

struct ZV_WS_VersionInfo : ZV_WS_Object {
    int Major = 0;
    int Minor = 0;
    int Revision = 0;
};

/// Base of most answers. ResponseCode is the service's own: 0 success, else what the operation defines.
struct ZV_WS_StandardResponse : ZV_WS_Object {
    int ResponseCode = 0;
    char* ResponseMessage = nullptr;
};

struct ZV_WS_Genre : ZV_WS_Object {
    int ID = 0;
    char* Name = nullptr;
    bool Visible = false;
    int ParentID = 0;
};

/// The genre tree, flat: each genre names its parent.
struct ZV_WS_GenreArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_Genre* Genre = nullptr;
};

struct ZV_WS_GenreLabelResponse : ZV_WS_StandardResponse {
    char* Label = nullptr;
    char* LabelMessage = nullptr;
};

struct ZV_WS_BonusAsset : ZV_WS_Object {
    int BonusAssetID = 0;
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

struct ZV_WS_AudioFile : ZV_WS_Object {
    int AssetAudioID = 0;
    char* FileLocation = nullptr;
    bool ContainsVideo = false;
    ZV_WS_AudioProfile AudioAssetProfile = AUDIO_PROFILE_STEREO_STANDARD;
};

struct ZV_WS_AudioFileArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_AudioFile* AudioFile = nullptr;
};

/// One way to buy or rent a title.
struct ZV_WS_ProductListing : ZV_WS_Object {
    int SkuID = 0;
    ZV_WS_PurchaseType PurchaseType = PURCHASE_TYPE_RENT;
    char* Price = nullptr;  ///< Decimal text as the service sent it.
    ZV_WS_FileProfileArray AvailableAssets;
    char* ExpireDate = nullptr;  ///< "YYYY/MM/DD HH:MM:SS".
    ZV_WS_AudioFileArray AvailableAudioProfiles;
    int RentalPeriod = 0;
};

struct ZV_WS_ProductListingArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_ProductListing* ProductListing = nullptr;
};

struct ZV_WS_TitleListing : ZV_WS_Object {
    int TitleID = 0;
    char* TitleName = nullptr;
    char* BoxArtPrefix = nullptr;
    short TitlePosition = 0;
    int EpisodeNumber = 0;
    ZV_WS_BonusAssetArray BonusAssets;
    bool IsTvListing = false;
    char* MPAARating = nullptr;
    ZV_WS_ProductListingArray AvailableProducts;
    bool IsTHXMediaDirectorEnabled = false;
    bool IsTHXMediaDirectorEnabledForTrailer = false;
    char* CHVRSRating = nullptr;
    char* LoyaltyPointsForBuy = nullptr;
    char* LoyaltyPointsForRent = nullptr;
};

struct ZV_WS_TitleListingArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitleListing* TitleListing = nullptr;
};

/// A title's details.
struct ZV_WS_TitleListingResponse : ZV_WS_TitleListing {
    int ResponseCode = 0;
    char* ResponseMessage = nullptr;
    char* Synopsis = nullptr;
    int UserRating = 0;
    char* Directors = nullptr;
    char* Actors = nullptr;
    char* Writers = nullptr;
    char* Producers = nullptr;
    char* Copyright = nullptr;
    char* RunTime = nullptr;
    char* RatingReason = nullptr;
};

struct ZV_WS_TitleListingResponseArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitleListingResponse* TitleListingResponse = nullptr;
};

/// A page of titles.
struct ZV_WS_TitlesResponse : ZV_WS_StandardResponse {
    int GenreID = 0;
    short CurrentPageNumber = 0;
    short ItemsPerPage = 0;
    short TotalPages = 0;
    short TotalItems = 0;
    ZV_WS_TitleListingArray Titles;
};

/// One page for each genre asked.
struct ZV_WS_TitlesResponseArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitlesResponse* TitlesResponse = nullptr;
};

struct ZV_WS_TvEpisode : ZV_WS_Object {
    int EpisodeID = 0;
    char* EpisodeName = nullptr;
    int EpisodeNumber = 0;
};

struct ZV_WS_TvEpisodeArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TvEpisode* TvEpisode = nullptr;
};

struct ZV_WS_TvEpisodeListResponse : ZV_WS_StandardResponse {
    ZV_WS_TvEpisodeArray Episodes;
};

struct ZV_WS_TranslateSkuIDResponse : ZV_WS_StandardResponse {
    int TitleID = 0;
};

struct ZV_WS_TranslateTivoExternalIDResponse : ZV_WS_StandardResponse {
    char* TivoExternalID = nullptr;
    int TitleID = 0;
};

struct ZV_WS_RecommendedTitlesResponse : ZV_WS_StandardResponse {
    ZV_WS_TitleListingArray Titles;
};

/// A title the account has bought or rented (or, in a wish list, wishes for).
struct ZV_WS_TitleListingPurchased : ZV_WS_TitleListing {
    int EpisodeID = 0;
    int TvListingTitleID = 0;
    ZV_WS_PurchaseType PurchaseType = PURCHASE_TYPE_RENT;
    ZV_WS_WatchStatus Status = WATCH_STATUS_WATCHNOW;
    char* RentalPeriod = nullptr;
    int PassID = 0;
    ZV_WS_StreamStatus PlayStatus = STREAM_STATUS_PLAY;
    int StartTimeSeconds = 0;  ///< Where playback resumes.
};

struct ZV_WS_TitleListingPurchasedArray : ZV_WS_Object {
    unsigned int size = 0;
    ZV_WS_TitleListingPurchased* TitleListingPurchased = nullptr;
};

struct ZV_WS_MyVideosResponse : ZV_WS_StandardResponse {
    short CurrentPageNumber = 0;
    short ItemsPerPage = 0;
    short TotalPages = 0;
    short TotalItems = 0;
    ZV_WS_TitleListingPurchasedArray Titles;
};

struct ZV_WS_WishlistItemsResponse : ZV_WS_MyVideosResponse {
    int SortOrder = 0;
};

/// One value for each title asked, in the order asked.
struct ZV_WS_TitlesInWishlist : ZV_WS_Object {
    unsigned int size = 0;
    bool* IsAvailInUserWishlist = nullptr;
};

struct ZV_WS_GiftCertificateResponse : ZV_WS_StandardResponse {
    int Balance = 0;
};

struct ZV_WS_CheckAdultVerificationEnabledResponse : ZV_WS_StandardResponse {
    bool IsAdultVerificationEnabled = false;
};

struct ZV_WS_CheckAdultVerificationPinResponse : ZV_WS_StandardResponse {
    bool IsPinVerified = false;
};

struct ZV_WS_PurchaseResponse : ZV_WS_StandardResponse {
    int PassID = 0;
    int TransactionID = 0;
    char* TransactionAuthNum = nullptr;
};

struct ZV_WS_StreamingAssetLocationResponse : ZV_WS_StandardResponse {
    char* StreamingAssetLocation = nullptr;
    int AssetID = 0;
    char* StreamID = nullptr;  ///< Names this playback in ZV_WS_manageStreamingInstanceStatus.
    char* DRMServerURL = nullptr;
    char* DRMACKServerURL = nullptr;
    ZV_WS_StreamStatus Status = STREAM_STATUS_PLAY;  ///< How the last playback ended.
    int StartTimeSeconds = 0;
    char* HeartbeatURL = nullptr;
    int HeartbeatPollInSeconds = 0;
};

struct ZV_WS_PPCardBalanceResponse : ZV_WS_StandardResponse {
    int Balance = 0;
};

struct ZV_WS_ConfigurationItem : ZV_WS_Object {
    char* Key = nullptr;
    char* Value = nullptr;
};

struct ZV_WS_ConfigResponse : ZV_WS_StandardResponse {
    unsigned int size = 0;
    ZV_WS_ConfigurationItem* ConfigurationItem = nullptr;
};

struct ZV_WS_BillingInfoResponse : ZV_WS_StandardResponse {
    char* CCLastFour = nullptr;
    int CCTypeID = 0;
    char* CCType = nullptr;
};

struct ZV_WS_BillingInfoAndPPCBalanceResponse : ZV_WS_Object {
    ZV_WS_BillingInfoResponse BillingInfo;
    ZV_WS_PPCardBalanceResponse PPCardBalance;
};

struct ZV_WS_SettingsPageInfoResponse : ZV_WS_StandardResponse {
    char* Account = nullptr;
    char* DeviceID = nullptr;
    char* DeviceName = nullptr;
};

struct ZV_WS_EmailAddressResponse : ZV_WS_StandardResponse {
    char* EmailAddress = nullptr;
};

struct ZV_WS_CalcOrderTaxResponse : ZV_WS_StandardResponse {
    char* SubTotal = nullptr;
    char* TotalPrice = nullptr;
    char* Tax = nullptr;
};

struct ZV_WS_RentalExpirationResponse : ZV_WS_StandardResponse {
    bool ShouldDisplay = false;
    int HoursRemaining = 0;
};

/// What the device can play, as the service knows it.
struct ZV_WS_FileType : ZV_WS_Object {
    ZV_WS_DRMProvider DRMProvider = DRM_PROVIDER_UNKNOWN;
    ZV_WS_AccessType AccessType = ACCESS_TYPE_UNKNOWN;
    ZV_WS_FileProfile FileProfile = FILE_PROFILE_UNKNOWN;
    ZV_WS_VideoFormat VideoFormat = VIDEO_FORMAT_UNKNOWN;
    ZV_WS_FileExtension FileExtension = FILE_EXTENSION_AUTOPOPULATE;
};

struct ZV_WS_THXMediaDirectorResponse : ZV_WS_StandardResponse {
    char* LongFormat = nullptr;
    char* ShortFormat = nullptr;
};

struct ZV_WS_AuthorizeDeviceResponse : ZV_WS_StandardResponse {
    char* AuthToken = nullptr;
};

// ---- Session

/// Makes a session: checks `params`, discovers the service environment unless EnvNum names one, and asks the service
/// for the access type unless AccessType does. Blocks on the network for both. `params` must not be null. Failures
/// leave the handle empty, except ZV_WS_Status_ssl_error, after which it still has to be released:
///  - ZV_WS_Status_invalid_param: a required text is missing or empty, the identifier is too long, a file cache has no
///  path, or
///    the cache limit is too small;
///  - ZV_WS_Status_failed_to_create_cache_folder;
///  - ZV_WS_Status_file_operation_error: the deployment file cannot be used (one line on the error stream says why);
///  - ZV_WS_Status_ssl_error: the certificate authorities cannot be loaded;
///  - ZV_WS_Status_connection_error: discovery could not reach the service;
///  - ZV_WS_Status_clock_wrong: nor can it before somebody sets the device's clock;
///  - ZV_WS_Status_local_cache_error: the cache cannot be opened, not even anew.
ZV_WS_Status ZV_WS_initialize(ZV_WS_Session* handle, const ZV_WS_SetupParams* params);

/// Makes a session with the settings of `source`, for another thread; another thread may be in the middle of a call
/// with `source`. Both share what they know of the customer: the authorisation token, and what a change has made stale.
/// Nothing is asked from the network. ZV_WS_Status_invalid_param without a source session. After ssl_error or
/// local_cache_error the new handle has to be released.
ZV_WS_Status ZV_WS_duplicate(ZV_WS_Session* newHandle, const ZV_WS_Session* source);

/// Frees whatever the record owns and empties it; ends a session. Always ZV_WS_Status_ok; null and empty records are
/// fine.
ZV_WS_Status ZV_WS_release(ZV_WS_Object* any);

/// Breaks off the call that another thread makes with the session, and lets no further one begin: the call returns
/// within 200 ms with a transport failure. For ending a session that may hang in the network; ZV_WS_release still has to
/// follow, after that thread's call has returned. Any thread. An empty handle is fine. A null one breaks off every
/// ZV_WS_getServerTime that is under way, and lets others begin.
void ZV_WS_abort(const ZV_WS_Session* handle);

/// The library's version, 1.3.1.
ZV_WS_Status ZV_WS_getVersion(ZV_WS_VersionInfo* version);

/// The environments to choose from at set-up. Needs no session.
ZV_WS_Status ZV_WS_getAvailableEnvLists(ZV_WS_EnvironmentLists* list);

/// Asks the service for the device's environment anew: blocks. ZV_WS_Status_net_error when it cannot be reached.
ZV_WS_Status ZV_WS_getDefaultEnvID(ZV_WS_Session* handle, ZV_WS_EnvID* env);

/// The environment found at set-up. 0 after a failure, as above.
ZV_WS_Status ZV_WS_getDeviceEnv(ZV_WS_Session* handle, ZV_WS_EnvID* env);

/// The text that every request carries as its user agent; empty when neither revisions nor model were given.
ZV_WS_Status ZV_WS_getUserAgent(ZV_WS_Session* handle, ZV_WS_String* userAgent);

/// The device's identifier as given at set-up.
ZV_WS_Status ZV_WS_getDestinationUniqueID(ZV_WS_Session* handle, ZV_WS_String* id);

// ---- Catalogue. Ids that the service does not know are its refusals (ZV_WS_Status_general_error).
//
// "Cached with the catalogue": a session that caches CacheData_Metadata answers from its cache without asking, as long
// as the service's catalogue stays the one it was. The answers are dropped when ZV_WS_updateLocalCache finds a later
// load time (set-up looks by itself), all together when they have outgrown their share of the limit, and by
// ZV_WS_clearLocalCache. An answer that was asked for before such a moment is not kept after it.
//
// Numbers of elements and pages above 2,147,483,647 are ZV_WS_Status_invalid_param.

/// Cached with the catalogue.
ZV_WS_Status ZV_WS_getNavigation(ZV_WS_Session* handle, ZV_WS_GenreArray* genres);

ZV_WS_Status ZV_WS_getGenreLabel(ZV_WS_Session* handle, int genreID, ZV_WS_GenreLabelResponse* label);

/// A page of a genre's titles. `purchaseType` is a ZV_WS_PurchaseType. Cached with the catalogue.
ZV_WS_Status ZV_WS_getTitles(ZV_WS_Session* handle, int genreID, const ZV_WS_Pagination* page, int purchaseType,
                             ZV_WS_TitlesResponse* titles);

/// The same page of each of `count` genres. Never cached.
ZV_WS_Status ZV_WS_getTitlesByGenreIDs(ZV_WS_Session* handle, const int* genreIDs, unsigned int count,
                                       const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                                       ZV_WS_TitlesResponseArray* titles);

/// All four are cached with the catalogue. The listings, which tell of the wish list, are also dropped with all that is
/// cached of the customer (ZV_WS_getWishlistItems), and when the wish list is emptied.
ZV_WS_Status ZV_WS_getTitleListing(ZV_WS_Session* handle, int titleID, ZV_WS_TitleListingResponse* listing);
ZV_WS_Status ZV_WS_getTvEpisodeListing(ZV_WS_Session* handle, int episodeID, ZV_WS_TitleListingResponse* listing);
ZV_WS_Status ZV_WS_getTvEpisodeListByTitleID(ZV_WS_Session* handle, int titleID, ZV_WS_TvEpisodeListResponse* episodes);
ZV_WS_Status ZV_WS_getAllTvEpisodeListings(ZV_WS_Session* handle, int titleID,
                                           ZV_WS_TitleListingResponseArray* listings);

/// Both are cached with the catalogue.
ZV_WS_Status ZV_WS_translateSkuID(ZV_WS_Session* handle, int skuID, ZV_WS_TranslateSkuIDResponse* title);
ZV_WS_Status ZV_WS_translateTivoExternalID(ZV_WS_Session* handle, const char* externalID,
                                           ZV_WS_TranslateTivoExternalIDResponse* title);

/// Titles whose names hold the text. Cached with the catalogue.
ZV_WS_Status ZV_WS_searchForTitle(ZV_WS_Session* handle, const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                                  ZV_WS_TitleTypeFilter typeFilter, const char* query, ZV_WS_TitlesResponse* titles);
/// The same with all that the service knows of each title. Cached with the catalogue.
ZV_WS_Status ZV_WS_searchForTitleDetail(ZV_WS_Session* handle, const ZV_WS_Pagination* page,
                                        ZV_WS_PurchaseType purchaseType, ZV_WS_TitleTypeFilter typeFilter,
                                        const char* query, ZV_WS_TitlesResponse* titles);

/// Titles like that one. Cached with the catalogue.
ZV_WS_Status ZV_WS_getRecommendedTitles(ZV_WS_Session* handle, int titleID, ZV_WS_RecommendedTitlesResponse* titles);

// ---- The device at the service

ZV_WS_Status ZV_WS_getFileType(ZV_WS_Session* handle, ZV_WS_FileType* fileType);

/// Activates the device with the PIN that the customer was shown. On success the next requests of the session, its
/// duplicates and the session that it is a duplicate of carry the new token, and all that is cached of the customer
/// before is dropped. A PIN is required.
ZV_WS_Status ZV_WS_authorizeDevice(ZV_WS_Session* handle, const char* pin, ZV_WS_AuthorizeDeviceResponse* answer);
/// Ends the activation: likewise, and the requests carry no token.
ZV_WS_Status ZV_WS_deactivateDevice(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);

/// Whether the service still takes the session's token.
ZV_WS_Status ZV_WS_checkAuthToken(ZV_WS_Session* handle, bool* isValid);

ZV_WS_Status ZV_WS_getConfig(ZV_WS_Session* handle, ZV_WS_ConfigResponse* config);
/// Cached with the customer's data (see below).
ZV_WS_Status ZV_WS_getSettingsPageInfo(ZV_WS_Session* handle, ZV_WS_SettingsPageInfoResponse* info);
ZV_WS_Status ZV_WS_getCountryID(ZV_WS_Session* handle, int* countryID);

ZV_WS_Status ZV_WS_setAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile profile,
                                           ZV_WS_StandardResponse* answer);
ZV_WS_Status ZV_WS_getAudioDefaultProperty(ZV_WS_Session* handle, ZV_WS_AudioProfile* profile);

// ---- The customer's account
//
// "Cached with the customer's data": a session that caches CacheData_Userdata answers from its cache without asking, as
// long as the device belongs to the same customer. All of it is dropped by every set-up, by ZV_WS_updateLocalCache with
// CacheData_Userdata, by ZV_WS_authorizeDevice and ZV_WS_deactivateDevice, together with the catalogue's answers when
// either has outgrown its share of the limit, and by ZV_WS_clearLocalCache; some of it by the changes named below, also
// when their answer was lost and nobody knows whether they were made. What was asked for before is not kept after it.

/// A page of what the customer bought or rented. `watchStatus` is a ZV_WS_WatchStatus. Cached with the customer's data,
/// but for devices that download; dropped by a purchase and by ZV_WS_removeAllMyPurchases.
ZV_WS_Status ZV_WS_getMyVideos(ZV_WS_Session* handle, const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                               ZV_WS_TitleTypeFilter typeFilter, int watchStatus, ZV_WS_MyVideosResponse* videos);

/// The purchased titles behind `count` passes.
ZV_WS_Status ZV_WS_getTitleListingPurchaseds(ZV_WS_Session* handle, const int* passIDs, unsigned int count,
                                             ZV_WS_TitleListingPurchasedArray* titles);

ZV_WS_Status ZV_WS_checkForPurchasedTitle(ZV_WS_Session* handle, int titleID, bool* isPurchased);
ZV_WS_Status ZV_WS_checkForPurchasedSku(ZV_WS_Session* handle, int skuID, bool* isPurchased);
ZV_WS_Status ZV_WS_checkRentalExpiration(ZV_WS_Session* handle, int passID, ZV_WS_RentalExpirationResponse* expiration);

/// Forgets every purchase of the account. The account's password is required.
ZV_WS_Status ZV_WS_removeAllMyPurchases(ZV_WS_Session* handle, const char* password, ZV_WS_StandardResponse* answer);

/// A page of the wish list. Cached with the customer's data; dropped by every change of the list.
ZV_WS_Status ZV_WS_getWishlistItems(ZV_WS_Session* handle, ZV_WS_SortOrder sortOrder, const ZV_WS_Pagination* page,
                                    ZV_WS_TitleTypeFilter typeFilter, ZV_WS_WishlistItemsResponse* items);
/// Changes of the wish list. What is known then of the title, or of all of them, is cached.
ZV_WS_Status ZV_WS_addItemToWishlist(ZV_WS_Session* handle, int titleID, ZV_WS_StandardResponse* answer);
ZV_WS_Status ZV_WS_removeItemFromWishlist(ZV_WS_Session* handle, int titleID, ZV_WS_StandardResponse* answer);
ZV_WS_Status ZV_WS_removeAllItemsFromWishlist(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);
/// Answers from what is cached of the title (a change of it, an earlier check), else from its listing, asked anew.
ZV_WS_Status ZV_WS_checkTitleInWishlist(ZV_WS_Session* handle, int titleID, bool* isInWishlist);

/// One answer for each of `count` titles: from what is cached when that tells of all of them, else from the wish list,
/// of which as many pages are asked for as it has.
ZV_WS_Status ZV_WS_checkTitlesInWishlist(ZV_WS_Session* handle, const int* titleIDs, unsigned int count,
                                         ZV_WS_TitleTypeFilter typeFilter, ZV_WS_TitlesInWishlist* answers);

ZV_WS_Status ZV_WS_checkAdultVerificationEnabled(ZV_WS_Session* handle,
                                                 ZV_WS_CheckAdultVerificationEnabledResponse* answer);
/// The PIN is sent with at least four digits, and once only: the service may count wrong ones.
ZV_WS_Status ZV_WS_checkAdultVerificationPin(ZV_WS_Session* handle, int pin,
                                             ZV_WS_CheckAdultVerificationPinResponse* answer);

/// Both are cached with the customer's data.
ZV_WS_Status ZV_WS_getEmailAddress(ZV_WS_Session* handle, ZV_WS_EmailAddressResponse* address);
ZV_WS_Status ZV_WS_getBillingInfo(ZV_WS_Session* handle, ZV_WS_BillingInfoResponse* billing);
/// These two are never cached.
ZV_WS_Status ZV_WS_getBillingInfoAndPPCBalance(ZV_WS_Session* handle, ZV_WS_BillingInfoAndPPCBalanceResponse* billing);
ZV_WS_Status ZV_WS_getPrePaidCardBalance(ZV_WS_Session* handle, ZV_WS_PPCardBalanceResponse* balance);
ZV_WS_Status ZV_WS_assignGiftCertificateToUser(ZV_WS_Session* handle, const char* code,
                                               ZV_WS_GiftCertificateResponse* answer);

/// Buys with the card on file, or from prepaid money. `ipAddress` is the customer's address. Sent once only: after a
/// transport failure the purchase may have been made.
ZV_WS_Status ZV_WS_doPurchaseSavedBilling(ZV_WS_Session* handle, int skuID, const char* ipAddress, bool usePrepaidFund,
                                          ZV_WS_PurchaseResponse* purchase);
ZV_WS_Status ZV_WS_calcOrderTax(ZV_WS_Session* handle, int skuID, ZV_WS_CalcOrderTaxResponse* tax);

// ---- Playback

ZV_WS_Status ZV_WS_getStreamingAssetLocation(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                             ZV_WS_StreamingAssetLocationResponse* location);
ZV_WS_Status ZV_WS_getStreamingBonusAssetLocation(ZV_WS_Session* handle, int bonusAssetID,
                                                  ZV_WS_StreamingAssetLocationResponse* location);
ZV_WS_Status ZV_WS_loadLastStreamingAssetLocation(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                                  ZV_WS_StreamingAssetLocationResponse* location);

/// Reports what became of a playback. `streamID` is that of its location and required; `stopTime` is its position in
/// seconds.
ZV_WS_Status ZV_WS_manageStreamingInstanceStatus(ZV_WS_Session* handle, const char* streamID, ZV_WS_StreamStatus status,
                                                 int stopTime, ZV_WS_StandardResponse* answer);

/// A refusal by the service leaves the status of these two at ok: it is in the record only.
ZV_WS_Status ZV_WS_getTHXMediaDirector(ZV_WS_Session* handle, int passID, ZV_WS_FileProfile fileProfile,
                                       ZV_WS_AudioProfile audioProfile, ZV_WS_THXMediaDirectorResponse* data);
ZV_WS_Status ZV_WS_getTHXMediaDirectorBonusAsset(ZV_WS_Session* handle, int bonusAssetID, ZV_WS_FileProfile fileProfile,
                                                 ZV_WS_BonusAssetType bonusAssetType,
                                                 ZV_WS_THXMediaDirectorResponse* data);

/// Diagnostic: ask the service to answer with a timeout, or with an error, to see a client's own way with it.
ZV_WS_Status ZV_WS_returnTimeout(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);
ZV_WS_Status ZV_WS_returnError(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer);

// ---- Local cache. Calls of the catalogue and the account answer from it without asking the service, and keep there
// what the service answered with success. A cache that fails never fails a call: a broken file is made anew, one that
// was removed comes back, and one that another process keeps locked for 10 s is not used for a while, or by a session
// that is just set up not at all.

/// Whether the catalogue has changed since that time (a text as ZV_WS_getLastCacheLoadTimeUTC gives it), by the
/// service's opinion. The time is required.
ZV_WS_Status ZV_WS_shouldUpdateCache(ZV_WS_Session* handle, const char* utcTime, bool* should);

/// When the service last loaded its catalogue.
ZV_WS_Status ZV_WS_getLastCacheLoadTimeUTC(ZV_WS_Session* handle, ZV_WS_String* utcTime);

/// Refreshes the session's cache; `operations` are CacheData bits: the catalogue's answers are dropped when the service
/// has loaded a new one, images are marked for revalidation, the user's data are dropped. ok also when nothing is
/// cached; failed steps are not reported.
ZV_WS_Status ZV_WS_updateLocalCache(ZV_WS_Session* handle, unsigned int operations);

/// Removes images, databases and temporary files of a cache folder. The folder is required.
ZV_WS_Status ZV_WS_clearLocalCache(const char* folder);

// ---- Box art. `prefix` is a title's BoxArtPrefix and required; one that is no plain file name is
// ZV_WS_Status_invalid_param. Others: connection_error; net_error; file_operation_error; file_not_found_on_server. An
// image that cannot be revalidated is answered as it is cached.

/// An image's bytes, from the cache or the image host. Cached images stay until ZV_WS_updateLocalCache with
/// CacheData_BoxArtImage marks them, after which the next call asks the host whether it has another one, and keeps the
/// old one when the host cannot be asked; until the oldest titles make room in a cache that has outgrown its share of
/// the limit; and until ZV_WS_clearLocalCache.
ZV_WS_Status ZV_WS_getBoxArtImageData(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix,
                                      ZV_WS_Image* image);

/// Where an image is: the file in the folder of a file cache that keeps images, fetched when it is not there whole, for
/// as long as above; for other sessions its address, and nothing is fetched.
ZV_WS_Status ZV_WS_getBoxArtImage(ZV_WS_Session* handle, ZV_WS_BoxArtSize size, const char* prefix,
                                  ZV_WS_String* place);

// ---- Clock, bandwidth, address

/// The service's clock in seconds since 1970 UTC; -1 on failure. Needs no session, and goes through the proxy of the one
/// that was last set up. ZV_WS_Status_connection_error, ZV_WS_Status_net_error, or ZV_WS_Status_general_error for an
/// answer that is no time.
ZV_WS_Status ZV_WS_getServerTime(time_t* serverTime);

/// The download rate in bits per second, measured on at most 200 KiB; 0 on failure. The file's address is asked once
/// per session (ZV_WS_getConfig, whose failures are returned). Others: connection_error; net_error;
/// file_not_found_on_server; failed_to_get_bandwidth_check_url and invalid_bandwidth_check_url for the address.
ZV_WS_Status ZV_WS_checkBandwidth(ZV_WS_Session* handle, unsigned int* bitsPerSecond);

/// The device's address as text, IPv4 or IPv6, on its way to the service or, where there is one, to the proxy; never a
/// loopback address. Asks neither the network nor a name server and does not block: the way is that of the session's
/// last connection, else that to the addresses already known of the service's name, else, as long as nothing is known
/// of it or when it is on this device, the default route. ZV_WS_Status_net_error when no way leaves the device.
ZV_WS_Status ZV_WS_getLocalIPAddr(ZV_WS_Session* handle, ZV_WS_String* address);

// ---- Files. ZV_WS_Status_invalid_param for a null path, ZV_WS_Status_file_operation_error when the operation fails.

/// A file that is not there counts as removed.
ZV_WS_Status ZV_WS_removeFile(const char* path);
/// A file copied onto itself (the same path, a link, another name of it) stays as it is: ok.
ZV_WS_Status ZV_WS_copyFile(const char* source, const char* target);
/// The path up to and including its last "/".
ZV_WS_Status ZV_WS_getFolderName(const char* path, ZV_WS_String* folder);
ZV_WS_Status ZV_WS_folderExist(const char* path, bool* exists);
/// Makes the missing folders above, too.
ZV_WS_Status ZV_WS_createFolder(const char* path);
ZV_WS_Status ZV_WS_fileExist(const char* path, bool* exists);

// ---- Settings: key/value pairs in a small XML file, some of the values enciphered with the device's own key. No
// session; any thread, any number of processes on one file. The calls block on the disk only, writers of one folder
// also on each other (at most 5 s).
//
// ZV_WS_Status_invalid_param for a null argument, an empty path and an empty key. ZV_WS_Status_setting_invalid_value as
// said for each call. ZV_WS_Status_file_operation_error when the file cannot be read or written, to read also when it
// is larger than 1 MiB, or, for a protected value, when the device key (docs/deployment.md) is missing.

/// The value of a key, never null on success; "" when the key has no value. Others: setting_key_not_found, also for a
/// file that is empty or no settings file; setting_invalid_value for a protected value that was changed from outside,
/// was stored under another key or by another device, or was never protected.
ZV_WS_Status ZV_WS_readSetting(const char* path, const char* key, bool protectedValue, ZV_WS_String* value);

/// Changes the key's value or adds it; makes the file when there is none, but no folder. Once it has succeeded the
/// value is on the disk; when it fails, or the process dies in it, the file is what it was or is whole with the new
/// value. A file that is ruined, so that it is no settings file or is larger than 1 MiB, is kept as "<path>.bad", in
/// the place of an earlier one and with a line in the log, and a new one is begun; what is no file is left alone
/// (file_operation_error). Key and value are UTF-8: setting_invalid_value for characters that XML cannot hold; a
/// protected value may be any bytes.
ZV_WS_Status ZV_WS_writeSetting(const char* path, const char* key, const char* value, bool protectedValue);

/// Keeps the environment that a device is set to in a file of its own, of the same format, under the key "EnvNum" in
/// decimal. The library never reads it: a movie passes the value to the set-up where it would pass ENVNUM_DEFAULT.
/// setting_invalid_value for a number outside of ZV_WS_EnvNum.
ZV_WS_Status ZV_WS_createEnvXML(const char* path, ZV_WS_EnvNum envNum);
/// A file that is not there counts as deleted.
ZV_WS_Status ZV_WS_deleteEnvXML(const char* path);
