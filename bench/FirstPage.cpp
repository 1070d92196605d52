// From the start of the client's process to the first page of titles on the screen.
#include <spawn.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>

#include "Store.h"

namespace {

using Clock = std::chrono::steady_clock;

// Starts the client with the movie; seconds until it has said "the page is there".
double UntilPage(const char* movie)
{
    setenv("STAGECRAFT_MOVIE", movie, 1);
    int ends[2];
    Check(pipe(ends) == 0, "a pipe");
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, ends[1], STDOUT_FILENO);
    posix_spawn_file_actions_addclose(&actions, ends[0]);
    posix_spawn_file_actions_addclose(&actions, ends[1]);
    char name[] = "zv_stagecraft", number[] = "5";
    char* arguments[] = {name, number, nullptr};
    pid_t process = 0;
    const Clock::time_point start = Clock::now();
    Check(posix_spawn(&process, CLIENT, &actions, nullptr, arguments, environ) == 0, "start of " CLIENT);
    close(ends[1]);
    posix_spawn_file_actions_destroy(&actions);
    FILE* output = fdopen(ends[0], "r");
    double seconds = -1;
    char line[4096];
    while (fgets(line, sizeof line, output)) {
        if (seconds < 0 && strstr(line, "the page is there\n"))  // other output may stand before it
            seconds = std::chrono::duration<double>(Clock::now() - start).count();
    }
    fclose(output);
    waitpid(process, nullptr, 0);
    Check(seconds >= 0, "the movie's page");
    return seconds;
}

void Process(benchmark::State& state, const char* movie)
{
    TheStore();
    while (state.KeepRunning())
        state.SetIterationTime(UntilPage(movie));
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
