// The catalogue: genres, pages of titles, details, episodes, search, box art, and the cache of all of it.
#include "ZVWSLibAEDispatch.h"

namespace {

ZV_WS_Status UpdateLocalCache(ZV_WS_Session* session, int operations, bool* succeeded)
{
    const ZV_WS_Status status = ZV_WS_updateLocalCache(session, static_cast<unsigned int>(operations));
    *succeeded = status == ZV_WS_Status_ok;
    return status;
}

}  // namespace

ZVWS_ASYNC(getNavigation, Param_base())
ZVWS_ASYNC(getTitles, Param_getTitles())
ZVWS_ASYNC(getTitleListing, Param_OneInteger("titleid"))
ZVWS_ASYNC(searchForTitle, Param_searchForTitle())
ZVWS_ASYNC(getRecommendedTitles, Param_OneInteger("titleid"))
ZVWS_ASYNC(translateSkuID, Param_OneInteger("skuid"))
ZVWS_ASYNC(getTvEpisodeListing, Param_OneInteger("episodeid"))
ZVWS_ASYNC(getTvEpisodeListByTitleID, Param_OneInteger("titleid"))
ZVWS_ASYNC(getAllTvEpisodeListings, Param_getAllTvEpisodeListings())
ZVWS_ASYNC(getBoxArtImage, Param_getBoxArtImage())
ZVWS_ASYNC_CALL(updateLocalCache, Param_OneInteger("operations"), UpdateLocalCache)
