// Fetching ahead, seen from the store: which pages are asked for after one was shown, in which order, and when not.
#include <chrono>

#include "PrefetchMovie.h"
#include "TempFolder.h"
#include "ZVWSLibAEPrefetchMgr.h"
#include "stagecraft/IStagecraft.h"

namespace {

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
    // What is dropped from the cache does not take with it what waits.
    for (const char* between :
         {"(function (then) { then(); })", "ask.bind(null, 'updateLocalCache', {operations: 4})"}) {
        // Load time, listings, and the images of all episodes but the first.
        EXPECT_EQ("", Run(7, static_cast<size_t>(2 + episodes - 1),
                          "ask('getAllTvEpisodeListings', {titleid: " + season + "}, function () { " + between +
                              "(function () { ws.idle(); until(quit); }); });"));
        std::string prefixes;
        for (const LoggedRequest& request : store->Log()) {
            if (request.service == "boxart") prefixes += request.operation + " ";
        }
        EXPECT_EQ(store->Query("SELECT group_concat(prefix || ' ', '') FROM (SELECT prefix FROM title WHERE season = " +
                               season + " ORDER BY episode LIMIT -1 OFFSET 1)"),
                  prefixes);
    }
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

// Neither the page nor the customer's own call gets an answer any more.
TEST_F(Prefetch, TheEndWaitsForNoPage)
{
    Fault("getTitlesByNavigation=ok");
    Fault("getTitlesByNavigation=stall");
    Fault("getTitleListing=stall");
    const auto started = std::chrono::steady_clock::now();
    EXPECT_EQ("", Run(1, 4,
                      PerPage(10) + "titles(1, function () { when('getTitlesByNavigation', 2, function () {"
                                    "call(ws, 'getTitleListing', {titleid: 12}); until(quit); }); });"));
    EXPECT_LT(std::chrono::steady_clock::now() - started, std::chrono::seconds(3));
    EXPECT_EQ("stall", store->Log().at(2).fault);
    EXPECT_EQ("stall", store->Log().at(3).fault);
}

// ---- What a page is known by

// A listing as a script asks for it, all but the page, of which a store that gives one item on a page has some.
struct Listed {
    const char* method;
    const char* parameters;
    const char* operation;
    std::vector<std::string> pages;  // page 2, shown first, and what is then fetched ahead
};

class CappedPrefetch : public Prefetch {
protected:
    void SetUp() override
    {
        StorefrontOptions options;
        options.largestPage = 1;
        Open(options);
    }

    // The script shows pages with show(page, perPage, then).
    std::string RunOn(const Listed& listed, const std::string& script)
    {
        return Run(7, 0,
                   std::string("function show(page, perPage, then) { ask('") + listed.method + "', {" +
                       listed.parameters + ", CurrentPageNumber: page, ItemsPerPage: perPage}, then); }" +
                       "function asked(count, then) { when('" + listed.operation + "', count, then); }" + script);
    }

    const Listed m_Titles = {
        "getTitles", "genreid: 8010, purchasetype: 2", "getTitlesByNavigation", {"2", "3", "1", "4", "5"}};
    const Listed m_Videos = {
        "getMyVideos", "purchasetype: 2, typefilter: 0, watchstatus: 3", "getMyStreamingVideos", {"2", "3", "1"}};
    const Listed m_Wishes = {"getWishlistItems", "sortorder: 1, typefilter: 0", "getWishlistItems", {"2", "3", "1"}};
};

// The store gives less on a page than it is asked for. All the same a page is fetched ahead as the script will ask for
// it, and each is asked for once. Box art is fetched when every page is there.
TEST_F(CappedPrefetch, PagesAreKnownByTheirRequests)
{
    for (const Listed& listed : {m_Titles, m_Videos, m_Wishes}) {
        EXPECT_EQ("1 on 2\n1 on 3\n1 on 1\n", RunOn(listed, "var count = " + std::to_string(listed.pages.size()) + R"(;
function tell(page) { report(page.ItemsPerPage + ' on ' + page.CurrentPageNumber); }
show(2, 50, function (page) { tell(page); asked(count, function () { ws.idle(); when('boxart', 1, function () {
    show(3, 50, function (page) { tell(page);
        show(1, 50, function (page) { tell(page); quit(); }); }); }); }); });)"));
        EXPECT_EQ(listed.pages, Pages(listed.operation));
        EXPECT_EQ(Strings(listed.pages.size(), "50"), Children(listed.operation, "ItemsPerPage"));
    }
}

// Sizes that the store makes equal are different requests: pages of one are not there for the other. Box art is fetched
// when no page is any more.
TEST_F(CappedPrefetch, AnotherPageSizeIsAnotherListing)
{
    EXPECT_EQ("", RunOn(m_Videos, R"(
show(2, 50, function () { ws.idle(); when('boxart', 1, function () {
    show(2, 40, function () { asked(6, quit); }); }); });)"));
    EXPECT_EQ((Strings{"2", "3", "1", "2", "3", "1"}), Pages(m_Videos.operation));
    EXPECT_EQ((Strings{"50", "50", "50", "40", "40", "40"}), Children(m_Videos.operation, "ItemsPerPage"));
}

// ---- What was dropped from the cache is not there

// Each change leaves the listing as it is: only that the cache lost it tells that it has to be fetched ahead again.
TEST_F(Prefetch, MarksAreForgottenWithWhatTheyDescribe)
{
    const char kTitles[] = "'getTitles', {genreid: 8010, purchasetype: 2";
    const char kVideos[] = "'getMyVideos', {purchasetype: 0, typefilter: 0, watchstatus: 3";
    const char kWishes[] = "'getWishlistItems', {sortorder: 1, typefilter: 2";
    const struct {
        const char* listing;
        const char* operation;
        Strings pages;
        const char* drop;  // goes on with next()
    } rows[] = {
        {kVideos, "getMyStreamingVideos", {"1", "2"}, "ask('updateLocalCache', {operations: 4}, next);"},
        {kVideos,
         "getMyStreamingVideos",
         {"1", "2"},
         "ask('doPurchaseSavedBilling', {skuid: 121, ipaddress: '10.0.0.1'}, next);"},
        {kVideos, "getMyStreamingVideos", {"1", "2"}, "ask('authorizeDevice', {pin: '123456'}, next);"},
        {kVideos, "getMyStreamingVideos", {"1", "2"}, "ask('deactivateDevice', {}, next);"},
        {kWishes, "getWishlistItems", {"1", "2", "3"}, "ask('addItemToWishlist', {titleid: 2401}, next);"},
        {kWishes, "getWishlistItems", {"1", "2", "3"}, "ask('removeItemFromWishlist', {titleid: 2401}, next);"},
        {kTitles,
         "getTitlesByNavigation",
         {"1", "2", "5", "3", "4"},
         "answer('load a catalogue'); ask('updateLocalCache', {operations: 1}, next);"},
        {kTitles,
         "getTitlesByNavigation",
         {"1", "2", "5", "3", "4"},
         "if (ws.clearLocalCache(setup.CachePath) !== 0) report('not cleared'); next();"},
        // Large answers, until the table is over its share.
        {kTitles, "getTitlesByNavigation", {"1", "2", "5", "3", "4"}, R"(var filled = 0; (function fill() {
             if (++filled > 6) return next();
             ask('searchForTitle', {CurrentPageNumber: filled, ItemsPerPage: 200, purchasetype: 2, typefilter: 0,
                                    query: 'e'}, fill); })();)"},
    };
    for (const auto& row : rows) {
        Strings twice = row.pages;
        twice.insert(twice.end(), row.pages.begin(), row.pages.end());
        EXPECT_EQ("", Run(7, 0,
                          std::string("function show(then) { ask(") + row.listing +
                              ", CurrentPageNumber: 1, ItemsPerPage: 1}, then); }"
                              "function next() { show(function () { when('" +
                              row.operation + "', " + std::to_string(twice.size()) + ", quit); }); }" +
                              "show(function () { ws.idle(); when('boxart', 1, function () {" + row.drop + "}); });"))
            << row.drop;
        EXPECT_EQ(twice, Pages(row.operation)) << row.drop;
    }
}

// Page 2 is on its way when something is dropped: it may have been put into the cache before.
TEST_F(Prefetch, APageWhoseFetchSawADropIsNotMarked)
{
    Fault("getTitlesByNavigation=ok");
    Fault("getTitlesByNavigation=ok,delay=700");
    EXPECT_EQ("", Run(7, 0, PerPage(3) + R"(
titles(1, function () { when('getTitlesByNavigation', 2, function () {
    ask('updateLocalCache', {operations: 4}, function () { ws.idle(); when('boxart', 1, function () {
        answer('lose all pages');
        titles(1, function () { when('getTitlesByNavigation', 5, quit); }); }); }); }); });)"));
    EXPECT_EQ((Strings{"1", "2", "3", "1", "2"}), Pages("getTitlesByNavigation"));
}

TEST(PrefetchMgr, MarksHoldWhileNothingIsDropped)
{
    const char* arguments[] = {"test", "movie.js"};
    ASSERT_NE(nullptr, ae::stagecraft::IStagecraft::InitializeStagecraftLibrary(2, arguments));
    {
        KernelMutex mutex;
        ZVWSLibAE::PrefetchMgr manager;
        manager.SetMutex(&mutex);
        AEArray<AEString> waiting;
        waiting.Append("prefix");
        manager.Update(waiting, eTitlesResponse, 3, 30, 10, 1, 2, 0);
        EXPECT_TRUE(waiting.empty());
        const auto missing = [&] {
            unsigned int pages[8], found = 0;
            manager.GetPagesForPrefetch(1, 8, pages, found);
            return std::vector<unsigned int>(pages, pages + found);
        };
        using Pages = std::vector<unsigned int>;
        const TempFolder folder;
        const auto drop = [&] { EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_clearLocalCache((folder / "").c_str())); };

        const uint64_t before = CacheInterface::Drops();
        manager.MarkPagePrefetched(2, before);
        EXPECT_EQ((Pages{3}), missing());
        waiting.Append("prefix");
        drop();
        EXPECT_EQ((Pages{2, 3}), missing());
        manager.MarkPagePrefetched(2, before);
        EXPECT_EQ((Pages{2, 3}), missing()) << "asked for before the drop";
        manager.MarkPagePrefetched(3, CacheInterface::Drops());
        EXPECT_EQ((Pages{2}), missing()) << "the mark on page 2 does not come back";
        manager.Update(waiting, eTitlesResponse, 3, 30, 10, 1, 2, 0);
        EXPECT_EQ((Pages{2}), missing());
        EXPECT_FALSE(waiting.empty());
    }
    ae::stagecraft::IStagecraft::UninitializeStagecraftLibrary();
}

}  // namespace
