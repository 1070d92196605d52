// The customer's account: purchases, wish list, billing.
#include "ZVWSLibAEDispatch.h"

void ZVWSLib::Remember(ZVWSLibAE::State& state, const Param_getMyVideos& param)
{
    state.m_Listing.m_PrefetchPurchaseType = param.purchasetype;
    state.m_Listing.m_PrefetchTypeFilter = param.typefilter;
    state.m_Listing.m_PrefetchWatchStatus = param.watchstatus;
}

void ZVWSLib::Remember(ZVWSLibAE::State& state, const Param_getWishlistItems& param)
{
    state.m_Listing.m_PrefetchSortOrder = param.sortorder;
    state.m_Listing.m_PrefetchTypeFilter = param.typefilter;
}

ZVWS_ASYNC_LISTING(getMyVideos, Param_getMyVideos())
ZVWS_ASYNC_LISTING(getWishlistItems, Param_getWishlistItems())
ZVWS_ASYNC(addItemToWishlist, Param_OneInteger("titleid"))
ZVWS_ASYNC(removeItemFromWishlist, Param_OneInteger("titleid"))
ZVWS_ASYNC(removeAllItemsFromWishlist, Param_base())
ZVWS_ASYNC(checkTitleInWishlist, Param_OneInteger("titleid"))
ZVWS_ASYNC(checkTitlesInWishlist, Param_checkTitlesInWishlist())
ZVWS_ASYNC(doPurchaseSavedBilling, Param_doPurchaseSavedbilling())
ZVWS_ASYNC(checkForPurchasedTitle, Param_OneInteger("titleid"))
ZVWS_ASYNC(checkForPurchasedSku, Param_OneInteger("skuid"))
ZVWS_ASYNC(checkAdultVerificationEnabled, Param_base())
ZVWS_ASYNC(checkAdultVerificationPin, Param_OneInteger("pin"))
ZVWS_ASYNC(assignGiftCertificateToUser, Param_assignGiftCertificateToUser())
ZVWS_ASYNC(checkRentalExpiration, Param_OneInteger("passid"))
ZVWS_ASYNC(getEmailAddress, Param_base())
ZVWS_ASYNC(getBillingInfo, Param_base())
ZVWS_ASYNC(getPrePaidCardBalance, Param_base())
ZVWS_ASYNC(calcOrderTax, Param_OneInteger("skuid"))
