// The catalogue: genres, titles and their details.
#include "ServiceCall.h"

static constexpr auto kMetadata = ZV_WS_CacheParam::CacheData_Metadata;

ZV_WS_Status ZV_WS_getNavigation(ZV_WS_Session* handle, ZV_WS_GenreArray* genres)
{
    return Ask<Operation::getNavigation>(__func__, handle, genres, kMetadata);
}

ZV_WS_Status ZV_WS_getGenreLabel(ZV_WS_Session* handle, int genreID, ZV_WS_GenreLabelResponse* label)
{
    return AskAbout(&_ZV1__getGenreLabel::GenreID, genreID, __func__, handle, label);
}

ZV_WS_Status ZV_WS_getTitles(ZV_WS_Session* handle, int genreID, const ZV_WS_Pagination* page, int purchaseType,
                             ZV_WS_TitlesResponse* titles)
{
    ServiceCall<Operation::getTitlesByNavigation> call(__func__, handle, titles);
    if (!call.Accepts(IsPage(page))) return call.Refusal();
    call.CacheAs(kMetadata, genreID, page->CurrentPageNumber, page->ItemsPerPage, purchaseType);
    call->GenreID = genreID;
    SetPage(call, *page);
    call.SetEnum(call->PurchaseType, purchaseType);
    return call.Into(titles);
}

ZV_WS_Status ZV_WS_getTitlesByGenreIDs(ZV_WS_Session* handle, const int* genreIDs, unsigned int count,
                                       const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                                       ZV_WS_TitlesResponseArray* titles)
{
    ServiceCall<Operation::getTitlesByGenreArray> call(__func__, handle, titles);
    if (!call.Accepts(IsPage(page) && IsArray(genreIDs, count))) return call.Refusal();
    ZV1__ArrayOfInt ids = BorrowedInts(genreIDs, count);
    call->GenreIDs = &ids;
    SetPage(call, *page);
    call.SetEnum(call->PurchaseType, purchaseType);
    return call.Into(titles);
}

ZV_WS_Status ZV_WS_getTitleListing(ZV_WS_Session* handle, int titleID, ZV_WS_TitleListingResponse* listing)
{
    return AskAbout(&_ZV1__getTitleListing::TitleID, titleID, __func__, handle, listing, kMetadata);
}

ZV_WS_Status ZV_WS_getTvEpisodeListing(ZV_WS_Session* handle, int episodeID, ZV_WS_TitleListingResponse* listing)
{
    return AskAbout(&_ZV1__getTvEpisodeListing::EpisodeID, episodeID, __func__, handle, listing, kMetadata);
}

ZV_WS_Status ZV_WS_getTvEpisodeListByTitleID(ZV_WS_Session* handle, int titleID, ZV_WS_TvEpisodeListResponse* episodes)
{
    return AskAbout(&_ZV1__getTvEpisodeListByTitleID::TitleID, titleID, __func__, handle, episodes, kMetadata);
}

ZV_WS_Status ZV_WS_getAllTvEpisodeListings(ZV_WS_Session* handle, int titleID,
                                           ZV_WS_TitleListingResponseArray* listings)
{
    return AskAbout(&_ZV1__getAllTvEpisodeListings::TitleID, titleID, __func__, handle, listings, kMetadata);
}

ZV_WS_Status ZV_WS_translateSkuID(ZV_WS_Session* handle, int skuID, ZV_WS_TranslateSkuIDResponse* title)
{
    return AskAbout(&_ZV1__translateSkuId::SkuId, skuID, __func__, handle, title, kMetadata);
}

ZV_WS_Status ZV_WS_translateTivoExternalID(ZV_WS_Session* handle, const char* externalID,
                                           ZV_WS_TranslateTivoExternalIDResponse* title)
{
    ServiceCall<Operation::translateTivoExternalId> call(__func__, handle, title);
    call.CacheAs(kMetadata, externalID);
    call.SetText(call->TivoExternalId, externalID);
    return call.Into(title);
}

// The two searches differ only in how much of each title they answer.
template <class Op>
static ZV_WS_Status Search(const char* function, ZV_WS_Session* handle, const ZV_WS_Pagination* page,
                           ZV_WS_PurchaseType purchaseType, ZV_WS_TitleTypeFilter typeFilter, const char* query,
                           ZV_WS_TitlesResponse* titles)
{
    ServiceCall<Op> call(function, handle, titles);
    if (!call.Accepts(IsPage(page))) return call.Refusal();
    call.CacheAs(kMetadata, page->CurrentPageNumber, page->ItemsPerPage, purchaseType, typeFilter, query);
    call.SetText(call->Query, query);
    SetPage(call, *page);
    call.SetEnum(call->PurchaseType, purchaseType);
    call.SetEnum(call->TitleType, typeFilter);
    return call.Into(titles);
}

ZV_WS_Status ZV_WS_searchForTitle(ZV_WS_Session* handle, const ZV_WS_Pagination* page, ZV_WS_PurchaseType purchaseType,
                                  ZV_WS_TitleTypeFilter typeFilter, const char* query, ZV_WS_TitlesResponse* titles)
{
    return Search<Operation::searchForTitle>(__func__, handle, page, purchaseType, typeFilter, query, titles);
}

ZV_WS_Status ZV_WS_searchForTitleDetail(ZV_WS_Session* handle, const ZV_WS_Pagination* page,
                                        ZV_WS_PurchaseType purchaseType, ZV_WS_TitleTypeFilter typeFilter,
                                        const char* query, ZV_WS_TitlesResponse* titles)
{
    return Search<Operation::searchForTitleDetail>(__func__, handle, page, purchaseType, typeFilter, query, titles);
}

ZV_WS_Status ZV_WS_getRecommendedTitles(ZV_WS_Session* handle, int titleID, ZV_WS_RecommendedTitlesResponse* titles)
{
    return AskAbout(&_ZV1__getRecommendedTitles::TitleId, titleID, __func__, handle, titles, kMetadata);
}
