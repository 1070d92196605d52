// Shows a page of titles with a file cache, and stays on it for a second while its box art is fetched ahead.
var ws = new com.orvex.ZVWSLib();

function call(method, parameters, use) {
    var code = ws[method]([{onComplete: function (status) {
        if (status !== 0) throw new Error(method + ": " + status);
        use();
    }}, parameters]);
    if (code !== 0) throw new Error(method + ": " + code);
}

call("init", {
    APIKey: "desktop", UserName: "customer", Password: "secret", DestinationUniqueID: "bench", DestinationTypeID: 48,
    CacheType: 2, CacheData: 7, CacheLimit: 0, CachePath: getenv("ZV_BENCH_CACHE"), AccessType: 2, EnvNum: 2
}, function () {
    call("getTitles", {genreid: 1, CurrentPageNumber: 1, ItemsPerPage: 20, purchasetype: 0}, function () {
        ws.idle();
        setTimeout(quit, 1000);
    });
});
