// Account and download service.

class ZV1__AuthorizeDeviceResponse {
public:
    int ResponseCode 1;
    char* ResponseMessage 0;
    char* AuthToken 0;
};

class _ZV1__checkRentalExpiration {
public:
    int PassId 1;
};
class _ZV1__checkRentalExpirationResponse {
public:
    ZV1__CheckRentalExpirationResponse* checkRentalExpirationResult 0;
};

class _ZV1__GetCountryID {
};
class _ZV1__GetCountryIDResponse {
public:
    int* GetCountryIDResult 0;
};

class _ZV1__getConfig {
};
class _ZV1__getConfigResponse {
public:
    ZV1__GetConfigResponse* getConfigResult 0;
};

class _ZV1__checkAdultVerificationPin {
public:
    char* Pin 0;
};
class _ZV1__checkAdultVerificationPinResponse {
public:
    ZV1__CheckAdultVerificationPinResponse* checkAdultVerificationPinResult 0;
};

class _ZV1__checkAdultVerificationEnabled {
};
class _ZV1__checkAdultVerificationEnabledResponse {
public:
    ZV1__CheckAdultVerificationEnabledResponse* checkAdultVerificationEnabledResult 0;
};

class _ZV1__addItemToWishlist {
public:
    int TitleID 1;
};
class _ZV1__addItemToWishlistResponse {
public:
    ZV1__WishListActionResponse* addItemToWishlistResult 0;
};

class _ZV1__removeAllItemsFromWishList {
};
class _ZV1__removeAllItemsFromWishListResponse {
public:
    ZV1__WishListActionResponse* removeAllItemsFromWishListResult 0;
};

class _ZV1__removeItemFromWishList {
public:
    int TitleID 1;
};
class _ZV1__removeItemFromWishListResponse {
public:
    ZV1__WishListActionResponse* removeItemFromWishListResult 0;
};

class _ZV1__getWishlistItems {
public:
    int sortOrder 1;
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__TitleTypeFilter TitleType 1;
};
class _ZV1__getWishlistItemsResponse {
public:
    ZV1__GetWishlistItemsResponse* getWishlistItemsResult 0;
};

class _ZV1__assignGiftCertificateToUser {
public:
    char* GiftCertificateCode 0;
};
class _ZV1__assignGiftCertificateToUserResponse {
public:
    ZV1__GiftCertificateResponse* assignGiftCertificateToUserResult 0;
};

class _ZV1__getSettingsPageInfo {
};
class _ZV1__getSettingsPageInfoResponse {
public:
    ZV1__SettingsPageInfo* getSettingsPageInfoResult 0;
};

class _ZV1__getEmailAddress {
};
class _ZV1__getEmailAddressResponse {
public:
    ZV1__GetEmailAddressResponse* getEmailAddressResult 0;
};

class _ZV1__showPrePaidCardBalance {
};
class _ZV1__showPrePaidCardBalanceResponse {
public:
    ZV1__PPCardBalanceResponse* showPrePaidCardBalanceResult 0;
};

class _ZV1__getBillingInfo {
};
class _ZV1__getBillingInfoResponse {
public:
    ZV1__BillingInfoResponse* getBillingInfoResult 0;
};

class _ZV1__checkForPurchasedTitle {
public:
    int TitleID 1;
};
class _ZV1__checkForPurchasedTitleResponse {
public:
    bool* checkForPurchasedTitleResult 0;
};

class _ZV1__getMyVideos {
public:
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
    enum ZV1__WatchStatus WatchStatusFilter 1;
};
class _ZV1__getMyVideosResponse {
public:
    ZV1__GetMyVideosResponse* getMyVideosResult 0;
};

class _ZV1__doPurchaseSavedbilling {
public:
    int SkuID 1;
    char* IPAddress 0;
    char* UsePrePaidFunds 0;
};
class _ZV1__doPurchaseSavedbillingResponse {
public:
    ZV1__PurchaseResponse* doPurchaseSavedbillingResult 0;
};

class _ZV1__authorizeDevice {
public:
    char* PIN 0;
};
class _ZV1__authorizeDeviceResponse {
public:
    ZV1__AuthorizeDeviceResponse* authorizeDeviceResult 0;
};

class _ZV1__deactivateDevice {
};
class _ZV1__deactivateDeviceResponse {
public:
    ZV1__StandardResponse* deactivateDeviceResult 0;
};

class _ZV1__checkAuthToken {
public:
    char* AuthToken 0;
};
class _ZV1__checkAuthTokenResponse {
public:
    bool* checkAuthTokenResult 0;
};

//gsoap ZV4 service name: DownloadAPISoap12
//gsoap ZV4 service type: DownloadAPISoap12
//gsoap ZV4 service namespace: http://api.zorvane.example/api/DownloadAPISoap12
//gsoap ZV4 service port: https://api.zorvane.example/api/DownloadAPI.asmx
//gsoap ZV4 service style: document
//gsoap ZV4 service encoding: literal

//gsoap ZV4 service method-action: checkRentalExpiration http://api.zorvane.example/api/checkRentalExpiration
int __ZV4__checkRentalExpiration(_ZV1__checkRentalExpiration* ZV1__checkRentalExpiration, _ZV1__checkRentalExpirationResponse* response);

//gsoap ZV4 service method-action: GetCountryID http://api.zorvane.example/api/GetCountryID
int __ZV4__GetCountryID(_ZV1__GetCountryID* ZV1__GetCountryID, _ZV1__GetCountryIDResponse* response);

//gsoap ZV4 service method-action: getConfig http://api.zorvane.example/api/getConfig
int __ZV4__getConfig(_ZV1__getConfig* ZV1__getConfig, _ZV1__getConfigResponse* response);

//gsoap ZV4 service method-action: checkAdultVerificationPin http://api.zorvane.example/api/checkAdultVerificationPin
int __ZV4__checkAdultVerificationPin(_ZV1__checkAdultVerificationPin* ZV1__checkAdultVerificationPin, _ZV1__checkAdultVerificationPinResponse* response);

//gsoap ZV4 service method-action: checkAdultVerificationEnabled http://api.zorvane.example/api/checkAdultVerificationEnabled
int __ZV4__checkAdultVerificationEnabled(_ZV1__checkAdultVerificationEnabled* ZV1__checkAdultVerificationEnabled, _ZV1__checkAdultVerificationEnabledResponse* response);

//gsoap ZV4 service method-action: addItemToWishlist http://api.zorvane.example/api/addItemToWishlist
int __ZV4__addItemToWishlist(_ZV1__addItemToWishlist* ZV1__addItemToWishlist, _ZV1__addItemToWishlistResponse* response);

//gsoap ZV4 service method-action: removeAllItemsFromWishList http://api.zorvane.example/api/removeAllItemsFromWishList
int __ZV4__removeAllItemsFromWishList(_ZV1__removeAllItemsFromWishList* ZV1__removeAllItemsFromWishList, _ZV1__removeAllItemsFromWishListResponse* response);

//gsoap ZV4 service method-action: removeItemFromWishList http://api.zorvane.example/api/removeItemFromWishList
int __ZV4__removeItemFromWishList(_ZV1__removeItemFromWishList* ZV1__removeItemFromWishList, _ZV1__removeItemFromWishListResponse* response);

//gsoap ZV4 service method-action: getWishlistItems http://api.zorvane.example/api/getWishlistItems
int __ZV4__getWishlistItems(_ZV1__getWishlistItems* ZV1__getWishlistItems, _ZV1__getWishlistItemsResponse* response);

//gsoap ZV4 service method-action: assignGiftCertificateToUser http://api.zorvane.example/api/assignGiftCertificateToUser
int __ZV4__assignGiftCertificateToUser(_ZV1__assignGiftCertificateToUser* ZV1__assignGiftCertificateToUser, _ZV1__assignGiftCertificateToUserResponse* response);

//gsoap ZV4 service method-action: getSettingsPageInfo http://api.zorvane.example/api/getSettingsPageInfo
int __ZV4__getSettingsPageInfo(_ZV1__getSettingsPageInfo* ZV1__getSettingsPageInfo, _ZV1__getSettingsPageInfoResponse* response);

//gsoap ZV4 service method-action: getEmailAddress http://api.zorvane.example/api/getEmailAddress
int __ZV4__getEmailAddress(_ZV1__getEmailAddress* ZV1__getEmailAddress, _ZV1__getEmailAddressResponse* response);

//gsoap ZV4 service method-action: showPrePaidCardBalance http://api.zorvane.example/api/showPrePaidCardBalance
int __ZV4__showPrePaidCardBalance(_ZV1__showPrePaidCardBalance* ZV1__showPrePaidCardBalance, _ZV1__showPrePaidCardBalanceResponse* response);

//gsoap ZV4 service method-action: getBillingInfo http://api.zorvane.example/api/getBillingInfo
int __ZV4__getBillingInfo(_ZV1__getBillingInfo* ZV1__getBillingInfo, _ZV1__getBillingInfoResponse* response);

//gsoap ZV4 service method-action: checkForPurchasedTitle http://api.zorvane.example/api/checkForPurchasedTitle
int __ZV4__checkForPurchasedTitle(_ZV1__checkForPurchasedTitle* ZV1__checkForPurchasedTitle, _ZV1__checkForPurchasedTitleResponse* response);

//gsoap ZV4 service method-action: getMyVideos http://api.zorvane.example/api/getMyVideos
int __ZV4__getMyVideos(_ZV1__getMyVideos* ZV1__getMyVideos, _ZV1__getMyVideosResponse* response);

//gsoap ZV4 service method-action: doPurchaseSavedbilling http://api.zorvane.example/api/doPurchaseSavedbilling
int __ZV4__doPurchaseSavedbilling(_ZV1__doPurchaseSavedbilling* ZV1__doPurchaseSavedbilling, _ZV1__doPurchaseSavedbillingResponse* response);

//gsoap ZV4 service method-action: authorizeDevice http://api.zorvane.example/api/authorizeDevice
int __ZV4__authorizeDevice(_ZV1__authorizeDevice* ZV1__authorizeDevice, _ZV1__authorizeDeviceResponse* response);

//gsoap ZV4 service method-action: deactivateDevice http://api.zorvane.example/api/deactivateDevice
int __ZV4__deactivateDevice(_ZV1__deactivateDevice* ZV1__deactivateDevice, _ZV1__deactivateDeviceResponse* response);

//gsoap ZV4 service method-action: checkAuthToken http://api.zorvane.example/api/checkAuthToken
int __ZV4__checkAuthToken(_ZV1__checkAuthToken* ZV1__checkAuthToken, _ZV1__checkAuthTokenResponse* response);
