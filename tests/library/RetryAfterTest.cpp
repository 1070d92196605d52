// What a session hears of its services: whether they answered at all, and how long they want to be left alone.
#include "ServiceTrouble.h"

#include "Store.h"
#include "TempFolder.h"

namespace {

TEST(RetryAfter, IsANumberOfSecondsOrNothing)
{
    const std::pair<const char*, unsigned int> rows[] = {
        {"120", 120},
        {" \t7 \r\nAge: 9", 7},
        {"0", 0},
        {"", 0},
        {"-5", 0},
        {"1.5", 0},
        {"12 s", 0},
        {"Wed, 21 Oct 2026 07:28:00 GMT", 0},
        {"\r\n30", 0},
        {"4294967295", ~0u},
        {"99999999999999999999999", ~0u},
    };
    for (const auto& [text, seconds] : rows)
        EXPECT_EQ(seconds, RetryAfter::SecondsOf(text)) << text;
}

using RetryAfterTest = Store;

TEST_F(RetryAfterTest, TellsWhatTheLastCallMet)
{
    const TempFolder folder;
    ZV_WS_SetupParams setup = Setup();
    setup.CacheParam.Type = CacheType_File;
    setup.CacheParam.Data = ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_BoxArtImage;
    const std::string path = folder / "";
    setup.CacheParam.Path = path.c_str();
    ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
    const AnyCall titles = Asking(ZV_WS_getTitleListing, 12),
                  image = Asking(ZV_WS_getBoxArtImage, BOX_ART_SIZE_95, "ZV00012");
    const struct {
        const AnyCall& call;
        const char* fault;
        const char* heard;
        int status;
    } rows[] = {
        {titles, "getTitleListing=http:503,retry=120", "answered unavailable 120", -4503},
        {titles, "getTitleListing=http:503", "answered unavailable 0", -4503},
        {titles, "getTitleListing=http:500,retry=120", "answered 0", -4500},
        {titles, "getTitleListing=code:3", "answered 0", ZV_WS_Status_general_error},
        {titles, "getTitleListing=reset,count=2", "silent 0", ZV_WS_Status_timeout_error},
        {titles, "", "answered 0", ZV_WS_Status_ok},
        {titles, "", "0", ZV_WS_Status_ok},  // from the cache
        {image, "boxart=http:503,retry=60", "answered unavailable 60", ZV_WS_Status_net_error},
        {image, "boxart=cut", "silent 0", ZV_WS_Status_net_error},
        {image, "", "answered 0", ZV_WS_Status_ok},
        {image, "", "0", ZV_WS_Status_ok},
        // The image that is there stays in use.
        {image, "boxart=http:503,retry=60", "answered unavailable 60", ZV_WS_Status_ok},
        {image, "boxart=cut", "silent 0", ZV_WS_Status_ok},
    };
    for (const auto& row : rows) {
        const bool renews = row.status == ZV_WS_Status_ok && *row.fault != '\0';
        if (renews) ZV_WS_updateLocalCache(&session, ZV_WS_CacheParam::CacheData_BoxArtImage);
        TakeHeard(session);
        if (*row.fault) Fault(row.fault);
        EXPECT_EQ(row.status, row.call(&session)) << row.fault;
        const RetryAfter::Heard heard = TakeHeard(session);
        EXPECT_EQ(row.heard, std::string(heard.answered ? "answered " : "") + (heard.silent ? "silent " : "") +
                                 (heard.unavailable ? "unavailable " : "") + std::to_string(heard.seconds))
            << row.fault;
        store->ClearFaults();
    }
    const ZV_WS_Session none;
    EXPECT_FALSE(TakeHeard(none).answered);
}

}  // namespace
