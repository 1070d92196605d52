// Faults on order: each bites as it says, once for each count, and undoes what it claims has failed.
#include <chrono>
#include <functional>

#include "RawClient.h"

namespace {

class FaultTest : public StorefrontTest {
protected:
    void SetUp() override { Begin(); }

    Reply Titles() { return Ask("RealTimeBrowse", "getTitleListing", Children({{"TitleID", "12"}})); }
};

TEST_F(FaultTest, EachFaultBitesOnceAndIsLogged)
{
    const auto cut = [](const Reply& r) { return r.status == 0; };
    const auto holds = [](const char* text) {
        return [=](const Reply& r) { return r.body.find(text) != std::string::npos; };
    };
    const struct {
        const char* fault;
        std::function<bool(const Reply&)> bites;
    } rows[] = {
        {"code:7", [](const Reply& r) { return r.Element("ResponseCode") == "7" && r.Element("TitleName").empty(); }},
        {"fault11", [&](const Reply& r) { return r.status == 500 && holds("<faultstring>")(r); }},
        {"fault12",
         [&](const Reply& r) {
             return r.status == 500 && holds("2003/05/soap-envelope")(r) && holds("<soap:Reason>")(r);
         }},
        {"soap12",
         [&](const Reply& r) {
             return r.status == 200 && holds("2003/05/soap-envelope")(r) && holds("<TitleID>12<")(r);
         }},
        {"http:404", [](const Reply& r) { return r.status == 404; }},
        {"http:302", [](const Reply& r) { return r.status == 302 && !r.Header("Location").empty(); }},
        {"cut", cut},
        {"cut-header", cut},
        {"reset", cut},
        {"cut-body", [](const Reply& r) { return r.status == 200 && !r.whole && !r.body.empty(); }},
        {"short", [](const Reply& r) { return r.status == 200 && !r.whole; }},
        {"drip:0", holds("<TitleID>12<")},
        {"split:1", holds("<TitleID>12<")},
        {"garbage", [&](const Reply& r) { return r.status == 200 && !holds("Envelope")(r); }},
        {"no-http", cut},
        {"no-length", [&](const Reply& r) { return r.Header("Content-Length").empty() && holds("<TitleID>12<")(r); }},
        {"zero-length", [](const Reply& r) { return r.Header("Content-Length") == "0"; }},
        {"empty", [](const Reply& r) { return r.status == 200 && r.body.empty(); }},
        {"bomb:1", [](const Reply& r) { return r.Header("Content-Encoding") == "gzip" && r.body.size() < 10000; }},
        {"damaged-gzip", [](const Reply& r) { return r.Header("Content-Encoding") == "gzip"; }},
        {"wrong-checksum", [](const Reply& r) { return r.Header("Content-Encoding") == "gzip"; }},
        {"missing-result", [&](const Reply& r) { return holds("getTitleListingResponse")(r) && !holds("Result>")(r); }},
        {"must-understand", holds("soap:mustUnderstand=\"1\"")},
        {"extra-header", [&](const Reply& r) { return holds("<x:Trace")(r) && !holds("mustUnderstand")(r); }},
        {"unknown-enum", holds("New_")},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fault);
        Order(std::string("getTitleListing=") + row.fault);
        EXPECT_TRUE(row.bites(Titles()));
        EXPECT_EQ(row.fault, LastLogged().fault);
        const Reply good = Titles();
        EXPECT_EQ(200, good.status);
        EXPECT_EQ("0", good.Element("ResponseCode"));
        EXPECT_EQ("", LastLogged().fault);
    }
}

TEST_F(FaultTest, StallsAreLoggedWhenTheyBegin)
{
    for (const char* fault : {"stall", "stall-body"}) {
        SCOPED_TRACE(fault);
        Order(std::string("getTitleListing=") + fault);
        const SoapRequest request{"RealTimeBrowse", "getTitleListing", Children({{"TitleID", "12"}})};
        RawClient client(store->HttpsPort(), CaFile());
        ASSERT_TRUE(client.Connect());
        store->ClearLog();
        ASSERT_TRUE(client.Send(request.Text(store->HttpsPort())));
        ASSERT_TRUE(store->WaitForRequests(1));
        EXPECT_EQ(fault, LastLogged().fault);
        if (std::string(fault) == "stall-body") {
            EXPECT_NE(std::string::npos, client.ReceiveSome().find("HTTP/1.1 200 OK"));
        }
    }
}

TEST_F(FaultTest, LeftOverBytesFollowAWholeAnswer)
{
    Order("getTitleListing=long");
    const SoapRequest request{"RealTimeBrowse", "getTitleListing", Children({{"TitleID", "12"}})};
    RawClient client(store->HttpsPort(), CaFile());
    ASSERT_TRUE(client.Connect());
    ASSERT_TRUE(client.Send(request.Text(store->HttpsPort())));
    const Reply reply = client.Receive();
    EXPECT_TRUE(reply.whole);
    EXPECT_NE(std::string::npos, reply.body.find("</soap:Envelope>"));
    EXPECT_EQ("left over", client.Rest().empty() ? client.ReceiveSome() : client.Rest());
}

TEST_F(FaultTest, AnEndlessBodyOutrunsEveryBound)
{
    Order("getTitleListing=endless");
    const SoapRequest request{"RealTimeBrowse", "getTitleListing", Children({{"TitleID", "12"}})};
    RawClient client(store->HttpsPort(), CaFile());
    ASSERT_TRUE(client.Connect());
    ASSERT_TRUE(client.Send(request.Text(store->HttpsPort())));
    for (size_t got = 0; got < 5u << 20;) {
        const size_t more = client.ReceiveSome().size();
        ASSERT_NE(0u, more) << got;
        got += more;
    }
}

TEST_F(FaultTest, ConnectionFaultsComeBeforeTheHandshake)
{
    for (const char* fault : {"close", "reset", "no-http", "stall-handshake", "stall"}) {
        SCOPED_TRACE(fault);
        store->ClearLog();
        Order(std::string("connect=") + fault);
        const bool stalls = std::string(fault).find("stall") == 0;
        if (stalls) {
            // Plain, since a handshake would wait for good.
            RawClient client(store->HttpsPort());
            ASSERT_TRUE(client.Connect());
            ASSERT_TRUE(store->WaitForRequests(1));
            if (std::string(fault) == "stall-handshake") {
                EXPECT_EQ('\x16', client.ReceiveSome()[0]);
            }
        } else {
            RawClient client(store->HttpsPort(), CaFile());
            EXPECT_FALSE(client.Connect());
            ASSERT_TRUE(store->WaitForRequests(1));
        }
        EXPECT_EQ("connect", store->Log()[0].service);
        EXPECT_EQ(fault, store->Log()[0].fault);
    }
    EXPECT_EQ(200, Titles().status);
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

TEST_F(FaultTest, ADelayPassesBeforeTheAnswer)
{
    Order("getTitleListing=ok,delay=150");
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(200, Titles().status);
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(150));
}

TEST_F(FaultTest, OrdersThatMakeNoSenseAreRefusedWithTheReason)
{
    const struct {
        const char* order;
        const char* reason;
    } rows[] = {
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
    for (const auto& row : rows) {
        std::string error;
        EXPECT_FALSE(store->AddFault(row.order, error)) << row.order;
        EXPECT_NE(std::string::npos, error.find(row.reason)) << error;
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
