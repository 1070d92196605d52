// Methods against a storefront: what a script's parameters become on the wire, sessions, and the end of a busy
// instance.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <chrono>
#include <iterator>

#include "MovieRun.h"
#include "Storefront.h"

namespace {

const char kPrelude[] = R"(
var setup = {APIKey: 'desktop', UserName: 'customer', Password: 'secret', DestinationUniqueID: 'device',
    DestinationTypeID: 48, AccessType: 2, EnvNum: 3, firmwareVersion: 'F', ApplicationRevision: 'A', modelNumber: 'M'};
var ws = new com.orvex.ZVWSLib();
function call(object, method, parameters, then) {
    var code = object[method]([{onComplete: then || function () {}}, parameters]);
    if (code !== 0) report(method + ' refused ' + code);
}
function ready(then) {
    call(ws, 'init', setup, function (status, result) {
        if (status !== 0 || result !== true) report('init ' + status + ' ' + result);
        then();
    });
}
// Calls one after the other; reports each method's status.
function each(calls, then) {
    if (calls.length === 0) return then && then();
    call(ws, calls[0][0], calls[0][1], function (status) {
        report(calls[0][0] + ' ' + status);
        each(calls.slice(1), then);
    });
}
)";

class Movies : public testing::Test {
protected:
    void SetUp() override
    {
        std::string error;
        store = Storefront::Start(StorefrontOptions(), error);
        ASSERT_TRUE(store) << error;
        setenv("ZV_DEPLOYMENT", store->DeploymentFile().c_str(), 1);
    }

    static std::string Report(const std::string& script)
    {
        const MovieRun run = RunMovie(kPrelude + script);
        EXPECT_TRUE(run.succeeded);
        return run.Text();
    }

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

    std::string LastRequest() const
    {
        const std::vector<std::string> requests = Requests();
        return requests.empty() ? "none" : requests.back();
    }

    std::unique_ptr<Storefront> store;
};

TEST_F(Movies, EachMethodSendsItsParameters)
{
    const struct {
        const char* method;
        const char* parameters;
        const char* request;
    } kCalls[] = {
        {"getNavigation", "{}", "getNavigation()"},
        // Numbers become integers as the script's own bit operations make them; what is missing is 0.
        {"getTitles", "{genreid: '0x1', CurrentPageNumber: 4294967298, ItemsPerPage: 7.9, purchasetype: NaN}",
         "getTitlesByNavigation(GenreID=1,CurrentPageNumber=2,ItemsPerPage=7,PurchaseType=rent)"},
        {"getTitles", "{CurrentPageNumber: true, ItemsPerPage: '3 items', purchasetype: null}",
         "getTitlesByNavigation(GenreID=0,CurrentPageNumber=1,ItemsPerPage=0,PurchaseType=rent)"},
        {"getTitleListing", "{titleid: -2147483649}", "getTitleListing(TitleID=2147483647)"},
        {"searchForTitle", "{query: 'A & B', CurrentPageNumber: 1, ItemsPerPage: 5, purchasetype: 2, typefilter: 2}",
         "searchForTitle(Query=A & B,ItemsPerPage=5,CurrentPageNumber=1,PurchaseType=any,TitleType=movies)"},
        {"getRecommendedTitles", "{titleid: 11}", "getRecommendedTitles(TitleId=11)"},
        {"translateSkuID", "{skuid: 12}", "translateSkuId(SkuId=12)"},
        {"getTvEpisodeListing", "{episodeid: 13}", "getTvEpisodeListing(EpisodeID=13)"},
        {"getTvEpisodeListByTitleID", "{titleid: 14}", "getTvEpisodeListByTitleID(TitleID=14)"},
        {"getAllTvEpisodeListings", "{titleid: 15}", "getAllTvEpisodeListings(TitleID=15)"},
        {"getMyVideos", "{CurrentPageNumber: 2, ItemsPerPage: 4, purchasetype: 1, typefilter: 1, watchstatus: 3}",
         "getMyStreamingVideos(CurrentPageNumber=2,ItemsPerPage=4,PurchaseType=buy,TitleType=tv,"
         "WatchStatusFilter=Undefined)"},
        {"getWishlistItems", "{sortorder: 1, CurrentPageNumber: 1, ItemsPerPage: 3, typefilter: 2}",
         "getWishlistItems(sortOrder=1,CurrentPageNumber=1,ItemsPerPage=3,TitleType=movies)"},
        {"addItemToWishlist", "{titleid: 16}", "addItemToWishlist(TitleID=16)"},
        {"removeItemFromWishlist", "{titleid: 17}", "removeItemFromWishList(TitleID=17)"},
        {"removeAllItemsFromWishlist", "{}", "removeAllItemsFromWishList()"},
        {"checkTitleInWishlist", "{titleid: 18}", "getTitleListing(TitleID=18)"},
        {"doPurchaseSavedBilling", "{skuid: 19, ipaddress: '10.0.0.1', useprepaidfund: 1}",
         "doPurchaseSavedbilling(SkuID=19,IPAddress=10.0.0.1,UsePrePaidFunds=yes)"},
        {"doPurchaseSavedBilling", "{skuid: 20, ipaddress: '10.0.0.2', useprepaidfund: ''}",
         "doPurchaseSavedbilling(SkuID=20,IPAddress=10.0.0.2,UsePrePaidFunds=no)"},
        {"checkForPurchasedTitle", "{titleid: 21}", "checkForPurchasedStreamByTitleID(TitleID=21)"},
        {"checkForPurchasedSku", "{skuid: 22}", "checkForPurchasedStream(SkuID=22)"},
        {"checkAdultVerificationEnabled", "{}", "checkAdultVerificationEnabled()"},
        {"checkAdultVerificationPin", "{pin: 42}", "checkAdultVerificationPin(Pin=***)"},
        {"assignGiftCertificateToUser", "{giftcertificatecode: 'G1'}",
         "assignGiftCertificateToUser(GiftCertificateCode=***)"},
        {"checkRentalExpiration", "{passid: 23}", "checkRentalExpiration(PassId=23)"},
        {"getStreamingAssetLocation", "{passid: 24, fileprofile: 2}",
         "getStreamingAssetLocation(PassID=24,FileProfile=HIGH_DEFINITION)"},
        {"getStreamingBonusAssetLocation", "{bonusassetid: 25}", "getBonusAssetLocation(BonusAssetID=25)"},
        {"loadLastStreamingAssetLocation", "{passid: 26, fileprofile: 1}",
         "loadLastStreamingAssetLocationForPass(PassID=26,FileProfile=STANDARD)"},
        {"manageStreamingInstanceStatus", "{streamid: 'S', streamstatus: 2, stoptimeSeconds: 61}",
         "manageStreamInstanceStatus(StreamID=S,Status=paused,StopTimeSeconds=61)"},
        {"getTHXMediaDirector", "{passid: 27, fileprofile: 2, audioprofile: 3}",
         "getTHXMediaDirector(PassID=27,FileProfile=HIGH_DEFINITION,AudioSetting=Dolby_Digital_Plus_51)"},
        {"getTHXMediaDirectorBonusAsset", "{bonusassetid: 28, fileprofile: 1, bonusassettype: 0}",
         "getTHXMediaDirectorBonusAsset(BonusAssetID=28,FileProfile=STANDARD,BonusAssetType=Trailer)"},
        {"getEmailAddress", "{}", "getEmailAddress()"},
        {"getBillingInfo", "{}", "getBillingInfo()"},
        {"getPrePaidCardBalance", "{}", "showPrePaidCardBalance()"},
        {"getConfig", "{}", "getConfig()"},
        {"getSettingsPageInfo", "{}", "getSettingsPageInfo()"},
        {"getCountryID", "{}", "GetCountryID()"},
        {"getFileType", "{}", "getFileType()"},
        {"calcOrderTax", "{skuid: 29}", "calcOrderTax(SKUID=29)"},
        {"setAudioDefaultProperty", "{audioprofile: 4}", "setAudioDefaultProperty(AudioSetting=DTS_Express_Stereo)"},
        {"getAudioDefaultProperty", "{}", "getAudioDefaultProperty()"},
        {"authorizeDevice", "{pin: '0123'}", "authorizeDevice(PIN=***)"},
        {"checkAuthToken", "{}", "checkAuthToken(AuthToken=***)"},
        {"deactivateDevice", "{}", "deactivateDevice()"},
    };
    std::string script = "ready(function () { each([";
    std::vector<std::string> requests = {"discovery(d=device,dt=48)"};
    for (const auto& one : kCalls) {
        script += std::string("['") + one.method + "', " + one.parameters + "],\n";
        requests.push_back(one.request);
    }
    const MovieRun run = RunMovie(kPrelude + script + "]); });");
    EXPECT_EQ(std::size(kCalls), run.lines.size());
    for (const std::string& line : run.lines)
        EXPECT_EQ(std::string::npos, line.find("refused")) << line;
    const std::vector<std::string> asked = Requests();
    ASSERT_EQ(requests.size(), asked.size());
    for (size_t i = 0; i < requests.size(); ++i)
        EXPECT_EQ(requests[i], asked[i]);
}

TEST_F(Movies, ResultsOfEachKindReachTheScript)
{
    const std::string title = store->Query("SELECT MIN(id) FROM title");
    EXPECT_EQ(
        "string getLocalIPAddr\nnumber checkBandwidth\nnumber getCountryID\nboolean checkTitleInWishlist\n"
        "object getNavigation\ntrue,false,true\n0 2\n-1000 \n",
        Report(
            "ready(function () {\n"
            "  var calls = ['getLocalIPAddr', 'checkBandwidth', 'getCountryID', 'checkTitleInWishlist',\n"
            "               'getNavigation'];\n"
            "  (function next() {\n"
            "    if (calls.length) return call(ws, calls[0], {titleid: " +
            title +
            "}, function (s, result) {\n"
            "      report(typeof result + ' ' + calls.shift()); next(); });\n"
            "    call(ws, 'addItemToWishlist', {titleid: " +
            title +
            "}, function () {\n"
            "    call(ws, 'checkTitlesInWishlist', {titleids: [" +
            title + ", 3, '" + title +
            "']},\n"
            "      function (s, flags) { report(flags);\n"
            "    call(ws, 'searchForTitle', {query: 'The', CurrentPageNumber: 1, ItemsPerPage: 2,\n"
            "      purchasetype: 2}, function (s, page) { report(s + ' ' + page.Titles.length);\n"
            "    call(ws, 'authorizeDevice', {}, function (s, answer) { report(s + ' ' + (answer.AuthToken || ''));\n"
            "    }); }); }); });\n"
            "  })(); });\n"));
}

TEST_F(Movies, TitleIdsMustBeAnArray)
{
    EXPECT_EQ(
        "checkTitlesInWishlist refused -3\ncheckTitlesInWishlist refused -3\n"
        "checkTitlesInWishlist refused -3\ncheckTitlesInWishlist refused -3\n0 []\n",
        Report("ready(function () {\n"
               "  [undefined, 5, {length: 1, 0: 1}, new Array(4294967295)].forEach(function (ids) {\n"
               "    call(ws, 'checkTitlesInWishlist', {titleids: ids}); });\n"
               "  call(ws, 'checkTitlesInWishlist', {titleids: []}, function (status, flags) {\n"
               "    report(status + ' ' + JSON.stringify(flags)); }); });\n"));
}

// ---- Sessions

TEST_F(Movies, AFailedInitCanBeRepeatedASecondOneDoesNothing)
{
    EXPECT_EQ("-1000 false\n-1\n0 true\n0\ngetCountryID 0\n",
              Report("call(ws, 'init', {}, function (status, result) { report(status + ' ' + result);\n"
                     "  report(ws.getNavigation([{}, {}]));\n"
                     "  call(ws, 'init', setup, function (status, result) { report(status + ' ' + result);\n"
                     "    report(ws.init([{onComplete: function () { report('never'); }}, {}]));\n"
                     "    each([['getCountryID', {}]]); }); });\n"));
}

TEST_F(Movies, AStoreThatCannotBeTrustedIsAStatusOfInit)
{
    store->SetCertificate(CertificateKind::WrongName);
    EXPECT_EQ(std::to_string(ZV_WS_Status_connection_error) + " false\n-1\n",
              Report("call(ws, 'init', setup, function (status, result) { report(status + ' ' + result);\n"
                     "  report(ws.getNavigation([{}, {}])); });\n"));
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
    EXPECT_EQ("0\n-2\ngetCountryID 0\n",
              Report("ready(function () {\n"
                     "  var twin = new com.orvex.ZVWSLib();\n"
                     "  report(twin.init([{}, {get APIKey() { report(twin.clone(ws)); }}]));\n"
                     "  ws = twin; each([['getCountryID', {}]]); });\n"));
}

TEST_F(Movies, WhatASessionKnowsIsAnsweredAtOnce)
{
    EXPECT_EQ("[]-1\nZVSDK: F|A ZVMODEL:M\n2\n0 apistg,1 stg,2 production!,3 default\n",
              Report("function environments() { return ws.getAvailableEnvLists().map(function (e) {\n"
                     "  return e.envNum + ' ' + e.endpoint + (e.isDefault ? '!' : ''); }).join(); }\n"
                     "report('[' + ws.getUserAgent() + ']' + ws.getDeviceEnv());\n"
                     "ready(function () { report(ws.getUserAgent()); report(ws.getDeviceEnv());\n"
                     "  report(environments()); });\n"));
}

// ---- The cache

TEST_F(Movies, BoxArtAndCacheCanBeRefreshedAndCleared)
{
    const std::string prefix = store->Query("SELECT prefix FROM title LIMIT 1");
    const std::string folder = store->DataFolder() + "/cache/";
    EXPECT_EQ("0 string true\n0 true\n-1000\n0\nfalse\n",
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
                     "    report(lib.clearLocalCache()); report(lib.clearLocalCache('" +
                     folder +
                     "'));\n"
                     "    report(lib.fileExist(path)); }); }); });\n"));
}

// ---- The end of an instance whose worker is inside a call: it is waited for, and what it brings is freed.

TEST_F(Movies, TheMovieEndsWhileCallsWaitForTheStore)
{
    store->SetLatency(300);
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ("", Report("ready(function () { call(ws, 'getNavigation', {}, function () { report('never'); });\n"
                         "  quit(); });\n"));
    EXPECT_EQ("getNavigation()", LastRequest());
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(10));
}

TEST_F(Movies, TheMovieEndsAtAnyPointOfACall)
{
    // The script holds the main thread for a while, so that nothing is delivered: the end meets the worker before,
    // inside and after its call.
    for (const char* hold : {"0", "2", "5", "10", "20", "60"}) {
        EXPECT_EQ("", Report("ready(function () { call(ws, 'getNavigation', {}, function () { report('never'); });\n"
                             "  for (var end = Date.now() + " +
                             std::string(hold) + "; Date.now() < end;) {} quit(); });\n"));
        EXPECT_EQ("getNavigation()", LastRequest());
    }
}

}  // namespace
