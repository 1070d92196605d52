// A customer's evening: activate the player, browse, search, keep a wish list, buy (with every refusal on the way), watch,
// stop, and go on where it stopped. Prints each step with its status; ends by itself.

var ws = new com.orvex.ZVWSLib();
var player = new com.orvex.ZVPlayerLibAE();

// What the steps learn and later ones need.
var known = {};

// Makes a call and goes on with the next step when it has been answered, whatever the answer.
function ask(method, parameters, use) {
    return function (next) {
        var given = typeof parameters === "function" ? parameters() : parameters;
        var code = ws[method]([{
            onComplete: function (status, result) {
                trace(method + ": " + status + (use ? " " + (use(result, status) || "") : ""));
                next();
            }
        }, given]);
        if (code !== 0) throw new Error(method + " was refused with code " + code);
    };
}

function tell(text) {
    return function (next) {
        trace("== " + text);
        next();
    };
}

function run(steps) {
    if (steps.length === 0) return quit();
    steps[0](function () { run(steps.slice(1)); });
}

var setup = {
    APIKey: flashvars.apikey || "desktop",
    UserName: flashvars.user || "customer",
    Password: flashvars.password || "secret",
    DestinationUniqueID: "desktop-player",
    DestinationTypeID: 48,
    AccessType: 2,
    EnvNum: 3,
    CacheType: flashvars.cache ? 2 : 0,  // a file cache in that folder, or none
    CacheData: 7,
    CacheLimit: 0,
    CachePath: flashvars.cache || "",
    ApplicationRevision: "1.0",
    firmwareVersion: "1.3.1",
    modelNumber: "desktop"
};

var page = {CurrentPageNumber: 1, ItemsPerPage: 5, purchasetype: 2, typefilter: 0};

// The simulator's products 9001 to 9022 refuse to be bought, each with its own code.
function refusals() {
    var steps = [];
    for (var code = 1; code <= 22; ++code) {
        steps.push(ask("doPurchaseSavedBilling", {skuid: 9000 + code, ipaddress: "10.0.0.1", useprepaidfund: false},
                       function (purchase) { return "refused with code " + purchase.ResponseCode; }));
    }
    return steps;
}

function play(next) {
    trace("player: " + player.Initialize() + ", version " + player.GetVersion());
    next();
}

run([
    tell("Start"),
    ask("init", setup),
    ask("authorizeDevice", {pin: "111111"}),
    ask("authorizeDevice", {pin: "123456"}, function (answer) { return answer.AuthToken ? "activated" : "no token"; }),
    ask("checkAuthToken", {}, function (valid) { return "token is valid: " + valid; }),
    ask("getSettingsPageInfo", {}, function (info) { return info.Account + ", " + info.DeviceName; }),

    tell("Look around"),
    ask("getNavigation", {}, function (genres) { return genres.length + " genres"; }),
    ask("searchForTitle", {CurrentPageNumber: 1, ItemsPerPage: 5, purchasetype: 0, typefilter: 2, query: "harbour"},
        function (found) {
            known.title = found.Titles[0];
            known.sku = known.title.AvailableProducts[0].SkuID;
            return found.TotalItems + " found, first: " + known.title.TitleName;
        }),
    ask("getTitleListing", function () { return {titleid: known.title.TitleID}; }, function (title) { return title.RunTime; }),
    ask("getBoxArtImage", function () { return {boxartsize: 6, boxartprefix: known.title.BoxArtPrefix}; },
        function (place) { return place; }),
    ask("getRecommendedTitles", function () { return {titleid: known.title.TitleID}; },
        function (answer) { return answer.Titles.length + " more like it"; }),

    tell("Wish list"),
    ask("addItemToWishlist", function () { return {titleid: known.title.TitleID}; }),
    ask("getWishlistItems", {sortorder: 1, CurrentPageNumber: 1, ItemsPerPage: 5, typefilter: 0},
        function (items) { return items.TotalItems + " wishes"; }),
    ask("checkTitlesInWishlist", function () { return {titleids: [known.title.TitleID, 1], typefilter: 0}; }),
    ask("removeItemFromWishlist", function () { return {titleid: known.title.TitleID}; }),

    tell("Buy")
].concat(refusals()).concat([
    ask("getPrePaidCardBalance", {}, function (answer) { return answer.Balance; }),
    ask("assignGiftCertificateToUser", {giftcertificatecode: "GIFT1"}, function (answer) { return answer.Balance; }),
    ask("calcOrderTax", function () { return {skuid: known.sku}; }, function (tax) { return tax.TotalPrice; }),
    ask("doPurchaseSavedBilling", function () { return {skuid: known.sku, ipaddress: "10.0.0.1", useprepaidfund: true}; },
        function (purchase) {
            known.pass = purchase.PassID;
            return "pass " + purchase.PassID;
        }),
    ask("checkForPurchasedSku", function () { return {skuid: known.sku}; }, function (yes) { return yes; }),
    ask("getMyVideos", {CurrentPageNumber: 1, ItemsPerPage: 5, purchasetype: 2, typefilter: 0, watchstatus: 3},
        function (videos) { return videos.TotalItems + " videos"; }),

    tell("Watch"),
    play,
    ask("getStreamingAssetLocation", function () { return {passid: known.pass, fileprofile: 2}; }, function (location) {
        known.stream = location.StreamID;
        return location.StreamingAssetLocation;
    }),
    ask("manageStreamingInstanceStatus",
        function () { return {streamid: known.stream, streamstatus: 0, stoptimeSeconds: 0}; }),
    ask("manageStreamingInstanceStatus",
        function () { return {streamid: known.stream, streamstatus: 1, stoptimeSeconds: 1234}; }),
    ask("loadLastStreamingAssetLocation", function () { return {passid: known.pass, fileprofile: 2}; },
        function (location) { return "goes on at " + location.StartTimeSeconds + " s"; }),
    ask("checkRentalExpiration", function () { return {passid: known.pass}; },
        function (answer) { return answer.HoursRemaining + " hours left"; }),

    tell("Good night"),
    ask("deactivateDevice", {}),
    ask("checkAuthToken", {}, function (valid) { return "token is valid: " + valid; })
]));
