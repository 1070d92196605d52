// Fetching ahead: the pages next to the one shown, on a worker and a library session of their own, and box art while
// the user interface is idle. Nothing of it is shown: it fills the cache, from which the page that the user turns to
// then comes. A page that the user turns to while it is being fetched ahead is asked for a second time: the user's call
// waits for nobody's.
//
// A service in trouble is left alone (ZVWSLibAEPrefetchPause.h, Backoff.h): the first failure ends it all. What then
// was not fetched waits: images in their list; pages as the page that is shown when the pause is over, whose neighbours
// are looked for anew. Nobody sleeps: whether it is over is asked when a page is shown, and on the ticks of an idle
// script.
#pragma once

#include <stdint.h>

#include <atomic>
#include <map>
#include <memory>
#include <string>

#include "CacheInterface.h"
#include "KernelMutex.h"
#include "ZVThread.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAEListings.h"
#include "ZVWSLibAEPrefetchMgr.h"
#include "ZVWSLibAEPrefetchPause.h"
#include "ZVWSLibAEResult.h"

/// What the worker of box art gets; its own to delete.
struct Param_prefetch_getBoxArts : Param_base {
    ZV_WS_BoxArtSize boxartsize = BOX_ART_SIZE_95;
    AEArray<AEString> boxartprefixs;
};

/// Main thread, unless a member says otherwise.
class ZVWSLibAE::Prefetcher {
public:
    explicit Prefetcher(ZVWSLibAE& owner);
    /// Breaks off what is being fetched and waits for the workers.
    ~Prefetcher();
    Prefetcher(const Prefetcher&) = delete;
    Prefetcher& operator=(const Prefetcher&) = delete;

    /// Breaks off what is being fetched, for good, and returns at once.
    void Stop();

    // ---- Set-up

    /// Takes over what another instance's "init" and "getBoxArtImage" set.
    void CopySettings(const Prefetcher& source) { m_Settings = source.m_Settings; }
    /// Before anything else: a pause by another clock, for tests.
    void UsePause(std::shared_ptr<PrefetchPause> pause) { m_Settings.m_Pause = std::move(pause); }
    /// Duplicates the sessions that fetch ahead from the instance's own, as far as there is a file cache for their
    /// kinds of data. The thread that uses the instance's session.
    void OpenSessions(const ZV_WS_Session& source);

    // ---- What the script does

    /// A foreground call starts with these parameters: the user interface is not idle.
    template <class Param>
    void CallStarts(const Param& param)
    {
        m_FlashIdle = false;
        m_NeedPrefetchTitles = false;
        Remember(param);
    }
    /// The library's call of a listing has ended, and its result is not published yet. What became of it tells how the
    /// service is. Foreground worker.
    void ListingEnded(ZV_WS_Status status, const RetryAfter::Heard& heard);
    /// A foreground call is about to be delivered: starts to fetch the pages around the one that it shows, unless
    /// others still are.
    void ResultComes(const Result& shown);

    void SetIdle() { m_FlashIdle = true; }
    /// On a tick without a result, when the script is idle: starts to fetch the pages that a pause has kept back, or
    /// one image that waits.
    void FetchWhenIdle();

    // ---- Workers

    /// Fetches each page into the cache, but those that the service refuses. Ends early when the instance does, and
    /// when the service is in trouble. Prefetch worker.
    template <class Request>
    static void FetchPages(void* argument);
    /// Prefetch worker.
    static void FetchBoxArts(void* argument);

private:
    /// What "clone" takes over.
    struct Settings {
        CacheType m_CurrentCacheType = CacheType_None;
        unsigned int m_CurrentCacheData = 0;
        ZV_WS_BoxArtSize m_PrefetchBoxArtSize = BOX_ART_SIZE_95;
        std::shared_ptr<PrefetchPause> m_Pause = std::make_shared<PrefetchPause>();
    };

    /// The listing that was asked for last.
    struct LastListing {
        ListingRequest request;
        uint64_t drops = 0;  ///< CacheInterface::Drops() when it was.
    };

    /// The page of a listing that was shown last, as the service answered it.
    struct ShownPage {
        LastListing listing;
        Result_Type type = eVoid;
        unsigned int number = 0;
        unsigned int totalPages = 0;
        unsigned int totalItems = 0;
    };

    // Most calls are no listings.
    void Remember(const Param_base&) {}
    void Remember(const Param_init& param);
    void Remember(const Param_getBoxArtImage& param);
    template <class Request>
    std::enable_if_t<kIsListing<Request>> Remember(const Request& request)
    {
        m_LastListing = {request, CacheInterface::Drops()};
    }

    bool Caches(ZV_WS_CacheParam::CacheData kind) const;
    ZV_WS_Session& SessionFor(ZV_WS_CacheParam::CacheData kind);

    PrefetchPause& Pause() { return *m_Settings.m_Pause; }
    /// Takes note of how a worker's call for `what` ended. True when fetching ahead has to stop. Prefetch worker.
    bool MetTrouble(const std::string& what, ZV_WS_Status status, const ZV_WS_Session& session);

    void Show(const std::monostate&, const Result&) {}
    /// The image of the first listing is on the screen already.
    void Show(const Param_getAllTvEpisodeListings& request, const Result& shown);
    template <class Request>
    void Show(const Request& request, const Result& shown);

    /// Starts to fetch the pages around the one that was shown last; in a pause, lets them wait. No page is being
    /// fetched.
    void FetchAroundShown();
    template <class Request>
    void FetchAround(const Request& request);
    void FetchAround(const std::monostate&) {}
    void FetchAround(const Param_getAllTvEpisodeListings&) {}
    /// False when fetching ahead has to stop. Prefetch worker.
    template <class Request>
    bool FetchPage(const Request& request);

    /// Starts a worker that fetches ahead, in the slot of its kind: "prefetch_getTitles" for pages, else box art. The
    /// one before in that slot must have ended. The worker owns `param`.
    void RunPrefetchThread(const char* name, void (*function)(void*), void* param);

    /// Starts to fetch the first image that waits. Nothing is being fetched, and no pause is on.
    void FetchBoxArt();
    /// What waits already keeps its place. Any thread.
    void AddWaitingForDownloadBoxArts(const AEArray<AEString>& prefixes);
    /// Empties the list. Any thread.
    AEArray<AEString> TakeWaitingForDownloadBoxArts();

    ZVWSLibAE& m_Owner;
    Settings m_Settings;  // its pause any thread's
    LastListing m_LastListing;
    ShownPage m_Shown;
    bool m_FlashIdle = false;
    std::atomic<bool> m_PagesWait{false};  // for the end of a pause
    std::atomic<bool> m_NeedPrefetchTitles{false};
    // Set for the whole life of the worker, which clears it as its last act on the instance.
    std::atomic<bool> m_PrefetchTitlesIsRunning{false};
    std::atomic<bool> m_PrefetchBoxArtsIsRunning{false};
    std::atomic<bool> m_StopPrefetch{false};

    // A worker's while it runs. Empty where nothing is fetched ahead.
    ZV_WS_Session m_PrefetchTitlesSession;
    ZV_WS_Session m_PrefetchBoxArtsSession;
    ZV_WS_Session m_PrefetchUserDataSession;

    KernelMutex m_Mutex;
    ZVThread* m_PrefetchTitlesThread ZV_GUARDED_BY(m_Mutex) = nullptr;
    ZVThread* m_PrefetchBoxArtsThread ZV_GUARDED_BY(m_Mutex) = nullptr;
    AEArray<AEString> m_WaitingForDownloadBoxArts ZV_GUARDED_BY(m_Mutex);
    // What the service answered with a failure, with the answers that there had been then.
    std::map<std::string, uint64_t> m_Failed ZV_GUARDED_BY(m_Mutex);
    PrefetchMgr m_PrefetchMgr;
};

namespace ZVWSLib {

void prefetch_getBoxArts(void* param);

}  // namespace ZVWSLib
