// Three instances with file caches that make calls at random, each when its last one was answered. Rests before the first
// call, after `mark` and after all `calls`: prints so, and goes on when the file "goN" is there, N the calls made.
//
// flashvars: seed, calls, mark, season (a title's number), folder (of the caches and the files to wait for).

var seed = Number(flashvars.seed), calls = Number(flashvars.calls), mark = Number(flashvars.mark);
var made = 0, stop = 0, busy = 0;

// The generator of Park and Miller: Math.random cannot be seeded.
function roll(sides) {
    seed = seed * 16807 % 2147483647;
    return seed % sides;
}

function page(more) {
    more.CurrentPageNumber = 1 + roll(9);
    more.ItemsPerPage = 5;
    more.purchasetype = 2;
    more.typefilter = 0;
    return more;
}
function title() { return {titleid: 1 + roll(200)}; }
function wish() { return {titleid: 60 + roll(30)}; }
function nothing() { return {}; }

// A method, how often it is drawn, its parameters.
var drawn = [];
[
    ["getTitles", 6, function () { return page({genreid: 1 + roll(8)}); }],
    ["getTitleListing", 4, title],
    ["getRecommendedTitles", 2, title],
    ["getAllTvEpisodeListings", 1, function () { return {titleid: Number(flashvars.season)}; }],
    ["searchForTitle", 2, function () { return page({query: ["harbour", "salt & iron", "nobody's"][roll(3)]}); }],
    ["getNavigation", 1, nothing],
    ["getBoxArtImage", 4, function () { return {boxartsize: 6, boxartprefix: "ZV" + (10001 + roll(200)).toString().replace("1", "0")}; }],
    ["getMyVideos", 2, function () { return page({watchstatus: 3}); }],
    ["getWishlistItems", 2, function () { return page({sortorder: roll(4)}); }],
    ["addItemToWishlist", 2, wish],
    ["removeItemFromWishlist", 2, wish],
    ["checkTitlesInWishlist", 2, function () { return {titleids: [wish().titleid, wish().titleid], typefilter: 0}; }],
    ["doPurchaseSavedBilling", 1, function () { return {skuid: 9001 + roll(22), ipaddress: "10.0.0.1", useprepaidfund: false}; }],
    ["getBillingInfo", 1, nothing],
    ["getSettingsPageInfo", 1, nothing],
    ["getConfig", 1, nothing],
    ["checkAuthToken", 1, nothing],
    ["loadLastStreamingAssetLocation", 1, function () { return {passid: 1 + roll(4), fileprofile: 2}; }],
    ["updateLocalCache", 2, function () { return {operations: 1 + roll(7)}; }],  // what is cached counts as old
    ["checkBandwidth", 1, nothing]
].forEach(function (row) {
    for (var i = 0; i < row[1]; ++i) drawn.push(row);
});

function call(ws, method, parameters, then) {
    var code = ws[method]([{onComplete: then}, parameters]);
    if (code !== 0) throw new Error(method + " was refused with code " + code);
}

function next(ws) {
    if (made === stop) {
        // A call ends the fetching of box art.
        return call(ws, "getNavigation", {}, function () {
            if (--busy === 0) rest();
        });
    }
    var row = drawn[roll(drawn.length)];
    if (++made % 100 === 0) trace(made + " calls");
    call(ws, row[0], row[2](), function () {
        if (roll(3) === 0) ws.idle();
        roll(8) === 0 ? setTimeout(next, 20, ws) : next(ws);
    });
}

function rest() {
    trace("at rest after " + made + " calls");
    var timer = setInterval(function () {
        if (!com.orvex.ZVWSLib.fileExist(flashvars.folder + "/go" + made)) return;
        clearInterval(timer);
        if (made === calls) return quit();
        stop = made === 0 ? mark : calls;
        made === 0 ? open(0) : start();
    }, 20);
}

function start() {
    busy = instances.length;
    instances.forEach(next);
}

function open(i) {
    trace("");  // the library's line about the user agent has no end
    if (i === instances.length) return start();
    call(instances[i], "init", {
        APIKey: "desktop", UserName: "customer", Password: "secret", DestinationUniqueID: "player " + i, DestinationTypeID: 48,
        AccessType: 2, EnvNum: 2, CacheType: 2, CacheData: 7, CacheLimit: 0, CachePath: flashvars.folder + "/cache" + i
    }, function (status) { open(status === 0 ? i + 1 : i); });
}

var instances = [1, 2, 3].map(function () { return new com.orvex.ZVWSLib(); });
rest();
