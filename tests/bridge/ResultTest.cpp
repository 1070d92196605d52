// How records become script values: property order, nulls, arrays, dates.
#include <gtest/gtest.h>
#include <time.h>

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

// Of a title with the product.
std::string JsonWith(ZV_WS_ProductListing& product)
{
    ZV_WS_TitleListingResponse title;
    title.AvailableProducts.size = 1;
    title.AvailableProducts.ProductListing = &product;
    return Json(title);
}

// What the store's answers look like is tested with the whole process; these are answers that it does not give.
TEST(ResultObjects, WhatIsAbsentIsNullOrEmpty)
{
    EXPECT_EQ("[]\n", Json(ZV_WS_GenreArray()));
    EXPECT_EQ("[]\n", Json(ZV_WS_TitlesInWishlist()));
    EXPECT_EQ("null\n", Json(ZV_WS_String()));
    EXPECT_EQ(R"({"ResponseCode":0,"ConfigurationItem":[],"ResponseMessage":null})"
              "\n",
              Json(ZV_WS_ConfigResponse()));
    EXPECT_EQ(R"({"TitleID":0,"TitleName":null,"BoxArtPrefix":null,"TitlePosition":0,"EpisodeNumber":0,)"
              R"("CHVRSRating":null,"LoyaltyPointsForBuy":null,"LoyaltyPointsForRent":null,"BonusAssets":[],)"
              R"("IsTvListing":false,"MPAARating":null,"IsTHXMediaDirectorEnabled":false,)"
              R"("IsTHXMediaDirectorEnabledForTrailer":false,"AvailableProducts":[],"ResponseCode":0,)"
              R"("ResponseMessage":null,"Synopsis":null,"UserRating":0,"Directors":null,"Actors":null,"Writers":null,)"
              R"("Producers":null,"Copyright":null,"RunTime":null,"RatingReason":null})"
              "\n",
              Json(ZV_WS_TitleListingResponse()));
}

TEST(ResultObjects, OddValuesStay)
{
    ZV_WS_FileProfile profiles[] = {FILE_PROFILE_STANDARD, static_cast<ZV_WS_FileProfile>(99)};
    ZV_WS_ProductListing product;
    product.SkuID = -7;
    product.Price = Text("\xc3\x9cnder \"quotes\"");
    product.AvailableAssets.size = 2;
    product.AvailableAssets.FileProfile = profiles;
    ZV_WS_AudioFile audio;
    audio.ContainsVideo = true;
    product.AvailableAudioProfiles.size = 1;
    product.AvailableAudioProfiles.AudioFile = &audio;
    EXPECT_NE(std::string::npos,
              JsonWith(product).find(
                  R"([{"SkuID":-7,"PurchaseType":0,"Price":"Ünder \"quotes\"","RentalPeriod":0,"AvailableAssets":)"
                  R"([{"FileProfile":1},{"FileProfile":99}],"AvailableAudioProfiles":[{"AssetAudioID":0,)"
                  R"("FileLocation":null,"ContainsVideo":true,"AudioAssetProfile":0}],"ExpireDate":null}])"));
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
    const std::pair<const char*, const char*> rows[] = {
        {"2030/01/31 23:59:58", "\"2030-01-31T18:29:58.000Z\""},
        {"2024/02/29 00:00:00", "\"2024-02-28T18:30:00.000Z\""},
        {"2030/7/4 1:2:3", "\"2030-07-03T19:32:03.000Z\""},
        {"0001/01/01 06:00:00", "\"0001-01-01T00:30:00.000Z\""},
        {"2030/01/31 23:59:58.123", "\"2030-01-31T18:29:58.000Z\""},
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
    setenv("TZ", "XXX-05:30", 1);
    tzset();
    for (const auto& [text, shown] : rows) {
        ZV_WS_ProductListing product;
        product.ExpireDate = const_cast<char*>(text);
        const std::string json = JsonWith(product);
        EXPECT_NE(std::string::npos, json.find(std::string("\"ExpireDate\":") + shown + "}]")) << json;
    }
}

}  // namespace
