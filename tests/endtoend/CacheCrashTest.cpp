// A player that is switched off in the middle of anything starts with a whole cache.
#include <signal.h>
#include <time.h>

#include <filesystem>
#include <random>

#include "CacheFile.h"
#include "Movie.h"
#include "Store.h"
#include "TempFolder.h"

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

void CheckCache(const TempFolder& folder, int& images)
{
    for (const auto& entry : fs::directory_iterator(folder / "cache")) {
        const fs::path& file = entry.path();
        if (file.extension() == ".zv") {
            EXPECT_EQ("ok ", CacheFile(file).Query("PRAGMA integrity_check"));
        } else if (file.extension() == ".jpg") {
            const std::string image = folder.Read("cache/" + file.filename().string());
            ++images;
            ASSERT_GT(image.size(), 4u) << file;
            EXPECT_EQ("\xff\xd8", image.substr(0, 2)) << file;
            EXPECT_EQ("\xff\xd9", image.substr(image.size() - 2)) << file;
        }
    }
}

using CacheCrash = Store;

TEST_F(CacheCrash, AKilledPlayerLeavesAWholeCache)
{
    const int kRounds = 40;
    const TempFolder folder;
    const std::string movie = folder.Write("movie.js", kMovie);
    const std::string cache = folder / "cache";
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
        CheckCache(folder, images);
    }
    EXPECT_GT(images, kRounds) << "the players were killed before they did anything";
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_clearLocalCache(cache.c_str()));
    for (const auto& entry : fs::directory_iterator(cache))
        EXPECT_EQ(".zv-journal", entry.path().extension());
}

}  // namespace
