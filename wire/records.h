// Records that the operations carry. Children stand in wire order; 1 marks a child that is always written, 0 one that is
// left out when null. Decimals stay text, so that 4.99 is never anything but those four characters. Arrays are a size and
// a block of pointers: nothing here throws when memory runs out.

class ZV1__ArrayOfBonusAsset;
class ZV1__ArrayOfProductListing;
class ZV1__ArrayOfFileProfile;
class ZV1__ArrayOfAudioFile;

// --- Common response header and catalogue records
class ZV1__StandardResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
};

class ZV1__Genre {
public:
    int ID 1;
    char* Name 0;
    bool Visible 1;
    int ParentId 1;
};

class ZV1__ArrayOfGenre {
public:
    int __sizeGenre;
    ZV1__Genre** Genre;
};

class ZV1__GenreRequest {
public:
    ZV1__ArrayOfGenre* Genres 0;
};

class ZV1__GetGenreLabelResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* Label 0;
    char* LabelMessage 0;
};

class ZV1__TitleListing {
public:
    int TitleID 1;
    char* TitleName 0;
    char* BoxArtPrefix 0;
    short TitlePosition 1;
    int EpisodeNumber 1;
    ZV1__ArrayOfBonusAsset* BonusAssets 0;
    bool IsTvListing 1;
    char* MPAARating 0;
    ZV1__ArrayOfProductListing* AvailableProducts 0;
    bool IsTHXMediaDirectorEnabled 1;
    bool IsTHXMediaDirectorEnabledForTrailer 1;
    char* CHVRSRating 0;
    char* LoyaltyPointsForBuy 0;
    char* LoyaltyPointsForRent 0;
};

class ZV1__ArrayOfTitleListing {
public:
    int __sizeTitleListing;
    ZV1__TitleListing** TitleListing;
};

class ZV1__TitleListingResponse : public ZV1__TitleListing {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* Synopsys 0;
    int UserRating 1;
    char* Directors 0;
    char* Actors 0;
    char* Writers 0;
    char* Producers 0;
    char* Copyright 0;
    char* RunTime 0;
    bool IsAvailInUserWishList 1;
    char* RatingReason 0;
};

class ZV1__ArrayOfTitleListingResponse {
public:
    int __sizeTitleListingResponse;
    ZV1__TitleListingResponse** TitleListingResponse;
};

class ZV1__BonusAsset {
public:
    @int BonusAssetID;
    @enum ZV1__FileProfile Profile;
    @enum ZV1__BonusAssetType BonusType;
};

class ZV1__ArrayOfBonusAsset {
public:
    int __sizeBonusAsset;
    ZV1__BonusAsset** BonusAsset;
};

class ZV1__ProductListing {
public:
    int SkuID 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    xsd__decimal Price 0;
    ZV1__ArrayOfFileProfile* AvailableAssets 0;
    char* ExpireDate 0;
    ZV1__ArrayOfAudioFile* AvailableAudioProfiles 0;
    int RentalPeriod 1;
};

class ZV1__ArrayOfProductListing {
public:
    int __sizeProductListing;
    ZV1__ProductListing** ProductListing;
};

class ZV1__ArrayOfFileProfile {
public:
    int __sizeFileProfile;
    enum ZV1__FileProfile* FileProfile;
};

class ZV1__AudioFile {
public:
    int AssetAudioID 1;
    char* FileLocation 0;
    bool ContainsVideo 1;
    enum ZV1__AudioProfile AudioAssetProfile 1;
};

class ZV1__ArrayOfAudioFile {
public:
    int __sizeAudioFile;
    ZV1__AudioFile** AudioFile;
};

class ZV1__GetTitlesResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    int GenreID 1;
    short CurrentPageNumber 1;
    short ItemsPerPage 1;
    short TotalPages 1;
    short TotalItems 1;
    ZV1__ArrayOfTitleListing* Titles 0;
};

class ZV1__ArrayOfGetTitlesResponse {
public:
    int __sizeGetTitlesResponse;
    ZV1__GetTitlesResponse** GetTitlesResponse;
};

class ZV1__TvEpisode {
public:
    int EpisodeID 1;
    char* EpisodeName 0;
    int EpisodeNumber 1;
};

class ZV1__ArrayOfTvEpisode {
public:
    int __sizeTvEpisode;
    ZV1__TvEpisode** TvEpisode;
};

class ZV1__TvEpisodeList {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    ZV1__ArrayOfTvEpisode* Episodes 0;
};

class ZV1__RecommendedTitlesResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    ZV1__ArrayOfTitleListing* Titles 0;
};

class ZV1__TranslateSkuIdResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    int TitleId 1;
};

class ZV1__TranslatedTivoExternalIdResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* TivoExternalId 0;
    int TitleId 1;
};

class ZV1__FileType {
public:
    enum ZV1__DRMProvider File_USCOREDRMProvider 1;
    enum ZV1__AccessType File_USCOREAccessType 1;
    enum ZV1__FileProfile File_USCOREFileProfile 1;
    enum ZV1__VideoFormat File_USCOREVideoFormat 1;
    enum ZV1__FileExtension File_USCOREFileExtension 1;
};

class ZV1__ArrayOfInt {
public:
    int __sizeint_;
    int* int_;
};


// --- Purchased titles, my videos and wish list
class ZV1__TitleListingPurchased : public ZV1__TitleListing {
public:
    int EpisodeID 1;
    int TvListingTitleID 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__WatchStatus Status 1;
    char* RentalPeriod 0;
    int PassID 1;
    enum ZV1__StreamStatus PlayStatus 1;
    int StartTimeSeconds 1;
};

class ZV1__ArrayOfTitleListingPurchased {
public:
    int __sizeTitleListingPurchased;
    ZV1__TitleListingPurchased** TitleListingPurchased;
};

class ZV1__TitleListingPurchasedForPass : public ZV1__TitleListingPurchased {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
};

class ZV1__ArrayOfTitleListingPurchasedForPass {
public:
    int __sizeTitleListingPurchasedForPass;
    ZV1__TitleListingPurchasedForPass** TitleListingPurchasedForPass;
};

class ZV1__GetMyVideosResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    ZV1__ArrayOfTitleListingPurchased* Titles 0;
    short CurrentPageNumber 1;
    short ItemsPerPage 1;
    short TotalPages 1;
    short TotalItems 1;
};

class ZV1__ArrayOfGetMyVideosResponse {
public:
    int __sizeGetMyVideosResponse;
    ZV1__GetMyVideosResponse** GetMyVideosResponse;
};

class ZV1__GetWishlistItemsResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    ZV1__ArrayOfTitleListingPurchased* Titles 0;
    short CurrentPageNumber 1;
    short ItemsPerPage 1;
    short TotalPages 1;
    short TotalItems 1;
    int SortOrder 1;
};

class ZV1__WishListActionResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
};


// --- Account, configuration and billing
class ZV1__ConfigurationItemOfString {
public:
    @char* Key;
    char* Value 0;
};

class ZV1__ArrayOfConfigurationItemOfString {
public:
    int __sizeConfiguration;
    ZV1__ConfigurationItemOfString** Configuration;
};

class ZV1__GetConfigResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    ZV1__ArrayOfConfigurationItemOfString* ConfigurationSet 0;
};

class ZV1__SettingsPageInfo {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* Account 0;
    char* DeviceID 0;
    char* DeviceName 0;
};

class ZV1__GetEmailAddressResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* EmailAddress 0;
};

class ZV1__BillingInfoResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* CCLastFour 0;
    int CCTypeId 1;
    char* CCType 0;
};

class ZV1__PPCardBalanceResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    int Balance 1;
};

class ZV1__BillingInfoAndPPCBalanceResponse {
public:
    ZV1__BillingInfoResponse* BillingInfo 0;
    ZV1__PPCardBalanceResponse* PPCardBalance 0;
};

class ZV1__GiftCertificateResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    int Balance 1;
};

class ZV1__CalcOrderTaxResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    xsd__decimal SubTotal 0;
    xsd__decimal TotalPrice 0;
    xsd__decimal Tax 0;
};

class ZV1__PurchaseResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    int PassID 1;
    int TransactionId 1;
    char* TransactionAuthNum 0;
};

class ZV1__CheckRentalExpirationResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    bool ShouldDisplay 1;
    int HoursRemaining 1;
};

class ZV1__CheckAdultVerificationEnabledResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    _XML IsAdultVerificationEnabled 0;
};

class ZV1__CheckAdultVerificationPinResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    bool IsPinVerified 1;
};


// --- Streaming
class ZV1__GetStreamingAssetLocationResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* StreamingAssetLocation 0;
    int AssetID 1;
    char* StreamID 0;
    char* DRMServerURL 0;
    char* DRMACKServerURL 0;
    enum ZV1__StreamStatus Status 1;
    int StartTimeSeconds 1;
    char* HeartbeatURL 0;
    int HeartbeatPollInSeconds 1;
};

class ZV1__THXMediaDirectorResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* LongFormat 0;
    char* ShortFormat 0;
};

