// The wish list.
#include <algorithm>
#include <set>

#include "ServiceCall.h"

namespace {

constexpr unsigned int kItemsPerPage = 50;
// A bound for services that keep announcing one page more.
constexpr unsigned int kMostPages = 1000;

const char kListTable[] = "getWishlistItems";

// Puts a title in or takes it out. `wished` is what the cache then knows of it; its pages of the list are stale.
template <class Op>
ZV_WS_Status ChangeItem(const char* function, ZV_WS_Session* handle, int titleID, bool wished,
                        ZV_WS_StandardResponse* answer)
{
    ServiceCall<Op> call(function, handle, answer);
    call->TitleID = titleID;
    const ZV_WS_Status status = call.Into(answer);
    const bool isKnown = call.change() == ServiceCallBase::Change::Made;
    DropStale(call, kListTable, [=](CacheInterface& cache) {
        return isKnown ? cache.WriteWishlistFlag(titleID, wished) : cache.RemoveWishlistFlag(titleID);
    });
    return status;
}

// Keeps what was found out. A list narrowed to a type tells nothing of the titles that it leaves out.
void KeepFlags(SessionImpl& session, const int* titleIDs, const ZV_WS_TitlesInWishlist& answers, bool isWholeList,
               const SessionCache::Stamp& stamp)
{
    ZVWS_IntVector titles;
    ZVWS_BoolVector flags;
    for (unsigned int i = 0; i < answers.size; ++i) {
        if (!isWholeList && !answers.IsAvailInUserWishlist[i]) continue;
        titles.push_back(titleIDs[i]);
        flags.push_back(answers.IsAvailInUserWishlist[i]);
    }
    SessionCache(session).KeepFlags(titles, flags, stamp);
}

// The titles of the whole list.
ZV_WS_Status ReadList(ZV_WS_Session* handle, ZV_WS_TitleTypeFilter typeFilter, std::set<int>& titles)
{
    ZV_WS_Pagination page;
    page.ItemsPerPage = kItemsPerPage;
    for (bool more = true; more && page.CurrentPageNumber <= kMostPages; ++page.CurrentPageNumber) {
        ZV_WS_WishlistItemsResponse items;
        const ZV_WS_Status status = ZV_WS_getWishlistItems(handle, SORT_ORDER_DATEADDED, &page, typeFilter, &items);
        for (unsigned int i = 0; i < items.Titles.size; ++i) {
            titles.insert(items.Titles.TitleListingPurchased[i].TitleID);
        }
        more = items.Titles.size != 0 && static_cast<int>(page.CurrentPageNumber) < items.TotalPages;
        ZV_WS_release(&items);
        if (status != ZV_WS_Status_ok) return status;
    }
    return ZV_WS_Status_ok;
}

}  // namespace

ZV_WS_Status ZV_WS_getWishlistItems(ZV_WS_Session* handle, ZV_WS_SortOrder sortOrder, const ZV_WS_Pagination* page,
                                    ZV_WS_TitleTypeFilter typeFilter, ZV_WS_WishlistItemsResponse* items)
{
    ServiceCall<Operation::getWishlistItems> call(__func__, handle, items);
    if (!call.Accepts(IsPage(page))) return call.Refusal();
    call.CacheAs(ZV_WS_CacheParam::CacheData_Userdata, sortOrder, page->CurrentPageNumber, page->ItemsPerPage,
                 typeFilter);
    call.SetSortOrder(call->sortOrder, sortOrder);
    SetPage(call, *page);
    call.SetEnum(call->TitleType, typeFilter);
    return call.Into(items);
}

ZV_WS_Status ZV_WS_addItemToWishlist(ZV_WS_Session* handle, int titleID, ZV_WS_StandardResponse* answer)
{
    return ChangeItem<Operation::addItemToWishlist>(__func__, handle, titleID, true, answer);
}

ZV_WS_Status ZV_WS_removeItemFromWishlist(ZV_WS_Session* handle, int titleID, ZV_WS_StandardResponse* answer)
{
    return ChangeItem<Operation::removeItemFromWishList>(__func__, handle, titleID, false, answer);
}

ZV_WS_Status ZV_WS_removeAllItemsFromWishlist(ZV_WS_Session* handle, ZV_WS_StandardResponse* answer)
{
    ServiceCall<Operation::removeAllItemsFromWishList> call(__func__, handle, answer);
    const ZV_WS_Status status = call.Into(answer);
    DropStale(call, kListTable, [](CacheInterface& cache) { return cache.RemoveAllWishlistFlags(); });
    return status;
}

ZV_WS_Status ZV_WS_checkTitleInWishlist(ZV_WS_Session* handle, int titleID, bool* isInWishlist)
{
    ServiceCall<Operation::getTitleListing> call(__func__, handle, isInWishlist);
    if (!call.Accepts()) return call.Refusal();
    SessionCache cache(call.session());
    SessionCache::Stamp stamp;
    bool isKnown = false;
    WithinMemory([&] { isKnown = cache.FindFlags(&titleID, 1, isInWishlist, stamp); });
    if (isKnown) return LogAnswer(__func__, LogStatus(__func__, ZV_WS_Status_ok), *isInWishlist);
    call->TitleID = titleID;
    const ZV_WS_Status status =
        call.Into([&](const ZV1__TitleListingResponse* listing) { *isInWishlist = listing->IsAvailInUserWishList; });
    if (status == ZV_WS_Status_ok) WithinMemory([&] { cache.KeepFlags({titleID}, {*isInWishlist}, stamp); });
    return LogAnswer(__func__, status, *isInWishlist);
}

ZV_WS_Status ZV_WS_checkTitlesInWishlist(ZV_WS_Session* handle, const int* titleIDs, unsigned int count,
                                         ZV_WS_TitleTypeFilter typeFilter, ZV_WS_TitlesInWishlist* answers)
{
    ZV_ASSERT(answers != 0);
    return LogStatus(__func__, Records::Fill(*answers, [&] {
                         if (!SessionOf(handle) || !IsArray(titleIDs, count)) return ZV_WS_Status_invalid_param;
                         if (count == 0) return ZV_WS_Status_ok;
                         SessionImpl& session = *handle->_pSessionImpl;
                         Records::Allocate(answers->size, answers->IsAvailInUserWishlist, count);
                         bool* flags = answers->IsAvailInUserWishlist;
                         SessionCache::Stamp stamp;
                         if (SessionCache(session).FindFlags(titleIDs, count, flags, stamp)) return ZV_WS_Status_ok;
                         std::set<int> wished;
                         const ZV_WS_Status status = ReadList(handle, typeFilter, wished);
                         if (status != ZV_WS_Status_ok) {
                             Records::FreeMembers(*answers);
                             return status;
                         }
                         std::transform(titleIDs, titleIDs + count, flags,
                                        [&](int titleID) { return wished.count(titleID) != 0; });
                         KeepFlags(session, titleIDs, *answers, typeFilter == TITLE_TYPE_FILTER_ANY, stamp);
                         return ZV_WS_Status_ok;
                     }));
}
