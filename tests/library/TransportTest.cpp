// What a service can do to a connection, and that the next call works.
#include <csignal>

#include "Deployment.h"
#include "Store.h"
#include "Tls.h"

namespace {

class Transport : public Store {
protected:
    void SetUp() override
    {
        Store::SetUp();
        ASSERT_EQ(ZV_WS_Status_ok, Initialize());
        ASSERT_EQ(ZV_WS_Status_ok, Listing());
        store->ClearLog();
    }

    ZV_WS_Status Listing()
    {
        Owned<ZV_WS_TitleListingResponse> listing;
        const ZV_WS_Status status = ZV_WS_getTitleListing(&session, 12, &listing);
        EXPECT_EQ(status == ZV_WS_Status_ok ? 12 : 0, listing.TitleID);
        return status;
    }
};

TEST_F(Transport, FaultsOfOneAnswerEndThere)
{
    const int kFails = 1;  // with a status that is the SOAP runtime's affair
    const struct {
        const char* fault;
        int status;
    } rows[] = {
        {"fault11", -6012},
        {"fault12", -6012},
        {"http:404", -4404},
        {"http:500", -4500},
        {"http:503", -4503},
        {"http:302", -4302},
        {"garbage", kFails},
        {"empty", kFails},
        {"cut-header", kFails},
        {"cut-body", kFails},
        {"damaged-gzip", kFails},
        {"bomb:64", kFails},
        {"endless", kFails},
        {"unknown-enum", -1004},
        {"missing-result", -1004},
        {"code:3", -1004},
        {"must-understand", -6008},
        {"soap12", 0},
        {"extra-header", 0},
        {"split", 0},
        {"long", 0},
        {"no-length", 0},
        {"drip:0", 0},
        {"short", 0},
    };
    for (const auto& row : rows) {
        Fault(std::string("getTitleListing=") + row.fault);
        Owned<ZV_WS_TitleListingResponse> listing;
        const ZV_WS_Status status = ZV_WS_getTitleListing(&session, 12, &listing);
        if (row.status == kFails) {
            EXPECT_NE(ZV_WS_Status_ok, status) << row.fault;
        } else {
            EXPECT_EQ(row.status, status) << row.fault;
        }
        EXPECT_EQ(row.status == 0 ? 12 : 0, listing.TitleID) << row.fault;
        EXPECT_EQ(ZV_WS_Status_ok, Listing()) << "after " << row.fault;
        store->ClearFaults();
    }
}

TEST_F(Transport, RefusalsKeepCodeAndMessage)
{
    Fault("getTitleListing=code:3");
    Owned<ZV_WS_TitleListingResponse> listing;
    EXPECT_EQ(ZV_WS_Status_general_error, ZV_WS_getTitleListing(&session, 12, &listing));
    EXPECT_EQ(3, listing.ResponseCode);
    EXPECT_STREQ("refused as asked", listing.ResponseMessage);
}

TEST_F(Transport, OneConnectionIsKept)
{
    for (int i = 0; i < 3; ++i)
        ASSERT_EQ(ZV_WS_Status_ok, Listing());
    const auto log = store->Log();
    ASSERT_EQ(3u, log.size());
    EXPECT_EQ(log[0].connection, log[2].connection);
}

TEST_F(Transport, ADeadKeptConnectionIsReplacedAndItsSessionResumed)
{
    const unsigned long before = [&] {
        EXPECT_EQ(ZV_WS_Status_ok, Listing());
        return store->Log().back().connection;
    }();
    for (const char* fault : {"getTitleListing=cut", "getTitleListing=reset"}) {
        store->ClearLog();
        Fault(fault);
        EXPECT_EQ(ZV_WS_Status_ok, Listing()) << fault;
        const auto log = store->Log();
        ASSERT_EQ(2u, log.size()) << fault;
        EXPECT_NE(log[0].connection, log[1].connection);
        EXPECT_NE(before, log[1].connection);
        EXPECT_TRUE(log[1].resumed);
        // Not more than once.
        Fault(std::string(fault) + ",count=2");
        EXPECT_EQ(ZV_WS_Status_timeout_error, Listing()) << fault;
        EXPECT_EQ(4u, store->Log().size()) << fault;
        EXPECT_EQ(ZV_WS_Status_ok, Listing());
    }
}

// The context lives as long as the process.
TEST_F(Transport, ConnectionsLeaveNoSessionsInTheirContext)
{
    for (int i = 0; i < 5; ++i) {
        Fault("getTitleListing=no-length");
        ASSERT_EQ(ZV_WS_Status_ok, Listing());
    }
    EXPECT_TRUE(store->Log().back().resumed);
    SSL_CTX* context = Tls::ContextFor(Deployment::Current().ca_file, "localhost");
    EXPECT_LE(5, SSL_CTX_sess_connect_good(context));
    EXPECT_EQ(0, SSL_CTX_sess_number(context));
    SSL_CTX_free(context);
}

TEST_F(Transport, WhatChangesSomethingIsSentOnce)
{
    Owned<ZV_WS_ConfigResponse> config;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getConfig(&session, &config));
    store->ClearLog();
    Fault("doPurchaseSavedbilling=cut,after");
    Owned<ZV_WS_PurchaseResponse> purchase;
    const int passes = Number("SELECT COUNT(*) FROM pass");
    EXPECT_EQ(ZV_WS_Status_timeout_error, ZV_WS_doPurchaseSavedBilling(&session, Number("SELECT MIN(sku) FROM product"),
                                                                       "10.0.0.1", false, &purchase));
    EXPECT_EQ(1u, store->Log().size());
    EXPECT_EQ(passes + 1, Number("SELECT COUNT(*) FROM pass"));
}

// A broken connection must neither kill the process nor change its handling of the signal.
TEST_F(Transport, TheProcessKeepsItsSignals)
{
    struct sigaction before;
    sigaction(SIGPIPE, nullptr, &before);
    EXPECT_EQ(SIG_DFL, before.sa_handler);
    for (int i = 0; i < 20; ++i) {
        Fault("getTitleListing=reset,count=2");
        Listing();
    }
    struct sigaction after;
    sigaction(SIGPIPE, nullptr, &after);
    EXPECT_EQ(SIG_DFL, after.sa_handler);
    sigset_t pending;
    sigpending(&pending);
    EXPECT_FALSE(sigismember(&pending, SIGPIPE));
}

TEST_F(Transport, AServiceThatIsGoneIsAConnectionError)
{
    store.reset();
    EXPECT_EQ(ZV_WS_Status_connection_error, Listing());
}

}  // namespace
