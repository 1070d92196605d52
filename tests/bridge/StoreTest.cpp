// Methods against a storefront: what a script's parameters become on the wire, sessions, and the end of a busy
// instance.
#include <filesystem>

#include "StoreMovie.h"

namespace {

class Movies : public StoreMovie {
protected:
    std::string AnswerTo(const std::string& question) override
    {
        const std::string verb = question.substr(0, 5);
        if (verb == "lose ") return std::to_string(std::filesystem::remove_all(question.substr(5)));
        if (verb == "find ") return std::to_string(std::filesystem::create_directory(question.substr(5)));
        return StoreMovie::AnswerTo(question);
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

// ---- Properties that cannot be read

// Every method with properties, in the order in which they are read. What stands before a name tells what it is read
// as: # a number, $ a text, ? a boolean, @ an array of numbers.
const char kProperties[] = R"(var methods = {
    init: '$APIKey $UserName $Password #DestinationTypeID $AuthToken $DestinationUniqueID $ServiceBaseURL #Type ' +
        '#CacheType #CacheData $CachePath #CacheLimit $ProxyHost $ProxyUserName #ProxyPort $ProxyPassword #AccessType ' +
        '$ApplicationRevision #EnvNum $firmwareVersion $modelNumber',
    getTitles: '#genreid #CurrentPageNumber #ItemsPerPage #purchasetype',
    getTitleListing: '#titleid',
    searchForTitle: '#CurrentPageNumber #ItemsPerPage #purchasetype #typefilter $query',
    getRecommendedTitles: '#titleid', translateSkuID: '#skuid', getTvEpisodeListing: '#episodeid',
    getTvEpisodeListByTitleID: '#titleid', getAllTvEpisodeListings: '#titleid', authorizeDevice: '$pin',
    getBoxArtImage: '#boxartsize $boxartprefix',
    getMyVideos: '#CurrentPageNumber #ItemsPerPage #purchasetype #typefilter #watchstatus',
    getWishlistItems: '#sortorder #CurrentPageNumber #ItemsPerPage #typefilter',
    addItemToWishlist: '#titleid', removeItemFromWishlist: '#titleid', checkTitleInWishlist: '#titleid',
    checkTitlesInWishlist: '@titleids #typefilter',
    doPurchaseSavedBilling: '#skuid $ipaddress ?useprepaidfund',
    checkForPurchasedTitle: '#titleid', checkForPurchasedSku: '#skuid', checkAdultVerificationPin: '#pin',
    assignGiftCertificateToUser: '$giftcertificatecode', checkRentalExpiration: '#passid',
    getStreamingAssetLocation: '#passid #fileprofile', getStreamingBonusAssetLocation: '#bonusassetid',
    loadLastStreamingAssetLocation: '#passid #fileprofile',
    manageStreamingInstanceStatus: '$streamid #streamstatus #stoptimeSeconds',
    getTHXMediaDirector: '#passid #fileprofile #audioprofile',
    getTHXMediaDirectorBonusAsset: '#bonusassetid #fileprofile #bonusassettype',
    updateLocalCache: '#operations', calcOrderTax: '#skuid', setAudioDefaultProperty: '#audioprofile'};
function fail() { throw new Error('on purpose'); }
function withLength(get) {
    return new Proxy([1], {get: function (array, name) { return name === 'length' ? get() : array[name]; }}); }
function withItem(item) { return [1, item, 3]; }
var toPrimitive = {}; toPrimitive[Symbol.toPrimitive] = fail;
// Values that are no text, and so no number either; values that are no number; arrays of those.
var noTexts = [{toString: fail}, toPrimitive, Symbol('s'), Object.create(null), {toString: function () { return {}; }}];
var noNumbers = noTexts.concat([{valueOf: fail}]);
var noArrays = noNumbers.map(withItem).concat([withLength(fail), withLength(function () { return {valueOf: fail}; }),
    Object.defineProperty([1, 2, 3], 1, {get: fail}), 7, undefined, {length: 1, 0: 1}]);
var bad = {'#': noNumbers, '?': noNumbers, '$': noTexts, '@': noArrays};
)";

TEST_F(Movies, APropertyThatCannotBeReadRefusesTheCall)
{
    EXPECT_EQ("done\n0\n", Report(kProperties + std::string(R"(
function refuse(object, method, name, property, what) {
    var code = object[method]([{}, Object.defineProperty({titleids: [1]}, name, property)]);
    if (code !== -3) report(method + ' took ' + name + ' ' + what + ': ' + code);
}
ready(function () {
    for (var method in methods) {
        var object = method === 'init' ? new com.orvex.ZVWSLib() : ws;
        methods[method].split(' ').forEach(function (property) {
            var name = property.substr(1);
            refuse(object, method, name, {get: fail}, 'of a getter');
            bad[property[0]].forEach(function (value, at) { refuse(object, method, name, {value: value}, at); }); });
    }
    report('done');
    call(ws, 'getCountryID', {}, function (status) { report(status); }); });)")));
    EXPECT_EQ((std::vector<std::string>{"discovery(d=device,dt=48)", "GetCountryID()"}), Requests());
}

// Nothing is given, which is not the same.
TEST_F(Movies, PropertiesAreReadInOrderAndOnce)
{
    EXPECT_EQ("", Report(kProperties + std::string(R"(
ready(function () {
    var names = Object.keys(methods);
    (function next() {
        var read = [], method = names.shift();
        if (!method) return;
        function watched(target) {
            return new Proxy(target, {get: function (target, name) { read.push(name); return target[name]; }}); }
        var ids = watched([7, {valueOf: function () { read.push('valueOf'); return 19; }}]);
        call(method === 'init' ? new com.orvex.ZVWSLib() : ws, method,
            watched(method === 'checkTitlesInWishlist' ? {titleids: ids} : {}), next);
        var expected = methods[method].replace(/[#$?@]/g, '').replace('titleids', 'titleids length 0 1 valueOf');
        if (read.join(' ') !== expected) report(method + ' read ' + read.join(' '));
    })(); });)")));
}

TEST_F(Movies, PrepaidMoneyIsUsedWhenTheScriptSaysSo)
{
    EXPECT_EQ("", Report(R"(
var values = [false, 0, -0, NaN, '', '0', 'false', undefined, null, new Boolean(false), new Number(0), new String('0'), [],
              true, 1, -0.5, Infinity, '1', 'true', 'no', ' ', 'False', new Boolean(true), new Number(2), {}, new Date(1)];
ready(function next() {
    if (values.length === 0) return;
    call(ws, 'doPurchaseSavedBilling', {skuid: 9001, ipaddress: '', useprepaidfund: values.shift()}, next); });)"));
    std::string answers;
    for (const LoggedRequest& request : store->Log()) {
        for (const auto& child : request.children) {
            if (child.first == "UsePrePaidFunds") answers += child.second + " ";
        }
    }
    EXPECT_EQ("no no no no no no no no no no no no no yes yes yes yes yes yes yes yes yes yes yes yes yes ", answers);
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
    EXPECT_EQ("0\n-4\n-4\n0\nclone 0,late 0,source 0\n",
              Report("ready(function () {\n"
                     "  var twin = new com.orvex.ZVWSLib(), late = new com.orvex.ZVWSLib(), done = [];\n"
                     "  function finished(name) { return function (status) { done.push(name + ' ' + status);\n"
                     "    if (done.length === 3) report(done.sort()); }; }\n"
                     "  report(twin.clone(ws)); report(twin.clone(ws)); report(ws.clone(twin));\n"
                     "  call(ws, 'getCountryID', {}, function (status) { ws = null; finished('source')(status); });\n"
                     "  call(twin, 'getCountryID', {}, finished('clone'));\n"
                     "  report(late.clone(twin));\n"
                     "  call(late, 'getCountryID', {}, finished('late')); });\n"));
    EXPECT_EQ(4u, store->Log().size());  // one discovery
}

// The source's call gets no answer while the clone works, and fetches ahead.
TEST_F(Movies, AnInstanceIsClonedWhileItsCallIsUnderWay)
{
    Fault("getTitleListing=stall");
    EXPECT_EQ("0\n0 2 of 5\n", Report(R"(setup.CacheType = 2; setup.CacheData = 1; setup.CachePath = ')" +
                                      store->DataFolder() + R"(/cache/';
ready(function () {
    call(ws, 'getTitleListing', {titleid: 12}, function () { report('the source is answered'); });
    when('getTitleListing', 1, function () {
        var twin = new com.orvex.ZVWSLib();
        var code = twin.clone(ws);
        report(code);
        if (code !== 0) return quit();
        call(twin, 'getTitles', {genreid: 8010, CurrentPageNumber: 2, ItemsPerPage: 1, purchasetype: 2},
            function (status, page) {
                report(status + ' ' + page.CurrentPageNumber + ' of ' + page.TotalPages);
                when('getTitlesByNavigation', 5, quit); }); }); });)"));
    const std::vector<LoggedRequest> log = store->Log();
    EXPECT_EQ("stall", log.at(2).fault) << log[2].operation;
}

TEST_F(Movies, AFailedCloneCanBeRepeated)
{
    const std::string folder = store->DataFolder() + "/cache";
    EXPECT_EQ("-5\n-1\n0\n", Report("setup.CacheType = 2; setup.CacheData = 1; setup.CachePath = '" + folder +
                                    R"(';
ready(function () {
    var twin = new com.orvex.ZVWSLib();
    answer('lose ' + setup.CachePath);
    report(twin.clone(ws)); report(twin.getCountryID([{}, {}]));
    answer('find ' + setup.CachePath);
    report(twin.clone(ws)); });)"));
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
