// How long an update tick of an instance takes while it fetches box art ahead: the movie waits that long.
#include <stdlib.h>

#include <algorithm>
#include <chrono>
#include <vector>

#include "Store.h"
#include "ZVWSLibAEDispatch.h"
#include "stagecraft/IStagecraft.h"

using namespace ae::stagecraft;

namespace {

using Clock = std::chrono::steady_clock;

std::vector<double> s_Ticks;  // seconds

class TimedWSLib : public ZVWSLibAE {
public:
    using ZVWSLibAE::ZVWSLibAE;

    static ASExtensionClass* ConstructInstance(StageWindow* window, ASObject& object, ASValueArray& arguments)
    {
        return new TimedWSLib(window, object, arguments);
    }

    void OnUpdate(StageWindow* window, ASObject& object) override
    {
        const bool delivers = GetCall().HasResult();  // waits on purpose, and runs the movie's code
        const Clock::time_point start = Clock::now();
        ZVWSLibAE::OnUpdate(window, object);
        if (!delivers) s_Ticks.push_back(std::chrono::duration<double>(Clock::now() - start).count());
    }
};

void RunMovie(const TemporaryFolder& cache)
{
    TheStore();
    setenv("STAGECRAFT_FPS", "1000", 1);
    setenv("STAGECRAFT_MOVIE", FOLDER "/tick.js", 1);
    setenv("ZV_BENCH_CACHE", cache.Path(), 1);
    const char* arguments[] = {"zv_bench", ""};
    IStagecraft* runtime = IStagecraft::InitializeStagecraftLibrary(2, arguments);
    if (!runtime) return Check(false, "the script runtime");
    runtime->RegisterExtensionClass<TimedWSLib>();
    AEArray<StageWindow*> windows;
    runtime->CreateAndConfigureStageWindowSet(windows, 2, arguments, 1);
    Check(runtime->RunStageWindowSet(windows).m_nErrorValue == AEError::OK, "the movie tick.js");
    runtime->DestroyStageWindowSet(windows);
    IStagecraft::UninitializeStagecraftLibrary();
}

// `share` of all ticks took at most the reported time.
void Tick(benchmark::State& state, double share)
{
    while (state.KeepRunning()) {
        const TemporaryFolder cache;
        s_Ticks.clear();
        const size_t before = TheStore().Log().size();
        RunMovie(cache);
        Check(TheStore().Log().size() >= before + kItems, "box art was fetched");
        std::sort(s_Ticks.begin(), s_Ticks.end());
        state.SetIterationTime(s_Ticks[static_cast<size_t>(share * static_cast<double>(s_Ticks.size() - 1))]);
    }
}

}  // namespace

BENCHMARK_CAPTURE(Tick, median, 0.5)->Name("tick/median")->UseManualTime()->Iterations(1);
BENCHMARK_CAPTURE(Tick, longest, 1.0)->Name("tick/longest")->UseManualTime()->Iterations(1);
