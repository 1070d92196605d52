// Fetching ahead, seen from the store: which pages are asked for after one was shown, in which order, and when not.
#include <filesystem>
#include <fstream>
#include <thread>

#include "StoreMovie.h"

namespace {

class Prefetch : public StoreMovie {
protected:
    // Runs the script in a movie, in `ready` of an instance with a new file cache for `data`. until(then) goes on when
    // the store has seen `requests` of them.
    std::string Run(int data, size_t requests, const std::string& script)
    {
        const std::string go = store->DataFolder() + "/go", cache = store->DataFolder() + "/cache";
        std::filesystem::remove(go);
        std::filesystem::remove_all(cache);
        store->ClearLog();
        std::thread opener([&] {
            if (store->WaitForRequests(requests)) std::ofstream(go) << "go";
        });
        const std::string report = Report("var perPage, go = '" + go +
                                          "';setup.EnvNum = 2; setup.CacheType = 2; setup.CachePath = '" + cache +
                                          "'; setup.CacheData = " + std::to_string(data) + R"(;
function ask(method, parameters, then) {
    call(ws, method, parameters, function (status, result) {
        if (status !== 0) report(method + ' ' + status);
        then(result);
    });
}
function until(then) {
    var timer = setInterval(function () {
        if (!ws.fileExist(go)) return;
        clearInterval(timer);
        then();
    }, 10);
}
function titles(page, then) {
    ask('getTitles', {genreid: 100, CurrentPageNumber: page, ItemsPerPage: perPage, purchasetype: 2}, then);
}
ready(function () {)" + script + "});");
        store->ClearFaults();
        opener.join();
        return report;
    }

    // The pages asked for, in order.
    std::vector<std::string> Pages(const std::string& operation) const
    {
        std::vector<std::string> pages;
        for (const LoggedRequest& request : store->Log()) {
            for (const auto& child : request.children) {
                if (request.operation == operation && child.first == "CurrentPageNumber") pages.push_back(child.second);
            }
        }
        return pages;
    }

    // So many items on a page that genre 100 has that many pages.
    std::string PerPage(int pages) const
    {
        const int total = Number("SELECT COUNT(*) FROM title_genre WHERE genre = 100");
        return "perPage = " + std::to_string((total + pages - 1) / pages) + ";";
    }

    using Strings = std::vector<std::string>;
};

TEST_F(Prefetch, PagesAroundTheOneShownNearestFirst)
{
    const struct {
        int pages;
        int shown;
        Strings asked;
    } rows[] = {
        {10, 10, {"10", "1", "9", "2", "8", "3", "7", "4", "6"}},
        {10, 5, {"5", "6", "4", "7", "3", "8", "2", "9", "1"}},
        {3, 1, {"1", "2", "3"}},
        {2, 2, {"2", "1"}},
    };
    for (const auto& row : rows) {
        // The load time comes first.
        EXPECT_EQ("",
                  Run(1, row.asked.size() + 1,
                      PerPage(row.pages) + "titles(" + std::to_string(row.shown) + ", function () { until(quit); });"));
        EXPECT_EQ(row.asked, Pages("getTitlesByNavigation"));
    }
}

TEST_F(Prefetch, ThePageTurnedToIsThere)
{
    EXPECT_EQ("2\n3\n",
              Run(1, 10,
                  PerPage(10) + "titles(1, function () { until(function () {"
                                "titles(2, function (page) { report(page.CurrentPageNumber);"
                                "titles(3, function (page) { report(page.CurrentPageNumber); quit(); }); }); }); });"));
    const Strings pages = Pages("getTitlesByNavigation");
    EXPECT_EQ(1, std::count(pages.begin(), pages.end(), "2"));
    EXPECT_EQ(1, std::count(pages.begin(), pages.end(), "3"));
}

TEST_F(Prefetch, TheUsersListsAreTheirOwnKind)
{
    EXPECT_EQ("", Run(4, 3,
                      "ask('getMyVideos', {CurrentPageNumber: 1, ItemsPerPage: 1, purchasetype: 2, typefilter: 0, "
                      "watchstatus: 3}, function () { until(quit); });"));
    EXPECT_EQ((Strings{"1", "2", "3"}), Pages("getMyStreamingVideos"));
}

TEST_F(Prefetch, NothingIsFetchedAheadWithoutNeed)
{
    // A search is no listing; a failed page has no neighbours; another kind of data is cached; one page is all.
    const struct {
        int data;
        const char* script;
        const char* fault;
        size_t requests;
    } rows[] = {
        {1,
         "ask('searchForTitle', {CurrentPageNumber: 1, ItemsPerPage: 2, purchasetype: 2, typefilter: 0, query: "
         "'the'}, quit)",
         "", 2},
        {1, "perPage = 10; titles(1, quit)", "getTitlesByNavigation=code:3", 2},
        {2, "perPage = 10; titles(1, quit)", "", 1},
        {1, "perPage = 10000; titles(1, quit)", "", 2},
    };
    for (const auto& row : rows) {
        if (*row.fault) Fault(row.fault);
        Run(row.data, row.requests, row.script);
        EXPECT_EQ(row.requests, store->Log().size()) << row.script;
    }
}

TEST_F(Prefetch, BoxArtComesWhileTheScriptIsIdle)
{
    const std::string season =
        store->Query("SELECT season FROM title WHERE season > 0 GROUP BY season ORDER BY season LIMIT 1");
    const int episodes = Number("SELECT COUNT(*) FROM title WHERE season = " + season);
    // Load time, listings, and the images of all episodes but the first.
    EXPECT_EQ(
        "", Run(3, static_cast<size_t>(2 + episodes - 1),
                "ask('getAllTvEpisodeListings', {titleid: " + season + "}, function () { ws.idle(); until(quit); });"));
    std::string prefixes;
    for (const LoggedRequest& request : store->Log()) {
        if (request.service == "boxart") prefixes += request.operation + " ";
    }
    EXPECT_EQ(store->Query("SELECT group_concat(prefix || ' ', '') FROM (SELECT prefix FROM title WHERE season = " +
                           season + " ORDER BY episode LIMIT -1 OFFSET 1)"),
              prefixes);
}

// A page that nobody waits for may hang: the customer's own call does not.
TEST_F(Prefetch, AForegroundCallWins)
{
    Fault("getTitlesByNavigation=ok");
    Fault("getTitlesByNavigation=ok,delay=1500");
    EXPECT_EQ(
        "answered\n",
        Run(1, 3,
            PerPage(10) + "titles(1, function () { until(function () {"
                          "var asked = new Date().getTime();"
                          "ask('getTitleListing', {titleid: 12}, function () {"
                          "report(new Date().getTime() - asked < 1000 ? 'answered' : 'late'); quit(); }); }); });"));
}

}  // namespace
