// Browse service: the catalogue.

// The form in which the service has films for this type of device: protection, streamed or downloaded, profile, format,
// extension. A session that was not told whether its device streams or downloads starts with it.
class _ZV1__getFileType {
};
class _ZV1__getFileTypeResponse { public: ZV1__FileType* getFileTypeResult 0; };

// Whether the catalogue has changed since the time that getLastCacheLoadTimeUTC told: 0 when it has not, 1 when what a
// player keeps of it is stale.
class _ZV1__shouldUpdateCache { public: char* UTCTime 0; };
class _ZV1__shouldUpdateCacheResponse { public: int* shouldUpdateCacheResult 0; };

// Titles like the one given.
class _ZV1__getRecommendedTitles { public: int TitleId 1; };
class _ZV1__getRecommendedTitlesResponse { public: ZV1__RecommendedTitlesResponse* getRecommendedTitlesResult 0; };

// When the catalogue was loaded last, a text that the player keeps as it is and hands back to shouldUpdateCache.
class _ZV1__getLastCacheLoadTimeUTC {
};
class _ZV1__getLastCacheLoadTimeUTCResponse { public: char* getLastCacheLoadTimeUTCResult 0; };

// The title that a product belongs to.
class _ZV1__translateSkuId { public: int SkuId 1; };
class _ZV1__translateSkuIdResponse { public: ZV1__TranslateSkuIdResponse* translateSkuIdResult 0; };

// The title that another guide knows by that identifier.
class _ZV1__translateTivoExternalId { public: char* TivoExternalId 0; };
class _ZV1__translateTivoExternalIdResponse {
public:
    ZV1__TranslatedTivoExternalIdResponse* translateTivoExternalIdResult 0;
};

// Every episode of a season with all its details, in the order of their numbers.
class _ZV1__getAllTvEpisodeListings { public: int TitleID 1; };
class _ZV1__getAllTvEpisodeListingsResponse {
public:
    ZV1__ArrayOfTitleListingResponse* getAllTvEpisodeListingsResult 0;
};

// All details of one episode.
class _ZV1__getTvEpisodeListing { public: int EpisodeID 1; };
class _ZV1__getTvEpisodeListingResponse { public: ZV1__TitleListingResponse* getTvEpisodeListingResult 0; };

// The episodes of a season by name and number.
class _ZV1__getTvEpisodeListByTitleID { public: int TitleID 1; };
class _ZV1__getTvEpisodeListByTitleIDResponse { public: ZV1__TvEpisodeList* getTvEpisodeListByTitleIDResult 0; };

// All details of one title, and whether it is in the customer's wish list.
class _ZV1__getTitleListing { public: int TitleID 1; };
class _ZV1__getTitleListingResponse { public: ZV1__TitleListingResponse* getTitleListingResult 0; };

// The same page of each of several genres, one answer record a genre in the order asked.
class _ZV1__getTitlesByGenreArray {
public:
    ZV1__ArrayOfInt* GenreIDs 0;
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
};
class _ZV1__getTitlesByGenreArrayResponse { public: ZV1__ArrayOfGetTitlesResponse* getTitlesByGenreArrayResult 0; };

// A page of a genre's titles.
class _ZV1__getTitlesByNavigation {
public:
    int GenreID 1;
    int CurrentPageNumber 1;
    int ItemsPerPage 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
};
class _ZV1__getTitlesByNavigationResponse { public: ZV1__GetTitlesResponse* getTitlesByNavigationResult 0; };

// The text that labels a genre, and the one that explains it.
class _ZV1__getGenreLabel { public: int GenreID 1; };
class _ZV1__getGenreLabelResponse { public: ZV1__GetGenreLabelResponse* getGenreLabelResult 0; };

// A page of the titles with the text in their names or among the people who made them.
class _ZV1__searchForTitleDetail {
public:
    char* Query 0;
    int ItemsPerPage 1;
    int CurrentPageNumber 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
};
class _ZV1__searchForTitleDetailResponse { public: ZV1__GetTitlesResponse* searchForTitleDetailResult 0; };

// A page of the titles whose names hold the text.
class _ZV1__searchForTitle {
public:
    char* Query 0;
    int ItemsPerPage 1;
    int CurrentPageNumber 1;
    enum ZV1__StreamAPIPurchaseType PurchaseType 1;
    enum ZV1__TitleTypeFilter TitleType 1;
};
class _ZV1__searchForTitleResponse { public: ZV1__GetTitlesResponse* searchForTitleResult 0; };

// Every genre, as a flat list in which each names the one above it.
class _ZV1__getNavigation {
};
class _ZV1__getNavigationResponse { public: ZV1__GenreRequest* getNavigationResult 0; };

//gsoap ZV3 service name: RealTimeBrowseSoap12
//gsoap ZV3 service type: RealTimeBrowseSoap12
//gsoap ZV3 service namespace: http://api.zorvane.example/api/RealTimeBrowseSoap12
//gsoap ZV3 service port: https://api.zorvane.example/api/RealTimeBrowse.asmx
//gsoap ZV3 service style: document
//gsoap ZV3 service encoding: literal

//gsoap ZV3 service method-action: getFileType http://api.zorvane.example/api/getFileType
int __ZV3__getFileType(_ZV1__getFileType* ZV1__getFileType, _ZV1__getFileTypeResponse* ZV1__getFileTypeResponse);

//gsoap ZV3 service method-action: shouldUpdateCache http://api.zorvane.example/api/shouldUpdateCache
int __ZV3__shouldUpdateCache(_ZV1__shouldUpdateCache* ZV1__shouldUpdateCache, _ZV1__shouldUpdateCacheResponse* ZV1__shouldUpdateCacheResponse);

//gsoap ZV3 service method-action: getRecommendedTitles http://api.zorvane.example/api/getRecommendedTitles
int __ZV3__getRecommendedTitles(_ZV1__getRecommendedTitles* ZV1__getRecommendedTitles, _ZV1__getRecommendedTitlesResponse* ZV1__getRecommendedTitlesResponse);

//gsoap ZV3 service method-action: getLastCacheLoadTimeUTC http://api.zorvane.example/api/getLastCacheLoadTimeUTC
int __ZV3__getLastCacheLoadTimeUTC(_ZV1__getLastCacheLoadTimeUTC* ZV1__getLastCacheLoadTimeUTC, _ZV1__getLastCacheLoadTimeUTCResponse* ZV1__getLastCacheLoadTimeUTCResponse);

//gsoap ZV3 service method-action: translateSkuId http://api.zorvane.example/api/translateSkuId
int __ZV3__translateSkuId(_ZV1__translateSkuId* ZV1__translateSkuId, _ZV1__translateSkuIdResponse* ZV1__translateSkuIdResponse);

//gsoap ZV3 service method-action: translateTivoExternalId http://api.zorvane.example/api/translateTivoExternalId
int __ZV3__translateTivoExternalId(_ZV1__translateTivoExternalId* ZV1__translateTivoExternalId, _ZV1__translateTivoExternalIdResponse* ZV1__translateTivoExternalIdResponse);

//gsoap ZV3 service method-action: getAllTvEpisodeListings http://api.zorvane.example/api/getAllTvEpisodeListings
int __ZV3__getAllTvEpisodeListings(_ZV1__getAllTvEpisodeListings* ZV1__getAllTvEpisodeListings, _ZV1__getAllTvEpisodeListingsResponse* ZV1__getAllTvEpisodeListingsResponse);

//gsoap ZV3 service method-action: getTvEpisodeListing http://api.zorvane.example/api/getTvEpisodeListing
int __ZV3__getTvEpisodeListing(_ZV1__getTvEpisodeListing* ZV1__getTvEpisodeListing, _ZV1__getTvEpisodeListingResponse* ZV1__getTvEpisodeListingResponse);

//gsoap ZV3 service method-action: getTvEpisodeListByTitleID http://api.zorvane.example/api/getTvEpisodeListByTitleID
int __ZV3__getTvEpisodeListByTitleID(_ZV1__getTvEpisodeListByTitleID* ZV1__getTvEpisodeListByTitleID, _ZV1__getTvEpisodeListByTitleIDResponse* ZV1__getTvEpisodeListByTitleIDResponse);

//gsoap ZV3 service method-action: getTitleListing http://api.zorvane.example/api/getTitleListing
int __ZV3__getTitleListing(_ZV1__getTitleListing* ZV1__getTitleListing, _ZV1__getTitleListingResponse* ZV1__getTitleListingResponse);

//gsoap ZV3 service method-action: getTitlesByGenreArray http://api.zorvane.example/api/getTitlesByGenreArray
int __ZV3__getTitlesByGenreArray(_ZV1__getTitlesByGenreArray* ZV1__getTitlesByGenreArray, _ZV1__getTitlesByGenreArrayResponse* ZV1__getTitlesByGenreArrayResponse);

//gsoap ZV3 service method-action: getTitlesByNavigation http://api.zorvane.example/api/getTitlesByNavigation
int __ZV3__getTitlesByNavigation(_ZV1__getTitlesByNavigation* ZV1__getTitlesByNavigation, _ZV1__getTitlesByNavigationResponse* ZV1__getTitlesByNavigationResponse);

//gsoap ZV3 service method-action: getGenreLabel http://api.zorvane.example/api/getGenreLabel
int __ZV3__getGenreLabel(_ZV1__getGenreLabel* ZV1__getGenreLabel, _ZV1__getGenreLabelResponse* ZV1__getGenreLabelResponse);

//gsoap ZV3 service method-action: searchForTitleDetail http://api.zorvane.example/api/searchForTitleDetail
int __ZV3__searchForTitleDetail(_ZV1__searchForTitleDetail* ZV1__searchForTitleDetail, _ZV1__searchForTitleDetailResponse* ZV1__searchForTitleDetailResponse);

//gsoap ZV3 service method-action: searchForTitle http://api.zorvane.example/api/searchForTitle
int __ZV3__searchForTitle(_ZV1__searchForTitle* ZV1__searchForTitle, _ZV1__searchForTitleResponse* ZV1__searchForTitleResponse);

//gsoap ZV3 service method-action: getNavigation http://api.zorvane.example/api/getNavigation
int __ZV3__getNavigation(_ZV1__getNavigation* ZV1__getNavigation, _ZV1__getNavigationResponse* ZV1__getNavigationResponse);
