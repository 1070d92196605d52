// Fetching ahead: the pages next to the one shown, on a worker and a library session of their own, and box art while
// the user interface is idle. Nothing of it is shown: it fills the cache, from which the page that the user turns to
// then comes. A page that the user turns to while it is being fetched ahead is asked for a second time: the user's call
// waits for nobody's.
#pragma once

#include <stdint.h>

#include <atomic>

#include "CacheInterface.h"
#include "KernelMutex.h"
#include "ZVThread.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAEListings.h"
#include "ZVWSLibAEPrefetchMgr.h"
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
    /// Set by the worker of a listing call whose status is 0, before it publishes the result. Foreground worker.
    void ListingAnswered() { m_NeedPrefetchTitles = true; }
    /// A foreground call is about to be delivered: starts to fetch the pages around the one that it shows, unless
    /// others still are.
    void ResultComes(const Result& shown);

    void SetIdle() { m_FlashIdle = true; }
    /// On a tick without a result: fetches one image that waits, when the script is idle.
    void FetchBoxArtWhenIdle();

    // ---- Workers

    /// Fetches each page into the cache. Ends early when the instance does, and at a page that cannot be had: the store
    /// is not to be bothered for pages that nobody asked for while it fails. Prefetch worker.
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
    };

    /// The listing that was asked for last.
    struct LastListing {
        ListingRequest request;
        uint64_t drops = 0;  ///< CacheInterface::Drops() when it was.
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

    void FetchAround(const std::monostate&, const Result&) {}
    /// The image of the first listing is on the screen already.
    void FetchAround(const Param_getAllTvEpisodeListings& request, const Result& shown);
    template <class Request>
    void FetchAround(const Request& request, const Result& shown);

    /// Starts a worker that fetches ahead, in the slot of its kind: "prefetch_getTitles" for pages, else box art. The
    /// one before in that slot must have ended. The worker owns `param`.
    void RunPrefetchThread(const char* name, void (*function)(void*), void* param);

    /// What waits already keeps its place. Any thread.
    void AddWaitingForDownloadBoxArts(const AEArray<AEString>& prefixes);
    /// Empties the list. Any thread.
    AEArray<AEString> TakeWaitingForDownloadBoxArts();

    ZVWSLibAE& m_Owner;
    Settings m_Settings;
    LastListing m_LastListing;
    bool m_FlashIdle = false;
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
    PrefetchMgr m_PrefetchMgr;
};

namespace ZVWSLib {

void prefetch_getBoxArts(void* param);

}  // namespace ZVWSLib
