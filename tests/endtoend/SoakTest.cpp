// Calls with faults on the way leave the process as large as it was. ZV_SOAK_CALLS sets how many; from 10,000 on the
// resident size is compared, too, which needs a thousand calls to come to rest.
#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <random>

#include "Movie.h"
#include "Storefront.h"
#include "TempFolder.h"

namespace {

namespace fs = std::filesystem;

#ifdef ZV_SANITIZED
constexpr bool kSizeCounts = false;  // freed memory is kept back
#else
constexpr bool kSizeCounts = true;
#endif

constexpr int kFewCalls = 300;
constexpr int kEnoughForSize = 10000;

// Three instances: each has one to three services and the image host, and one for each kind that it fetches ahead.
constexpr long kMostConnections = 3 * (3 + 3);
constexpr long kMostImages = 8;  // whose rows wait for others

struct Footprint {
    long kibibytes = 0;
    long threads = 0;
    long files = 0;  // descriptors that are no sockets
    long sockets = 0;
};

Footprint Measure(pid_t pid)
{
    const std::string folder = "/proc/" + std::to_string(pid);
    Footprint now;
    std::ifstream status(folder + "/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("VmRSS:", 0) == 0) now.kibibytes = atol(line.c_str() + 6);
        if (line.rfind("Threads:", 0) == 0) now.threads = atol(line.c_str() + 8);
    }
    for (const auto& entry : fs::directory_iterator(folder + "/fd")) {
        std::error_code closed;
        const std::string target = fs::read_symlink(entry, closed).string();
        if (!closed) ++(target.rfind("socket:", 0) == 0 ? now.sockets : now.files);
    }
    return now;
}

// When no more threads run than that; or what is there after a minute.
Footprint MeasureAtRest(pid_t pid, long threads)
{
    Footprint now = Measure(pid);
    for (int tries = 0; now.threads > threads && tries < 6000; ++tries) {
        usleep(10000);
        now = Measure(pid);
    }
    return now;
}

// Every few requests and connections one that goes wrong, for more of them than the calls can make.
void AddFaults(Storefront& store, std::mt19937& random, int calls)
{
    const char* const answers[] = {"cut",         "cut-header", "cut-body",       "reset",           "garbage",
                                   "no-http",     "short",      "long",           "no-length",       "zero-length",
                                   "empty",       "endless",    "bomb:8",         "damaged-gzip",    "wrong-checksum",
                                   "split:20",    "http:503",   "http:302",       "http:500,after",  "missing-result",
                                   "fault11",     "fault12",    "extra-header",   "must-understand", "unknown-enum",
                                   "ok,delay=60", "code:3",     "cut-body,after", "soap12",          "reset,after"};
    const char* const connections[] = {"reset", "close", "no-http", "ok,delay=60"};
    const auto roll = [&](size_t sides) { return std::uniform_int_distribution<size_t>(0, sides - 1)(random); };
    const auto add = [&](const std::string& fault) {
        std::string error;
        EXPECT_TRUE(store.AddFault(fault, error)) << error;
    };
    for (int i = 0; i < calls; ++i) {
        add("any=ok,count=" + std::to_string(1 + roll(20)));
        add(std::string("any=") + answers[roll(std::size(answers))]);
        add("connect=ok,count=" + std::to_string(1 + roll(20)));
        add(std::string("connect=") + connections[roll(std::size(connections))]);
    }
    add("getSettingsPageInfo=drip:0,count=" + std::to_string(calls));
}

// Waits for the rest after so many calls, and until no more threads run than given.
Footprint After(int calls, Process& player, Storefront& store, long threads)
{
    const std::string line = "at rest after " + std::to_string(calls) + " calls";
    EXPECT_TRUE(player.WaitForLine(line));
    int faults = 0;
    for (const LoggedRequest& request : store.Log())
        faults += request.fault.empty() ? 0 : 1;
    EXPECT_GT(faults, calls / 50);
    store.ClearFaults();
    store.ClearLog();
    const Footprint now = MeasureAtRest(player.Pid(), threads);
    printf("%s: %d faults, %ld KiB, %ld threads, %ld files, %ld sockets\n", line.c_str(), faults, now.kibibytes,
           now.threads, now.files, now.sockets);
    return now;
}

TEST(Soak, NothingGrows)
{
    const char* wanted = getenv("ZV_SOAK_CALLS");
    const int calls = wanted ? atoi(wanted) : kFewCalls;
    const int mark = calls / 10;
    ASSERT_GE(calls, 100) << "ZV_SOAK_CALLS";
    const unsigned int number = std::random_device{}() % 1000000 + 1;
    const std::string seed = std::to_string(number);
    printf("seed %s\n", seed.c_str());
    std::mt19937 random(number);

    std::string error;
    const auto store = Storefront::Start(StorefrontOptions(), error);
    ASSERT_TRUE(store) << error;
    const std::string season = store->Query("SELECT MIN(season) FROM title WHERE season > 0");
    const TempFolder folder;
    Process player({ZV_STAGECRAFT, "5"}, {{"ZV_DEPLOYMENT", store->DeploymentFile()},
                                          {"STAGECRAFT_MOVIE", ZV_SOAK_MOVIE},
                                          {"STAGECRAFT_FPS", "1000"},
                                          {"ZV_FLASHVARS", "seed=" + seed + "&calls=" + std::to_string(calls) +
                                                               "&mark=" + std::to_string(mark) + "&season=" + season +
                                                               "&folder=" + folder / ""}});
    ASSERT_TRUE(player.WaitForLine("at rest after 0 calls"));
    const Footprint idle = Measure(player.Pid());
    AddFaults(*store, random, mark);
    folder.Write("go0", "");
    const Footprint early = After(mark, player, *store, idle.threads);
    AddFaults(*store, random, calls);
    folder.Write("go" + std::to_string(mark), "");
    const Footprint late = After(calls, player, *store, idle.threads);
    folder.Write("go" + std::to_string(calls), "");
    EXPECT_EQ(0, player.WaitForEnd());
    EXPECT_EQ(Lines{"movie ended: ok"}, player.Errors());

    for (const Footprint& now : {early, late}) {
        EXPECT_EQ(idle.threads, now.threads);
        EXPECT_LE(now.files, idle.files + kMostImages);
        EXPECT_LE(now.sockets, idle.sockets + kMostConnections);
    }
    if (kSizeCounts && calls >= kEnoughForSize) {
        EXPECT_LE(late.kibibytes, early.kibibytes + early.kibibytes / 100);
    }
}

}  // namespace
