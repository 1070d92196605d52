#include "ZVWSLibAEPrefetch.h"

#include <string.h>

#include <algorithm>

#include "ZVWSLibAEDispatch.h"
#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

// ---- Which pages

void ZVWSLibAE::PrefetchMgr::SetMutex(KernelMutex* mutex)
{
    AE_USAGE_CHECK(mutex != nullptr);
    m_Mutex = mutex;
}

bool ZVWSLibAE::PrefetchMgr::IsPageAlreadyPrefetched(unsigned int page) const
{
    return std::find(m_PrefetchedPages.begin(), m_PrefetchedPages.end(), page) != m_PrefetchedPages.end();
}

void ZVWSLibAE::PrefetchMgr::Update(AEArray<AEString>& waitingBoxArts, Result_Type type, unsigned int totalPages,
                                    unsigned int totalItems, unsigned int itemsPerPage, int userdata1, int userdata2,
                                    int userdata3)
{
    AE_USAGE_CHECK(m_Mutex != nullptr);
    const auto identity = [this] {
        return std::tie(m_type, m_TotalPages, m_TotalItems, m_ItemsPerPage, m_userdata1, m_userdata2, m_userdata3);
    };
    const auto shown = std::make_tuple(type, totalPages, totalItems, itemsPerPage, userdata1, userdata2, userdata3);
    if (identity() == shown) return;
    const KernelLock lock(*m_Mutex);
    identity() = shown;
    m_PrefetchedPages.RemoveAll();
    waitingBoxArts.RemoveAll();
    m_LastPageNumber = 0;
}

void ZVWSLibAE::PrefetchMgr::MarkPagePrefetched(unsigned int page)
{
    const KernelLock lock(*m_Mutex);
    m_PrefetchedPages.Append(page);
}

ZVWSLibAE::PrefetchMgr::Pages ZVWSLibAE::PrefetchMgr::Scan(unsigned int current, unsigned int count, bool forward) const
{
    const char* const direction = forward ? " pageForNext" : ",pageForPre";
    Pages pages(m_kPrefetchPages);
    for (unsigned int i = 1; i <= count; ++i) {
        const unsigned int rest = (forward ? current + i : current + m_TotalPages - i) % m_TotalPages;
        const unsigned int page = rest == 0 ? m_TotalPages : rest;
        if (IsPageAlreadyPrefetched(page)) continue;
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch,%s[%d]:%d \n",
                     direction, static_cast<int>(pages.size()), static_cast<int>(page));
        pages.Append(page);
    }
    // Both directions are counted under this name.
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch, pageNumsForNext:%d \n",
                 static_cast<int>(pages.size()));
    return pages;
}

void ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch(unsigned int current, unsigned int count, unsigned int* pages,
                                                 unsigned int& found)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE,
                 "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch enter,CurrentPageNumber:%d, pageNumsToRequest:%d,\n",
                 static_cast<int>(current), static_cast<int>(count));
    const KernelLock lock(*m_Mutex);
    found = 0;
    if (!pages || m_TotalPages == 0 || count == 0 || current == 0 || current > m_TotalPages) return;
    const unsigned int n = std::min({count, m_TotalPages, m_kPrefetchPages});
    const Pages next = Scan(current, (n + 1) / 2, true);
    Pages previous = Scan(current, n / 2, false);
    // Where both directions meet, forward has the page. The hole that it leaves ends the way back.
    for (unsigned int& page : previous) {
        if (std::find(next.begin(), next.end(), page) != next.end()) page = 0;
    }
    size_t taken[2] = {0, 0};
    for (unsigned int slot = 0; slot < n; ++slot) {
        const Pages& list = slot % 2 == 0 ? next : previous;
        size_t& at = taken[slot % 2];
        if (at == list.size() || list[at] == 0) continue;
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch,,pageNum[%d]:%d \n",
                     static_cast<int>(found), static_cast<int>(list[at]));
        pages[found++] = list[at++];
    }
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE,
                 "ZVWSLibAE::PrefetchMgr::GetPagesForPrefetch left,pageNumsFound:%d \n", static_cast<int>(found));
}

// ---- Workers

void ZVWSLibAE::State::RunPrefetchThread(const char* name, void (*function)(void*), void* param)
{
    const KernelLock lock(m_ThreadMutex);
    const bool isTitles = strcmp(name, "prefetch_getTitles") == 0;
    ZVThread*& slot = isTitles ? m_PrefetchTitlesThread : m_PrefetchBoxArtsThread;
    std::atomic<bool>& isRunning = isTitles ? m_PrefetchTitlesIsRunning : m_PrefetchBoxArtsIsRunning;
    ZVThread::SafeDestroyThread(slot);  // of a worker that has ended
    ZVThread* const pThread = slot = ZVThread::CreateThread();
    ZV_ASSERT(pThread != 0);
    isRunning = true;
    if (pThread->Run(name, function, param)) return;
    isRunning = false;
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "Failed to launch worker thread: %s!\n", name);
    ZVThread::DestroyThread(slot);
    slot = nullptr;
}

namespace {

// Clears a worker's flag when the worker is done with the instance.
class Running {
public:
    explicit Running(std::atomic<bool>& flag) : m_Flag(flag) {}
    ~Running() { m_Flag = false; }
    Running(const Running&) = delete;
    Running& operator=(const Running&) = delete;

private:
    std::atomic<bool>& m_Flag;
};

template <class Titles>
void AddBoxArts(ZVWSLibAE::State& state, const Titles* titles, unsigned int size)
{
    const KernelLock lock(state.m_Mutex);
    for (unsigned int i = 0; i < size; ++i) {
        const char* prefix = titles[i].BoxArtPrefix;
        if (prefix && *prefix) state.m_WaitingForDownloadBoxArts.Append(prefix);
    }
}

void AddBoxArts(ZVWSLibAE::State& state, const ZV_WS_TitlesResponse& page)
{
    AddBoxArts(state, page.Titles.TitleListing, page.Titles.size);
}
void AddBoxArts(ZVWSLibAE::State& state, const ZV_WS_MyVideosResponse& page)
{
    AddBoxArts(state, page.Titles.TitleListingPurchased, page.Titles.size);
}

// Fetches each page into the cache. Ends early when the instance does, and at a page that cannot be had: the store is
// not to be bothered for pages that nobody asked for while it fails.
template <class Response, class Param, class Fetch>
void FetchPages(void* argument, Fetch fetch)
{
    const std::unique_ptr<Param> param(static_cast<Param*>(argument));
    ZVWSLibAE::State& state = param->pZVWSLibAE->GetState();
    const Running running(state.m_PrefetchTitlesIsRunning);
    for (const unsigned int page : param->prefetchpages) {
        if (state.m_StopPrefetch) return;
        Response response;
        param->page.CurrentPageNumber = page;
        const bool fetched = fetch(state, *param, response) == ZV_WS_Status_ok;
        if (fetched) {
            state.m_PrefetchMgr.MarkPagePrefetched(page);
            AddBoxArts(state, response);
        }
        ZV_WS_release(&response);
        if (!fetched) return;
    }
}

}  // namespace

namespace ZVWSLib {

void prefetch_getTitles(void* argument)
{
    FetchPages<ZV_WS_TitlesResponse, Param_prefetch_getTitles>(
        argument, [](auto& state, const auto& param, auto& response) {
            return ZV_WS_getTitles(&state.m_PrefetchTitlesSession, param.genreid, &param.page, param.purchasetype,
                                   &response);
        });
}

void prefetch_getMyVideos(void* argument)
{
    FetchPages<ZV_WS_MyVideosResponse, Param_prefetch_getMyVideos>(
        argument, [](auto& state, const auto& param, auto& response) {
            return ZV_WS_getMyVideos(&state.m_PrefetchUserDataSession, &param.page, param.purchasetype,
                                     param.typefilter, param.watchstatus, &response);
        });
}

void prefetch_getWishlistItems(void* argument)
{
    FetchPages<ZV_WS_WishlistItemsResponse, Param_prefetch_getWishlistItems>(
        argument, [](auto& state, const auto& param, auto& response) {
            return ZV_WS_getWishlistItems(&state.m_PrefetchUserDataSession, param.sortorder, &param.page,
                                          param.typefilter, &response);
        });
}

void prefetch_getBoxArts(void* argument)
{
    const std::unique_ptr<Param_prefetch_getBoxArts> param(static_cast<Param_prefetch_getBoxArts*>(argument));
    ZVWSLibAE::State& state = param->pZVWSLibAE->GetState();
    const Running running(state.m_PrefetchBoxArtsIsRunning);
    for (const AEString& prefix : param->boxartprefixs) {
        if (state.m_StopPrefetch) return;
        ZV_WS_String place;
        ZV_WS_getBoxArtImage(&state.m_PrefetchBoxArtsSession, param->boxartsize, prefix.c_str(), &place);
        ZV_WS_release(&place);
    }
}

void DuplicatePrefetchSessions(ZVWSLibAE::State& state)
{
    if (state.m_Listing.m_CurrentCacheType != CacheType_File) return;
    const unsigned int data = state.m_Listing.m_CurrentCacheData;
    if (data & ZV_WS_CacheParam::CacheData_Metadata) {
        ZV_WS_duplicate(&state.m_PrefetchTitlesSession, &state.m_Session);
        if (data & ZV_WS_CacheParam::CacheData_BoxArtImage) {
            ZV_WS_duplicate(&state.m_PrefetchBoxArtsSession, &state.m_Session);
        }
    }
    if (data & ZV_WS_CacheParam::CacheData_Userdata) {
        ZV_WS_duplicate(&state.m_PrefetchUserDataSession, &state.m_Session);
    }
}

// ---- When

namespace {

// A listing's own way to be fetched: the worker's record, its filters as numbers, and what has to be cached for it.
struct Plan {
    ZVWSLibAE& instance;
    ZVWSLibAE::State& state = instance.GetState();
    const ZVWSLibAE::State::Listing& listing = state.m_Listing;

    bool Caches(unsigned int kind) const { return (listing.m_CurrentCacheData & kind) != 0; }

    // For Update, which takes the mutex itself: the analysis does not see that the manager's is this one.
    AEArray<AEString>& WaitingBoxArts() const ZV_THREAD_ATTRIBUTE(no_thread_safety_analysis)
    {
        return state.m_WaitingForDownloadBoxArts;
    }

    template <class Param, class Response>
    void Pages(Result_Type type, const Response& shown, Param param, int userdata1, int userdata2, int userdata3,
               void (*worker)(void*))
    {
        if (shown.TotalPages < 2) return;
        ZVWSLibAE::PrefetchMgr& manager = state.m_PrefetchMgr;
        manager.Update(WaitingBoxArts(), type, shown.TotalPages, shown.TotalItems, shown.ItemsPerPage, userdata1,
                       userdata2, userdata3);
        manager.MarkPagePrefetched(shown.CurrentPageNumber);
        unsigned int pages[ZVWSLibAE::PrefetchMgr::m_kPrefetchPages];
        unsigned int found = 0;
        manager.GetPagesForPrefetch(shown.CurrentPageNumber, std::size(pages), pages, found);
        if (found == 0) return;
        param.pZVWSLibAE = &instance;
        param.page.ItemsPerPage = shown.ItemsPerPage;
        for (unsigned int i = 0; i < found; ++i)
            param.prefetchpages.Append(pages[i]);
        state.RunPrefetchThread("prefetch_getTitles", worker, new Param(std::move(param)));
    }

    void operator()(const ZV_WS_TitlesResponse& shown)
    {
        if (!Caches(ZV_WS_CacheParam::CacheData_Metadata)) return;
        Param_prefetch_getTitles param;
        param.genreid = shown.GenreID;
        param.purchasetype = listing.m_PrefetchPurchaseType;
        Pages(eTitlesResponse, shown, param, shown.GenreID, param.purchasetype, 0, prefetch_getTitles);
    }

    void operator()(const ZV_WS_MyVideosResponse& shown)
    {
        if (!Caches(ZV_WS_CacheParam::CacheData_Userdata)) return;
        Param_prefetch_getMyVideos param;
        param.purchasetype = listing.m_PrefetchPurchaseType;
        param.typefilter = listing.m_PrefetchTypeFilter;
        param.watchstatus = listing.m_PrefetchWatchStatus;
        Pages(eMyVideosResponse, shown, param, param.purchasetype, param.typefilter, param.watchstatus,
              prefetch_getMyVideos);
    }

    void operator()(const ZV_WS_WishlistItemsResponse& shown)
    {
        if (!Caches(ZV_WS_CacheParam::CacheData_Userdata)) return;
        Param_prefetch_getWishlistItems param;
        param.sortorder = listing.m_PrefetchSortOrder;
        param.typefilter = listing.m_PrefetchTypeFilter;
        Pages(eWishlistItemsResponse, shown, param, param.sortorder, param.typefilter, 0, prefetch_getWishlistItems);
    }

    // The first listing's image is on the screen already.
    void operator()(const ZV_WS_TitleListingResponseArray& shown)
    {
        if (shown.size < 2) return;
        {
            const KernelLock lock(state.m_Mutex);
            state.m_WaitingForDownloadBoxArts.RemoveAll();
        }
        AddBoxArts(state, shown.TitleListingResponse + 1, shown.size - 1);
    }

    template <class Other>
    void operator()(const Other&)
    {}
};

}  // namespace

void SchedulePrefetch(ZVWSLibAE& instance)
{
    ZVWSLibAE::State& state = instance.GetState();
    if (state.m_Result.retCode != ZV_WS_Status_ok || state.m_Listing.m_CurrentCacheType != CacheType_File) return;
    if (!state.m_NeedPrefetchTitles || state.m_PrefetchTitlesIsRunning) return;
    std::visit(Plan{instance}, state.m_Result.value);
}

void FetchBoxArtWhenIdle(ZVWSLibAE& instance)
{
    ZVWSLibAE::State& state = instance.GetState();
    if (!state.m_FlashIdle || state.m_PrefetchTitlesIsRunning || state.m_PrefetchBoxArtsIsRunning) return;
    const bool keepsImages = state.m_Listing.m_CurrentCacheType == CacheType_File &&
                             (state.m_Listing.m_CurrentCacheData & ZV_WS_CacheParam::CacheData_BoxArtImage) != 0;
    if (!keepsImages) return;
    auto param = std::make_unique<Param_prefetch_getBoxArts>();
    {
        const KernelLock lock(state.m_Mutex);
        if (state.m_WaitingForDownloadBoxArts.empty()) return;
        param->boxartprefixs.Append(state.m_WaitingForDownloadBoxArts[0]);
        state.m_WaitingForDownloadBoxArts.RemoveAt(0);
    }
    param->pZVWSLibAE = &instance;
    param->boxartsize = state.m_Listing.m_PrefetchBoxArtSize;
    state.RunPrefetchThread("prefetch_getBoxArts", prefetch_getBoxArts, param.release());
}

}  // namespace ZVWSLib
