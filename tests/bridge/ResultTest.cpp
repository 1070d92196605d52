// How records become script values: property order, nulls, arrays, dates.
#include <gtest/gtest.h>

#include "MovieRun.h"

namespace {

// What JSON.stringify makes of the result: it keeps the order of the properties.
template <class Record>
std::string Json(const Record& record)
{
    Result result;
    result.Set(record, ZV_WS_Status_ok);
    const MovieRun run = RunMovie("report(JSON.stringify(result()));\n", result);
    EXPECT_TRUE(run.succeeded);
    EXPECT_EQ(1u, run.lines.size());
    return run.Text();
}

char* Text(const char* text)
{
    return const_cast<char*>(text);  // records own their texts; these are never released
}

const char kEmptyListing[] =
    R"("TitleID":0,"TitleName":null,"BoxArtPrefix":null,"TitlePosition":0,"EpisodeNumber":0,"CHVRSRating":null,)"
    R"("LoyaltyPointsForBuy":null,"LoyaltyPointsForRent":null,"BonusAssets":[],"IsTvListing":false,"MPAARating":null,)"
    R"("IsTHXMediaDirectorEnabled":false,"IsTHXMediaDirectorEnabledForTrailer":false,"AvailableProducts":[])";

TEST(ResultObjects, EmptyRecordsHaveEveryPropertyInOrder)
{
    const std::string listing = kEmptyListing;
    const std::string page = R"("CurrentPageNumber":0,"ItemsPerPage":0,"TotalPages":0,"TotalItems":0,)";
    const std::string answer = R"("ResponseCode":0,"ResponseMessage":null)";
    const std::string videos = page + answer + R"(,"Titles":[])";
    const auto object = [](const std::string& members) { return "{" + members + "}\n"; };

    EXPECT_EQ("[]\n", Json(ZV_WS_GenreArray()));
    EXPECT_EQ("[]\n", Json(ZV_WS_TitleListingResponseArray()));
    EXPECT_EQ("[]\n", Json(ZV_WS_TitlesInWishlist()));
    EXPECT_EQ("null\n", Json(ZV_WS_String()));
    EXPECT_EQ(object(R"("GenreID":0,)" + videos), Json(ZV_WS_TitlesResponse()));
    EXPECT_EQ(object(listing + "," + answer +
                     R"(,"Synopsis":null,"UserRating":0,"Directors":null,"Actors":null,"Writers":null,)"
                     R"("Producers":null,"Copyright":null,"RunTime":null,"RatingReason":null)"),
              Json(ZV_WS_TitleListingResponse()));
    EXPECT_EQ(object(answer + R"(,"AuthToken":null)"), Json(ZV_WS_AuthorizeDeviceResponse()));
    EXPECT_EQ(object(videos), Json(ZV_WS_MyVideosResponse()));
    EXPECT_EQ(object(videos + R"(,"SortOrder":0)"), Json(ZV_WS_WishlistItemsResponse()));
    EXPECT_EQ(object(answer), Json(ZV_WS_StandardResponse()));
    EXPECT_EQ(object(answer + R"(,"Titles":[])"), Json(ZV_WS_RecommendedTitlesResponse()));
    EXPECT_EQ(object(answer + R"(,"Episodes":[])"), Json(ZV_WS_TvEpisodeListResponse()));
    EXPECT_EQ(object(R"("ResponseCode":0,"ConfigurationItem":[],"ResponseMessage":null)"),
              Json(ZV_WS_ConfigResponse()));
    EXPECT_EQ(object(R"("StreamingAssetLocation":null,"AssetID":0,"StreamID":null,"DRMServerURL":null,)"
                     R"("DRMACKServerURL":null,"Status":0,"StartTimeSeconds":0,"HeartbeatURL":null,)"
                     R"("HeartbeatPollInSeconds":0,)" +
                     answer),
              Json(ZV_WS_StreamingAssetLocationResponse()));
    EXPECT_EQ(object(answer + R"(,"CCLastFour":null,"CCTypeID":0,"CCType":null)"), Json(ZV_WS_BillingInfoResponse()));
    EXPECT_EQ(object(R"("DRMProvider":0,"AccessType":0,"FileProfile":0,"VideoFormat":0,"FileExtension":0)"),
              Json(ZV_WS_FileType()));
    EXPECT_EQ(object(answer + R"(,"ShouldDisplay":false,"HoursRemaining":0)"), Json(ZV_WS_RentalExpirationResponse()));
}

TEST(ResultObjects, ATitleIsConvertedToItsLastPart)
{
    ZV_WS_FileProfile profiles[] = {FILE_PROFILE_STANDARD, static_cast<ZV_WS_FileProfile>(99)};
    ZV_WS_AudioFile audio;
    audio.AssetAudioID = 5;
    audio.FileLocation = Text("http://x/a");
    audio.ContainsVideo = true;
    audio.AudioAssetProfile = AUDIO_PROFILE_DTS_EXPRESS_51;
    ZV_WS_ProductListing product;
    product.SkuID = -7;
    product.PurchaseType = PURCHASE_TYPE_BUY;
    product.Price = Text("9.99");
    product.RentalPeriod = 48;
    product.AvailableAssets.size = 2;
    product.AvailableAssets.FileProfile = profiles;
    product.AvailableAudioProfiles.size = 1;
    product.AvailableAudioProfiles.AudioFile = &audio;
    ZV_WS_BonusAsset bonus[2];
    bonus[1].BonusAssetID = 2;
    bonus[1].Profile = FILE_PROFILE_HIGHDEFINITION;
    ZV_WS_TitleListingPurchased title;
    title.TitleName = Text("Ünder \"quotes\"");
    title.TitlePosition = -3;
    title.BonusAssets.size = 2;
    title.BonusAssets.BonusAsset = bonus;
    title.AvailableProducts.size = 1;
    title.AvailableProducts.ProductListing = &product;
    title.CHVRSRating = Text("G");
    title.RentalPeriod = Text("2 days");
    title.PlayStatus = STREAM_STATUS_PAUSED;
    ZV_WS_WishlistItemsResponse items;
    items.SortOrder = 2;
    items.TotalItems = 32767;
    items.Titles.size = 1;
    items.Titles.TitleListingPurchased = &title;
    EXPECT_EQ(R"({"CurrentPageNumber":0,"ItemsPerPage":0,"TotalPages":0,"TotalItems":32767,"ResponseCode":0,)"
              R"("ResponseMessage":null,"Titles":[{"TitleID":0,"TitleName":"Ünder \"quotes\"","BoxArtPrefix":null,)"
              R"("TitlePosition":-3,"EpisodeNumber":0,"CHVRSRating":"G","LoyaltyPointsForBuy":null,)"
              R"("LoyaltyPointsForRent":null,"BonusAssets":[{"BonusAssetID":0,"Profile":0,"BonusType":0},)"
              R"({"BonusAssetID":2,"Profile":2,"BonusType":0}],"IsTvListing":false,"MPAARating":null,)"
              R"("IsTHXMediaDirectorEnabled":false,"IsTHXMediaDirectorEnabledForTrailer":false,"AvailableProducts":[)"
              R"({"SkuID":-7,"PurchaseType":1,"Price":"9.99","RentalPeriod":48,"AvailableAssets":[{"FileProfile":1},)"
              R"({"FileProfile":99}],"AvailableAudioProfiles":[{"AssetAudioID":5,"FileLocation":"http://x/a",)"
              R"("ContainsVideo":true,"AudioAssetProfile":5}],"ExpireDate":null}],"EpisodeID":0,"TvListingTitleID":0,)"
              R"("PurchaseType":0,"Status":0,"RentalPeriod":"2 days","PassID":0,"PlayStatus":2,"StartTimeSeconds":0}],)"
              R"("SortOrder":2})"
              "\n",
              Json(items));
}

TEST(ResultObjects, PlainValues)
{
    EXPECT_EQ("true\n", Json(true));
    EXPECT_EQ("-5\n", Json(-5));
    EXPECT_EQ("4000000000\n", Json(4000000000u));
    EXPECT_EQ("3\n", Json(AUDIO_PROFILE_DOLBY_DIGITAL_PLUS_51));
    bool flags[] = {true, false, true};
    ZV_WS_TitlesInWishlist wishlist;
    wishlist.size = 3;
    wishlist.IsAvailInUserWishlist = flags;
    EXPECT_EQ("[true,false,true]\n", Json(wishlist));
    ZV_WS_String text;
    text.size = 2;
    text.data = Text("hi");
    EXPECT_EQ("\"hi\"\n", Json(text));
    EXPECT_EQ("true\n", RunMovie("report(result() === undefined);\n").Text());
}

TEST(ResultObjects, ExpireDateIsALocalDateOrNull)
{
    const struct {
        const char* text;
        const char* shown;  // year, month counted from 0, day, hours, minutes, seconds
    } kDates[] = {
        {"2030/01/31 23:59:58", "2030,0,31,23,59,58"},
        {"2024/02/29 00:00:00", "2024,1,29,0,0,0"},
        {"2030/7/4 1:2:3", "2030,6,4,1,2,3"},
        {"0001/01/01 00:00:00", "1,0,1,0,0,0"},
        {"2030/01/31 23:59:58.123", "2030,0,31,23,59,58"},
        {nullptr, "null"},
        {"", "null"},
        {"soon", "null"},
        {"2030/01/31", "null"},
        {"2030-01-31 23:59:58", "null"},
        {"2030/13/01 00:00:00", "null"},
        {"2030/01/00 00:00:00", "null"},
        {"2030/01/32 00:00:00", "null"},
        {"2030/01/01 24:00:00", "null"},
        {"2030/01/01 -1:00:00", "null"},
        {"99999/01/01 00:00:00", "null"},
    };
    for (const auto& date : kDates) {
        ZV_WS_ProductListing product;
        product.ExpireDate = const_cast<char*>(date.text);
        ZV_WS_TitleListingResponse title;
        title.AvailableProducts.size = 1;
        title.AvailableProducts.ProductListing = &product;
        Result result;
        result.Set(title, ZV_WS_Status_ok);
        const MovieRun run = RunMovie(
            "var d = result().AvailableProducts[0].ExpireDate;\n"
            "report(d === null ? 'null' : d instanceof Date && [d.getFullYear(), d.getMonth(), d.getDate(),\n"
            "    d.getHours(), d.getMinutes(), d.getSeconds()]);\n",
            result);
        EXPECT_EQ(std::string(date.shown) + "\n", run.Text()) << (date.text ? date.text : "no text");
    }
}

}  // namespace
