// The catalogue: genres, pages of titles, details, episodes, search, box art, and the cache of all of it.
#include "ZVWSLibAEDispatch.h"
#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

void ZVWSLib::Remember(ZVWSLibAE::State& state, const Param_getTitles& param)
{
    // Log readers search for this text: the misspelled word and the pointer are part of it.
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_VERBOSE,
                 "ZVWSLibAE::getTitles, parameters geneeid:%d, currentPageNo:%d,itemsPerPage:%d, purchaseType:%p \n",
                 param.genreid, static_cast<int>(param.page.CurrentPageNumber),
                 static_cast<int>(param.page.ItemsPerPage),
                 reinterpret_cast<void*>(static_cast<intptr_t>(param.purchasetype)));
    state.m_Listing.m_PrefetchPurchaseType = param.purchasetype;
}

void ZVWSLib::Remember(ZVWSLibAE::State& state, const Param_getBoxArtImage& param)
{
    state.m_Listing.m_PrefetchBoxArtSize = param.boxartsize;
}

namespace {

ZV_WS_Status UpdateLocalCache(ZV_WS_Session* session, int operations, bool* succeeded)
{
    const ZV_WS_Status status = ZV_WS_updateLocalCache(session, static_cast<unsigned int>(operations));
    *succeeded = status == ZV_WS_Status_ok;
    return status;
}

}  // namespace

ZVWS_ASYNC(getNavigation, Param_base())
ZVWS_ASYNC_LISTING(getTitles, Param_getTitles())
ZVWS_ASYNC(getTitleListing, Param_OneInteger("titleid"))
ZVWS_ASYNC(searchForTitle, Param_searchForTitle())
ZVWS_ASYNC(getRecommendedTitles, Param_OneInteger("titleid"))
ZVWS_ASYNC(translateSkuID, Param_OneInteger("skuid"))
ZVWS_ASYNC(getTvEpisodeListing, Param_OneInteger("episodeid"))
ZVWS_ASYNC(getTvEpisodeListByTitleID, Param_OneInteger("titleid"))
ZVWS_ASYNC_LISTING(getAllTvEpisodeListings, Param_OneInteger("titleid"))
ZVWS_ASYNC(getBoxArtImage, Param_getBoxArtImage())
ZVWS_ASYNC_CALL(updateLocalCache, Param_OneInteger("operations"), UpdateLocalCache)
