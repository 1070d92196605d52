// The calls against the simulator, whose checks hold the requests' form: those that no movie makes, and of the others
// what a movie that is answered well (tests/endtoend/MethodsTest.cpp) does not show.
#include <limits.h>

#include <regex>
#include <set>

#include "Store.h"
#include "TempFolder.h"

namespace {

class Calls : public Store {
protected:
    void SetUp() override
    {
        Store::SetUp();
        Begin(ACCESS_TYPE_STREAM);
    }

    void Begin(ZV_WS_AccessType accessType)
    {
        ZV_WS_release(&session);
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(Setup(accessType)));
        store->ClearLog();
    }
};

#define OK(call) ASSERT_EQ(ZV_WS_Status_ok, call)

// ---- Calls that no movie makes

TEST_F(Calls, OfTheCatalogue)
{
    Owned<ZV_WS_GenreLabelResponse> label;
    OK(ZV_WS_getGenreLabel(&session, 6, &label));
    EXPECT_STREQ("Music & Dance *", label.Label);
    EXPECT_STREQ("All of Music & Dance *", label.LabelMessage);

    const ZV_WS_Pagination page = Page(2, 7);
    const int genres[] = {3, 77};
    Owned<ZV_WS_TitlesResponseArray> pages;
    OK(ZV_WS_getTitlesByGenreIDs(&session, genres, 2, &page, PURCHASE_TYPE_RENT, &pages));
    ASSERT_EQ(2u, pages.size);
    EXPECT_EQ(3, pages.TitlesResponse[0].GenreID);
    EXPECT_EQ(7u, pages.TitlesResponse[0].Titles.size);
    EXPECT_EQ(8, pages.TitlesResponse[0].Titles.TitleListing[0].TitlePosition);
    EXPECT_EQ(1, pages.TitlesResponse[1].ResponseCode);
    Owned<ZV_WS_TitlesResponseArray> none;
    OK(ZV_WS_getTitlesByGenreIDs(&session, nullptr, 0, &page, PURCHASE_TYPE_RENT, &none));
    EXPECT_EQ(0u, none.size);

    Owned<ZV_WS_TitlesResponse> detail;
    OK(ZV_WS_searchForTitleDetail(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, "<H>", &detail));
    EXPECT_EQ(Number("SELECT COUNT(*) FROM title WHERE actors || directors LIKE '%<H>%'"), detail.TotalItems);
    Owned<ZV_WS_TranslateTivoExternalIDResponse> external;
    OK(ZV_WS_translateTivoExternalID(&session, "EXT31", &external));
    EXPECT_STREQ("EXT31", external.TivoExternalID);
    EXPECT_EQ(31, external.TitleID);
}

TEST_F(Calls, OfTheAccount)
{
    const int first = Number("SELECT MIN(id) FROM pass");
    const int passes[] = {first + 1, 999999, first};
    Owned<ZV_WS_TitleListingPurchasedArray> titles;
    OK(ZV_WS_getTitleListingPurchaseds(&session, passes, 3, &titles));
    ASSERT_EQ(2u, titles.size);
    EXPECT_EQ(WATCH_STATUS_RENTAGAIN, titles.TitleListingPurchased[0].Status);
    EXPECT_EQ(12, titles.TitleListingPurchased[1].TitleID);
    Owned<ZV_WS_BillingInfoAndPPCBalanceResponse> both;
    OK(ZV_WS_getBillingInfoAndPPCBalance(&session, &both));
    EXPECT_STREQ("Visa", both.BillingInfo.CCType);
    EXPECT_EQ(Number("SELECT prepaid FROM account WHERE id = 1"), both.PPCardBalance.Balance);
    EXPECT_EQ(ZV_WS_Status_general_error, Asking(ZV_WS_removeAllMyPurchases, "wrong")(&session));
    OK(Asking(ZV_WS_removeAllMyPurchases, StorefrontAccount::kPassword)(&session));
    EXPECT_EQ(0, Number("SELECT COUNT(*) FROM pass WHERE account = 1"));
    OK(Asking(ZV_WS_returnTimeout)(&session));
    OK(Asking(ZV_WS_returnError)(&session));
    EXPECT_EQ("timeout,error", store->Query("SELECT group_concat(kind) FROM report"));
}

// ---- Routing

TEST_F(Calls, TheAccessTypeChoosesTheService)
{
    const ZV_WS_Pagination page = Page(1, 5);
    const struct {
        ZV_WS_AccessType type;
        std::vector<std::string> asked;
    } rows[] = {
        {ACCESS_TYPE_DOWNLOAD,
         {"account getConfig", "account getMyVideos", "account checkForPurchasedTitle",
          "stream checkForPurchasedStream", "account getWishlistItems", "account GetCountryID"}},
        {ACCESS_TYPE_STREAM,
         {"stream getConfig", "stream getMyStreamingVideos", "stream checkForPurchasedStreamByTitleID",
          "stream checkForPurchasedStream", "stream getWishlistItems", "stream GetCountryID"}},
    };
    for (const auto& row : rows) {
        Begin(row.type);
        OK(Asking(ZV_WS_getConfig)(&session));
        Owned<ZV_WS_MyVideosResponse> videos;
        OK(ZV_WS_getMyVideos(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, WATCH_STATUS_UNDEFINED,
                             &videos));
        EXPECT_EQ(3u, videos.Titles.size);
        bool title = false, sku = false;
        OK(ZV_WS_checkForPurchasedTitle(&session, 12, &title));
        OK(ZV_WS_checkForPurchasedSku(&session, 240, &sku));
        EXPECT_TRUE(title && sku);
        OK(Asking(ZV_WS_getWishlistItems, SORT_ORDER_TITLENAME, &page, TITLE_TYPE_FILTER_ANY)(&session));
        int country = 0;
        OK(ZV_WS_getCountryID(&session, &country));
        std::vector<std::string> asked;
        for (const LoggedRequest& request : store->Log())
            asked.push_back(request.service + " " + request.operation);
        EXPECT_EQ(row.asked, asked);
    }
}

// ---- Refusals

// A refusal of calibration data is no failure of the call.
TEST_F(Calls, THXRefusalsLeaveTheStatus)
{
    Owned<ZV_WS_THXMediaDirectorResponse> refused, bonus;
    OK(ZV_WS_getTHXMediaDirector(&session, 999999, FILE_PROFILE_STANDARD, AUDIO_PROFILE_STEREO_STANDARD, &refused));
    EXPECT_EQ(2, refused.ResponseCode);
    OK(ZV_WS_getTHXMediaDirectorBonusAsset(&session, 999999, FILE_PROFILE_STANDARD, BONUS_ASSET_TYPE_TRAILER, &bonus));
    EXPECT_EQ(2, bonus.ResponseCode);
}

// What authorizeDevice is given, later calls send.
TEST_F(Calls, TheTokenIsTheSessions)
{
    const auto isValid = [this] {
        bool valid = false;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkAuthToken(&session, &valid));
        return valid;
    };
    EXPECT_FALSE(isValid());
    OK(Asking(ZV_WS_authorizeDevice, StorefrontAccount::kActivationPin)(&session));
    EXPECT_TRUE(isValid());
    OK(Asking(ZV_WS_deactivateDevice)(&session));
    EXPECT_FALSE(isValid());
    Owned<ZV_WS_CheckAdultVerificationPinResponse> verified;
    OK(ZV_WS_checkAdultVerificationPin(&session, 43, &verified));
    EXPECT_FALSE(verified.IsPinVerified);
}

TEST_F(Calls, RefusalCodesHaveTheirStatus)
{
    const AnyCall purchase = Asking(ZV_WS_doPurchaseSavedBilling, 120, "", false);
    const struct {
        const char* operation;
        AnyCall call;
        std::vector<int> statuses;  // of response codes 1, 2, ...
    } rows[] = {
        {"doPurchaseSavedbilling", purchase, {-1007, -1008, -1009, -1010, -1011, -1012, -1013, -1014,
                                              -1015, -1016, -1017, -1018, -1004, -1004, -1004, -1004,
                                              -1004, -1004, -1004, -1028, -1021, -1022, -1004}},
        {"authorizeDevice",
         Asking(ZV_WS_authorizeDevice, "1"),
         {ZV_WS_Status_invalid_pin, ZV_WS_Status_device_locked_out, -1004}},
        {"getBillingInfo", Asking(ZV_WS_getBillingInfo), {-1008, -1017, -1011, -1012, -1004}},
        {"assignGiftCertificateToUser", Asking(ZV_WS_assignGiftCertificateToUser, "x"), {-1019, -1020, -1004}},
        {"calcOrderTax", Asking(ZV_WS_calcOrderTax, 1), {-1023, -1024, -1025, -1004, -1004, -1004, -1004,
                                                         -1004, -1004, -1004, -1026, -1027, -1004, -1004,
                                                         -1004, -1004, -1004, -1004, -1004, -1028, -1004}},
    };
    for (const auto& row : rows) {
        for (size_t i = 0; i < row.statuses.size(); ++i) {
            Fault(std::string(row.operation) + "=code:" + std::to_string(i + 1));
            EXPECT_EQ(row.statuses[i], row.call(&session)) << row.operation << " code " << i + 1;
        }
    }
    const int passes = Number("SELECT COUNT(*) FROM pass");
    Fault("doPurchaseSavedbilling=code:6");
    purchase(&session);
    EXPECT_EQ(passes, Number("SELECT COUNT(*) FROM pass"));
}

TEST_F(Calls, WrongArgumentsSendNothing)
{
    constexpr unsigned int kTooMany = 0x80000000u;  // the contract's numbers end before
    const ZV_WS_Pagination page = Page(1, 1), farPage = Page(kTooMany, 1), fullPage = Page(1, kTooMany);
    const int ids[] = {1, 2};
    const AnyCall calls[] = {
        Asking(ZV_WS_getTitles, 1, &farPage, 2),
        Asking(ZV_WS_getWishlistItems, SORT_ORDER_RATING, &fullPage, TITLE_TYPE_FILTER_ANY),
        Asking(ZV_WS_getTitlesByGenreIDs, ids, kTooMany, &page, PURCHASE_TYPE_ANY),
        Asking(ZV_WS_getTitleListingPurchaseds, ids, kTooMany),
        Asking(ZV_WS_checkTitlesInWishlist, ids, kTooMany, TITLE_TYPE_FILTER_ANY),
        Asking(ZV_WS_getTitles, 1, nullptr, 2),
        Asking(ZV_WS_getTitlesByGenreIDs, nullptr, 2, &page, PURCHASE_TYPE_ANY),
        Asking(ZV_WS_removeAllMyPurchases, ""),
        Asking(ZV_WS_authorizeDevice, nullptr),
        Asking(ZV_WS_checkTitlesInWishlist, nullptr, 1, TITLE_TYPE_FILTER_ANY),
        Asking(ZV_WS_manageStreamingInstanceStatus, "", STREAM_STATUS_PLAY, 0),
        // Numbers that the contract has no text for.
        Asking(ZV_WS_getTitles, 1, &page, 3),
        Asking(ZV_WS_getTitles, 1, &page, -1),
        Asking(ZV_WS_getMyVideos, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, 4),
        Asking(ZV_WS_getMyVideos, &page, PURCHASE_TYPE_ANY, static_cast<ZV_WS_TitleTypeFilter>(3), 0),
        Asking(ZV_WS_getWishlistItems, static_cast<ZV_WS_SortOrder>(4), &page, TITLE_TYPE_FILTER_ANY),
        Asking(ZV_WS_setAudioDefaultProperty, static_cast<ZV_WS_AudioProfile>(6)),
        Asking(ZV_WS_getStreamingAssetLocation, 1, static_cast<ZV_WS_FileProfile>(11)),
        Asking(ZV_WS_manageStreamingInstanceStatus, "1", static_cast<ZV_WS_StreamStatus>(5), 0),
        Asking(ZV_WS_getTHXMediaDirectorBonusAsset, 1, FILE_PROFILE_STANDARD, static_cast<ZV_WS_BonusAssetType>(1)),
    };
    for (size_t i = 0; i < std::size(calls); ++i)
        EXPECT_EQ(ZV_WS_Status_invalid_param, calls[i](&session)) << i;
    EXPECT_TRUE(store->Log().empty());
}

TEST_F(Calls, TextsThatXmlCannotCarryAreNotSent)
{
    const ZV_WS_Pagination page = Page(1, 1);
    const struct {
        const char* text;
        bool isText;
    } rows[] = {
        {"a\tb\nc\rd", true},
        {"\x7f", true},
        {"\xC2\x80 \xE0\xA0\x80 \xED\x9F\xBF \xEE\x80\x80 \xEF\xBF\xBD \xF0\x90\x80\x80 \xF4\x8F\xBF\xBF", true},
        {"\x01", false},
        {"a\x1f", false},
        {"\x80", false},  // no first byte
        {"\xC3", false},  // cut short
        {"\xC3(", false},
        {"\xE2\x82", false},
        {"\xC0\xAF", false},  // longer than it has to be
        {"\xE0\x9F\xBF", false},
        {"\xF0\x8F\xBF\xBF", false},
        {"\xED\xA0\x80", false},  // half a pair
        {"\xEF\xBF\xBE", false},  // U+FFFE
        {"\xEF\xBF\xBF", false},
        {"\xF4\x90\x80\x80", false},  // beyond the last
        {"\xF8\x88\x80\x80\x80", false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(testing::PrintToString(row.text));
        store->ClearLog();
        const AnyCall search = Asking(ZV_WS_searchForTitle, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, row.text);
        EXPECT_EQ(row.isText ? ZV_WS_Status_ok : ZV_WS_Status_invalid_param, search(&session));
        EXPECT_EQ(row.isText ? 1u : 0u, store->Log().size());
        store->ClearLog();
        ZV_WS_SetupParams setup = Setup(ACCESS_TYPE_STREAM);
        setup.DestinationUniqueID = row.text;
        ZV_WS_Session other;
        EXPECT_EQ(row.isText, ZV_WS_initialize(&other, &setup) != ZV_WS_Status_invalid_param);
        ZV_WS_release(&other);
    }
    for (const AnyCall& call : {
             Asking(ZV_WS_authorizeDevice, "\x01"),
             Asking(ZV_WS_translateTivoExternalID, "\x01"),
             Asking(ZV_WS_assignGiftCertificateToUser, "\x01"),
             Asking(ZV_WS_doPurchaseSavedBilling, 1, "\x01", false),
             Asking(ZV_WS_removeAllMyPurchases, "\x01"),
             Asking(ZV_WS_manageStreamingInstanceStatus, "\x01", STREAM_STATUS_PLAY, 0),
         }) {
        store->ClearLog();
        EXPECT_EQ(ZV_WS_Status_invalid_param, call(&session));
        EXPECT_TRUE(store->Log().empty());
    }
}

// ---- Clock, bandwidth, address

TEST_F(Calls, ServerTime)
{
    const struct {
        const char* fault;
        ZV_WS_Status status;
        time_t time;
    } rows[] = {
        {"clock=body:3/7/2011 12:30:00 PM", ZV_WS_Status_ok,
         1299544200},  // 12 PM becomes the next day's first half hour
        {"clock=body:3/7/2011 1:30:00 PM", ZV_WS_Status_ok, 1299504600},
        {"clock=body:3/7/2011 12:05:00 AM", ZV_WS_Status_ok, 1299499500},
        {"clock=body:3/7/2011 1:30:00 pm", ZV_WS_Status_ok, 1299461400},
        {"clock=body:3/7/2011 1:30:00", ZV_WS_Status_general_error, -1},
        {"clock=body:99999999999/1/1 1:1:1 AM", ZV_WS_Status_general_error, -1},
        {"clock=split:200", ZV_WS_Status_general_error, -1},
    };
    for (const auto& row : rows) {
        Fault(row.fault);
        time_t now = 0;
        EXPECT_EQ(row.status, ZV_WS_getServerTime(&now)) << row.fault;
        EXPECT_EQ(row.time, now) << row.fault;
    }
    const auto headers = store->Log().back().headers;
    EXPECT_EQ("user-agent", headers[0].first);
    EXPECT_EQ("host", headers[1].first);
    time_t now = 0;
    OK(ZV_WS_getServerTime(&now));
    EXPECT_NEAR(static_cast<double>(time(nullptr)), static_cast<double>(now), 5);
}

TEST_F(Calls, Bandwidth)
{
    unsigned int rate = 1;
    OK(ZV_WS_checkBandwidth(&session, &rate));
    EXPECT_GT(rate, 0u);
    const auto headers = store->Log().back().headers;
    EXPECT_EQ("host", headers[0].first);
    OK(ZV_WS_checkBandwidth(&session, &rate));
    EXPECT_EQ((std::vector<std::string>{"getConfig", "bandwidth", "bandwidth"}), Asked());
    // The connection that SOAP kept is whole afterwards.
    OK(Asking(ZV_WS_getConfig)(&session));
}

TEST_F(Calls, BandwidthAddress)
{
    const struct {
        const char* config;
        ZV_WS_Status status;
    } rows[] = {
        {"('BandwithCheckURL', ''), ('BandwidthCheckURL', 'http://localhost/x')",
         ZV_WS_Status_failed_to_get_bandwidth_check_url},
        {"('bandwithcheckurl', 'http://localhost')", ZV_WS_Status_invalid_bandwidth_check_url},
        {"('BandwithCheckURL', 'localhost/x')", ZV_WS_Status_invalid_bandwidth_check_url},
        {"('BandwithCheckURL', 'http:///x')", ZV_WS_Status_invalid_bandwidth_check_url},
        {"('BandwithCheckURL', 'http://localhost:1/x')", ZV_WS_Status_connection_error},
    };
    unsigned int rate = 1;
    for (const auto& row : rows) {
        Begin(ACCESS_TYPE_STREAM);
        store->Query("DELETE FROM config");
        store->Query(std::string("INSERT INTO config VALUES ") + row.config);
        EXPECT_EQ(row.status, ZV_WS_checkBandwidth(&session, &rate)) << row.config;
        EXPECT_EQ(0u, rate);
    }
    Begin(ACCESS_TYPE_STREAM);
    Fault("getConfig=http:503");
    EXPECT_EQ(-4503, ZV_WS_checkBandwidth(&session, &rate));
}

TEST_F(Calls, Files)
{
    const std::string data = store->DataFolder(), file = data + "/a/b/c.txt";
    bool isFolder = false, before = true, after = false;
    OK(ZV_WS_createFolder((data + "/a/b").c_str()));
    OK(ZV_WS_folderExist((data + "/a/b").c_str(), &isFolder));
    OK(ZV_WS_fileExist(file.c_str(), &before));
    OK(ZV_WS_copyFile((data + "/account.txt").c_str(), file.c_str()));
    OK(ZV_WS_fileExist(file.c_str(), &after));
    EXPECT_TRUE(isFolder && !before && after);
    Owned<ZV_WS_String> folder;
    OK(ZV_WS_getFolderName(file.c_str(), &folder));
    EXPECT_EQ(data + "/a/b/", folder.data);
    OK(ZV_WS_removeFile(file.c_str()));
    OK(ZV_WS_removeFile(file.c_str()));
    EXPECT_EQ(ZV_WS_Status_file_operation_error, ZV_WS_removeFile((data + "/a").c_str()));
    EXPECT_EQ(ZV_WS_Status_file_operation_error, ZV_WS_createFolder((data + "/account.txt/x").c_str()));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_copyFile(nullptr, "x"));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_fileExist(nullptr, &after));
}

TEST_F(Calls, EveryStatusHasATextOfItsOwn)
{
    const std::string header = ContentOf(ZV_SOURCES "Public/ZV_WS_Status.h");
    const std::regex row("ZV_WS_Status_\\w+ = (-?\\d+)");
    std::set<std::string> texts = {ZV_WS_statusText(static_cast<ZV_WS_Status>(1))};
    EXPECT_EQ(1u, texts.count("unknown status"));
    int named = 0;
    for (std::sregex_iterator at(header.begin(), header.end(), row), end; at != end; ++at, ++named) {
        const std::string text = ZV_WS_statusText(static_cast<ZV_WS_Status>(std::stoi(at->str(1))));
        EXPECT_TRUE(texts.insert(text).second && !text.empty()) << at->str() << ": " << text;
    }
    EXPECT_LT(60, named);
    const std::pair<int, const char*> others[] = {
        {-4503, "HTTP failure"},   {-5030, "TLS failure"},    {-6012, "SOAP failure"},
        {-4999, "HTTP failure"},   {-6999, "SOAP failure"},   {-2999, "unknown status"},
        {-7000, "unknown status"}, {-1002, "unknown status"}, {INT_MIN, "unknown status"}};
    for (const auto& [status, text] : others)
        EXPECT_STREQ(text, ZV_WS_statusText(static_cast<ZV_WS_Status>(status))) << status;
}

}  // namespace
