#include "Store.h"

#include <errno.h>
#include <spawn.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>

ZV_WS_Pagination FirstPage()
{
    ZV_WS_Pagination page;
    page.CurrentPageNumber = 1;
    page.ItemsPerPage = kItems;
    return page;
}

void Check(bool holds, const char* what)
{
    if (holds) return;
    fprintf(stderr, "%s: failed: %s\n", program_invocation_short_name, what);
    exit(1);
}

Storefront& TheStore()
{
    static const std::unique_ptr<Storefront> store = [] {
        std::string error;
        std::unique_ptr<Storefront> started = Storefront::Start(StorefrontOptions(), error);
        Check(started != nullptr, error.c_str());
        setenv("ZV_DEPLOYMENT", started->DeploymentFile().c_str(), 1);
        return started;
    }();
    return *store;
}

namespace {

// The line has its end.
bool EndsIn(const std::string& line, const std::string& text)
{
    const std::string end = text + "\n";
    return line.size() >= end.size() && line.compare(line.size() - end.size(), end.size(), end) == 0;
}

}  // namespace

double RunClient(const char* movie, const char* text)
{
    using Clock = std::chrono::steady_clock;
    TheStore();
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
        if (seconds < 0 && EndsIn(line, text))  // other output may stand before it
            seconds = std::chrono::duration<double>(Clock::now() - start).count();
    }
    fclose(output);
    int status = -1;
    waitpid(process, &status, 0);
    Check(status == 0 && seconds >= 0, movie);
    return seconds;
}

BenchSession::BenchSession(const char* cacheFolder, unsigned int kinds)
{
    TheStore();
    ZV_WS_SetupParams setup;
    setup.APIKey = StorefrontAccount::kApiKey;
    setup.DestinationUniqueID = "bench";
    setup.DestinationTypeID = 48;
    setup.UserName = StorefrontAccount::kUser;
    setup.Password = StorefrontAccount::kPassword;
    setup.AccessType = ACCESS_TYPE_STREAM;
    setup.EnvNum = ENVNUM_PRODUCTION;
    if (cacheFolder) {
        setup.CacheParam.Type = CacheType_File;
        setup.CacheParam.Data = kinds;
        setup.CacheParam.Path = cacheFolder;
    }
    Check(ZV_WS_initialize(&m_Handle, &setup) == ZV_WS_Status_ok, "ZV_WS_initialize");
}

void BenchSession::GetTitles()
{
    const ZV_WS_Pagination page = FirstPage();
    ZV_WS_TitlesResponse titles;
    const ZV_WS_Status status = ZV_WS_getTitles(&m_Handle, 1, &page, PURCHASE_TYPE_RENT, &titles);
    Check(status == ZV_WS_Status_ok && titles.Titles.size == kItems, "ZV_WS_getTitles");
    ZV_WS_release(&titles);
}

TemporaryFolder::TemporaryFolder()
{
    Check(mkdtemp(m_Path) != nullptr, "a folder in /tmp");
}

TemporaryFolder::~TemporaryFolder()
{
    std::filesystem::remove_all(m_Path);
}
