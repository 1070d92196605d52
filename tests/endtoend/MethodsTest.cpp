// All methods of com.orvex.ZVWSLib from a movie in the real process. Each result is written as JSON by the movie, which
// keeps the order of the properties, and compared with what the simulator's database says, also as JSON.
#include "Movie.h"
#include "Store.h"
#include "TempFolder.h"

namespace {

// ---- Expected values, as SQL over the simulator's tables

std::string Flag(const std::string& condition)
{
    return "json(CASE WHEN " + condition + " THEN 'true' ELSE 'false' END)";
}

const std::string kProducts =
    "(SELECT json_group_array(json_object('SkuID', sku, 'PurchaseType', type, 'Price', price, 'RentalPeriod', period, "
    "'AvailableAssets', json('[{\"FileProfile\":1},{\"FileProfile\":2}]'), 'AvailableAudioProfiles', "
    "json_array(json_object('AssetAudioID', sku * 2, 'FileLocation', 'audio/' || sku || '.ac3', 'ContainsVideo', "
    "json('false'), 'AudioAssetProfile', 1)), 'ExpireDate', replace(replace(expires, '/', '-'), ' ', 'T') || '.000Z')) "
    "FROM (SELECT * FROM product WHERE title = t.id ORDER BY sku))";

// The properties of a title listing, for json_object; `t` is the title's row.
std::string Title(const std::string& position)
{
    return "'TitleID', t.id, 'TitleName', t.name, 'BoxArtPrefix', t.prefix, 'TitlePosition', " + position +
           ", 'EpisodeNumber', t.episode, 'CHVRSRating', nullif(t.chvrs, ''), 'LoyaltyPointsForBuy', CAST(t.id % 100 "
           "AS TEXT), 'LoyaltyPointsForRent', CAST(t.id % 10 AS TEXT), 'BonusAssets', (SELECT "
           "json_group_array(json_object('BonusAssetID', id, 'Profile', profile, 'BonusType', 0)) FROM bonus WHERE "
           "title = t.id), 'IsTvListing', " +
           Flag("t.is_tv") + ", 'MPAARating', nullif(t.rating, ''), 'IsTHXMediaDirectorEnabled', " + Flag("t.thx") +
           ", 'IsTHXMediaDirectorEnabledForTrailer', json('false'), 'AvailableProducts', " + kProducts;
}

const std::string kDetails =
    ", 'ResponseCode', 0, 'ResponseMessage', 'OK', 'Synopsis', nullif(synopsis, ''), 'UserRating', stars, 'Directors', "
    "nullif(directors, ''), 'Actors', nullif(actors, ''), 'Writers', nullif(writers, ''), 'Producers', "
    "nullif(producers, ''), 'Copyright', nullif(copyright, ''), 'RunTime', nullif(runtime, ''), 'RatingReason', "
    "nullif(reason, '')";

std::string Details(const std::string& where)
{
    return "SELECT json_object(" + Title("1") + kDetails + ") FROM title t WHERE " + where;
}

const std::string kOk = "'ResponseCode', 0, 'ResponseMessage', 'OK'";

// A page of the titles that `where` selects.
std::string Titles(const std::string& genre, int perPage, const std::string& where)
{
    const std::string items = std::to_string(perPage);
    return "SELECT json_object('GenreID', " + genre + ", 'CurrentPageNumber', 1, 'ItemsPerPage', " + items +
           ", 'TotalPages', (total + " + items + " - 1) / " + items + ", 'TotalItems', total, " + kOk +
           ", 'Titles', (SELECT json_group_array(json_object(" + Title("row") +
           ")) FROM (SELECT *, row_number() OVER (ORDER BY id) AS row FROM title WHERE " + where +
           " ORDER BY id LIMIT " + items + ") t)) FROM (SELECT COUNT(*) AS total FROM title WHERE " + where + ")";
}

std::string Purchased(const std::string& pass)
{
    return Title("row") + ", 'EpisodeID', 0, 'TvListingTitleID', 0, 'PurchaseType', " +
           (pass.empty()
                ? "0, 'Status', 3, 'RentalPeriod', '48 hours', 'PassID', 0, 'PlayStatus', 0, 'StartTimeSeconds', 0"
                : "p_type, 'Status', watch, 'RentalPeriod', CASE WHEN p_type = 0 THEN '48 hours' ELSE '' END, "
                  "'PassID', pass, 'PlayStatus', status, 'StartTimeSeconds', position");
}

std::string PurchasedPage(const std::string& pass, const std::string& rows, const std::string& more)
{
    return "SELECT json_object('CurrentPageNumber', 1, 'ItemsPerPage', 9, 'TotalPages', 1, 'TotalItems', 3, " + kOk +
           ", 'Titles', (SELECT json_group_array(json_object(" + Purchased(pass) + ")) FROM (" + rows + ") t)" + more +
           ")";
}

std::string Object(const std::string& properties)
{
    return "SELECT json_object(" + properties + ")";
}
std::string Account(const std::string& properties)
{
    return "SELECT json_object(" + kOk + ", " + properties + ") FROM account WHERE id = 1";
}
std::string Value(const std::string& json)
{
    return "SELECT '" + json + "'";
}

std::string Location(const std::string& file, int asset, const std::string& stream, int status, int position)
{
    return Object("'StreamingAssetLocation', 'http://HOST/media/" + file + "', 'AssetID', " + std::to_string(asset) +
                  ", 'StreamID', '" + stream +
                  "', 'DRMServerURL', 'http://HOST/drm/licence', 'DRMACKServerURL', 'http://HOST/drm/ack', 'Status', " +
                  std::to_string(status) + ", 'StartTimeSeconds', " + std::to_string(position) +
                  ", 'HeartbeatURL', 'http://HOST/heartbeat?stream=" + stream + "', 'HeartbeatPollInSeconds', 60, " +
                  kOk);
}

// ---- The methods

struct Row {
    const char* method;
    std::string parameters;
    std::string expected;  // SQL for the result as JSON; HOST stands for the simulator's plain address
};

std::vector<Row> Rows(const Storefront& store)
{
    const std::string season = store.Query("SELECT MIN(id) FROM title WHERE is_tv = 1");
    const std::string episode = store.Query("SELECT MIN(id) FROM title WHERE season > 0");
    const std::string sku = store.Query("SELECT MIN(sku) FROM product WHERE type = 1 AND title > 50");
    const std::string bonus = store.Query("SELECT MIN(id) FROM bonus");
    const std::string recommended =
        "SELECT DISTINCT title FROM title_genre WHERE genre = (SELECT MAX(genre) FROM title_genre WHERE title = 12) "
        "AND title > 12 ORDER BY title LIMIT 5";
    const std::string wishRows =
        "SELECT title.*, row_number() OVER (ORDER BY name, id) AS row FROM wish JOIN title ON title = id WHERE "
        "account = 1 ORDER BY name, id";
    const std::string passRows =
        "SELECT title.*, pass.id AS pass, pass.type AS p_type, watch, status, position, row_number() OVER (ORDER BY "
        "pass.id) AS row FROM pass JOIN title ON title.id = pass.title WHERE account = 1 "
        "ORDER BY pass.id";
    return {
        {"getNavigation", "{}",
         "SELECT json_group_array(json_object('ID', id, 'Name', name, 'Visible', " + Flag("visible") +
             ", 'ParentID', parent)) FROM (SELECT * FROM genre ORDER BY id)"},
        {"getTitles", "{genreid: 1, CurrentPageNumber: 1, ItemsPerPage: 4, purchasetype: 2}",
         Titles("1", 4, "id IN (SELECT title FROM title_genre WHERE genre = 1)")},
        {"getTitleListing", "{titleid: 11}", Details("id = 11")},
        {"searchForTitle",
         "{CurrentPageNumber: 1, ItemsPerPage: 3, purchasetype: 1, typefilter: 2, query: 'Salt & Iron'}",
         Titles("0", 3,
                "name LIKE '%Salt & Iron%' AND is_tv = 0 AND season = 0 AND id IN (SELECT title FROM product WHERE "
                "type = 1)")},
        {"getRecommendedTitles", "{titleid: 12}",
         Object(kOk + ", 'Titles', (SELECT json_group_array(json_object(" + Title("row") +
                ")) FROM (SELECT *, row_number() OVER (ORDER BY id) AS row FROM title WHERE id IN (" + recommended +
                ") ORDER BY id) t)")},
        {"translateSkuID", "{skuid: " + sku + "}",
         Object(kOk + ", 'TitleID', (SELECT title FROM product WHERE sku = " + sku + ")")},
        {"getTvEpisodeListing", "{episodeid: " + episode + "}", Details("id = " + episode)},
        {"getTvEpisodeListByTitleID", "{titleid: " + season + "}",
         Object(kOk +
                ", 'Episodes', (SELECT json_group_array(json_object('EpisodeID', id, 'EpisodeName', name, "
                "'EpisodeNumber', episode)) FROM (SELECT * FROM title WHERE season = " +
                season + " ORDER BY episode))")},
        {"getAllTvEpisodeListings", "{titleid: " + season + "}",
         "SELECT json_group_array(json_object(" + Title("1") + kDetails +
             ")) FROM (SELECT * FROM title WHERE season = " + season + " ORDER BY episode) t"},
        {"authorizeDevice", "{pin: '123456'}", Object(kOk + ", 'AuthToken', 'token-2'")},
        {"checkAuthToken", "{}", Value("true")},
        {"deactivateDevice", "{}", Object(kOk)},
        {"getBoxArtImage", "{boxartsize: 6, boxartprefix: 'ZV00012'}",
         Value("\"http://HOST/images/boxart/135s/ZV00012135.jpg\"")},
        {"getMyVideos", "{CurrentPageNumber: 1, ItemsPerPage: 9, purchasetype: 2, typefilter: 0, watchstatus: 3}",
         PurchasedPage("pass", passRows, "")},
        {"getWishlistItems", "{sortorder: 1, CurrentPageNumber: 1, ItemsPerPage: 9, typefilter: 0}",
         PurchasedPage("", wishRows, ", 'SortOrder', 1")},
        {"addItemToWishlist", "{titleid: 60}", Object(kOk)},
        {"checkTitleInWishlist", "{titleid: 60}", Value("true")},
        {"checkTitlesInWishlist", "{titleids: [61, 60, 7], typefilter: 0}", Value("[false,true,true]")},
        {"removeItemFromWishlist", "{titleid: 60}", Object(kOk)},
        {"removeAllItemsFromWishlist", "{}", Object(kOk)},
        {"doPurchaseSavedBilling", "{skuid: " + sku + ", ipaddress: '10.0.0.1', useprepaidfund: true}",
         Object(kOk + ", 'PassID', 5, 'TransactionID', 5005, 'TransactionAuthNum', 'A5'")},
        {"checkForPurchasedTitle", "{titleid: 61}", Value("false")},
        {"checkForPurchasedSku", "{skuid: " + sku + "}", Value("true")},
        {"checkAdultVerificationEnabled", "{}", Object(kOk + ", 'IsAdultVerificationEnabled', json('true')")},
        {"checkAdultVerificationPin", "{pin: 42}", Object(kOk + ", 'IsPinVerified', json('true')")},
        {"assignGiftCertificateToUser", "{giftcertificatecode: 'GIFT3'}", Account("'Balance', prepaid")},
        {"checkRentalExpiration", "{passid: 1}", Object(kOk + ", 'ShouldDisplay', json('true'), 'HoursRemaining', 30")},
        {"getStreamingAssetLocation", "{passid: 1, fileprofile: 2}",
         Location("12-HIGH_DEFINITION.mp4", 102, "stream-1", 2, 0)},
        {"manageStreamingInstanceStatus", "{streamid: 'stream-1', streamstatus: 1, stoptimeSeconds: 77}", Object(kOk)},
        {"loadLastStreamingAssetLocation", "{passid: 1, fileprofile: 1}",
         Location("12-STANDARD.mp4", 101, "stream-1", 1, 77)},
        {"getStreamingBonusAssetLocation", "{bonusassetid: " + bonus + "}",
         Location("trailer-" + bonus + ".mp4", atoi(bonus.c_str()), "trailer-" + bonus, 0, 0)},
        {"getTHXMediaDirector", "{passid: 1, fileprofile: 2, audioprofile: 5}",
         Object(kOk + ", 'LongFormat', 'THX-LONG-DTS_Express_51', 'ShortFormat', 'THX-S'")},
        {"getTHXMediaDirectorBonusAsset", "{bonusassetid: " + bonus + ", fileprofile: 2, bonusassettype: 0}",
         Object(kOk + ", 'LongFormat', 'THX-LONG-Trailer', 'ShortFormat', 'THX-S'")},
        {"getEmailAddress", "{}", Account("'EmailAddress', email")},
        {"getBillingInfo", "{}", Account("'CCLastFour', card, 'CCTypeID', card_type, 'CCType', card_name")},
        {"getPrePaidCardBalance", "{}", Account("'Balance', prepaid")},
        {"getConfig", "{}",
         Object("'ResponseCode', 0, 'ConfigurationItem', "
                "json('[{\"Key\":\"BandwithCheckURL\",\"Value\":\"http://HOST/bandwidth/"
                "test.bin\"},{\"Key\":\"Region\",\"Value\":\"00\"},{\"Key\":\"Unset\",\"Value\":null}]'), "
                "'ResponseMessage', 'OK'")},
        {"getSettingsPageInfo", "{}", Account("'Account', name, 'DeviceID', '1', 'DeviceName', 'Living room'")},
        {"getCountryID", "{}", Value("1")},
        {"getFileType", "{}",
         Object("'DRMProvider', 3, 'AccessType', 2, 'FileProfile', 2, 'VideoFormat', 6, 'FileExtension', 4")},
        {"updateLocalCache", "{operations: 7}", Value("true")},
        {"calcOrderTax", "{skuid: " + sku + "}",
         "SELECT json_object(" + kOk +
             ", 'SubTotal', price, 'TotalPrice', price, 'Tax', '0.00') FROM product WHERE sku = " + sku},
        {"setAudioDefaultProperty", "{audioprofile: 4}", Object(kOk)},
        {"getAudioDefaultProperty", "{}", Value("4")},
        // Their values are the machine's own; a movie sees their kind.
        {"checkBandwidth", "{}", Value("\"a number\"")},
        {"getLocalIPAddr", "{}", Value("\"an address\"")},
    };
}

// What answers at once, with a script that shows it and what is expected.
const struct {
    const char* method;
    const char* show;
    const char* expected;
} kAtOnce[] = {
    {"getUserAgent", "ws.getUserAgent()", "\"ZVSDK: F|A ZVMODEL:M\""},
    {"getDeviceEnv", "ws.getDeviceEnv()", "2"},
    {"getAvailableEnvLists",
     "ws.getAvailableEnvLists().map(function (e) { return [e.endpoint, e.envNum, e.isDefault]; })",
     "[[\"apistg\",0,null],[\"stg\",1,null],[\"production\",2,true],[\"default\",3,null]]"},
    {"getSysInfo", "[ws.getSysInfo('x'), ws.getSysInfo(), ws.getSysInfo(1, 2), ws.getSysInfo(5)]",
     "[\"x\",\"\",\"\",\"5\"]"},
    {"fileExist", "[com.orvex.ZVWSLib.fileExist('/'), com.orvex.ZVWSLib.fileExist('/no/such/file')]", "[true,false]"},
    {"clearLocalCache", "com.orvex.ZVWSLib.clearLocalCache('')", "-1000"},
    {"checkZVSWFmd5sum", "com.orvex.ZVWSLib.checkZVSWFmd5sum('/no/such/file', '')", "false"},
    {"setLogAreaIDsAndTargetConfig",
     "com.orvex.ZVWSLib.setLogAreaIDsAndTargetConfig({LogAreaIDs: '0', LogTarget: '0'})", "1"},
    {"clone",
     "(function () { var other = new com.orvex.ZVWSLib(); return [other.clone(ws), other.clone(ws), ws.clone(ws)]; "
     "})()",
     "[0,-4,-4]"},
    {"idle", "ws.idle()", "0"},
    {"trace", "(com.orvex.ZVWSLib.trace('seen'), 1)", "1"},
};

std::string Movie(const std::vector<Row>& rows)
{
    std::string movie = R"(
var ws = new com.orvex.ZVWSLib();
function show(name, status, value) { trace('=' + name + ' ' + status + ' ' + JSON.stringify(value)); }
function call(name, parameters, next) {
    var code = ws[name]([{onComplete: function (status, result) {
        if (name === 'checkBandwidth' && result > 0) result = 'a number';
        if (name === 'getLocalIPAddr') {  // or word that no way leaves the machine
            if (status === -1001 && result === null) { status = 0; result = 'an address'; }
            if (/^[0-9a-f.:]+$/.test(result) && !/^127\.|^::1$/.test(result)) result = 'an address';
        }
        show(name, status, result);
        next();
    }}, parameters]);
    if (code !== 0) { trace('=' + name + ' refused ' + code); next(); }
}
var calls = [
    ['init', {APIKey: 'desktop', UserName: 'customer', Password: 'secret', DestinationUniqueID: 'd', DestinationTypeID: 1,
              AccessType: 2, EnvNum: 3, firmwareVersion: 'F', ApplicationRevision: 'A', modelNumber: 'M'}],
)";
    for (const Row& row : rows)
        movie += std::string("    ['") + row.method + "', " + row.parameters + "],\n";
    movie += "];\nfunction atOnce() {\n";
    for (const auto& row : kAtOnce) {
        movie += std::string("    show('") + row.method + "', 0, " + row.show + ");\n";
    }
    return movie + R"(    ws.quitFlash();
}
(function step() { calls.length === 0 ? atOnce() : (function (c) { call(c[0], c[1], step); })(calls.shift()); })();
)";
}

using Methods = Store;

TEST_F(Methods, AnswerWhatTheStoreHolds)
{
    const std::vector<Row> rows = Rows(*store);
    // What later rows change is read before, and what they change to, after the movie has ended.
    std::vector<std::string> expected;
    expected.reserve(std::size(rows));
    for (const Row& row : rows)
        expected.push_back(store->Query(row.expected));

    const TempFolder folder;
    const MovieOutput output = RunMovieFile(folder.Write("movie.js", Movie(rows)),
                                            {{"ZV_DEPLOYMENT", store->DeploymentFile()}, {"TZ", "UTC"}});
    EXPECT_EQ(0, output.status);
    EXPECT_EQ("0 true", output.After("=init "));
    EXPECT_EQ("seen", output.After("FLASH TRACE == "));
    const std::string host = "localhost:" + std::to_string(store->HttpPort());
    for (size_t i = 0; i < rows.size(); ++i) {
        const std::string method = rows[i].method;
        std::string wanted = expected[i];
        if (method == "assignGiftCertificateToUser" || method == "getPrePaidCardBalance")
            wanted = store->Query(rows[i].expected);
        for (size_t at; (at = wanted.find("HOST")) != std::string::npos;)
            wanted.replace(at, 4, host);
        EXPECT_EQ("0 " + wanted, output.After("=" + method + " ")) << method;
    }
    for (const auto& row : kAtOnce) {
        EXPECT_EQ(std::string("0 ") + row.expected, output.After(std::string("=") + row.method + " ")) << row.method;
    }
    // With "init" and "quitFlash" that is all of them.
    EXPECT_EQ(59u, rows.size() + std::size(kAtOnce) + 2);
    if (testing::Test::HasFailure()) printf("%s", output.Text().c_str());
}

}  // namespace
