// What happens on order to kept connections that wait for their next request.
#include <gtest/gtest.h>

#include "RawClient.h"

namespace {

class KeptConnectionTest : public StorefrontTest {
protected:
    void SetUp() override { Begin(); }

    std::string Request()
    {
        std::string text = SoapRequest{"StreamAPI", "getConfig"}.Text(store->HttpsPort());
        const std::string close = "Connection: close\r\n";
        return text.erase(text.find(close), close.size());
    }
    // Two connections, one of each port, that have been answered.
    struct Clients {
        RawClient tls, plain;
    };
    std::unique_ptr<Clients> Answered()
    {
        std::unique_ptr<Clients> clients(new Clients{{store->HttpsPort(), true}, {store->HttpPort(), false}});
        EXPECT_TRUE(clients->tls.Send(Request()) && clients->plain.Send(TimeRequest()));
        EXPECT_EQ(200, clients->tls.ReceiveOne().status);
        EXPECT_EQ(200, clients->plain.ReceiveOne().status);
        EXPECT_TRUE(store->WaitForIdle(2));
        return clients;
    }
};

TEST_F(KeptConnectionTest, BytesComeUnasked)
{
    const auto clients = Answered();
    EXPECT_EQ(2u, store->ActOnIdle(IdleAction::Write));
    EXPECT_EQ(408, clients->tls.ReceiveOne().status);
    EXPECT_EQ(408, clients->plain.ReceiveOne().status);
    EXPECT_EQ("2\n", Plain("/control/idle", "", "POST", "write\nHTTP/1.1 200 OK\r\nContent-Length: 2\r\n\r\nno").body);
    EXPECT_EQ("no", clients->tls.ReceiveOne().body);
    EXPECT_EQ("no", clients->plain.ReceiveOne().body);
    ASSERT_TRUE(clients->tls.Send(Request()));
    EXPECT_EQ(200, clients->tls.ReceiveOne().status) << "the connection still works";

    Order("clock=stray");
    ASSERT_TRUE(clients->plain.Send(TimeRequest()));
    EXPECT_EQ(200, clients->plain.ReceiveOne().status);
    EXPECT_EQ(408, clients->plain.ReceiveOne().status);
}

TEST_F(KeptConnectionTest, EndsComeInOrderOrNot)
{
    for (const bool inOrder : {true, false}) {
        const auto clients = Answered();
        EXPECT_EQ(2u, store->ActOnIdle(inOrder ? IdleAction::Close : IdleAction::Reset));
        EXPECT_EQ(inOrder, clients->tls.EndsInOrder());
        EXPECT_EQ(inOrder, clients->plain.EndsInOrder());
        EXPECT_EQ(0u, store->ActOnIdle(IdleAction::Write));
    }
}

TEST_F(KeptConnectionTest, SilenceIsForEver)
{
    const auto clients = Answered();
    EXPECT_EQ("2\n", Plain("/control/idle", "", "POST", "silence").body);
    EXPECT_EQ(0u, store->ActOnIdle(IdleAction::Write));
    ASSERT_TRUE(clients->tls.Send(Request()) && clients->plain.Send(TimeRequest()));
    store->ClearLog();
    const auto others = Answered();
    EXPECT_EQ(2u, store->Log().size());
    EXPECT_FALSE(clients->tls.HasBytes() || clients->plain.HasBytes());
    store.reset();
}

TEST_F(KeptConnectionTest, TicketsComeLate)
{
    const auto clients = Answered();
    const std::string before = clients->tls.Ticket();
    EXPECT_EQ(1u, store->ActOnIdle(IdleAction::Ticket)) << "the plain one has none";
    ASSERT_TRUE(clients->tls.Send(Request()));
    EXPECT_EQ(200, clients->tls.ReceiveOne().status);
    EXPECT_NE(before, clients->tls.Ticket());
    EXPECT_NE("", before);
}

TEST_F(KeptConnectionTest, OnlyWhatWaitsIsReached)
{
    Order("clock=hold");
    RawClient fresh(store->HttpPort(), false), held(store->HttpPort(), false);
    ASSERT_TRUE(held.Send(TimeRequest()));
    ASSERT_TRUE(store->WaitForRequests(1));
    EXPECT_EQ(0u, store->ActOnIdle(IdleAction::Close));
    store->ClearFaults();
    EXPECT_EQ(200, held.ReceiveOne().status);
    ASSERT_TRUE(store->WaitForIdle(1));
    EXPECT_EQ(1u, store->ActOnIdle(IdleAction::Close));
    ASSERT_TRUE(fresh.Send(TimeRequest()));
    EXPECT_EQ(200, fresh.ReceiveOne().status);
    EXPECT_EQ(400, Plain("/control/idle", "", "POST", "shout").status);
}

}  // namespace
