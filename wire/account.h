// Account and download service.

class ZV1__AuthorizeDeviceResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* AuthToken 0;
};

// How many hours are left of a rental, and whether to warn the customer.
class _ZV1__checkRentalExpiration { public: int PassId 1; };
class _ZV1__checkRentalExpirationResponse {
public:
    ZV1__CheckRentalExpirationResponse* checkRentalExpirationResult 0;
};

// The number of the country whose store the customer uses.
class _ZV1__GetCountryID {
};
class _ZV1__GetCountryIDResponse { public: int* GetCountryIDResult 0; };

// Values that the service gives its players, by key. The address of the bandwidth test stands under "BandwithCheckURL",
// spelled so.
class _ZV1__getConfig {
};
class _ZV1__getConfigResponse { public: ZV1__GetConfigResponse* getConfigResult 0; };

// Whether that is the customer's PIN for adult titles. It is never repeated by itself, since wrong ones may be counted.
class _ZV1__checkAdultVerificationPin { public: char* Pin 0; };
class _ZV1__checkAdultVerificationPinResponse {
public:
    ZV1__CheckAdultVerificationPinResponse* checkAdultVerificationPinResult 0;
};

// Whether the customer wants a PIN asked before adult titles.
class _ZV1__checkAdultVerificationEnabled {
};
class _ZV1__checkAdultVerificationEnabledResponse {
public:
    ZV1__CheckAdultVerificationEnabledResponse* checkAdultVerificationEnabledResult 0;
};

// Puts a title into the wish list. One that is already there is no failure.
class _ZV1__addItemToWishlist { public: int TitleID 1; };
class _ZV1__addItemToWishlistResponse { public: ZV1__WishListActionResponse* addItemToWishlistResult 0; };

// Empties the wish list.
class _ZV1__removeAllItemsFromWishList {
};
class _ZV1__removeAllItemsFromWishListResponse {
public:
    ZV1__WishListActionResponse* removeAllItemsFromWishListResult 0;
};

// Takes a title out of the wish list.
class _ZV1__removeItemFromWishList { public: int TitleID 1; };
class _ZV1__removeItemFromWishListResponse { public: ZV1__WishListActionResponse* removeItemFromWishListResult 0; };

// A page of the wish list, sorted by when a title was put there (0), by its name (1), rating (2) or stars (3).
class _ZV1__getWishlistItems {
public:
    int sortOrder 1;
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__TitleTypeFilter TitleType 1;
};
class _ZV1__getWishlistItemsResponse { public: ZV1__GetWishlistItemsResponse* getWishlistItemsResult 0; };

// Adds the worth of a gift code to the customer's prepaid money, once, and tells the new balance.
class _ZV1__assignGiftCertificateToUser { public: char* GiftCertificateCode 0; };
class _ZV1__assignGiftCertificateToUserResponse {
public:
    ZV1__GiftCertificateResponse* assignGiftCertificateToUserResult 0;
};

// What a settings page shows of the account and the device.
class _ZV1__getSettingsPageInfo {
};
class _ZV1__getSettingsPageInfoResponse { public: ZV1__SettingsPageInfo* getSettingsPageInfoResult 0; };

// The customer's e-mail address.
class _ZV1__getEmailAddress {
};
class _ZV1__getEmailAddressResponse { public: ZV1__GetEmailAddressResponse* getEmailAddressResult 0; };

// The customer's prepaid money, in cents.
class _ZV1__showPrePaidCardBalance {
};
class _ZV1__showPrePaidCardBalanceResponse { public: ZV1__PPCardBalanceResponse* showPrePaidCardBalanceResult 0; };

// The kind and the last four digits of the card on file.
class _ZV1__getBillingInfo {
};
class _ZV1__getBillingInfoResponse { public: ZV1__BillingInfoResponse* getBillingInfoResult 0; };

// Whether the customer has bought or rented the title.
class _ZV1__checkForPurchasedTitle { public: int TitleID 1; };
class _ZV1__checkForPurchasedTitleResponse { public: bool* checkForPurchasedTitleResult 0; };

// A page of what the customer has bought or rented, for devices that download.
class _ZV1__getMyVideos {
public:
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
    enum ZV1__WatchStatus WatchStatusFilter 1;
};
class _ZV1__getMyVideosResponse { public: ZV1__GetMyVideosResponse* getMyVideosResult 0; };

// Buys or rents a product, with prepaid money ("yes") or the card on file ("no"). It is never repeated by itself.
class _ZV1__doPurchaseSavedbilling {
public:
    int SkuID 1;
    char* IPAddress 0;
    char* UsePrePaidFunds 0;
};
class _ZV1__doPurchaseSavedbillingResponse { public: ZV1__PurchaseResponse* doPurchaseSavedbillingResult 0; };

// Ties the device to the customer who was shown the PIN. The token of the answer comes with every later request.
class _ZV1__authorizeDevice { public: char* PIN 0; };
class _ZV1__authorizeDeviceResponse { public: ZV1__AuthorizeDeviceResponse* authorizeDeviceResult 0; };

// Unties the device from its customer.
class _ZV1__deactivateDevice {
};
class _ZV1__deactivateDeviceResponse { public: ZV1__StandardResponse* deactivateDeviceResult 0; };

// Whether a token that authorizeDevice gave is still good.
class _ZV1__checkAuthToken { public: char* AuthToken 0; };
class _ZV1__checkAuthTokenResponse { public: bool* checkAuthTokenResult 0; };

//gsoap ZV4 service name: DownloadAPISoap12
//gsoap ZV4 service type: DownloadAPISoap12
//gsoap ZV4 service namespace: http://api.zorvane.example/api/DownloadAPISoap12
//gsoap ZV4 service port: https://api.zorvane.example/api/DownloadAPI.asmx
//gsoap ZV4 service style: document
//gsoap ZV4 service encoding: literal

//gsoap ZV4 service method-action: checkRentalExpiration http://api.zorvane.example/api/checkRentalExpiration
int __ZV4__checkRentalExpiration(_ZV1__checkRentalExpiration* ZV1__checkRentalExpiration, _ZV1__checkRentalExpirationResponse* ZV1__checkRentalExpirationResponse);

//gsoap ZV4 service method-action: GetCountryID http://api.zorvane.example/api/GetCountryID
int __ZV4__GetCountryID(_ZV1__GetCountryID* ZV1__GetCountryID, _ZV1__GetCountryIDResponse* ZV1__GetCountryIDResponse);

//gsoap ZV4 service method-action: getConfig http://api.zorvane.example/api/getConfig
int __ZV4__getConfig(_ZV1__getConfig* ZV1__getConfig, _ZV1__getConfigResponse* ZV1__getConfigResponse);

//gsoap ZV4 service method-action: checkAdultVerificationPin http://api.zorvane.example/api/checkAdultVerificationPin
int __ZV4__checkAdultVerificationPin(_ZV1__checkAdultVerificationPin* ZV1__checkAdultVerificationPin, _ZV1__checkAdultVerificationPinResponse* ZV1__checkAdultVerificationPinResponse);

//gsoap ZV4 service method-action: checkAdultVerificationEnabled http://api.zorvane.example/api/checkAdultVerificationEnabled
int __ZV4__checkAdultVerificationEnabled(_ZV1__checkAdultVerificationEnabled* ZV1__checkAdultVerificationEnabled, _ZV1__checkAdultVerificationEnabledResponse* ZV1__checkAdultVerificationEnabledResponse);

//gsoap ZV4 service method-action: addItemToWishlist http://api.zorvane.example/api/addItemToWishlist
int __ZV4__addItemToWishlist(_ZV1__addItemToWishlist* ZV1__addItemToWishlist, _ZV1__addItemToWishlistResponse* ZV1__addItemToWishlistResponse);

//gsoap ZV4 service method-action: removeAllItemsFromWishList http://api.zorvane.example/api/removeAllItemsFromWishList
int __ZV4__removeAllItemsFromWishList(_ZV1__removeAllItemsFromWishList* ZV1__removeAllItemsFromWishList, _ZV1__removeAllItemsFromWishListResponse* ZV1__removeAllItemsFromWishListResponse);

//gsoap ZV4 service method-action: removeItemFromWishList http://api.zorvane.example/api/removeItemFromWishList
int __ZV4__removeItemFromWishList(_ZV1__removeItemFromWishList* ZV1__removeItemFromWishList, _ZV1__removeItemFromWishListResponse* ZV1__removeItemFromWishListResponse);

//gsoap ZV4 service method-action: getWishlistItems http://api.zorvane.example/api/getWishlistItems
int __ZV4__getWishlistItems(_ZV1__getWishlistItems* ZV1__getWishlistItems, _ZV1__getWishlistItemsResponse* ZV1__getWishlistItemsResponse);

//gsoap ZV4 service method-action: assignGiftCertificateToUser http://api.zorvane.example/api/assignGiftCertificateToUser
int __ZV4__assignGiftCertificateToUser(_ZV1__assignGiftCertificateToUser* ZV1__assignGiftCertificateToUser, _ZV1__assignGiftCertificateToUserResponse* ZV1__assignGiftCertificateToUserResponse);

//gsoap ZV4 service method-action: getSettingsPageInfo http://api.zorvane.example/api/getSettingsPageInfo
int __ZV4__getSettingsPageInfo(_ZV1__getSettingsPageInfo* ZV1__getSettingsPageInfo, _ZV1__getSettingsPageInfoResponse* ZV1__getSettingsPageInfoResponse);

//gsoap ZV4 service method-action: getEmailAddress http://api.zorvane.example/api/getEmailAddress
int __ZV4__getEmailAddress(_ZV1__getEmailAddress* ZV1__getEmailAddress, _ZV1__getEmailAddressResponse* ZV1__getEmailAddressResponse);

//gsoap ZV4 service method-action: showPrePaidCardBalance http://api.zorvane.example/api/showPrePaidCardBalance
int __ZV4__showPrePaidCardBalance(_ZV1__showPrePaidCardBalance* ZV1__showPrePaidCardBalance, _ZV1__showPrePaidCardBalanceResponse* ZV1__showPrePaidCardBalanceResponse);

//gsoap ZV4 service method-action: getBillingInfo http://api.zorvane.example/api/getBillingInfo
int __ZV4__getBillingInfo(_ZV1__getBillingInfo* ZV1__getBillingInfo, _ZV1__getBillingInfoResponse* ZV1__getBillingInfoResponse);

//gsoap ZV4 service method-action: checkForPurchasedTitle http://api.zorvane.example/api/checkForPurchasedTitle
int __ZV4__checkForPurchasedTitle(_ZV1__checkForPurchasedTitle* ZV1__checkForPurchasedTitle, _ZV1__checkForPurchasedTitleResponse* ZV1__checkForPurchasedTitleResponse);

//gsoap ZV4 service method-action: getMyVideos http://api.zorvane.example/api/getMyVideos
int __ZV4__getMyVideos(_ZV1__getMyVideos* ZV1__getMyVideos, _ZV1__getMyVideosResponse* ZV1__getMyVideosResponse);

//gsoap ZV4 service method-action: doPurchaseSavedbilling http://api.zorvane.example/api/doPurchaseSavedbilling
int __ZV4__doPurchaseSavedbilling(_ZV1__doPurchaseSavedbilling* ZV1__doPurchaseSavedbilling, _ZV1__doPurchaseSavedbillingResponse* ZV1__doPurchaseSavedbillingResponse);

//gsoap ZV4 service method-action: authorizeDevice http://api.zorvane.example/api/authorizeDevice
int __ZV4__authorizeDevice(_ZV1__authorizeDevice* ZV1__authorizeDevice, _ZV1__authorizeDeviceResponse* ZV1__authorizeDeviceResponse);

//gsoap ZV4 service method-action: deactivateDevice http://api.zorvane.example/api/deactivateDevice
int __ZV4__deactivateDevice(_ZV1__deactivateDevice* ZV1__deactivateDevice, _ZV1__deactivateDeviceResponse* ZV1__deactivateDeviceResponse);

//gsoap ZV4 service method-action: checkAuthToken http://api.zorvane.example/api/checkAuthToken
int __ZV4__checkAuthToken(_ZV1__checkAuthToken* ZV1__checkAuthToken, _ZV1__checkAuthTokenResponse* ZV1__checkAuthTokenResponse);
