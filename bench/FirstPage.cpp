// From the start of the client's process to the first page of titles on the screen.
#include "Store.h"

namespace {

void Process(benchmark::State& state, const char* movie)
{
    while (state.KeepRunning())
        state.SetIterationTime(RunClient(movie, "the page is there"));
}

// The same in a process that runs: set-up of a session and its first call, without ticks.
void Session(benchmark::State& state)
{
    while (state.KeepRunning())
        BenchSession().GetTitles();
}

}  // namespace

BENCHMARK_CAPTURE(Process, page, FOLDER "/first-page.js")->Name("start/page")->UseManualTime()->Iterations(3);
BENCHMARK_CAPTURE(Process, nothing, FOLDER "/nothing.js")->Name("start/nothing")->UseManualTime()->Iterations(3);
BENCHMARK(Session)->Name("start/session");
