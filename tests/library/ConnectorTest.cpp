// Names, addresses and the way through a proxy, as far as a connected socket.
#include "Connector.h"

#include <gtest/gtest.h>
#include <net/if.h>
#include <sched.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <future>

#include "Listener.h"
#include "NameServer.h"
#include "Resolver.h"
#include "ZVUtilities.h"

namespace {

using std::chrono::milliseconds;

// Milliseconds. Sanitizers slow everything down.
#ifdef ZV_SANITIZED
constexpr int kSlow = 4;
#else
constexpr int kSlow = 1;
#endif
constexpr int kSlack = kSlow * 150;  // for a busy machine
constexpr auto kAbort = milliseconds(kSlow * 200);

// One connect, and how long it took.
struct Attempt {
    bool isOpen = false;
    std::string peer;
    long took = 0;  // milliseconds

    Attempt(const char* host, int port, int limit = 5000)
    {
        const std::atomic<bool> never{false};
        Run(host, port, limit, never);
    }
    Attempt(const char* host, int port, int limit, const std::atomic<bool>& aborted)
    {
        Run(host, port, limit, aborted);
    }

private:
    void Run(const char* host, int port, int limit, const std::atomic<bool>& aborted)
    {
        const uint64_t begin = ZVUtilities::MillisecondTime();
        const int connected = Connector::OpenTcp(host, port, {begin + static_cast<unsigned int>(limit), aborted});
        took = static_cast<long>(ZVUtilities::MillisecondTime() - begin);
        isOpen = connected >= 0;
        if (!isOpen) return;
        sockaddr_storage other = {};
        socklen_t size = sizeof other;
        getpeername(connected, reinterpret_cast<sockaddr*>(&other), &size);
        char text[INET6_ADDRSTRLEN];
        const bool isSix = other.ss_family == AF_INET6;
        peer = inet_ntop(other.ss_family,
                         isSix ? static_cast<void*>(&reinterpret_cast<sockaddr_in6&>(other).sin6_addr)
                               : &reinterpret_cast<sockaddr_in&>(other).sin_addr,
                         text, sizeof text);
        close(connected);
    }
};

// ---- Names

TEST(Names, AddressesAndTheHostsFileAreNotAsked)
{
    const NameServer server(NameServer::Fault::Silent);
    const Listener four("127.0.0.1", 0, true);
    for (const char* host : {"127.0.0.1", "localhost"}) {
        const Attempt attempt(host, four.Port());
        EXPECT_TRUE(attempt.isOpen) << host;
        EXPECT_LT(attempt.took, kSlack) << host;
        EXPECT_EQ(0, server.Asked(host)) << host;
    }
    const Listener six("::1", 0, true);
    if (six.Port() == 0) return;
    EXPECT_TRUE(Attempt("::1", six.Port()).isOpen);
    EXPECT_EQ(0, server.Asked("::1"));
}

TEST(Names, AreKeptAsLongAsTheirRecordsSay)
{
    NameServer server;
    server.Add("kept.test", NameServer::A, {"127.0.0.1"}, 60);
    server.Add("fleeting.test", NameServer::A, {"127.0.0.1"}, 0);
    const Listener one("127.0.0.1", 0, true), other("127.0.0.1", 0, true);
    for (int i = 0; i < 2; ++i) {
        EXPECT_TRUE(Attempt("kept.test", one.Port()).isOpen);
        EXPECT_TRUE(Attempt("kept.test", other.Port()).isOpen);  // a port has nothing to do with it
        EXPECT_TRUE(Attempt("fleeting.test", one.Port()).isOpen);
    }
    EXPECT_EQ(2, server.Asked("kept.test"));  // once for each family
    EXPECT_EQ(4, server.Asked("fleeting.test"));
}

// Their owner has moved, perhaps.
TEST(Names, AreAskedAgainWhenNoAddressIsGood)
{
    NameServer server;
    const Listener good("127.0.0.1", 0, true);
    server.Add("moved.test", NameServer::A, {"127.0.0.9"});
    EXPECT_FALSE(Attempt("moved.test", good.Port()).isOpen);
    server.Add("moved.test", NameServer::A, {"127.0.0.1"});
    EXPECT_TRUE(Attempt("moved.test", good.Port()).isOpen);
}

TEST(Names, FailuresEndInTime)
{
    constexpr int kLimit = 1000;
    const struct {
        NameServer::Fault fault;
        bool isSure;  // that there will be no answer
    } rows[] = {
        {NameServer::Fault::None, true},  // it knows no such name
        {NameServer::Fault::Refused, true},   {NameServer::Fault::Silent, false},   {NameServer::Fault::Garbage, false},
        {NameServer::Fault::Stranger, false}, {NameServer::Fault::CutShort, false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(static_cast<int>(row.fault));
        NameServer server(row.fault);
        if (row.fault != NameServer::Fault::None) server.Add("some.test", NameServer::A, {"127.0.0.1"});
        const Listener good("127.0.0.1", 0, true);
        const Attempt attempt("some.test", good.Port(), kLimit);
        EXPECT_FALSE(attempt.isOpen);
        EXPECT_LT(attempt.took, (row.isSure ? 0 : kLimit) + kSlack);
        EXPECT_EQ(row.fault != NameServer::Fault::Refused, server.Asked("some.test") > 0);
    }
}

TEST(Names, AMuteServerHoldsUpNoAbort)
{
    const NameServer server(NameServer::Fault::Silent);
    std::atomic<bool> aborted{false};
    auto attempt = std::async(std::launch::async, [&] { return Attempt("some.test", 1, 20000, aborted); });
    while (server.Asked("some.test") == 0 && attempt.wait_for(milliseconds(1)) != std::future_status::ready) {
    }
    EXPECT_GT(server.Asked("some.test"), 0);
    const auto begin = std::chrono::steady_clock::now();
    aborted = true;
    EXPECT_FALSE(attempt.get().isOpen);
    EXPECT_LT(std::chrono::steady_clock::now() - begin, kAbort);
}

// ---- Addresses

// Several routers never answer for IPv6.
TEST(Addresses, OneFamilyDoesNotWaitForTheOther)
{
    const Listener four("127.0.0.1", 0, true);
    {
        NameServer server;
        server.Ignore(NameServer::AAAA);
        server.Add("four.test", NameServer::A, {"127.0.0.1"});
        const Attempt attempt("four.test", four.Port());
        EXPECT_EQ("127.0.0.1", attempt.peer);
        EXPECT_LT(attempt.took, 50 + kSlack);
        EXPECT_EQ(2, server.Asked("four.test"));
    }
    const Listener six("::1", 0, true);
    if (six.Port() == 0) GTEST_SKIP() << "no IPv6 here";
    NameServer server;
    server.Ignore(NameServer::A);
    server.Add("six.test", NameServer::AAAA, {"::1"});
    const Attempt attempt("six.test", six.Port());
    EXPECT_EQ("::1", attempt.peer);
    EXPECT_LT(attempt.took, kSlack);
}

TEST(Addresses, TheNextIsTriedWhenOneFailsOrIsSilent)
{
    const Listener good("127.0.0.1", 0, true);
    const Listener silent("127.0.0.2", good.Port(), false), mute("127.0.0.3", good.Port(), false);
    const struct {
        std::vector<std::string> addresses;
        long least, most;
    } rows[] = {
        {{"127.0.0.9", "127.0.0.1"}, 0, 0},      // nobody listens there
        {{"127.0.0.2", "127.0.0.1"}, 250, 250},  // nobody answers there
        {{"127.0.0.2", "127.0.0.3", "127.0.0.1"}, 500, 500},
        {{"127.0.0.2", "127.0.0.9", "127.0.0.1"}, 250, 250},
        {{"127.0.0.1", "127.0.0.2"}, 0, 0},
    };
    for (const auto& row : rows) {
        NameServer server;
        server.Ignore(NameServer::AAAA);
        server.Add("many.test", NameServer::A, row.addresses);
        const Attempt attempt("many.test", good.Port());
        SCOPED_TRACE(testing::PrintToString(row.addresses));
        EXPECT_EQ("127.0.0.1", attempt.peer);
        EXPECT_LE(row.least, attempt.took);
        EXPECT_LT(attempt.took, row.most + 50 + kSlack);
    }
}

TEST(Addresses, ABlackHoleOfOneFamilyCostsAQuarterOfASecond)
{
    const Listener four("127.0.0.1", 0, true);
    const Listener six("::1", four.Port(), false);
    if (six.Port() == 0) GTEST_SKIP() << "no IPv6 here";
    NameServer server;
    server.Add("both.test", NameServer::A, {"127.0.0.1"});
    server.Add("both.test", NameServer::AAAA, {"::1"});
    const Attempt attempt("both.test", four.Port());
    EXPECT_EQ("127.0.0.1", attempt.peer);
    EXPECT_LE(250, attempt.took);  // IPv6 was tried first
    EXPECT_LT(attempt.took, 250 + kSlow * 100);
    const Attempt nobody("both.test", 1, 300);
    EXPECT_FALSE(nobody.isOpen);
    EXPECT_LT(nobody.took, kSlack);
}

TEST(Addresses, SilenceEndsWithTheTimeOrAnAbort)
{
    const Listener silent("127.0.0.1", 0, false);
    const Attempt attempt("127.0.0.1", silent.Port(), 500);
    EXPECT_FALSE(attempt.isOpen);
    EXPECT_LE(500, attempt.took);
    EXPECT_LT(attempt.took, 500 + kSlack);
    std::atomic<bool> aborted{false};
    std::promise<void> begun;
    auto broken = std::async(std::launch::async, [&] {
        begun.set_value();
        return Attempt("127.0.0.1", silent.Port(), 20000, aborted);
    });
    begun.get_future().wait();
    const auto begin = std::chrono::steady_clock::now();
    aborted = true;
    EXPECT_FALSE(broken.get().isOpen);
    EXPECT_LT(std::chrono::steady_clock::now() - begin, kAbort);
}

// In a network of its own, where only the loopback is: the exit code of the child that it takes.
enum { kRight, kWrong, kNoNetwork };

int InItsOwnNetwork(int (*body)())
{
    const pid_t child = fork();
    if (child == 0) {
        const int control = unshare(CLONE_NEWUSER | CLONE_NEWNET) == 0 || unshare(CLONE_NEWNET) == 0
                                ? socket(AF_INET, SOCK_DGRAM, 0)
                                : -1;
        ifreq loopback = {};
        strcpy(loopback.ifr_name, "lo");
        loopback.ifr_flags = IFF_UP;
        _exit(control >= 0 && ioctl(control, SIOCSIFFLAGS, &loopback) == 0 ? body() : kNoNetwork);
    }
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : kWrong;
}

TEST(Addresses, AFamilyWithoutARouteCostsNothing)
{
    const int result = InItsOwnNetwork([]() -> int {
        const Listener four("127.0.0.1", 0, true);
        NameServer server;
        server.Add("both.test", NameServer::A, {"127.0.0.1"});
        server.Add("both.test", NameServer::AAAA, {"2001:db8::1", "2001:db8::2"});
        const Attempt attempt("both.test", four.Port());
        return attempt.peer == "127.0.0.1" && attempt.took < kSlack ? kRight : kWrong;
    });
    if (result == kNoNetwork) GTEST_SKIP() << "no network namespace can be made here";
    EXPECT_EQ(kRight, result);
}

}  // namespace
