// The proxy: tunnels and plain requests, whom it lets through, how the log tells them from direct ones, its faults.
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>

#include "RawClient.h"

namespace {

const char kSite[] = "api.zorvane.example:443";
const char kImage[] = "http://images.zorvane.example/images/boxart/95/ZV0001295.jpg";

class ProxyTest : public StorefrontTest {
protected:
    void SetUp() override { BeginProxy(""); }
    void BeginProxy(const std::string& user)
    {
        StorefrontOptions options;
        options.proxyPort = 0;
        options.proxyUser = user;
        options.proxyPassword = "open sesame";
        Begin(options);
    }

    static std::string Connect(const std::string& target, const std::string& headers = "")
    {
        return "CONNECT " + target + " HTTP/1.1\r\nHost: " + target + "\r\n" + headers + "\r\n";
    }
    static std::string Get(const std::string& target, const std::string& headers = "")
    {
        return "GET " + target + " HTTP/1.1\r\nHost: x\r\n" + headers + "\r\n";
    }
    // What the proxy answers to the bytes, with all that follows until the connection ends.
    Reply Through(const std::string& bytes) { return SendBytes(store->ProxyPort(), false, bytes); }
    Reply AskThrough(RawClient& client)
    {
        SoapRequest request = {"StreamAPI", "getConfig"};
        request.host = "api.zorvane.example";
        EXPECT_TRUE(client.StartTls("api.zorvane.example", store->DataFolder() + "/ca.pem"));
        EXPECT_TRUE(client.Send(request.Text(0)));
        return client.Receive();
    }
};

TEST_F(ProxyTest, ATunnelLeadsToTheServicesUnderTheirNames)
{
    RawClient client(store->ProxyPort(), false);
    ASSERT_TRUE(client.Send(Connect(kSite, "Connection: close\r\n")));
    EXPECT_EQ("HTTP/1.1 200 Connection established", client.ReceiveOne(true).head.substr(0, 35));
    EXPECT_EQ(200, AskThrough(client).status);
    EXPECT_EQ(200, Ask("StreamAPI", "getConfig").status);
    const auto log = store->Log();
    ASSERT_EQ(3u, log.size());
    EXPECT_EQ("proxy", log[0].service);
    EXPECT_EQ("CONNECT", log[0].method);
    EXPECT_EQ(kSite, log[0].target);
    EXPECT_EQ("", log[0].credentials);
    EXPECT_EQ("/api/StreamAPI.asmx", log[1].target);
    EXPECT_EQ(log[0].connection, log[1].proxy);
    EXPECT_EQ(0u, log[2].proxy) << "a direct one";
}

TEST_F(ProxyTest, PlainRequestsShareConnections)
{
    RawClient client(store->ProxyPort(), false);
    const std::string clock = "http://LOCALHOST:" + std::to_string(store->HttpPort()) + "/device/time/";
    for (const std::string& target : {std::string(kImage), std::string(kImage), clock}) {
        ASSERT_TRUE(client.Send(Get(target)));
        EXPECT_EQ(200, client.ReceiveOne().status) << target;
        EXPECT_EQ("GET", store->Log().end()[-2].method);
        EXPECT_EQ(target, store->Log().end()[-2].target);
        EXPECT_EQ(target.substr(target.find('/', 7)), LastLogged().target);
        EXPECT_EQ(store->Log()[0].connection, LastLogged().proxy);
    }
    EXPECT_EQ(store->Log()[1].connection, store->Log()[3].connection);
    EXPECT_EQ("via", LastLogged().headers[1].first);
}

// Whatever the answer is like behind it, the client gets the same bytes.
TEST_F(ProxyTest, AnswersPassAsTheyAre)
{
    for (const char* fault : {"no-length", "cut-body", "short", "split:1", "http:404", "cut", "no-http", "headers"}) {
        Order(std::string("clock=") + fault);
        const Reply direct = Plain("/device/time/");
        Order(std::string("clock=") + fault);
        const Reply proxied = Through(Get("http://www.zorvane.example/device/time/", "Connection: close\r\n"));
        EXPECT_EQ(direct.head, proxied.head) << fault;
        EXPECT_EQ(direct.body.size(), proxied.body.size()) << fault;
        EXPECT_EQ(fault, LastLogged().fault);
    }
}

TEST_F(ProxyTest, LetsThroughWhomItKnows)
{
    BeginProxy("customer");
    const std::string right = Base64("customer:open sesame");
    const struct {
        std::string header;
        const char* standing;
    } rows[] = {
        {"", "none"},
        {"Proxy-Authorization: Basic " + Base64("customer:guess") + "\r\n", "wrong"},
        {"Proxy-Authorization: Digest " + right + "\r\n", "wrong"},
        {"Authorization: Basic " + right + "\r\n", "none"},
        {"Proxy-Authorization: Basic " + right + "\r\n", "right"},
        {"proxy-authorization: bAsIc  " + right + "\r\n", "right"},
    };
    RawClient plain(store->ProxyPort(), false);
    for (const auto& row : rows) {
        const bool right = std::string(row.standing) == "right";
        RawClient tunnel(store->ProxyPort(), false);
        for (const auto& [client, text] : {std::pair<RawClient*, std::string>(&plain, Get(kImage, row.header)),
                                           {&tunnel, Connect(kSite, row.header)}}) {
            ASSERT_TRUE(client->Send(text));
            const Reply reply = client->ReceiveOne();
            EXPECT_EQ(right ? 200 : 407, reply.status) << row.header;
            EXPECT_EQ(right ? "" : "Basic realm=\"storefront\"", reply.Header("Proxy-Authenticate")) << row.header;
            const auto log = store->Log();
            const LoggedRequest& entry =
                *std::find_if(log.rbegin(), log.rend(), [](const auto& logged) { return logged.service == "proxy"; });
            EXPECT_EQ(row.standing, entry.credentials) << row.header;
            EXPECT_EQ(std::string::npos, Value(entry.headers, "proxy-authorization").find(right)) << "a secret";
        }
    }
}

TEST_F(ProxyTest, WhatCannotBeReachedIsSaid)
{
    const int closed = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof address;
    ASSERT_EQ(0, bind(closed, reinterpret_cast<sockaddr*>(&address), size));
    getsockname(closed, reinterpret_cast<sockaddr*>(&address), &size);
    const std::string port = std::to_string(ntohs(address.sin_port));
    const std::pair<std::string, int> rows[] = {
        {Connect("127.0.0.1:" + port), 502},
        {Connect("[::1]:" + port), 502},
        {Get("http://127.0.0.1:" + port), 502},
        {Connect("api.zorvane.example"), 400},
        {Connect("api.zorvane.example:0"), 400},
        {Connect(":443"), 400},
        {Get("/device/time/"), 400},
        {Get("https://api.zorvane.example/"), 400},
        {Get("http://host:80000/"), 400},
        {Connect("[::1:443"), 400},
    };
    RawClient client(store->ProxyPort(), false);
    for (const auto& [request, status] : rows) {
        ASSERT_TRUE(client.Send(request));
        EXPECT_EQ(status, client.ReceiveOne().status) << request;
    }
    close(closed);
}

// What a fault leaves of the answer to CONNECT, and whether the tunnel then works.
TEST_F(ProxyTest, FaultsConcernTheAnswerOrTheTunnel)
{
    const struct {
        const char* fault;
        int status;
        const char* bite;  // in the head
        bool works;
    } rows[] = {
        {"ok", 200, "", true},
        {"http:407", 407, "Proxy-Authenticate: Basic", false},
        {"http:502", 502, "Bad Gateway", false},
        {"cut", 0, "", false},
        {"cut-header", 0, "HTTP/1.1 200", false},
        {"reset", 0, "", false},
        {"no-http", 0, "no protocol", false},
        {"drip:0", 200, "", true},
        {"zero-length", 200, "Content-Length: 0", true},
        {"headers", 200, "X-Filler: xxx", true},
        {"cut-tunnel", 200, "", false},
        {"cut-tunnel:300", 200, "", false},
        {"long", 200, "", false},
        {"garbage", 200, "", false},
        {"endless", 200, "", false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fault);
        store->ClearLog();
        Order(std::string("proxy=") + row.fault);
        RawClient client(store->ProxyPort(), false);
        ASSERT_TRUE(client.Send(Connect(kSite)));
        const Reply reply = client.ReceiveOne(true);
        EXPECT_EQ(row.status, reply.status);
        EXPECT_NE(std::string::npos, reply.head.find(row.bite)) << reply.head;
        if (row.status == 200) {
            EXPECT_EQ(row.works, client.StartTls("api.zorvane.example", store->DataFolder() + "/ca.pem"));
        }
        EXPECT_EQ(std::string(row.fault) == "ok" ? "" : row.fault, store->Log()[0].fault);
    }
    Order("proxy=headers");
    EXPECT_GT(Through(Get(kImage, "Connection: close\r\n")).head.size(), 64u * 1024);
    Order("proxy=cut-tunnel:200");
    EXPECT_LT(Through(Get(kImage)).body.size(), 200u);
}

TEST_F(ProxyTest, TheEndDoesNotWait)
{
    // Nobody takes connections from this one, whose queue is full.
    const int full = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof address;
    ASSERT_EQ(0, bind(full, reinterpret_cast<sockaddr*>(&address), size));
    ASSERT_EQ(0, listen(full, 0));
    getsockname(full, reinterpret_cast<sockaddr*>(&address), &size);
    const RawClient first(ntohs(address.sin_port), false);
    const std::string dead = "127.0.0.1:" + std::to_string(ntohs(address.sin_port));
    const std::pair<const char*, std::string> rows[] = {
        {"ok", Connect(kSite)},   {"stall", Connect(kSite)},        {"stall-header", Connect(kSite)},
        {"hold", Connect(kSite)}, {"stall-tunnel", Connect(kSite)}, {"endless-header", Connect(kSite)},
        {"ok", Connect(dead)},    {"ok", Get("http://" + dead)},
    };
    for (const auto& [fault, request] : rows) {
        SCOPED_TRACE(fault);
        SetUp();
        Order(std::string("proxy=") + fault);
        RawClient client(store->ProxyPort(), false);
        ASSERT_TRUE(client.Send(request));
        ASSERT_TRUE(store->WaitForRequests(1));
        store.reset();
    }
    close(full);
}

}  // namespace
