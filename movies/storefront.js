// Shows the store: its genres as a tree, a page of titles as a table, one title's details, and how long each call took.
//
// The account comes from flashvars (ZV_FLASHVARS="user=...&password=...&apikey=..."), else it is the simulator's standard one.

var ws = new com.orvex.ZVWSLib();
var purchaseTypes = ["rent", "buy", "any"];

// Calls a method and hands its result to `use`; ends the movie when the call is refused or fails.
function call(method, parameters, use) {
    var started = new Date().getTime();
    var listener = {
        onComplete: function (status, result) {
            var took = new Date().getTime() - started;
            trace("-- " + method + ": status " + status + ", " + took + " ms");
            if (status !== 0) {
                quit();
                throw new Error(method + " failed with status " + status);
            }
            use(result);
        }
    };
    var code = ws[method]([listener, parameters]);
    if (code !== 0) throw new Error(method + " was refused with code " + code);
}

function pad(text, width) {
    text = String(text === null ? "" : text);
    while (text.length < width) text += " ";
    return text.length > width ? text.substr(0, width - 1) + "\u2026" : text;
}

function showGenres(genres) {
    function show(parent, indent) {
        genres.forEach(function (genre) {
            if (genre.ParentID !== parent || genre.ID === parent || !genre.Visible) return;
            trace(indent + genre.Name + " (" + genre.ID + ")");
            show(genre.ID, indent + "    ");
        });
    }
    trace("Genres");
    show(0, "    ");
}

function price(title) {
    return title.AvailableProducts.map(function (product) {
        return purchaseTypes[product.PurchaseType] + " " + product.Price;
    }).join(", ");
}

function showTitles(page) {
    trace("Titles, page " + page.CurrentPageNumber + " of " + page.TotalPages + " (" + page.TotalItems + " titles)");
    trace("    " + pad("id", 8) + pad("title", 40) + pad("rating", 8) + "products");
    page.Titles.forEach(function (title) {
        trace("    " + pad(title.TitleID, 8) + pad(title.TitleName, 40) + pad(title.MPAARating, 8) + price(title));
    });
}

function showDetails(title) {
    trace(title.TitleName + " (" + title.TitleID + ")");
    ["Synopsis", "RunTime", "Directors", "Actors", "Writers", "Producers", "Copyright"].forEach(function (name) {
        if (title[name]) trace("    " + pad(name, 12) + title[name]);
    });
    title.AvailableProducts.forEach(function (product) {
        trace("    " + pad(purchaseTypes[product.PurchaseType], 12) + product.Price + ", until " + product.ExpireDate.toDateString());
    });
}

// The first genre that has titles of its own.
function firstLeaf(genres) {
    return genres.filter(function (genre) {
        return genre.Visible && !genres.some(function (other) { return other.ParentID === genre.ID; });
    })[0];
}

function browse() {
    call("getNavigation", {}, function (genres) {
        showGenres(genres);
        var query = {genreid: firstLeaf(genres).ID, CurrentPageNumber: 1, ItemsPerPage: 10, purchasetype: 2};
        call("getTitles", query, function (page) {
            showTitles(page);
            call("getTitleListing", {titleid: page.Titles[0].TitleID}, function (title) {
                showDetails(title);
                quit();
            });
        });
    });
}

call("init", {
    APIKey: flashvars.apikey || "desktop",
    UserName: flashvars.user || "customer",
    Password: flashvars.password || "secret",
    DestinationUniqueID: "desktop-player",
    DestinationTypeID: 48,
    AuthToken: "",
    ServiceBaseURL: "",
    Type: 0,
    CacheType: 0,
    CacheData: 0,
    CacheLimit: 0,
    CachePath: "",
    ProxyHost: "",
    ProxyPort: 0,
    ProxyUserName: "",
    ProxyPassword: "",
    AccessType: 0,
    ApplicationRevision: "1.0",
    EnvNum: 3,
    firmwareVersion: "1.3.1",
    modelNumber: "desktop"
}, browse);
