// Browse service: the catalogue.

class _ZV1__getFileType {
};
class _ZV1__getFileTypeResponse {
public:
    ZV1__FileType* getFileTypeResult 0;
};

class _ZV1__shouldUpdateCache {
public:
    char* UTCTime 0;
};
class _ZV1__shouldUpdateCacheResponse {
public:
    int* shouldUpdateCacheResult 0;
};

class _ZV1__getRecommendedTitles {
public:
    int TitleId 1;
};
class _ZV1__getRecommendedTitlesResponse {
public:
    ZV1__RecommendedTitlesResponse* getRecommendedTitlesResult 0;
};

class _ZV1__getLastCacheLoadTimeUTC {
};
class _ZV1__getLastCacheLoadTimeUTCResponse {
public:
    char* getLastCacheLoadTimeUTCResult 0;
};

class _ZV1__translateSkuId {
public:
    int SkuId 1;
};
class _ZV1__translateSkuIdResponse {
public:
    ZV1__TranslateSkuIdResponse* translateSkuIdResult 0;
};

class _ZV1__translateTivoExternalId {
public:
    char* TivoExternalId 0;
};
class _ZV1__translateTivoExternalIdResponse {
public:
    ZV1__TranslatedTivoExternalIdResponse* translateTivoExternalIdResult 0;
};

class _ZV1__getAllTvEpisodeListings {
public:
    int TitleID 1;
};
class _ZV1__getAllTvEpisodeListingsResponse {
public:
    ZV1__ArrayOfTitleListingResponse* getAllTvEpisodeListingsResult 0;
};

class _ZV1__getTvEpisodeListing {
public:
    int EpisodeID 1;
};
class _ZV1__getTvEpisodeListingResponse {
public:
    ZV1__TitleListingResponse* getTvEpisodeListingResult 0;
};

class _ZV1__getTvEpisodeListByTitleID {
public:
    int TitleID 1;
};
class _ZV1__getTvEpisodeListByTitleIDResponse {
public:
    ZV1__TvEpisodeList* getTvEpisodeListByTitleIDResult 0;
};

class _ZV1__getTitleListing {
public:
    int TitleID 1;
};
class _ZV1__getTitleListingResponse {
public:
    ZV1__TitleListingResponse* getTitleListingResult 0;
};

class _ZV1__getTitlesByGenreArray {
public:
    ZV1__ArrayOfInt* GenreIDs 0;
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
};
class _ZV1__getTitlesByGenreArrayResponse {
public:
    ZV1__ArrayOfGetTitlesResponse* getTitlesByGenreArrayResult 0;
};

class _ZV1__getTitlesByNavigation {
public:
    int GenreID 1;
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
};
class _ZV1__getTitlesByNavigationResponse {
public:
    ZV1__GetTitlesResponse* getTitlesByNavigationResult 0;
};

class _ZV1__getGenreLabel {
public:
    int GenreID 1;
};
class _ZV1__getGenreLabelResponse {
public:
    ZV1__GetGenreLabelResponse* getGenreLabelResult 0;
};

class _ZV1__searchForTitleDetail {
public:
    char* Query 0;
    int ItemsPerPage 1;
    int CurrentPageNumber 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
};
class _ZV1__searchForTitleDetailResponse {
public:
    ZV1__GetTitlesResponse* searchForTitleDetailResult 0;
};

class _ZV1__searchForTitle {
public:
    char* Query 0;
    int ItemsPerPage 1;
    int CurrentPageNumber 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
};
class _ZV1__searchForTitleResponse {
public:
    ZV1__GetTitlesResponse* searchForTitleResult 0;
};

class _ZV1__getNavigation {
};
class _ZV1__getNavigationResponse {
public:
    ZV1__GenreRequest* getNavigationResult 0;
};

//gsoap ZV3 service name: RealTimeBrowseSoap12
//gsoap ZV3 service type: RealTimeBrowseSoap12
//gsoap ZV3 service namespace: http://api.zorvane.example/api/RealTimeBrowseSoap12
//gsoap ZV3 service port: https://api.zorvane.example/api/RealTimeBrowse.asmx
//gsoap ZV3 service style: document
//gsoap ZV3 service encoding: literal

//gsoap ZV3 service method-action: getFileType http://api.zorvane.example/api/getFileType
int __ZV3__getFileType(_ZV1__getFileType* ZV1__getFileType, _ZV1__getFileTypeResponse* response);

//gsoap ZV3 service method-action: shouldUpdateCache http://api.zorvane.example/api/shouldUpdateCache
int __ZV3__shouldUpdateCache(_ZV1__shouldUpdateCache* ZV1__shouldUpdateCache, _ZV1__shouldUpdateCacheResponse* response);

//gsoap ZV3 service method-action: getRecommendedTitles http://api.zorvane.example/api/getRecommendedTitles
int __ZV3__getRecommendedTitles(_ZV1__getRecommendedTitles* ZV1__getRecommendedTitles, _ZV1__getRecommendedTitlesResponse* response);

//gsoap ZV3 service method-action: getLastCacheLoadTimeUTC http://api.zorvane.example/api/getLastCacheLoadTimeUTC
int __ZV3__getLastCacheLoadTimeUTC(_ZV1__getLastCacheLoadTimeUTC* ZV1__getLastCacheLoadTimeUTC, _ZV1__getLastCacheLoadTimeUTCResponse* response);

//gsoap ZV3 service method-action: translateSkuId http://api.zorvane.example/api/translateSkuId
int __ZV3__translateSkuId(_ZV1__translateSkuId* ZV1__translateSkuId, _ZV1__translateSkuIdResponse* response);

//gsoap ZV3 service method-action: translateTivoExternalId http://api.zorvane.example/api/translateTivoExternalId
int __ZV3__translateTivoExternalId(_ZV1__translateTivoExternalId* ZV1__translateTivoExternalId, _ZV1__translateTivoExternalIdResponse* response);

//gsoap ZV3 service method-action: getAllTvEpisodeListings http://api.zorvane.example/api/getAllTvEpisodeListings
int __ZV3__getAllTvEpisodeListings(_ZV1__getAllTvEpisodeListings* ZV1__getAllTvEpisodeListings, _ZV1__getAllTvEpisodeListingsResponse* response);

//gsoap ZV3 service method-action: getTvEpisodeListing http://api.zorvane.example/api/getTvEpisodeListing
int __ZV3__getTvEpisodeListing(_ZV1__getTvEpisodeListing* ZV1__getTvEpisodeListing, _ZV1__getTvEpisodeListingResponse* response);

//gsoap ZV3 service method-action: getTvEpisodeListByTitleID http://api.zorvane.example/api/getTvEpisodeListByTitleID
int __ZV3__getTvEpisodeListByTitleID(_ZV1__getTvEpisodeListByTitleID* ZV1__getTvEpisodeListByTitleID, _ZV1__getTvEpisodeListByTitleIDResponse* response);

//gsoap ZV3 service method-action: getTitleListing http://api.zorvane.example/api/getTitleListing
int __ZV3__getTitleListing(_ZV1__getTitleListing* ZV1__getTitleListing, _ZV1__getTitleListingResponse* response);

//gsoap ZV3 service method-action: getTitlesByGenreArray http://api.zorvane.example/api/getTitlesByGenreArray
int __ZV3__getTitlesByGenreArray(_ZV1__getTitlesByGenreArray* ZV1__getTitlesByGenreArray, _ZV1__getTitlesByGenreArrayResponse* response);

//gsoap ZV3 service method-action: getTitlesByNavigation http://api.zorvane.example/api/getTitlesByNavigation
int __ZV3__getTitlesByNavigation(_ZV1__getTitlesByNavigation* ZV1__getTitlesByNavigation, _ZV1__getTitlesByNavigationResponse* response);

//gsoap ZV3 service method-action: getGenreLabel http://api.zorvane.example/api/getGenreLabel
int __ZV3__getGenreLabel(_ZV1__getGenreLabel* ZV1__getGenreLabel, _ZV1__getGenreLabelResponse* response);

//gsoap ZV3 service method-action: searchForTitleDetail http://api.zorvane.example/api/searchForTitleDetail
int __ZV3__searchForTitleDetail(_ZV1__searchForTitleDetail* ZV1__searchForTitleDetail, _ZV1__searchForTitleDetailResponse* response);

//gsoap ZV3 service method-action: searchForTitle http://api.zorvane.example/api/searchForTitle
int __ZV3__searchForTitle(_ZV1__searchForTitle* ZV1__searchForTitle, _ZV1__searchForTitleResponse* response);

//gsoap ZV3 service method-action: getNavigation http://api.zorvane.example/api/getNavigation
int __ZV3__getNavigation(_ZV1__getNavigation* ZV1__getNavigation, _ZV1__getNavigationResponse* response);
