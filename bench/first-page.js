// Says "the page is there" when the first page of titles is there.
var ws = new com.orvex.ZVWSLib();

function call(method, parameters, use) {
    var code = ws[method]([{onComplete: function (status, result) {
        if (status !== 0) throw new Error(method + ": " + status);
        use(result);
    }}, parameters]);
    if (code !== 0) throw new Error(method + ": " + code);
}

call("init", {
    APIKey: "desktop", UserName: "customer", Password: "secret", DestinationUniqueID: "bench", DestinationTypeID: 48,
    AuthToken: "", ServiceBaseURL: "", Type: 0, CacheType: 0, CacheData: 0, CacheLimit: 0, CachePath: "", ProxyHost: "",
    ProxyPort: 0, ProxyUserName: "", ProxyPassword: "", AccessType: 2, ApplicationRevision: "1.0", EnvNum: 2,
    firmwareVersion: "1.3.1", modelNumber: "bench"
}, function () {
    call("getTitles", {genreid: 1, CurrentPageNumber: 1, ItemsPerPage: 20, purchasetype: 0}, function (page) {
        if (page.Titles.length !== 20) throw new Error("no page");
        trace("the page is there");
        quit();
    });
});
