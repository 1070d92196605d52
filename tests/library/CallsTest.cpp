// Every call against the simulator, whose checks hold the requests' form, and whose database holds the answers.
#include <functional>

#include "Store.h"

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

    // The service that the last request went to, and its operation.
    std::string Last() const { return store->Log().back().service + " " + store->Log().back().operation; }

    int Pass() const { return Number("SELECT MIN(id) FROM pass"); }
    std::string Name(int title) const
    {
        return store->Query("SELECT name FROM title WHERE id = " + std::to_string(title));
    }
};

#define OK(call) ASSERT_EQ(ZV_WS_Status_ok, call)

// ---- Catalogue

TEST_F(Calls, Navigation)
{
    Owned<ZV_WS_GenreArray> genres;
    OK(ZV_WS_getNavigation(&session, &genres));
    const auto rows = store->Rows("SELECT id, name, visible, parent FROM genre ORDER BY id");
    ASSERT_EQ(rows.size(), genres.size);
    for (unsigned int i = 0; i < genres.size; ++i) {
        const ZV_WS_Genre& genre = genres.Genre[i];
        const std::vector<std::string> row = {std::to_string(genre.ID), genre.Name, genre.Visible ? "1" : "0",
                                              std::to_string(genre.ParentID)};
        EXPECT_EQ(rows[i], row);
    }
    Owned<ZV_WS_GenreLabelResponse> label;
    OK(ZV_WS_getGenreLabel(&session, 6, &label));
    EXPECT_STREQ("Music & Dance *", label.Label);
    EXPECT_STREQ("All of Music & Dance *", label.LabelMessage);
}

TEST_F(Calls, TitlePages)
{
    const int total = Number("SELECT COUNT(*) FROM title_genre WHERE genre = 1");
    const ZV_WS_Pagination page = Page(2, 7);
    Owned<ZV_WS_TitlesResponse> titles;
    OK(ZV_WS_getTitles(&session, 1, &page, PURCHASE_TYPE_ANY, &titles));
    EXPECT_EQ(1, titles.GenreID);
    EXPECT_EQ(2, titles.CurrentPageNumber);
    EXPECT_EQ(7, titles.ItemsPerPage);
    EXPECT_EQ(total, titles.TotalItems);
    EXPECT_EQ((total + 6) / 7, titles.TotalPages);
    const auto rows = store->Rows("SELECT title FROM title_genre WHERE genre = 1 ORDER BY title LIMIT 7 OFFSET 7");
    ASSERT_EQ(7u, titles.Titles.size);
    for (unsigned int i = 0; i < 7; ++i) {
        const ZV_WS_TitleListing& title = titles.Titles.TitleListing[i];
        EXPECT_EQ(rows[i][0], std::to_string(title.TitleID));
        EXPECT_EQ(Name(title.TitleID), title.TitleName);
        EXPECT_EQ(static_cast<int>(8 + i), title.TitlePosition);
    }
    Owned<ZV_WS_TitlesResponse> nothing;
    EXPECT_EQ(ZV_WS_Status_general_error, ZV_WS_getTitles(&session, 77, &page, PURCHASE_TYPE_ANY, &nothing));
    EXPECT_EQ(1, nothing.ResponseCode);

    const int genres[] = {3, 77};
    Owned<ZV_WS_TitlesResponseArray> pages;
    OK(ZV_WS_getTitlesByGenreIDs(&session, genres, 2, &page, PURCHASE_TYPE_RENT, &pages));
    ASSERT_EQ(2u, pages.size);
    EXPECT_EQ(3, pages.TitlesResponse[0].GenreID);
    EXPECT_EQ(7u, pages.TitlesResponse[0].Titles.size);
    EXPECT_EQ(1, pages.TitlesResponse[1].ResponseCode);
    Owned<ZV_WS_TitlesResponseArray> none;
    OK(ZV_WS_getTitlesByGenreIDs(&session, nullptr, 0, &page, PURCHASE_TYPE_RENT, &none));
    EXPECT_EQ(0u, none.size);
}

TEST_F(Calls, TitleDetails)
{
    for (const int id : {12, 11}) {  // 11 lacks all that may be absent
        Owned<ZV_WS_TitleListingResponse> title;
        OK(ZV_WS_getTitleListing(&session, id, &title));
        const auto row = store->Rows(
            "SELECT name, rating, synopsis, stars, directors, copyright, runtime, prefix FROM title WHERE id = " +
            std::to_string(id))[0];
        EXPECT_EQ(row[0], title.TitleName);
        const auto text = [](const char* given) { return std::string(given ? given : ""); };
        EXPECT_EQ(row[1], text(title.MPAARating));
        EXPECT_EQ(row[2], text(title.Synopsis));
        EXPECT_EQ(row[3], std::to_string(title.UserRating));
        EXPECT_EQ(row[4], text(title.Directors));
        EXPECT_EQ(row[5], text(title.Copyright));
        EXPECT_EQ(row[6], text(title.RunTime));
        EXPECT_EQ(row[7], text(title.BoxArtPrefix));
        EXPECT_EQ(id == 11, title.Synopsis == nullptr);
        const auto products = store->Rows(
            "SELECT sku, type, price, expires FROM product WHERE title = " + std::to_string(id) + " ORDER BY sku");
        ASSERT_EQ(products.size(), title.AvailableProducts.size);
        for (unsigned int i = 0; i < products.size(); ++i) {
            const ZV_WS_ProductListing& product = title.AvailableProducts.ProductListing[i];
            const std::vector<std::string> found = {std::to_string(product.SkuID), std::to_string(product.PurchaseType),
                                                    product.Price, product.ExpireDate};
            EXPECT_EQ(products[i], found);
            EXPECT_EQ(2u, product.AvailableAssets.size);
            ASSERT_EQ(1u, product.AvailableAudioProfiles.size);
            EXPECT_EQ(AUDIO_PROFILE_DOLBY_STEREO_AC3, product.AvailableAudioProfiles.AudioFile[0].AudioAssetProfile);
        }
    }
}

TEST_F(Calls, Series)
{
    const int season = Number("SELECT MIN(id) FROM title WHERE is_tv = 1");
    const auto rows = store->Rows("SELECT id, name, episode FROM title WHERE season = " + std::to_string(season) +
                                  " ORDER BY episode");
    Owned<ZV_WS_TvEpisodeListResponse> list;
    OK(ZV_WS_getTvEpisodeListByTitleID(&session, season, &list));
    ASSERT_EQ(rows.size(), list.Episodes.size);
    EXPECT_EQ(rows[2][1], list.Episodes.TvEpisode[2].EpisodeName);
    EXPECT_EQ(3, list.Episodes.TvEpisode[2].EpisodeNumber);
    Owned<ZV_WS_TitleListingResponseArray> all;
    OK(ZV_WS_getAllTvEpisodeListings(&session, season, &all));
    ASSERT_EQ(rows.size(), all.size);
    EXPECT_EQ(rows[1][0], std::to_string(all.TitleListingResponse[1].TitleID));
    Owned<ZV_WS_TitleListingResponse> one;
    OK(ZV_WS_getTvEpisodeListing(&session, atoi(rows[0][0].c_str()), &one));
    EXPECT_EQ(rows[0][1], one.TitleName);
    Owned<ZV_WS_TitleListingResponse> none;
    EXPECT_EQ(ZV_WS_Status_general_error, ZV_WS_getTvEpisodeListing(&session, season, &none));
}

TEST_F(Calls, SearchAndTranslation)
{
    const ZV_WS_Pagination page = Page(1, 100);
    const struct {
        ZV_WS_TitleTypeFilter filter;
        const char* where;
    } rows[] = {{TITLE_TYPE_FILTER_ANY, "1"},
                {TITLE_TYPE_FILTER_TV, "is_tv = 1"},
                {TITLE_TYPE_FILTER_MOVIE, "is_tv = 0 AND season = 0"}};
    for (const auto& row : rows) {
        Owned<ZV_WS_TitlesResponse> titles;
        OK(ZV_WS_searchForTitle(&session, &page, PURCHASE_TYPE_ANY, row.filter, "zo\u00eb", &titles));
        EXPECT_EQ(Number(std::string("SELECT COUNT(*) FROM title WHERE name LIKE '%zo\u00eb%' AND ") + row.where),
                  titles.TotalItems);
    }
    Owned<ZV_WS_TitlesResponse> detail;
    OK(ZV_WS_searchForTitleDetail(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, "<H>", &detail));
    EXPECT_EQ(Number("SELECT COUNT(*) FROM title WHERE actors || directors LIKE '%<H>%'"), detail.TotalItems);
    Owned<ZV_WS_TranslateSkuIDResponse> sku;
    OK(ZV_WS_translateSkuID(&session, Number("SELECT MIN(sku) FROM product WHERE title = 30"), &sku));
    EXPECT_EQ(30, sku.TitleID);
    Owned<ZV_WS_TranslateTivoExternalIDResponse> external;
    OK(ZV_WS_translateTivoExternalID(&session, "EXT31", &external));
    EXPECT_STREQ("EXT31", external.TivoExternalID);
    EXPECT_EQ(31, external.TitleID);
    Owned<ZV_WS_RecommendedTitlesResponse> recommended;
    OK(ZV_WS_getRecommendedTitles(&session, 12, &recommended));
    EXPECT_EQ(5u, recommended.Titles.size);
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
          "stream checkForPurchasedStream"}},
        {ACCESS_TYPE_STREAM,
         {"stream getConfig", "stream getMyStreamingVideos", "stream checkForPurchasedStreamByTitleID",
          "stream checkForPurchasedStream"}},
    };
    for (const auto& row : rows) {
        Begin(row.type);
        Owned<ZV_WS_ConfigResponse> config;
        OK(ZV_WS_getConfig(&session, &config));
        Owned<ZV_WS_MyVideosResponse> videos;
        OK(ZV_WS_getMyVideos(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, WATCH_STATUS_UNDEFINED,
                             &videos));
        EXPECT_EQ(3u, videos.Titles.size);
        bool flag = false;
        OK(ZV_WS_checkForPurchasedTitle(&session, 12, &flag));
        EXPECT_TRUE(flag);
        OK(ZV_WS_checkForPurchasedSku(&session, 240, &flag));
        EXPECT_TRUE(flag);
        std::vector<std::string> asked;
        for (const LoggedRequest& request : store->Log())
            asked.push_back(request.service + " " + request.operation);
        EXPECT_EQ(row.asked, asked);
    }
}

// ---- The account

TEST_F(Calls, MyVideos)
{
    const ZV_WS_Pagination page = Page(1, 5);
    Owned<ZV_WS_MyVideosResponse> videos;
    OK(ZV_WS_getMyVideos(&session, &page, PURCHASE_TYPE_RENT, TITLE_TYPE_FILTER_MOVIE, WATCH_STATUS_WATCHNOW, &videos));
    ASSERT_EQ(1u, videos.Titles.size);
    const ZV_WS_TitleListingPurchased& video = videos.Titles.TitleListingPurchased[0];
    EXPECT_EQ(12, video.TitleID);
    EXPECT_EQ(Pass(), video.PassID);
    EXPECT_EQ(STREAM_STATUS_PAUSED, video.PlayStatus);
    EXPECT_EQ(1860, video.StartTimeSeconds);
    EXPECT_STREQ("48 hours", video.RentalPeriod);
    const int passes[] = {Pass() + 1, 999999, Pass()};
    Owned<ZV_WS_TitleListingPurchasedArray> titles;
    OK(ZV_WS_getTitleListingPurchaseds(&session, passes, 3, &titles));
    ASSERT_EQ(2u, titles.size);
    EXPECT_EQ(WATCH_STATUS_RENTAGAIN, titles.TitleListingPurchased[0].Status);
    EXPECT_EQ(12, titles.TitleListingPurchased[1].TitleID);
    Owned<ZV_WS_RentalExpirationResponse> expiration;
    OK(ZV_WS_checkRentalExpiration(&session, Pass(), &expiration));
    EXPECT_TRUE(expiration.ShouldDisplay);
    EXPECT_EQ(30, expiration.HoursRemaining);
    Owned<ZV_WS_StandardResponse> answer;
    EXPECT_EQ(ZV_WS_Status_general_error, ZV_WS_removeAllMyPurchases(&session, "wrong", &answer));
    Owned<ZV_WS_StandardResponse> removed;
    OK(ZV_WS_removeAllMyPurchases(&session, StorefrontAccount::kPassword, &removed));
    EXPECT_EQ(0, Number("SELECT COUNT(*) FROM pass"));
}

TEST_F(Calls, Wishlist)
{
    const auto wished = [&](int title) {
        bool flag = false;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitleInWishlist(&session, title, &flag));
        return flag;
    };
    const ZV_WS_Pagination page = Page(1, 2);
    Owned<ZV_WS_StandardResponse> answer[4];
    EXPECT_FALSE(wished(50));
    OK(ZV_WS_addItemToWishlist(&session, 50, &answer[0]));
    EXPECT_TRUE(wished(50));
    Owned<ZV_WS_WishlistItemsResponse> items;
    OK(ZV_WS_getWishlistItems(&session, SORT_ORDER_TITLENAME, &page, TITLE_TYPE_FILTER_ANY, &items));
    EXPECT_EQ(SORT_ORDER_TITLENAME, items.SortOrder);
    EXPECT_EQ(4, items.TotalItems);
    EXPECT_EQ(2, items.TotalPages);
    EXPECT_EQ(store->Query("SELECT MIN(name) FROM wish JOIN title ON id = title"),
              items.Titles.TitleListingPurchased[0].TitleName);
    const int asked[] = {50, 51, 7, 1001};
    Owned<ZV_WS_TitlesInWishlist> flags;
    OK(ZV_WS_checkTitlesInWishlist(&session, asked, 4, TITLE_TYPE_FILTER_ANY, &flags));
    ASSERT_EQ(4u, flags.size);
    EXPECT_EQ((std::vector<bool>{true, false, true, true}),
              std::vector<bool>(flags.IsAvailInUserWishlist, flags.IsAvailInUserWishlist + 4));
    OK(ZV_WS_removeItemFromWishlist(&session, 50, &answer[1]));
    EXPECT_FALSE(wished(50));
    EXPECT_EQ(ZV_WS_Status_general_error, ZV_WS_removeItemFromWishlist(&session, 50, &answer[2]));
    OK(ZV_WS_removeAllItemsFromWishlist(&session, &answer[3]));
    EXPECT_EQ(0, Number("SELECT COUNT(*) FROM wish"));
}

TEST_F(Calls, Money)
{
    Owned<ZV_WS_GiftCertificateResponse> gift;
    OK(ZV_WS_assignGiftCertificateToUser(&session, "GIFT2", &gift));
    EXPECT_EQ(4500, gift.Balance);
    Owned<ZV_WS_PPCardBalanceResponse> balance;
    OK(ZV_WS_getPrePaidCardBalance(&session, &balance));
    EXPECT_EQ(4500, balance.Balance);
    const int sku = Number("SELECT MIN(sku) FROM product WHERE title = 40");
    Owned<ZV_WS_CalcOrderTaxResponse> tax;
    OK(ZV_WS_calcOrderTax(&session, sku, &tax));
    EXPECT_EQ(store->Query("SELECT price FROM product WHERE sku = " + std::to_string(sku)), tax.TotalPrice);
    Owned<ZV_WS_PurchaseResponse> purchase;
    OK(ZV_WS_doPurchaseSavedBilling(&session, sku, "10.0.0.1", true, &purchase));
    EXPECT_EQ(purchase.PassID + 5000, purchase.TransactionID);
    EXPECT_LT(Number("SELECT prepaid FROM account"), 4500);
    Owned<ZV_WS_BillingInfoResponse> billing;
    OK(ZV_WS_getBillingInfo(&session, &billing));
    EXPECT_STREQ("4242", billing.CCLastFour);
    Owned<ZV_WS_BillingInfoAndPPCBalanceResponse> both;
    OK(ZV_WS_getBillingInfoAndPPCBalance(&session, &both));
    EXPECT_STREQ("Visa", both.BillingInfo.CCType);
    EXPECT_EQ(Number("SELECT prepaid FROM account"), both.PPCardBalance.Balance);
    Owned<ZV_WS_EmailAddressResponse> email;
    OK(ZV_WS_getEmailAddress(&session, &email));
    EXPECT_STREQ("ana@customer.example", email.EmailAddress);
}

TEST_F(Calls, ParentalControl)
{
    Owned<ZV_WS_CheckAdultVerificationEnabledResponse> enabled;
    OK(ZV_WS_checkAdultVerificationEnabled(&session, &enabled));
    EXPECT_TRUE(enabled.IsAdultVerificationEnabled);
    for (const int pin : {42, 43}) {  // sent as "0042"
        Owned<ZV_WS_CheckAdultVerificationPinResponse> verified;
        OK(ZV_WS_checkAdultVerificationPin(&session, pin, &verified));
        EXPECT_EQ(pin == 42, verified.IsPinVerified);
    }
}

TEST_F(Calls, Device)
{
    bool valid = true;
    OK(ZV_WS_checkAuthToken(&session, &valid));
    EXPECT_FALSE(valid);
    Owned<ZV_WS_AuthorizeDeviceResponse> answers[3];
    EXPECT_EQ(ZV_WS_Status_invalid_pin, ZV_WS_authorizeDevice(&session, "111111", &answers[0]));
    EXPECT_EQ(ZV_WS_Status_device_locked_out, ZV_WS_authorizeDevice(&session, "000000", &answers[1]));
    OK(ZV_WS_authorizeDevice(&session, StorefrontAccount::kActivationPin, &answers[2]));
    EXPECT_EQ(store->Query("SELECT token FROM account"), answers[2].AuthToken);
    OK(ZV_WS_checkAuthToken(&session, &valid));
    EXPECT_TRUE(valid);
    Owned<ZV_WS_StandardResponse> answer;
    OK(ZV_WS_deactivateDevice(&session, &answer));
    OK(ZV_WS_checkAuthToken(&session, &valid));
    EXPECT_FALSE(valid);
    Owned<ZV_WS_SettingsPageInfoResponse> info;
    OK(ZV_WS_getSettingsPageInfo(&session, &info));
    EXPECT_STREQ("Living room", info.DeviceName);
    int country = 0;
    OK(ZV_WS_getCountryID(&session, &country));
    EXPECT_EQ(1, country);
    Owned<ZV_WS_StandardResponse> set;
    OK(ZV_WS_setAudioDefaultProperty(&session, AUDIO_PROFILE_DTS_EXPRESS_51, &set));
    ZV_WS_AudioProfile audio = AUDIO_PROFILE_STEREO_STANDARD;
    OK(ZV_WS_getAudioDefaultProperty(&session, &audio));
    EXPECT_EQ(AUDIO_PROFILE_DTS_EXPRESS_51, audio);
    Owned<ZV_WS_FileType> type;
    OK(ZV_WS_getFileType(&session, &type));
    EXPECT_EQ(DRM_PROVIDER_WIDEVINE, type.DRMProvider);
    EXPECT_EQ(VIDEO_FORMAT_H264, type.VideoFormat);
}

// ---- Playback

TEST_F(Calls, Playback)
{
    Owned<ZV_WS_StreamingAssetLocationResponse> fresh, resumed, trailer, none;
    OK(ZV_WS_getStreamingAssetLocation(&session, Pass(), FILE_PROFILE_HIGHDEFINITION, &fresh));
    EXPECT_EQ(0, fresh.StartTimeSeconds);
    Owned<ZV_WS_StandardResponse> answers[2];
    OK(ZV_WS_manageStreamingInstanceStatus(&session, fresh.StreamID, STREAM_STATUS_STOPPED, 95, &answers[0]));
    OK(ZV_WS_loadLastStreamingAssetLocation(&session, Pass(), FILE_PROFILE_HIGHDEFINITION, &resumed));
    EXPECT_EQ(95, resumed.StartTimeSeconds);
    EXPECT_EQ(STREAM_STATUS_STOPPED, resumed.Status);
    EXPECT_EQ(60, resumed.HeartbeatPollInSeconds);
    OK(ZV_WS_getStreamingBonusAssetLocation(&session, Number("SELECT MIN(id) FROM bonus"), &trailer));
    EXPECT_EQ(ZV_WS_Status_general_error,
              ZV_WS_getStreamingAssetLocation(&session, 999999, FILE_PROFILE_STANDARD, &none));
    EXPECT_EQ(2, none.ResponseCode);
    store->ClearLog();
    EXPECT_EQ(ZV_WS_Status_invalid_param,
              ZV_WS_manageStreamingInstanceStatus(&session, "", STREAM_STATUS_PLAY, 0, &answers[1]));
    EXPECT_TRUE(store->Log().empty());
}

// A refusal of calibration data is no failure of the call.
TEST_F(Calls, THXRefusalsLeaveTheStatus)
{
    Owned<ZV_WS_THXMediaDirectorResponse> good, refused, bonus;
    OK(ZV_WS_getTHXMediaDirector(&session, Pass(), FILE_PROFILE_STANDARD, AUDIO_PROFILE_DOLBY_DIGITAL_PLUS_51, &good));
    EXPECT_STREQ("THX-LONG-Dolby_Digital_Plus_51", good.LongFormat);
    OK(ZV_WS_getTHXMediaDirector(&session, 999999, FILE_PROFILE_STANDARD, AUDIO_PROFILE_STEREO_STANDARD, &refused));
    EXPECT_EQ(2, refused.ResponseCode);
    OK(ZV_WS_getTHXMediaDirectorBonusAsset(&session, 999999, FILE_PROFILE_STANDARD, BONUS_ASSET_TYPE_TRAILER, &bonus));
    EXPECT_EQ(2, bonus.ResponseCode);
}

TEST_F(Calls, Reports)
{
    Owned<ZV_WS_StandardResponse> timeout, error;
    OK(ZV_WS_returnTimeout(&session, &timeout));
    OK(ZV_WS_returnError(&session, &error));
    EXPECT_EQ("timeout,error", store->Query("SELECT group_concat(kind) FROM report"));
}

// ---- Refusals

TEST_F(Calls, RefusalCodesHaveTheirStatus)
{
    const auto purchase = [this] {
        Owned<ZV_WS_PurchaseResponse> record;
        return ZV_WS_doPurchaseSavedBilling(&session, 120, "", false, &record);
    };
    const auto billing = [this] {
        Owned<ZV_WS_BillingInfoResponse> record;
        return ZV_WS_getBillingInfo(&session, &record);
    };
    const auto gift = [this] {
        Owned<ZV_WS_GiftCertificateResponse> record;
        return ZV_WS_assignGiftCertificateToUser(&session, "x", &record);
    };
    const auto tax = [this] {
        Owned<ZV_WS_CalcOrderTaxResponse> record;
        return ZV_WS_calcOrderTax(&session, 1, &record);
    };
    const struct {
        const char* operation;
        std::function<ZV_WS_Status()> call;
        std::vector<int> statuses;  // of response codes 1, 2, ...
    } rows[] = {
        {"doPurchaseSavedbilling", purchase, {-1007, -1008, -1009, -1010, -1011, -1012, -1013, -1014,
                                              -1015, -1016, -1017, -1018, -1004, -1004, -1004, -1004,
                                              -1004, -1004, -1004, -1028, -1021, -1022, -1004}},
        {"getBillingInfo", billing, {-1008, -1017, -1011, -1012, -1004}},
        {"assignGiftCertificateToUser", gift, {-1019, -1020, -1004}},
        {"calcOrderTax", tax, {-1023, -1024, -1025, -1004, -1004, -1004, -1004, -1004, -1004, -1004, -1026,
                               -1027, -1004, -1004, -1004, -1004, -1004, -1004, -1004, -1028, -1004}},
    };
    for (const auto& row : rows) {
        for (size_t i = 0; i < row.statuses.size(); ++i) {
            Fault(std::string(row.operation) + "=code:" + std::to_string(i + 1));
            EXPECT_EQ(row.statuses[i], row.call()) << row.operation << " code " << i + 1;
        }
    }
    const int passes = Number("SELECT COUNT(*) FROM pass");
    Fault("doPurchaseSavedbilling=code:6");
    purchase();
    EXPECT_EQ(passes, Number("SELECT COUNT(*) FROM pass"));
}

TEST_F(Calls, WrongArgumentsSendNothing)
{
    const ZV_WS_Pagination page = Page(1, 1);
    Owned<ZV_WS_TitlesResponse> titles;
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_getTitles(&session, 1, nullptr, 2, &titles));
    Owned<ZV_WS_TitlesResponseArray> pages;
    EXPECT_EQ(ZV_WS_Status_invalid_param,
              ZV_WS_getTitlesByGenreIDs(&session, nullptr, 2, &page, PURCHASE_TYPE_ANY, &pages));
    Owned<ZV_WS_StandardResponse> answer;
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_removeAllMyPurchases(&session, "", &answer));
    Owned<ZV_WS_AuthorizeDeviceResponse> device;
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_authorizeDevice(&session, nullptr, &device));
    Owned<ZV_WS_TitlesInWishlist> flags;
    EXPECT_EQ(ZV_WS_Status_invalid_param,
              ZV_WS_checkTitlesInWishlist(&session, nullptr, 1, TITLE_TYPE_FILTER_ANY, &flags));
    EXPECT_TRUE(store->Log().empty());
    // Enumerations outside of their lists go to the service as numbers, which refuses them.
    Owned<ZV_WS_TitlesResponse> odd;
    EXPECT_NE(ZV_WS_Status_ok, ZV_WS_getTitles(&session, 1, &page, 9, &odd));
    EXPECT_EQ(std::vector<std::string>{"getTitlesByNavigation!"}, Asked());
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
        {"clock=no-length", ZV_WS_Status_net_error, -1},
        {"clock=zero-length", ZV_WS_Status_net_error, -1},
        {"clock=http:503", ZV_WS_Status_net_error, -1},
        {"clock=cut", ZV_WS_Status_net_error, -1},
        {"clock=cut-header", ZV_WS_Status_net_error, -1},
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
    store.reset();
    EXPECT_EQ(ZV_WS_Status_connection_error, ZV_WS_getServerTime(&now));
    EXPECT_EQ(-1, now);
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
    const struct {
        const char* fault;
        ZV_WS_Status status;
    } faults[] = {{"http:404", ZV_WS_Status_file_not_found_on_server},
                  {"http:503", ZV_WS_Status_net_error},
                  {"zero-length", ZV_WS_Status_net_error},
                  {"cut-header", ZV_WS_Status_net_error},
                  {"split", ZV_WS_Status_ok}};
    for (const auto& row : faults) {
        Fault(std::string("bandwidth=") + row.fault);
        EXPECT_EQ(row.status, ZV_WS_checkBandwidth(&session, &rate)) << row.fault;
        EXPECT_EQ(row.status == ZV_WS_Status_ok, rate != 0) << row.fault;
    }
    // The connection that SOAP kept is whole afterwards.
    Owned<ZV_WS_ConfigResponse> config;
    OK(ZV_WS_getConfig(&session, &config));
}

TEST_F(Calls, BandwidthAddress)
{
    const struct {
        const char* key;
        const char* value;
        ZV_WS_Status status;
    } rows[] = {
        {"BandwidthCheckURL", "http://localhost/x", ZV_WS_Status_failed_to_get_bandwidth_check_url},
        {"bandwithcheckurl", "http://localhost", ZV_WS_Status_invalid_bandwidth_check_url},
        {"BandwithCheckURL", "localhost/x", ZV_WS_Status_invalid_bandwidth_check_url},
        {"BandwithCheckURL", "http:///x", ZV_WS_Status_invalid_bandwidth_check_url},
        {"BandwithCheckURL", "http://localhost:1/x", ZV_WS_Status_connection_error},
    };
    for (const auto& row : rows) {
        Begin(ACCESS_TYPE_STREAM);
        store->Query("DELETE FROM config");
        store->Query("INSERT INTO config VALUES ('BandwithCheckURL', '')");
        store->Query(std::string("INSERT INTO config VALUES ('") + row.key + "', '" + row.value + "')");
        if (std::string(row.key) != "BandwidthCheckURL") store->Query("DELETE FROM config WHERE value = ''");
        unsigned int rate = 1;
        EXPECT_EQ(row.status, ZV_WS_checkBandwidth(&session, &rate)) << row.key << " " << row.value;
        EXPECT_EQ(0u, rate);
    }
    Begin(ACCESS_TYPE_STREAM);
    Fault("getConfig=http:503");
    unsigned int rate = 1;
    EXPECT_EQ(-4503, ZV_WS_checkBandwidth(&session, &rate));
}

TEST_F(Calls, LocalAddress)
{
    Owned<ZV_WS_String> address;
    OK(ZV_WS_getLocalIPAddr(&session, &address));
    unsigned int parts[4];
    EXPECT_EQ(4, sscanf(address.data, "%u.%u.%u.%u", &parts[0], &parts[1], &parts[2], &parts[3])) << address.data;
    EXPECT_EQ(strlen(address.data), address.size);
}

TEST_F(Calls, Files)
{
    const std::string file = store->DataFolder() + "/a/b/c.txt";
    bool flag = true;
    OK(ZV_WS_createFolder((store->DataFolder() + "/a/b").c_str()));
    OK(ZV_WS_folderExist((store->DataFolder() + "/a/b").c_str(), &flag));
    EXPECT_TRUE(flag);
    OK(ZV_WS_fileExist(file.c_str(), &flag));
    EXPECT_FALSE(flag);
    OK(ZV_WS_copyFile((store->DataFolder() + "/account.txt").c_str(), file.c_str()));
    OK(ZV_WS_fileExist(file.c_str(), &flag));
    EXPECT_TRUE(flag);
    Owned<ZV_WS_String> folder;
    OK(ZV_WS_getFolderName(file.c_str(), &folder));
    EXPECT_EQ(store->DataFolder() + "/a/b/", folder.data);
    OK(ZV_WS_removeFile(file.c_str()));
    OK(ZV_WS_removeFile(file.c_str()));
    EXPECT_EQ(ZV_WS_Status_file_operation_error, ZV_WS_removeFile((store->DataFolder() + "/a").c_str()));
    EXPECT_EQ(ZV_WS_Status_file_operation_error, ZV_WS_createFolder((store->DataFolder() + "/account.txt/x").c_str()));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_copyFile(nullptr, "x"));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_fileExist(nullptr, &flag));
}

}  // namespace
