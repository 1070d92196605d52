// Methods against a storefront: what a script's parameters become on the wire, sessions, and the end of a busy
// instance.
#include "StoreMovie.h"

namespace {

class Movies : public StoreMovie {
protected:
    // The requests since the log was cleared: "operation(child=value,...)".
    std::vector<std::string> Requests() const
    {
        std::vector<std::string> requests;
        for (const LoggedRequest& request : store->Log()) {
            std::string text = request.operation + "(";
            for (const auto& child : request.children)
                text += child.first + "=" + child.second + ",";
            if (text.back() == ',') text.pop_back();
            requests.push_back(text + ")" + request.violation);
        }
        return requests;
    }
};

// What each method sends shows in what it answers, which is tested with the whole process; here is what does not show.
TEST_F(Movies, ParametersBecomeRequests)
{
    const struct {
        const char* method;
        const char* parameters;
        const char* request;  // null: nothing is sent
    } kCalls[] = {
        // Numbers become integers as the script's own bit operations make them; what is missing is 0.
        {"getTitles", "{genreid: '0x1', CurrentPageNumber: 4294967298, ItemsPerPage: 7.9, purchasetype: NaN}",
         "getTitlesByNavigation(GenreID=1,CurrentPageNumber=2,ItemsPerPage=7,PurchaseType=rent)"},
        {"getTitles", "{CurrentPageNumber: true, ItemsPerPage: '3 items', purchasetype: null}",
         "getTitlesByNavigation(GenreID=0,CurrentPageNumber=1,ItemsPerPage=0,PurchaseType=rent)"},
        {"getTitleListing", "{titleid: -2147483649}", "getTitleListing(TitleID=2147483647)"},
        {"authorizeDevice", "{}", nullptr},
        {"doPurchaseSavedBilling", "{skuid: 19, ipaddress: '10.0.0.1', useprepaidfund: 1}",
         "doPurchaseSavedbilling(SkuID=19,IPAddress=10.0.0.1,UsePrePaidFunds=yes)"},
        {"doPurchaseSavedBilling", "{skuid: 20, ipaddress: '10.0.0.2', useprepaidfund: ''}",
         "doPurchaseSavedbilling(SkuID=20,IPAddress=10.0.0.2,UsePrePaidFunds=no)"},
        {"searchForTitle", "{query: 'A', CurrentPageNumber: 1, ItemsPerPage: 5, purchasetype: 2}",
         "searchForTitle(Query=A,ItemsPerPage=5,CurrentPageNumber=1,PurchaseType=any,TitleType=any)"},
        {"getMyVideos", "{CurrentPageNumber: 2, ItemsPerPage: 4, purchasetype: 1, typefilter: 1, watchstatus: 0}",
         "getMyStreamingVideos(CurrentPageNumber=2,ItemsPerPage=4,PurchaseType=buy,TitleType=tv,"
         "WatchStatusFilter=WatchNow)"},
    };
    std::string calls;
    std::vector<std::string> requests = {"discovery(d=device,dt=48)"};
    for (const auto& one : kCalls) {
        calls += std::string("['") + one.method + "', " + one.parameters + "],\n";
        if (one.request) requests.push_back(one.request);
    }
    const std::string answers = Report("var calls = [" + calls + R"(];
ready(function next() {
    var one = calls.shift();
    if (one) call(ws, one[0], one[1], next);
});
)");
    EXPECT_EQ("", answers);
    EXPECT_EQ(requests, Requests());
}

TEST_F(Movies, TitleIdsMustBeAnArray)
{
    EXPECT_EQ("-3\n-3\n-3\n-3\n0 []\ntrue,false,true\n",
              Report("ready(function () {\n"
                     "  [undefined, 5, {length: 1, 0: 1}, new Array(4294967295)].forEach(function (ids) {\n"
                     "    report(ws.checkTitlesInWishlist([{}, {titleids: ids}])); });\n"
                     "  call(ws, 'checkTitlesInWishlist', {titleids: []}, function (status, flags) {\n"
                     "    report(status + ' ' + JSON.stringify(flags));\n"
                     "    call(ws, 'checkTitlesInWishlist', {titleids: [7, 3, '7']}, function (status, flags) {\n"
                     "      report(flags); }); }); });\n"));
}

// ---- Sessions

TEST_F(Movies, AFailedInitCanBeRepeatedASecondOneDoesNothing)
{
    EXPECT_EQ("-1000 false\n-1\n0 true\n0\n0\n",
              Report("call(ws, 'init', {}, function (status, result) { report(status + ' ' + result);\n"
                     "  report(ws.getNavigation([{}, {}]));\n"
                     "  call(ws, 'init', setup, function (status, result) { report(status + ' ' + result);\n"
                     "    report(ws.init([{onComplete: function () { report('never'); }}, {}]));\n"
                     "    call(ws, 'getCountryID', {}, function (status) { report(status); }); }); });\n"));
}

TEST_F(Movies, ClonesWorkBesideTheirSource)
{
    store->SetLatency(50);
    EXPECT_EQ("0\n-4\n-4\n-5\nclone 0,late 0,source 0\n",
              Report("ready(function () {\n"
                     "  var twin = new com.orvex.ZVWSLib(), late = new com.orvex.ZVWSLib(), done = [];\n"
                     "  function finished(name) { return function (status) { done.push(name + ' ' + status);\n"
                     "    if (done.length === 3) report(done.sort()); }; }\n"
                     "  report(twin.clone(ws)); report(twin.clone(ws)); report(ws.clone(twin));\n"
                     "  call(ws, 'getCountryID', {}, function (status) { ws = null; finished('source')(status); });\n"
                     "  call(twin, 'getCountryID', {}, function (status) {\n"
                     "    if (late.clone(twin) !== 0) report('late clone failed');\n"
                     "    call(late, 'getCountryID', {}, finished('late')); finished('clone')(status); });\n"
                     "  report(late.clone(ws)); });\n"));
    EXPECT_EQ(4u, store->Log().size());  // one discovery
}

TEST_F(Movies, AnInitThatReadsACloneIntoBeingIsRefused)
{
    EXPECT_EQ("0\n-2\n0\n",
              Report("ready(function () {\n"
                     "  var twin = new com.orvex.ZVWSLib();\n"
                     "  report(twin.init([{}, {get APIKey() { report(twin.clone(ws)); }}]));\n"
                     "  ws = twin; call(ws, 'getCountryID', {}, function (status) { report(status); }); });\n"));
}

// ---- The cache

TEST_F(Movies, BoxArtAndCacheCanBeRefreshedAndCleared)
{
    const std::string prefix = store->Query("SELECT prefix FROM title LIMIT 1");
    const std::string folder = store->DataFolder() + "/cache/";
    EXPECT_EQ("0 string true\n0 true\n0\nfalse\n",
              Report("setup.CacheType = 2; setup.CacheData = 7; setup.CachePath = '" + folder +
                     "';\n"
                     "var lib = com.orvex.ZVWSLib;\n"
                     "ready(function () {\n"
                     "  call(ws, 'getBoxArtImage', {boxartsize: 6, boxartprefix: '" +
                     prefix +
                     "'}, function (status, path) {\n"
                     "    report(status + ' ' + typeof path + ' ' + lib.fileExist(path));\n"
                     "  call(ws, 'updateLocalCache', {operations: 7}, function (status, result) {\n"
                     "    report(status + ' ' + result);\n"
                     "    report(lib.clearLocalCache('" +
                     folder +
                     "'));\n"
                     "    report(lib.fileExist(path)); }); }); });\n"));
}

// ---- The end of an instance whose worker is inside a call: it is waited for, and what it brings is freed.

TEST_F(Movies, TheMovieEndsAtAnyPointOfACall)
{
    // The script holds the main thread for a while, so that nothing is delivered: the end meets the worker before,
    // inside and after its call.
    for (const char* hold : {"0", "2", "5", "10", "20", "60"}) {
        EXPECT_EQ("", Report("ready(function () { call(ws, 'getNavigation', {}, function () { report('never'); });\n"
                             "  for (var end = Date.now() + " +
                             std::string(hold) + "; Date.now() < end;) {} quit(); });\n"));
    }
}

}  // namespace
