// Connections: kept, replaced, resumed, and what is never sent twice.
#include <csignal>
#include <set>

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

TEST_F(Transport, RefusalsKeepCodeAndMessage)
{
    Fault("getTitleListing=code:3");
    Owned<ZV_WS_TitleListingResponse> listing;
    EXPECT_EQ(ZV_WS_Status_general_error, ZV_WS_getTitleListing(&session, 12, &listing));
    EXPECT_EQ(3, listing.ResponseCode);
    EXPECT_STREQ("refused as asked", listing.ResponseMessage);
}

TEST_F(Transport, OneConnectionIsKeptAndReplacedWhenDeadWithItsSessionResumed)
{
    for (int i = 0; i < 3; ++i)
        EXPECT_EQ(ZV_WS_Status_ok, Listing());
    const auto kept = store->Log();
    ASSERT_EQ(3u, kept.size());
    EXPECT_EQ(kept[0].connection, kept[2].connection);
    for (const char* fault : {"getTitleListing=cut", "getTitleListing=reset"}) {
        store->ClearLog();
        Fault(fault);
        EXPECT_EQ(ZV_WS_Status_ok, Listing()) << fault;
        const auto log = store->Log();
        ASSERT_EQ(2u, log.size()) << fault;
        EXPECT_NE(log[0].connection, log[1].connection);
        EXPECT_NE(kept[0].connection, log[1].connection);
        EXPECT_TRUE(log[1].resumed);
        // Not more than once.
        Fault(std::string(fault) + ",count=2");
        EXPECT_EQ(ZV_WS_Status_timeout_error, Listing()) << fault;
        EXPECT_EQ(4u, store->Log().size()) << fault;
        EXPECT_EQ(ZV_WS_Status_ok, Listing());
    }
}

// Of all sessions of the process together, discovery included.
TEST_F(Transport, AHostSeesOneFullHandshake)
{
    ZV_WS_release(&session);
    Open(StorefrontOptions());
    ASSERT_EQ(ZV_WS_Status_ok, Initialize(Setup(ACCESS_TYPE_UNKNOWN)));
    ZV_WS_Session copies[2];
    for (ZV_WS_Session& copy : copies)
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&copy, &session));
    for (ZV_WS_Session* each : {&session, &copies[0], &copies[1]}) {
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getTitleListing, 12)(each));
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getEmailAddress)(each));
    }
    std::set<unsigned long> connections, resumed;
    for (const LoggedRequest& request : store->Log()) {
        connections.insert(request.connection);
        if (request.resumed) resumed.insert(request.connection);
    }
    EXPECT_EQ(7u, connections.size());  // discovery, and two services of three sessions
    EXPECT_EQ(connections.size() - 1, resumed.size());
    for (ZV_WS_Session& copy : copies)
        ZV_WS_release(&copy);
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
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getConfig)(&session));
    store->ClearLog();
    Fault("doPurchaseSavedbilling=cut,after");
    const int passes = Number("SELECT COUNT(*) FROM pass"), sku = Number("SELECT MIN(sku) FROM product");
    EXPECT_EQ(ZV_WS_Status_timeout_error, Asking(ZV_WS_doPurchaseSavedBilling, sku, "10.0.0.1", false)(&session));
    EXPECT_EQ(1u, store->Log().size());
    EXPECT_EQ(passes + 1, Number("SELECT COUNT(*) FROM pass"));
    Fault("checkAdultVerificationPin=cut");  // the service may count wrong PINs
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getConfig)(&session));
    store->ClearLog();
    EXPECT_EQ(ZV_WS_Status_timeout_error, Asking(ZV_WS_checkAdultVerificationPin, 1234)(&session));
    EXPECT_EQ(1u, store->Log().size());
}

// A broken connection must neither kill the process nor change its handling of the signal.
TEST_F(Transport, TheProcessKeepsItsSignals)
{
    for (int i = 0; i < 20; ++i) {
        Fault("getTitleListing=reset,count=2");
        Listing();
    }
    struct sigaction action;
    sigaction(SIGPIPE, nullptr, &action);
    EXPECT_EQ(SIG_DFL, action.sa_handler);
    sigset_t pending;
    sigpending(&pending);
    EXPECT_FALSE(sigismember(&pending, SIGPIPE));
}

}  // namespace
