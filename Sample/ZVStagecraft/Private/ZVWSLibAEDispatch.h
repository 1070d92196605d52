// How a script call reaches the library on a worker thread and how its result comes back.
//
//   main thread    AsyncDispatch: checks, reads the arguments into a Param_ record, RunThread
//   worker         Work: calls the library with the instance's session, Publish
//   main thread    ZVWSLibAE::OnUpdate, on a later tick: the script value, "onComplete"
//
// A method that asks the library and does nothing else is one row: ZVWS_ASYNC(name, its Param_ record), which makes the
// handler and the worker ZVWSLib::name(void*) for ZV_WS_name. The library's last parameter decides the kind of result.
#pragma once

#include <atomic>
#include <memory>
#include <tuple>
#include <type_traits>

#include "KernelMutex.h"
#include "ZVAssert.h"
#include "ZVThread.h"
#include "ZVWSAELog.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAEParams.h"
#include "ZVWSLibAEPrefetch.h"
#include "ZVWSLibAEResult.h"

/// Main thread, unless a member says otherwise.
struct ZVWSLibAE::State {
    /// What listings were last asked for and how much is cached: what fetching ahead rests on. "clone" takes it over.
    struct Listing {
        ZV_WS_SortOrder m_PrefetchSortOrder = SORT_ORDER_DATEADDED;
        ZV_WS_TitleTypeFilter m_PrefetchTypeFilter = TITLE_TYPE_FILTER_ANY;
        ZV_WS_WatchStatus m_PrefetchWatchStatus = WATCH_STATUS_WATCHNOW;
        ZV_WS_PurchaseType m_PrefetchPurchaseType = PURCHASE_TYPE_RENT;
        ZV_WS_BoxArtSize m_PrefetchBoxArtSize = BOX_ART_SIZE_95;
        CacheType m_CurrentCacheType = CacheType_None;
        unsigned int m_CurrentCacheData = 0;
    };

    State() { m_PrefetchMgr.SetMutex(&m_Mutex); }
    ~State();

    /// Whether a call has been started and not been delivered.
    bool IsBusy();

    /// Starts the worker, which owns `param` from then on, and the update calls for `object`. A thread that cannot be
    /// made is one line in the log: no "onComplete" follows, the callback stays set and `param` is not freed.
    void RunThread(const char* name, void (*function)(void*), void* param, ae::stagecraft::ASObject& object,
                   const ae::stagecraft::ASValue& callback);

    /// Starts a worker that fetches ahead, in the slot of its kind: "prefetch_getTitles" for pages, else box art. The
    /// one before in that slot must have ended. The worker owns `param`.
    void RunPrefetchThread(const char* name, void (*function)(void*), void* param);

    void EndWorker(ZVThread* thread);

    /// The worker's last act on the instance: hands the result over.
    template <class Output>
    void Publish(const Output& output, ZV_WS_Status status)
    {
        m_Result.Set(output, status);
        m_NeedFireEvent = true;
    }

    Result m_Result;          ///< The worker's until m_NeedFireEvent is set, then the main thread's.
    ZV_WS_Session m_Session;  ///< The worker's while one runs.
    KernelMutex m_ThreadMutex;
    ZVThread* m_Thread ZV_GUARDED_BY(m_ThreadMutex) = nullptr;
    ZVThread* m_PrefetchTitlesThread ZV_GUARDED_BY(m_ThreadMutex) = nullptr;
    ZVThread* m_PrefetchBoxArtsThread ZV_GUARDED_BY(m_ThreadMutex) = nullptr;
    ae::stagecraft::ASValue m_CallbackObject ZV_GUARDED_BY(m_ThreadMutex);
    Listing m_Listing;
    std::atomic<bool> m_Init{false};           ///< Set by the worker of "init".
    std::atomic<bool> m_NeedFireEvent{false};  ///< Set by a worker, after the result.
    bool m_FlashIdle = false;

    // ---- Fetching ahead. The sessions are their workers', empty where nothing is fetched.
    ZV_WS_Session m_PrefetchTitlesSession;
    ZV_WS_Session m_PrefetchBoxArtsSession;
    ZV_WS_Session m_PrefetchUserDataSession;
    std::atomic<bool> m_NeedPrefetchTitles{false};  ///< A listing was answered; set by its worker before the result.
    std::atomic<bool> m_PrefetchTitlesIsRunning{false};
    std::atomic<bool> m_PrefetchBoxArtsIsRunning{false};
    std::atomic<bool> m_StopPrefetch{false};  ///< The instance ends.
    KernelMutex m_Mutex;
    AEArray<AEString> m_WaitingForDownloadBoxArts ZV_GUARDED_BY(m_Mutex);
    PrefetchMgr m_PrefetchMgr;
};

namespace ZVWSLib {

int LogAreaID();

/// Remembers what a listing was asked with. Most calls are no listings.
inline void Remember(ZVWSLibAE::State&, const Param_base&) {}
void Remember(ZVWSLibAE::State& state, const Param_getTitles& param);
void Remember(ZVWSLibAE::State& state, const Param_getMyVideos& param);
void Remember(ZVWSLibAE::State& state, const Param_getWishlistItems& param);
void Remember(ZVWSLibAE::State& state, const Param_getBoxArtImage& param);
void Remember(ZVWSLibAE::State& state, const Param_init& param);

/// The elements of the one argument when it is an Array of two objects.
bool ReadArguments(ae::stagecraft::ASValueArray& arguments, ae::stagecraft::ASValue& callback,
                   ae::stagecraft::ASValue& parameters);

/// Everything of an asynchronous call after the question whether the instance may make it now.
template <class Param>
ZVWSLibAE::ReturnCode StartCall(ZVWSLibAE& instance, const char* name, void (*worker)(void*), const Param& prototype,
                                ae::stagecraft::ASObject& object, ae::stagecraft::ASValueArray& arguments)
{
    ZVWSLibAE::State& state = instance.GetState();
    if (state.IsBusy()) return ZVWSLibAE::kBusy;
    const bool wasInitialized = state.m_Init;
    ae::stagecraft::ASValue callback, parameters;
    if (!ReadArguments(arguments, callback, parameters)) return ZVWSLibAE::kWrongArguments;

    auto param = std::make_unique<Param>(prototype);
    param->pZVWSLibAE = &instance;
    PropertyReader reader(*parameters.GetObject());
    param->ReadWith(reader);
    if (!reader.Succeeded()) return ZVWSLibAE::kWrongArguments;
    // A getter of the script may have made a call of its own.
    if (state.IsBusy() || state.m_Init != wasInitialized) return ZVWSLibAE::kBusy;

    Remember(state, *param);
    state.RunThread(name, worker, param.release(), object, callback);
    return ZVWSLibAE::kStarted;
}

/// A whole handler.
template <class Param>
ae::stagecraft::ASValue AsyncDispatch(ZVWSLibAE& instance, const char* name, void (*worker)(void*),
                                      const Param& prototype, ae::stagecraft::ASObject& object,
                                      ae::stagecraft::ASValueArray& arguments)
{
    const ZVWSAELog scope("ZVWSLibAE", name, LogAreaID());
    if (!instance.GetState().m_Init) return ae::stagecraft::ASValue::Number(ZVWSLibAE::kNotInitialized);
    return ae::stagecraft::ASValue::Number(StartCall(instance, name, worker, prototype, object, arguments));
}

// ---- A field of a Param_ record as arguments of a library call.

template <class Field>
std::tuple<Field> Pass(const Field& field)
{
    return std::make_tuple(field);
}
inline std::tuple<const char*> Pass(const AEString& text)
{
    return std::make_tuple(text.c_str());
}
inline std::tuple<const ZV_WS_Pagination*> Pass(const ZV_WS_Pagination& page)
{
    return std::make_tuple(&page);
}
inline std::tuple<const int*, unsigned int> Pass(const AEArray<int>& numbers)
{
    return std::make_tuple(numbers.begin(), static_cast<unsigned int>(numbers.size()));
}

void LogStatus(const char* name, ZV_WS_Status status);

/// A worker: owns its param. Worker thread. What comes around the answer of a listing is worth fetching ahead.
template <class Param, bool isListing, class... Parameters>
void Work(const char* name, ZV_WS_Status (*call)(ZV_WS_Session*, Parameters...), void* argument)
{
    using OutputPointer = std::tuple_element_t<sizeof...(Parameters) - 1, std::tuple<Parameters...>>;
    using Output = std::remove_pointer_t<OutputPointer>;

    const std::unique_ptr<Param> param(static_cast<Param*>(argument));
    ZV_ASSERT(param != nullptr);
    ZV_ASSERT(param->pZVWSLibAE != nullptr);
    ZVWSLibAE::State& state = param->pZVWSLibAE->GetState();
    Output output{};
    const ZV_WS_Status status = std::apply(
        [&](const auto&... fields) {
            return std::apply(
                call, std::tuple_cat(std::make_tuple(&state.m_Session), Pass(fields)..., std::make_tuple(&output)));
        },
        param->Arguments());
    LogStatus(name, status);
    if (isListing && status == ZV_WS_Status_ok) state.m_NeedPrefetchTitles = true;
    state.Publish(output, status);
}

}  // namespace ZVWSLib

/// A row whose worker calls `call`.
#define ZVWS_ASYNC_ROW(name, prototype, call, isListing)                                                 \
    namespace ZVWSLib {                                                                                  \
    void name(void* param)                                                                               \
    {                                                                                                    \
        Work<decltype(prototype), isListing>(#name, call, param);                                        \
    }                                                                                                    \
    }                                                                                                    \
    void ZVWSLibAE::name(ae::stagecraft::StageWindow* /*window*/, ae::stagecraft::ASObject& object,      \
                         ae::stagecraft::ASValueArray& arguments, ae::stagecraft::ASValue& returnValue)  \
    {                                                                                                    \
        returnValue = ZVWSLib::AsyncDispatch(*this, #name, ZVWSLib::name, prototype, object, arguments); \
    }

#define ZVWS_ASYNC_CALL(name, prototype, call) ZVWS_ASYNC_ROW(name, prototype, call, false)
#define ZVWS_ASYNC(name, prototype) ZVWS_ASYNC_ROW(name, prototype, ZV_WS_##name, false)
#define ZVWS_ASYNC_LISTING(name, prototype) ZVWS_ASYNC_ROW(name, prototype, ZV_WS_##name, true)
