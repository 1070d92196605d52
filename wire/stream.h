// Stream service: playback, and the account operations with the same elements.

// The THX set-up texts, long and short, for a trailer.
class _ZV1__getTHXMediaDirectorBonusAsset {
public:
    int BonusAssetID 1;
    enum ZV1__FileProfile FileProfile 1;
    enum ZV1__BonusAssetType BonusAssetType 1;
};
class _ZV1__getTHXMediaDirectorBonusAssetResponse {
public:
    ZV1__THXMediaDirectorResponse* getTHXMediaDirectorBonusAssetResult 0;
};

// The THX set-up texts, long and short, for what a pass plays.
class _ZV1__getTHXMediaDirector {
public:
    int PassID 1;
    enum ZV1__FileProfile FileProfile 1;
    enum ZV1__AudioProfile AudioSetting 1;
};
class _ZV1__getTHXMediaDirectorResponse { public: ZV1__THXMediaDirectorResponse* getTHXMediaDirectorResult 0; };

// Keeps the sound that the customer prefers.
class _ZV1__setAudioDefaultProperty { public: enum ZV1__AudioProfile AudioSetting 1; };
class _ZV1__setAudioDefaultPropertyResponse { public: ZV1__StandardResponse* setAudioDefaultPropertyResult 0; };

// The sound that the customer prefers.
class _ZV1__getAudioDefaultProperty {
};
class _ZV1__getAudioDefaultPropertyResponse { public: enum ZV1__AudioProfile* getAudioDefaultPropertyResult 0; };

// What a product costs, without and with tax.
class _ZV1__calcOrderTax { public: int SKUID 1; };
class _ZV1__calcOrderTaxResponse { public: ZV1__CalcOrderTaxResponse* calcOrderTaxResult 0; };

// Diagnostic: a player reports a timeout, or sees how it takes what the service answers here.
class _ZV1__ReturnTimeout {
};
class _ZV1__ReturnTimeoutResponse { public: ZV1__StandardResponse* ReturnTimeoutResult 0; };

// Diagnostic: a player reports an error, or sees how it takes what the service answers here.
class _ZV1__ReturnError {
};
class _ZV1__ReturnErrorResponse { public: ZV1__StandardResponse* ReturnErrorResult 0; };

// Forgets every purchase of the account, whose password it wants.
class _ZV1__removeAllMyPurchases { public: char* password 0; };
class _ZV1__removeAllMyPurchasesResponse { public: ZV1__StandardResponse* removeAllMyPurchasesResult 0; };

// Where to go on playing what a pass stands for: the stream that was played last, and the second at which it stopped.
class _ZV1__loadLastStreamingAssetLocationForPass {
public:
    int PassID 1;
    enum ZV1__FileProfile FileProfile 1;
};
class _ZV1__loadLastStreamingAssetLocationForPassResponse {
public:
    ZV1__GetStreamingAssetLocationResponse* loadLastStreamingAssetLocationForPassResult 0;
};

// Where a trailer plays from.
class _ZV1__getBonusAssetLocation { public: int BonusAssetID 1; };
class _ZV1__getBonusAssetLocationResponse {
public:
    ZV1__GetStreamingAssetLocationResponse* getBonusAssetLocationResult 0;
};

// Where to start playing what a pass stands for: a new stream, its licence servers and its heartbeat.
class _ZV1__getStreamingAssetLocation {
public:
    int PassID 1;
    enum ZV1__FileProfile FileProfile 1;
};
class _ZV1__getStreamingAssetLocationResponse {
public:
    ZV1__GetStreamingAssetLocationResponse* getStreamingAssetLocationResult 0;
};

// Reports what became of a stream and at which second.
class _ZV1__manageStreamInstanceStatus {
public:
    char* StreamID 0;
    enum ZV1__StreamStatus Status 1;
    int StopTimeSeconds 1;
};
class _ZV1__manageStreamInstanceStatusResponse { public: ZV1__StandardResponse* manageStreamInstanceStatusResult 0; };

// The card on file and the prepaid money in one answer.
class _ZV1__getBillingInfoAndPPCBalance {
};
class _ZV1__getBillingInfoAndPPCBalanceResponse {
public:
    ZV1__BillingInfoAndPPCBalanceResponse* getBillingInfoAndPPCBalanceResult 0;
};

// Whether the customer has bought or rented the product.
class _ZV1__checkForPurchasedStream { public: int SkuID 1; };
class _ZV1__checkForPurchasedStreamResponse { public: bool* checkForPurchasedStreamResult 0; };

// Whether the customer has bought or rented the title.
class _ZV1__checkForPurchasedStreamByTitleID { public: int TitleID 1; };
class _ZV1__checkForPurchasedStreamByTitleIDResponse { public: bool* checkForPurchasedStreamByTitleIDResult 0; };

// The purchased titles behind several passes.
class _ZV1__getTitleListingsPurchasedForPasses { public: ZV1__ArrayOfInt* Passes 0; };
class _ZV1__getTitleListingsPurchasedForPassesResponse {
public:
    ZV1__ArrayOfTitleListingPurchasedForPass* getTitleListingsPurchasedForPassesResult 0;
};

// A page of what the customer has bought or rented, for devices that stream.
class _ZV1__getMyStreamingVideos {
public:
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
    enum ZV1__WatchStatus WatchStatusFilter 1;
};
class _ZV1__getMyStreamingVideosResponse { public: ZV1__GetMyVideosResponse* getMyStreamingVideosResult 0; };

//gsoap ZV2 service name: StreamAPISoap12
//gsoap ZV2 service type: StreamAPISoap12
//gsoap ZV2 service namespace: http://api.zorvane.example/api/StreamAPISoap12
//gsoap ZV2 service port: https://api.zorvane.example/api/StreamAPI.asmx
//gsoap ZV2 service style: document
//gsoap ZV2 service encoding: literal

//gsoap ZV2 service method-action: getTHXMediaDirectorBonusAsset http://api.zorvane.example/api/getTHXMediaDirectorBonusAsset
int __ZV2__getTHXMediaDirectorBonusAsset(_ZV1__getTHXMediaDirectorBonusAsset* ZV1__getTHXMediaDirectorBonusAsset, _ZV1__getTHXMediaDirectorBonusAssetResponse* ZV1__getTHXMediaDirectorBonusAssetResponse);

//gsoap ZV2 service method-action: getTHXMediaDirector http://api.zorvane.example/api/getTHXMediaDirector
int __ZV2__getTHXMediaDirector(_ZV1__getTHXMediaDirector* ZV1__getTHXMediaDirector, _ZV1__getTHXMediaDirectorResponse* ZV1__getTHXMediaDirectorResponse);

//gsoap ZV2 service method-action: setAudioDefaultProperty http://api.zorvane.example/api/setAudioDefaultProperty
int __ZV2__setAudioDefaultProperty(_ZV1__setAudioDefaultProperty* ZV1__setAudioDefaultProperty, _ZV1__setAudioDefaultPropertyResponse* ZV1__setAudioDefaultPropertyResponse);

//gsoap ZV2 service method-action: getAudioDefaultProperty http://api.zorvane.example/api/getAudioDefaultProperty
int __ZV2__getAudioDefaultProperty(_ZV1__getAudioDefaultProperty* ZV1__getAudioDefaultProperty, _ZV1__getAudioDefaultPropertyResponse* ZV1__getAudioDefaultPropertyResponse);

//gsoap ZV2 service method-action: calcOrderTax http://api.zorvane.example/api/calcOrderTax
int __ZV2__calcOrderTax(_ZV1__calcOrderTax* ZV1__calcOrderTax, _ZV1__calcOrderTaxResponse* ZV1__calcOrderTaxResponse);

//gsoap ZV2 service method-action: ReturnTimeout http://api.zorvane.example/api/ReturnTimeout
int __ZV2__ReturnTimeout(_ZV1__ReturnTimeout* ZV1__ReturnTimeout, _ZV1__ReturnTimeoutResponse* ZV1__ReturnTimeoutResponse);

//gsoap ZV2 service method-action: ReturnError http://api.zorvane.example/api/ReturnError
int __ZV2__ReturnError(_ZV1__ReturnError* ZV1__ReturnError, _ZV1__ReturnErrorResponse* ZV1__ReturnErrorResponse);

//gsoap ZV2 service method-action: removeAllMyPurchases http://api.zorvane.example/api/removeAllMyPurchases
int __ZV2__removeAllMyPurchases(_ZV1__removeAllMyPurchases* ZV1__removeAllMyPurchases, _ZV1__removeAllMyPurchasesResponse* ZV1__removeAllMyPurchasesResponse);

//gsoap ZV2 service method-action: loadLastStreamingAssetLocationForPass http://api.zorvane.example/api/loadLastStreamingAssetLocationForPass
int __ZV2__loadLastStreamingAssetLocationForPass(_ZV1__loadLastStreamingAssetLocationForPass* ZV1__loadLastStreamingAssetLocationForPass, _ZV1__loadLastStreamingAssetLocationForPassResponse* ZV1__loadLastStreamingAssetLocationForPassResponse);

//gsoap ZV2 service method-action: getBonusAssetLocation http://api.zorvane.example/api/getBonusAssetLocation
int __ZV2__getBonusAssetLocation(_ZV1__getBonusAssetLocation* ZV1__getBonusAssetLocation, _ZV1__getBonusAssetLocationResponse* ZV1__getBonusAssetLocationResponse);

//gsoap ZV2 service method-action: getStreamingAssetLocation http://api.zorvane.example/api/getStreamingAssetLocation
int __ZV2__getStreamingAssetLocation(_ZV1__getStreamingAssetLocation* ZV1__getStreamingAssetLocation, _ZV1__getStreamingAssetLocationResponse* ZV1__getStreamingAssetLocationResponse);

//gsoap ZV2 service method-action: manageStreamInstanceStatus http://api.zorvane.example/api/manageStreamInstanceStatus
int __ZV2__manageStreamInstanceStatus(_ZV1__manageStreamInstanceStatus* ZV1__manageStreamInstanceStatus, _ZV1__manageStreamInstanceStatusResponse* ZV1__manageStreamInstanceStatusResponse);

//gsoap ZV2 service method-action: getBillingInfoAndPPCBalance http://api.zorvane.example/api/getBillingInfoAndPPCBalance
int __ZV2__getBillingInfoAndPPCBalance(_ZV1__getBillingInfoAndPPCBalance* ZV1__getBillingInfoAndPPCBalance, _ZV1__getBillingInfoAndPPCBalanceResponse* ZV1__getBillingInfoAndPPCBalanceResponse);

//gsoap ZV2 service method-action: checkForPurchasedStream http://api.zorvane.example/api/checkForPurchasedStream
int __ZV2__checkForPurchasedStream(_ZV1__checkForPurchasedStream* ZV1__checkForPurchasedStream, _ZV1__checkForPurchasedStreamResponse* ZV1__checkForPurchasedStreamResponse);

//gsoap ZV2 service method-action: checkForPurchasedStreamByTitleID http://api.zorvane.example/api/checkForPurchasedStreamByTitleID
int __ZV2__checkForPurchasedStreamByTitleID(_ZV1__checkForPurchasedStreamByTitleID* ZV1__checkForPurchasedStreamByTitleID, _ZV1__checkForPurchasedStreamByTitleIDResponse* ZV1__checkForPurchasedStreamByTitleIDResponse);

//gsoap ZV2 service method-action: getTitleListingsPurchasedForPasses http://api.zorvane.example/api/getTitleListingsPurchasedForPasses
int __ZV2__getTitleListingsPurchasedForPasses(_ZV1__getTitleListingsPurchasedForPasses* ZV1__getTitleListingsPurchasedForPasses, _ZV1__getTitleListingsPurchasedForPassesResponse* ZV1__getTitleListingsPurchasedForPassesResponse);

//gsoap ZV2 service method-action: getMyStreamingVideos http://api.zorvane.example/api/getMyStreamingVideos
int __ZV2__getMyStreamingVideos(_ZV1__getMyStreamingVideos* ZV1__getMyStreamingVideos, _ZV1__getMyStreamingVideosResponse* ZV1__getMyStreamingVideosResponse);

//gsoap ZV2 service method-action: checkRentalExpiration http://api.zorvane.example/api/checkRentalExpiration
int __ZV2__checkRentalExpiration(_ZV1__checkRentalExpiration* ZV1__checkRentalExpiration, _ZV1__checkRentalExpirationResponse* ZV1__checkRentalExpirationResponse);

//gsoap ZV2 service method-action: GetCountryID http://api.zorvane.example/api/GetCountryID
int __ZV2__GetCountryID(_ZV1__GetCountryID* ZV1__GetCountryID, _ZV1__GetCountryIDResponse* ZV1__GetCountryIDResponse);

//gsoap ZV2 service method-action: getConfig http://api.zorvane.example/api/getConfig
int __ZV2__getConfig(_ZV1__getConfig* ZV1__getConfig, _ZV1__getConfigResponse* ZV1__getConfigResponse);

//gsoap ZV2 service method-action: checkAdultVerificationPin http://api.zorvane.example/api/checkAdultVerificationPin
int __ZV2__checkAdultVerificationPin(_ZV1__checkAdultVerificationPin* ZV1__checkAdultVerificationPin, _ZV1__checkAdultVerificationPinResponse* ZV1__checkAdultVerificationPinResponse);

//gsoap ZV2 service method-action: checkAdultVerificationEnabled http://api.zorvane.example/api/checkAdultVerificationEnabled
int __ZV2__checkAdultVerificationEnabled(_ZV1__checkAdultVerificationEnabled* ZV1__checkAdultVerificationEnabled, _ZV1__checkAdultVerificationEnabledResponse* ZV1__checkAdultVerificationEnabledResponse);

//gsoap ZV2 service method-action: addItemToWishlist http://api.zorvane.example/api/addItemToWishlist
int __ZV2__addItemToWishlist(_ZV1__addItemToWishlist* ZV1__addItemToWishlist, _ZV1__addItemToWishlistResponse* ZV1__addItemToWishlistResponse);

//gsoap ZV2 service method-action: removeAllItemsFromWishList http://api.zorvane.example/api/removeAllItemsFromWishList
int __ZV2__removeAllItemsFromWishList(_ZV1__removeAllItemsFromWishList* ZV1__removeAllItemsFromWishList, _ZV1__removeAllItemsFromWishListResponse* ZV1__removeAllItemsFromWishListResponse);

//gsoap ZV2 service method-action: removeItemFromWishList http://api.zorvane.example/api/removeItemFromWishList
int __ZV2__removeItemFromWishList(_ZV1__removeItemFromWishList* ZV1__removeItemFromWishList, _ZV1__removeItemFromWishListResponse* ZV1__removeItemFromWishListResponse);

//gsoap ZV2 service method-action: getWishlistItems http://api.zorvane.example/api/getWishlistItems
int __ZV2__getWishlistItems(_ZV1__getWishlistItems* ZV1__getWishlistItems, _ZV1__getWishlistItemsResponse* ZV1__getWishlistItemsResponse);

//gsoap ZV2 service method-action: assignGiftCertificateToUser http://api.zorvane.example/api/assignGiftCertificateToUser
int __ZV2__assignGiftCertificateToUser(_ZV1__assignGiftCertificateToUser* ZV1__assignGiftCertificateToUser, _ZV1__assignGiftCertificateToUserResponse* ZV1__assignGiftCertificateToUserResponse);

//gsoap ZV2 service method-action: getSettingsPageInfo http://api.zorvane.example/api/getSettingsPageInfo
int __ZV2__getSettingsPageInfo(_ZV1__getSettingsPageInfo* ZV1__getSettingsPageInfo, _ZV1__getSettingsPageInfoResponse* ZV1__getSettingsPageInfoResponse);

//gsoap ZV2 service method-action: getEmailAddress http://api.zorvane.example/api/getEmailAddress
int __ZV2__getEmailAddress(_ZV1__getEmailAddress* ZV1__getEmailAddress, _ZV1__getEmailAddressResponse* ZV1__getEmailAddressResponse);

//gsoap ZV2 service method-action: showPrePaidCardBalance http://api.zorvane.example/api/showPrePaidCardBalance
int __ZV2__showPrePaidCardBalance(_ZV1__showPrePaidCardBalance* ZV1__showPrePaidCardBalance, _ZV1__showPrePaidCardBalanceResponse* ZV1__showPrePaidCardBalanceResponse);

//gsoap ZV2 service method-action: getBillingInfo http://api.zorvane.example/api/getBillingInfo
int __ZV2__getBillingInfo(_ZV1__getBillingInfo* ZV1__getBillingInfo, _ZV1__getBillingInfoResponse* ZV1__getBillingInfoResponse);

//gsoap ZV2 service method-action: doPurchaseSavedbilling http://api.zorvane.example/api/doPurchaseSavedbilling
int __ZV2__doPurchaseSavedbilling(_ZV1__doPurchaseSavedbilling* ZV1__doPurchaseSavedbilling, _ZV1__doPurchaseSavedbillingResponse* ZV1__doPurchaseSavedbillingResponse);

//gsoap ZV2 service method-action: authorizeDevice http://api.zorvane.example/api/authorizeDevice
int __ZV2__authorizeDevice(_ZV1__authorizeDevice* ZV1__authorizeDevice, _ZV1__authorizeDeviceResponse* ZV1__authorizeDeviceResponse);

//gsoap ZV2 service method-action: deactivateDevice http://api.zorvane.example/api/deactivateDevice
int __ZV2__deactivateDevice(_ZV1__deactivateDevice* ZV1__deactivateDevice, _ZV1__deactivateDeviceResponse* ZV1__deactivateDeviceResponse);

//gsoap ZV2 service method-action: checkAuthToken http://api.zorvane.example/api/checkAuthToken
int __ZV2__checkAuthToken(_ZV1__checkAuthToken* ZV1__checkAuthToken, _ZV1__checkAuthTokenResponse* ZV1__checkAuthTokenResponse);
