// Walks through the pages of a genre and back with a file cache, as a customer does who turns a page a second: which pages
// were there already, and how long each took. Wants a slow store to be worth seeing:
//
//     ZV_STOREFRONT_OPTIONS="--latency 200" ./run.sh movies/pages.js
//
// The cache is a folder in the system's temporary one, emptied before and after, unless ZV_FLASHVARS says keep=1.

var ws = new com.orvex.ZVWSLib();
var folder = (getenv("TMPDIR") || "/tmp") + "/storefront-pages/";
var keeps = flashvars.keep === "1";
var genre = 8, perPage = 4, pause = 1000;

// A page that comes faster than the store can answer did not need it.
var slowest = 100;
var ready = 0, turned = 0, last = 0;

function call(method, parameters, use) {
    var started = new Date().getTime();
    var code = ws[method]([{
        onComplete: function (status, result) {
            if (status !== 0) {
                quit();
                throw new Error(method + " failed with status " + status);
            }
            use(result, new Date().getTime() - started);
        }
    }, parameters]);
    if (code !== 0) throw new Error(method + " was refused with code " + code);
}

function show(number, next) {
    call("getTitles", {genreid: genre, CurrentPageNumber: number, ItemsPerPage: perPage, purchasetype: 2},
        function (page, took) {
            var wasReady = took < slowest;
            last = page.TotalPages;
            if (turned > 0 && wasReady) ready += 1;
            turned += 1;
            trace("page " + number + " of " + last + ": " + took + " ms, " + (wasReady ? "was there" : "asked from the store"));
            ws.idle();
            setTimeout(next, pause);
        });
}

// Forward over the end of the listing to its start, then back over it.
function walk() {
    var numbers = [];
    for (var i = last - 2; i <= last; ++i) numbers.push(i);
    for (i = 1; i <= 6; ++i) numbers.push(i);
    for (i = 5; i >= 1; --i) numbers.push(i);
    numbers.push(last);
    turned = ready = 0;
    (function step() {
        if (numbers.length !== 0) return show(numbers.shift(), step);
        trace("After the first page " + Math.round(ready * 100 / (turned - 1)) + " % of " + (turned - 1) + " pages were there.");
        if (!keeps) com.orvex.ZVWSLib.clearLocalCache(folder);
        quit();
    })();
}

if (!keeps) com.orvex.ZVWSLib.clearLocalCache(folder);
call("init", {
    APIKey: flashvars.apikey || "desktop",
    UserName: flashvars.user || "customer",
    Password: flashvars.password || "secret",
    DestinationUniqueID: "desktop-player",
    DestinationTypeID: 48,
    AccessType: 2,
    EnvNum: 3,
    CacheType: 2,
    CacheData: 7,
    CacheLimit: 0,
    CachePath: folder
}, function () {
    // How many pages there are.
    call("getTitles", {genreid: genre, CurrentPageNumber: 1, ItemsPerPage: 1, purchasetype: 2}, function (page) {
        last = Math.ceil(page.TotalItems / perPage);
        setTimeout(walk, 3 * pause);  // this listing is fetched ahead, too; the walk starts when that is over
    });
});
