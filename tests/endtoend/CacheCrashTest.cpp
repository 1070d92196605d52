// A player that is switched off in the middle of anything starts with a whole cache.
#include <signal.h>
#include <sqlite3.h>
#include <time.h>

#include <filesystem>
#include <random>

#include "Movie.h"
#include "Storefront.h"
#include "ZVWSLib.h"

namespace {

namespace fs = std::filesystem;

// Browses and fetches images into the cache folder `flashvars.cache` for ever, each time anew.
const char kMovie[] = R"(
var ws = new com.orvex.ZVWSLib();
function call(method, parameters, then) {
    ws[method]([{onComplete: function (status, result) { then(result); }}, parameters]);
}
function page(number) {
    call('getTitles', {genreid: 1, CurrentPageNumber: number, ItemsPerPage: 5, purchasetype: 2}, function (titles) {
        image(titles.Titles, 0, number);
    });
}
function image(titles, i, number) {
    if (i === titles.length) return page(number % 100 + 1);
    call('getBoxArtImage', {boxartsize: 12, boxartprefix: titles[i].BoxArtPrefix}, function () { image(titles, i + 1, number); });
}
call('init', {APIKey: 'desktop', UserName: 'customer', Password: 'secret', DestinationUniqueID: 'd', DestinationTypeID: 1, EnvNum: 2,
              AccessType: 2, CacheType: 2, CacheData: 7, CacheLimit: 400000, CachePath: flashvars.cache}, function (ok) {
    trace('');
    trace('cache is open: ' + ok);
    page(1);
});
)";

std::string IntegrityOf(const fs::path& file)
{
    sqlite3* database = nullptr;
    std::string result = "does not open";
    if (sqlite3_open(file.c_str(), &database) == SQLITE_OK) {
        sqlite3_exec(
            database, "PRAGMA integrity_check",
            [](void* text, int, char** values, char**) {
                *static_cast<std::string*>(text) = values[0];
                return 0;
            },
            &result, nullptr);
    }
    sqlite3_close(database);
    return result;
}

void CheckCache(const fs::path& folder, int& images)
{
    for (const auto& entry : fs::directory_iterator(folder)) {
        const fs::path& file = entry.path();
        if (file.extension() == ".zv") {
            EXPECT_EQ("ok", IntegrityOf(file));
        } else if (file.extension() == ".jpg") {
            const std::string image = FileContents(file);
            ++images;
            ASSERT_GT(image.size(), 4u) << file;
            EXPECT_EQ("\xff\xd8", image.substr(0, 2)) << file;
            EXPECT_EQ("\xff\xd9", image.substr(image.size() - 2)) << file;
        }
    }
}

TEST(CacheCrash, AKilledPlayerLeavesAWholeCache)
{
    const int kRounds = 40;
    std::string error;
    const auto store = Storefront::Start(StorefrontOptions(), error);
    ASSERT_TRUE(store) << error;
    const Folder folder;
    const std::string movie = folder.Write("movie.js", kMovie);
    const std::string cache = folder.Path("cache");
    std::mt19937 random(7);  // fixed: what varies is the machine
    std::uniform_int_distribution<long> delay(0, 150000000);
    int images = 0;
    for (int round = 0; round < kRounds; ++round) {
        Process player({ZV_STAGECRAFT, "5"}, {{"ZV_DEPLOYMENT", store->DeploymentFile()},
                                              {"STAGECRAFT_MOVIE", movie},
                                              {"STAGECRAFT_FPS", "1000"},
                                              {"ZV_FLASHVARS", "cache=" + cache}});
        ASSERT_TRUE(player.WaitForLine("cache is open: true")) << round;
        const timespec pause = {0, delay(random)};  // the moment of death, anywhere in the writes that follow
        nanosleep(&pause, nullptr);
        kill(player.Pid(), SIGKILL);
        player.WaitForEnd();
        CheckCache(cache, images);
    }
    EXPECT_GT(images, kRounds) << "the players were killed before they did anything";
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_clearLocalCache(cache.c_str()));
    for (const auto& entry : fs::directory_iterator(cache))
        EXPECT_EQ(".zv-journal", entry.path().extension());
}

}  // namespace
