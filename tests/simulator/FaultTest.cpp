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
    const std::string purchase = Children({{"SkuID", store->Query("SELECT MIN(sku) FROM product")},
                                           {"IPAddress", "10.0.0.1"},
                                           {"UsePrePaidFunds", "no"}});
    const std::pair<int, std::vector<const char*>> rows[] = {
        {0, {"code:5", "fault11", "http:503", "cut", "cut-body", "reset", "missing-result", "empty"}},
        {1, {"code:5,after", "cut,after", "reset,after", "http:503,after", "extra-header", "soap12", "ok"}}};
    int passes = atoi(store->Query("SELECT COUNT(*) FROM pass").c_str());
    for (const auto& [bought, faults] : rows) {
        for (const char* fault : faults) {
            Order(std::string("doPurchaseSavedbilling=") + fault);
            Ask("StreamAPI", "doPurchaseSavedbilling", purchase);
            EXPECT_EQ(std::to_string(passes += bought), store->Query("SELECT COUNT(*) FROM pass")) << fault;
        }
    }
}

TEST_F(FaultTest, AreConsumedInOrderAndForgotten)
{
    EXPECT_EQ(200,
              Plain("/control/faults", "", "POST", "getTitleListing=ok\ngetTitleListing=http:503,count=2\n").status);
    EXPECT_EQ(200, Titles().status);
    EXPECT_EQ(503, Titles().status);
    Order("getTitleListing=code:3");
    EXPECT_EQ("getTitleListing=http:503,count=1\ngetTitleListing=code:3,count=1\n", Plain("/control/faults").body);
    EXPECT_EQ(503, Titles().status);
    EXPECT_EQ("3", Titles().Element("ResponseCode"));
    for (const auto& [order, after] : {std::pair<const char*, const char*>("http:503,retry=30", "30"),
                                       {"http:503", ""},
                                       {"http:429,retry=0", "0"}}) {
        Order(std::string("getTitleListing=") + order);
        EXPECT_EQ(after, Titles().Header("Retry-After")) << order;
    }
    EXPECT_EQ("0", Titles().Element("ResponseCode"));
    Order("getTitleListing=cut");
    EXPECT_EQ(200, Plain("/control/faults", "", "DELETE").status);
    EXPECT_EQ(200, Titles().status);
    EXPECT_EQ(200, Plain("/control/log", "", "DELETE").status);
    EXPECT_TRUE(store->Log().empty());
}

TEST_F(FaultTest, OrdersThatMakeNoSenseAreRefusedWithTheReason)
{
    const std::pair<const char*, const char*> rows[] = {
        {"getTitleListing", "expected"},
        {"getTitleListng=cut", "no operation getTitleListng"},
        {"getTitleListing=sever", "no kind"},
        {"getTitleListing=cut:5", "takes no value"},
        {"getTitleListing=code:x", "no number"},
        {"getTitleListing=http:99", "from 200 to 599"},
        {"getTitleListing=cut,count=0", "expected"},
        {"getTitleListing=cut,retry=5", "expected"},
        {"getTitleListing=not-modified", "cannot happen"},
        {"getNavigation=code:1", "no response code"},
    };
    for (const auto& [order, reason] : rows) {
        const Reply refused = Plain("/control/faults", "", "POST", order);
        EXPECT_EQ(400, refused.status) << order;
        EXPECT_NE(std::string::npos, refused.body.find(reason)) << refused.body;
    }
    EXPECT_EQ("", Plain("/control/faults").body);
}

}  // namespace
