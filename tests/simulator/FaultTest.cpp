// Faults on order: each bites as it says, once for each count, and undoes what it claims has failed.
#include <gtest/gtest.h>

#include "RawClient.h"

namespace {

class FaultTest : public StorefrontTest {
protected:
    void SetUp() override { Begin(); }

    Reply Titles() { return Ask("RealTimeBrowse", "getTitleListing", Children({{"TitleID", "12"}})); }
};

// Those at which the client does the same as without them, or as at another: what is on the wire tells them apart.
TEST_F(FaultTest, EachBitesOnceAndIsLogged)
{
    const std::pair<const char*, const char*> rows[] = {
        {"fault12", "2003/05/soap-envelope"}, {"soap12", "2003/05/soap-envelope"},
        {"http:302", "\r\nLocation: "},       {"wrong-checksum", "\r\nContent-Encoding: gzip\r\n"},
        {"extra-header", "<x:Trace"},         {"long", "</soap:Envelope>left over"},
    };
    const auto titles = [this] {
        const Reply reply = Titles();
        return reply.head + reply.body;
    };
    for (const auto& [fault, bite] : rows) {
        Order(std::string("getTitleListing=") + fault);
        EXPECT_NE(std::string::npos, titles().find(bite)) << fault;
        EXPECT_EQ(fault, LastLogged().fault);
        EXPECT_EQ(std::string::npos, titles().find(bite)) << fault;
        EXPECT_EQ("", LastLogged().fault);
    }
}

TEST_F(FaultTest, AFaultUndoesWhatItClaimsHasFailed)
{
    const std::string before = store->Query("SELECT COUNT(*) FROM pass");
    const std::string purchase = Children({{"SkuID", store->Query("SELECT MIN(sku) FROM product")},
                                           {"IPAddress", "10.0.0.1"},
                                           {"UsePrePaidFunds", "no"}});
    for (const char* fault : {"code:5", "fault11", "http:503", "cut", "cut-body", "reset", "missing-result", "empty"}) {
        Order(std::string("doPurchaseSavedbilling=") + fault);
        Ask("StreamAPI", "doPurchaseSavedbilling", purchase);
        EXPECT_EQ(before, store->Query("SELECT COUNT(*) FROM pass")) << fault;
    }
    int passes = atoi(before.c_str());
    for (const char* fault :
         {"code:5,after", "cut,after", "reset,after", "http:503,after", "extra-header", "soap12", "ok"}) {
        Order(std::string("doPurchaseSavedbilling=") + fault);
        Ask("StreamAPI", "doPurchaseSavedbilling", purchase);
        EXPECT_EQ(std::to_string(++passes), store->Query("SELECT COUNT(*) FROM pass")) << fault;
    }
}

TEST_F(FaultTest, ListsAreConsumedInOrderAndRequestsCanBeLetThrough)
{
    Order("getTitleListing=ok");
    Order("getTitleListing=http:503,count=2");
    Order("getTitleListing=code:3");
    Order("getConfig=http:404");
    EXPECT_EQ(200, Titles().status);
    EXPECT_EQ(503, Titles().status);
    EXPECT_EQ("getConfig=http:404,count=1\ngetTitleListing=http:503,count=1\ngetTitleListing=code:3,count=1\n",
              Plain("/control/faults").body);
    EXPECT_EQ(503, Titles().status);
    EXPECT_EQ("3", Titles().Element("ResponseCode"));
    EXPECT_EQ("0", Titles().Element("ResponseCode"));
    EXPECT_EQ(404, Ask("StreamAPI", "getConfig").status);
}

TEST_F(FaultTest, OrdersThatMakeNoSenseAreRefusedWithTheReason)
{
    const std::pair<const char*, const char*> rows[] = {
        {"", "expected"},
        {"getTitleListing", "expected"},
        {"getTitleListing=", "expected"},
        {"=cut", "no operation"},
        {"getTitleListng=cut", "no operation getTitleListng"},
        {"getTitleListing=sever", "no kind"},
        {"getTitleListing=cut:5", "takes no value"},
        {"getTitleListing=code:x", "no number"},
        {"getTitleListing=http:99", "from 200 to 599"},
        {"getTitleListing=cut,delay=soon", "expected"},
        {"getTitleListing=cut,count=0", "expected"},
        {"getTitleListing=cut,later", "expected"},
        {"getTitleListing=not-modified", "cannot happen"},
        {"getTitleListing=close", "cannot happen"},
        {"connect=http:404", "cannot happen"},
        {"clock=missing-result", "cannot happen"},
        {"getNavigation=code:1", "no response code"},
    };
    for (const auto& [order, reason] : rows) {
        std::string error;
        EXPECT_FALSE(store->AddFault(order, error)) << order;
        EXPECT_NE(std::string::npos, error.find(reason)) << error;
    }
    EXPECT_EQ("", Plain("/control/faults").body);
}

TEST_F(FaultTest, ControlRequestsOrderAndForget)
{
    EXPECT_EQ(200, Plain("/control/faults", "", "POST", "clock=http:404\ngetConfig=cut\n").status);
    EXPECT_EQ(404, Plain("/device/time/").status);
    const Reply refused = Plain("/control/faults", "", "POST", "clock=sever\n");
    EXPECT_EQ(400, refused.status);
    EXPECT_NE(std::string::npos, refused.body.find("sever"));
    EXPECT_EQ(200, Plain("/control/faults", "", "DELETE").status);
    EXPECT_EQ(200, Ask("StreamAPI", "getConfig").status);
    EXPECT_EQ(200, Plain("/control/log", "", "DELETE").status);
    EXPECT_TRUE(store->Log().empty());
}

}  // namespace
