#include "ZVWSLibAEPrefetch.h"
#include "ServiceTrouble.h"

#include <string.h>

#include <algorithm>
#include <memory>
#include <utility>

#include "ZVAssert.h"
#include "ZVWSAELog.h"
#include "ZVWSLibAECall.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

using Prefetcher = ZVWSLibAE::Prefetcher;

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

// The box art of titles, as far as they have some.
template <class Title>
AEArray<AEString> BoxArtsOf(const Title* titles, unsigned int size)
{
    AEArray<AEString> prefixes;
    for (unsigned int i = 0; i < size; ++i) {
        const char* prefix = titles[i].BoxArtPrefix;
        if (prefix && *prefix) prefixes.Append(prefix);
    }
    return prefixes;
}

AEArray<AEString> BoxArtsOf(const ZV_WS_TitlesResponse& page)
{
    return BoxArtsOf(page.Titles.TitleListing, page.Titles.size);
}
AEArray<AEString> BoxArtsOf(const ZV_WS_MyVideosResponse& page)
{
    return BoxArtsOf(page.Titles.TitleListingPurchased, page.Titles.size);
}

// The answer in a result, whose kind the call decides.
template <class... Parameters>
const ZVWSLib::OutputOf<Parameters...>& AnswerOf(ZV_WS_Status (*)(ZV_WS_Session*, Parameters...), const Result& result)
{
    const auto* answer = std::get_if<ZVWSLib::OutputOf<Parameters...>>(&result.value);
    ZV_ASSERT(answer != nullptr);
    return *answer;
}

}  // namespace

// ---- Life

Prefetcher::Prefetcher(ZVWSLibAE& owner) : m_Owner(owner)
{
    m_PrefetchMgr.SetMutex(&m_Mutex);
}

void Prefetcher::Stop()
{
    m_StopPrefetch = true;
    for (const ZV_WS_Session* session :
         {&m_PrefetchUserDataSession, &m_PrefetchBoxArtsSession, &m_PrefetchTitlesSession}) {
        ZV_WS_abort(session);
    }
}

Prefetcher::~Prefetcher()
{
    Stop();
    ZVThread* pages = nullptr;
    ZVThread* boxArts = nullptr;
    {
        const KernelLock lock(m_Mutex);
        std::swap(pages, m_PrefetchTitlesThread);
        std::swap(boxArts, m_PrefetchBoxArtsThread);
    }
    ZVWSLib::EndWorker(pages, {&m_PrefetchUserDataSession, &m_PrefetchTitlesSession});
    ZVWSLib::EndWorker(boxArts, {&m_PrefetchBoxArtsSession});
    for (ZV_WS_Session* session : {&m_PrefetchUserDataSession, &m_PrefetchBoxArtsSession, &m_PrefetchTitlesSession})
        ZV_WS_release(session);
}

void Prefetcher::OpenSessions(const ZV_WS_Session& source)
{
    const auto open = [&source](ZV_WS_Session& session) {
        // Without its cache it would only keep the store busy.
        if (ZV_WS_duplicate(&session, &source) != ZV_WS_Status_ok) ZV_WS_release(&session);
    };
    if (Caches(ZV_WS_CacheParam::CacheData_Metadata)) {
        open(m_PrefetchTitlesSession);
        if (Caches(ZV_WS_CacheParam::CacheData_BoxArtImage)) open(m_PrefetchBoxArtsSession);
    }
    if (Caches(ZV_WS_CacheParam::CacheData_Userdata)) open(m_PrefetchUserDataSession);
}

bool Prefetcher::Caches(ZV_WS_CacheParam::CacheData kind) const
{
    return m_Settings.m_CurrentCacheType == CacheType_File && (m_Settings.m_CurrentCacheData & kind) != 0;
}

ZV_WS_Session& Prefetcher::SessionFor(ZV_WS_CacheParam::CacheData kind)
{
    return kind == ZV_WS_CacheParam::CacheData_Userdata ? m_PrefetchUserDataSession : m_PrefetchTitlesSession;
}

void Prefetcher::Remember(const Param_init& param)
{
    m_Settings.m_CurrentCacheType = param.CacheType;
    m_Settings.m_CurrentCacheData = param.CacheData;
}

void Prefetcher::Remember(const Param_getBoxArtImage& param)
{
    m_Settings.m_PrefetchBoxArtSize = param.boxartsize;
}

void Prefetcher::RunPrefetchThread(const char* name, void (*function)(void*), void* param)
{
    const KernelLock lock(m_Mutex);
    const bool isTitles = strcmp(name, "prefetch_getTitles") == 0;
    ZVThread*& slot = isTitles ? m_PrefetchTitlesThread : m_PrefetchBoxArtsThread;
    std::atomic<bool>& isRunning = isTitles ? m_PrefetchTitlesIsRunning : m_PrefetchBoxArtsIsRunning;
    ZVThread::SafeDestroyThread(slot);  // of a worker that needs the mutex no more
    ZVThread* const pThread = slot = ZVThread::CreateThread();
    ZV_ASSERT(pThread != 0);
    isRunning = true;
    if (pThread->Run(name, function, param)) return;
    isRunning = false;
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "Failed to launch worker thread: %s!\n", name);
    ZVThread::DestroyThread(slot);
    slot = nullptr;
}

// ---- Trouble

void Prefetcher::ListingEnded(ZV_WS_Status status, const RetryAfter::Heard& heard)
{
    if (status == ZV_WS_Status_ok) m_NeedPrefetchTitles = true;
    if (!m_StopPrefetch) Pause().Note(status, heard);  // else it was broken off
}

bool Prefetcher::MetTrouble(const std::string& what, ZV_WS_Status status, const ZV_WS_Session& session)
{
    const RetryAfter::Heard heard = TakeHeard(session);
    if (m_StopPrefetch) return true;
    if (!PrefetchPause::IsTrouble(status, heard)) {
        Pause().Note(status, heard);
        const KernelLock lock(m_Mutex);
        m_Failed.erase(what);
        return false;
    }
    if (heard.answered && !heard.unavailable) {
        // When the service has done well by others since it first failed at this, then this is what is wrong: one image
        // that it cannot give must not keep all others waiting for ever longer.
        const uint64_t answers = Pause().Answers();
        const KernelLock lock(m_Mutex);
        const auto before = m_Failed.emplace(what, answers).first;
        if (before->second != answers) return false;
    }
    return Pause().Note(status, heard);
}

// ---- Pages

void Prefetcher::ResultComes(const Result& shown)
{
    if (shown.retCode != ZV_WS_Status_ok || m_Settings.m_CurrentCacheType != CacheType_File) return;
    if (!m_NeedPrefetchTitles) return;
    std::visit([&](const auto& request) { Show(request, shown); }, m_LastListing.request);
}

template <class Request>
void Prefetcher::Show(const Request& /*request*/, const Result& shown)
{
    const auto& page = AnswerOf(Listing<Request>::kCall, shown);
    m_Shown.listing = m_LastListing;
    m_Shown.type = shown.type();
    m_Shown.number = page.CurrentPageNumber;
    m_Shown.totalPages = page.TotalPages;
    m_Shown.totalItems = page.TotalItems;
    if (!m_PrefetchTitlesIsRunning) FetchAroundShown();
}

void Prefetcher::FetchAroundShown()
{
    m_PagesWait = false;
    std::visit([&](const auto& request) { FetchAround(request); }, m_Shown.listing.request);
}

template <class Request>
void Prefetcher::FetchAround(const Request& request)
{
    using Listed = Listing<Request>;
    if (!Caches(Listed::kData) || m_Shown.totalPages < 2) return;

    // The manager takes the mutex itself. Nobody adds to the list meanwhile: no page is being fetched.
    AEArray<AEString> waiting = TakeWaitingForDownloadBoxArts();
    const std::array<int, 3> identity = Listed::Identity(request);
    m_PrefetchMgr.Update(waiting, m_Shown.type, m_Shown.totalPages, m_Shown.totalItems, request.page.ItemsPerPage,
                         identity[0], identity[1], identity[2]);
    AddWaitingForDownloadBoxArts(waiting);

    m_PrefetchMgr.MarkPagePrefetched(request.page.CurrentPageNumber, m_Shown.listing.drops);
    if (!Pause().IsOver()) {
        m_PagesWait = true;
        return;
    }
    unsigned int pages[PrefetchMgr::m_kPrefetchPages];
    unsigned int found = 0;
    m_PrefetchMgr.GetPagesForPrefetch(m_Shown.number, std::size(pages), pages, found);
    if (found == 0) return;
    auto param = std::make_unique<typename Listed::Ahead>(request);
    for (unsigned int i = 0; i < found; ++i)
        param->prefetchpages.Append(pages[i]);
    RunPrefetchThread("prefetch_getTitles", Listed::kWorker, param.release());
}

template <class Request>
void Prefetcher::FetchPages(void* argument)
{
    using Ahead = typename Listing<Request>::Ahead;
    const std::unique_ptr<Ahead> param(static_cast<Ahead*>(argument));
    Prefetcher& self = param->pZVWSLibAE->GetPrefetcher();
    const Running running(self.m_PrefetchTitlesIsRunning);
    const AEArray<unsigned int>& pages = param->prefetchpages;
    self.m_PagesWait = !std::all_of(pages.begin(), pages.end(), [&](unsigned int number) {
        param->page.CurrentPageNumber = number;
        return self.FetchPage<Request>(*param);
    });
}

template <class Request>
bool Prefetcher::FetchPage(const Request& request)
{
    using Listed = Listing<Request>;
    if (m_StopPrefetch || !Pause().IsOver()) return false;  // another call may have met trouble
    std::decay_t<decltype(AnswerOf(Listed::kCall, Result()))> page;
    const unsigned int number = request.page.CurrentPageNumber;
    const uint64_t drops = CacheInterface::Drops();
    ZV_WS_Session& session = SessionFor(Listed::kData);
    const ZV_WS_Status status = ZVWSLib::CallLibrary(Listed::kCall, session, request, page);
    const bool isTrouble = MetTrouble("page " + std::to_string(number), status, session);
    if (status == ZV_WS_Status_ok) {
        m_PrefetchMgr.MarkPagePrefetched(number, drops);
        AddWaitingForDownloadBoxArts(BoxArtsOf(page));
    }
    ZV_WS_release(&page);
    return !isTrouble;
}

#define ZVWS_PREFETCH_WORKER(call, ...)              \
    void ZVWSLib::prefetch_##call(void* param)       \
    {                                                \
        Prefetcher::FetchPages<Param_##call>(param); \
    }
ZVWS_PAGED_LISTINGS(ZVWS_PREFETCH_WORKER)

// ---- Box art

void Prefetcher::Show(const Param_getAllTvEpisodeListings& /*request*/, const Result& shown)
{
    if (m_PrefetchTitlesIsRunning) return;
    const auto& listings = AnswerOf(ZV_WS_getAllTvEpisodeListings, shown);
    if (listings.size < 2) return;
    TakeWaitingForDownloadBoxArts();
    AddWaitingForDownloadBoxArts(BoxArtsOf(listings.TitleListingResponse + 1, listings.size - 1));
}

void Prefetcher::AddWaitingForDownloadBoxArts(const AEArray<AEString>& prefixes)
{
    const KernelLock lock(m_Mutex);
    AEArray<AEString>& list = m_WaitingForDownloadBoxArts;
    for (const AEString& prefix : prefixes) {
        if (std::find(list.begin(), list.end(), prefix) == list.end()) list.Append(prefix);
    }
}

AEArray<AEString> Prefetcher::TakeWaitingForDownloadBoxArts()
{
    const KernelLock lock(m_Mutex);
    return std::exchange(m_WaitingForDownloadBoxArts, AEArray<AEString>());
}

void Prefetcher::FetchWhenIdle()
{
    if (!m_FlashIdle || m_PrefetchTitlesIsRunning || m_PrefetchBoxArtsIsRunning || !Pause().IsOver()) return;
    if (m_PagesWait) FetchAroundShown();
    if (!m_PrefetchTitlesIsRunning) FetchBoxArt();
}

void Prefetcher::FetchBoxArt()
{
    if (!Caches(ZV_WS_CacheParam::CacheData_BoxArtImage)) return;
    auto param = std::make_unique<Param_prefetch_getBoxArts>();
    {
        const KernelLock lock(m_Mutex);
        if (m_WaitingForDownloadBoxArts.empty()) return;
        param->boxartprefixs.Append(m_WaitingForDownloadBoxArts[0]);
        m_WaitingForDownloadBoxArts.RemoveAt(0);
    }
    param->pZVWSLibAE = &m_Owner;
    param->boxartsize = m_Settings.m_PrefetchBoxArtSize;
    RunPrefetchThread("prefetch_getBoxArts", ZVWSLib::prefetch_getBoxArts, param.release());
}

void Prefetcher::FetchBoxArts(void* argument)
{
    const std::unique_ptr<Param_prefetch_getBoxArts> param(static_cast<Param_prefetch_getBoxArts*>(argument));
    Prefetcher& self = param->pZVWSLibAE->GetPrefetcher();
    const Running running(self.m_PrefetchBoxArtsIsRunning);
    for (const AEString& prefix : param->boxartprefixs) {
        if (self.m_StopPrefetch) return;
        ZV_WS_String place;
        ZV_WS_Session& session = self.m_PrefetchBoxArtsSession;
        const ZV_WS_Status status = ZV_WS_getBoxArtImage(&session, param->boxartsize, prefix.c_str(), &place);
        ZV_WS_release(&place);
        if (!self.MetTrouble(prefix.c_str(), status, session)) continue;
        // Behind the others, which may be better off.
        AEArray<AEString> again;
        again.Append(prefix);
        self.AddWaitingForDownloadBoxArts(again);
    }
}

void ZVWSLib::prefetch_getBoxArts(void* param)
{
    Prefetcher::FetchBoxArts(param);
}
