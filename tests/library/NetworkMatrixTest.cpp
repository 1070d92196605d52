// What homes do to connections: names, addresses, rest, proxies, clocks.
#include <arpa/inet.h>
#include <dirent.h>
#include <linux/filter.h>

#include <fstream>
#include <future>
#include <set>
#include <sstream>

#include "Clock.h"
#include "FaultMatrix.h"
#include "Listener.h"
#include "LogLines.h"
#include "NameServer.h"

namespace {

using std::chrono::milliseconds;
using std::chrono::steady_clock;

#ifdef ZV_SANITIZED
constexpr auto kAbort = milliseconds(800);  // sanitizers slow everything down
#else
constexpr auto kAbort = milliseconds(200);
#endif

#define ZV_FOR_EACH_KIND(suite)                                       \
    INSTANTIATE_TEST_SUITE_P(Kinds, suite, testing::ValuesIn(kKinds), \
                             [](const auto& info) { return std::string(info.param.name); })

bool IsSoap(const Kind& kind)
{
    return kind.column == kSoap;
}

// ---- Names and addresses

// The bandwidth file's address is the service's, and not the deployment's.
class Named : public FaultMatrix {
protected:
    static constexpr char kName[] = "api.zorvane.example";  // one of those in the certificate

    void SetUp() override
    {
        if (GetParam().column == kBandwidth) GTEST_SKIP() << "needs no name that is not in the hosts file";
        ASSERT_NO_FATAL_FAILURE(OpenStore());
        setenv("ZV_DEPLOYMENT", NamedDeployment(store->DeploymentFile(), kName, m_Folder).c_str(), 1);
        ServeNames(NameServer::Fault::None);
        ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
        ASSERT_LT(0, m_Names->Asked(kName));
    }

    void ServeNames(NameServer::Fault fault, const std::vector<std::string>& addresses = {"127.0.0.1"})
    {
        m_Names.reset();
        m_Names = std::make_unique<NameServer>(fault);
        if (!addresses.empty()) m_Names->Add(kName, NameServer::A, addresses);
    }

    TempFolder m_Folder;
    std::unique_ptr<NameServer> m_Names;
};

TEST_P(Named, NamesThatAreNotToBeHad)
{
    using Fault = NameServer::Fault;
    const Kind& kind = GetParam();
    const struct {
        Fault fault;
        std::vector<std::string> addresses;
    } rows[] = {{Fault::Refused, {}}, {Fault::None, {}}, {Fault::Silent, {}}, {Fault::Garbage, {}}};
    for (const auto& row : rows) {
        // It would take the clock's 30 seconds. What breaks off such a wait is below.
        const bool isSure = row.fault == Fault::Refused || row.fault == Fault::None;
        if (kind.column == kClock && !isSure) continue;
        SCOPED_TRACE(static_cast<int>(row.fault));
        ServeNames(row.fault, row.addresses);
        ReconnectNext();
        store->ClearLog();
        const auto begin = steady_clock::now();
        const Outcome outcome = kind.call(session, ++m_Row);
        EXPECT_LT(steady_clock::now() - begin, std::chrono::seconds(isSure ? kSlack : kTimeout + kSlack));
        EXPECT_EQ(kind.column == kDiscovery ? -1001 : -2011, outcome.status);
        EXPECT_TRUE(outcome.isEmpty);
        EXPECT_TRUE(store->Log().empty());
        EXPECT_EQ(row.fault == Fault::Refused, m_Names->Asked(kName) == 0);
        ServeNames(Fault::None);
        ExpectCached(false);
    }
}

TEST_P(Named, ASilentAddressBeforeAGoodOne)
{
    const Listener silent("127.0.0.2", store->HttpsPort(), false), mute("127.0.0.2", store->HttpPort(), false);
    ServeNames(NameServer::Fault::None, {"127.0.0.2", "127.0.0.1"});
    ReconnectNext();
    const auto begin = steady_clock::now();
    const Outcome outcome = GetParam().call(session, ++m_Row);
    EXPECT_GE(steady_clock::now() - begin, milliseconds(250));
    EXPECT_LT(steady_clock::now() - begin, std::chrono::seconds(kSlack));
    EXPECT_EQ(0, outcome.status);
    EXPECT_TRUE(outcome.isWhole);
}

ZV_FOR_EACH_KIND(Named);

// ---- Connections that have rested

class Rested : public FaultMatrix {
protected:
    void SetUp() override
    {
        if (!IsSoap(GetParam())) GTEST_SKIP() << "keeps no connection";
        FaultMatrix::SetUp();
    }

    // The connections of the calls since the log was cleared.
    std::vector<unsigned long> Connections() const
    {
        std::vector<unsigned long> connections;
        for (const LoggedRequest& request : store->Log())
            connections.push_back(request.connection);
        return connections;
    }
};

TEST_P(Rested, WhatHappensMeanwhileIsNeverTheNextAnswer)
{
    const struct {
        IdleAction action;
        bool isKept;
    } rows[] = {
        {IdleAction::Write, false}, {IdleAction::Close, false}, {IdleAction::Reset, false}, {IdleAction::Ticket, true}};
    for (const auto& row : rows) {
        SCOPED_TRACE(static_cast<int>(row.action));
        store->ClearLog();
        ASSERT_EQ(0, GetParam().call(session, ++m_Row).status);
        ASSERT_TRUE(store->WaitUntilIdle(store->Log().back().connection));
        ASSERT_LE(1u, store->ActOnIdle(row.action));
        const Outcome outcome = GetParam().call(session, ++m_Row);
        EXPECT_EQ(0, outcome.status);
        EXPECT_TRUE(outcome.isWhole);
        const auto connections = Connections();
        ASSERT_EQ(2u, connections.size());  // nothing was sent in vain
        EXPECT_EQ(row.isKept, connections[0] == connections[1]);
    }
}

TEST_P(Rested, TheLimitIsTheDeployments)
{
    ZV_WS_release(&session);
    std::ofstream(store->DeploymentFile(), std::ios::app) << "connection_idle_limit = 0\n";
    ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
    store->ClearLog();
    for (int i = 0; i < 3; ++i)
        EXPECT_EQ(0, GetParam().call(session, ++m_Row).status);
    const auto connections = Connections();
    EXPECT_EQ(3u, std::set<unsigned long>(connections.begin(), connections.end()).size());
}

ZV_FOR_EACH_KIND(Rested);

// From now on nothing passes in either direction, and nobody is told: what a router does when it forgets a connection.
// Returns how many of this process's connections from that port there were.
int DropAllFrom(int port)
{
    sock_filter none[] = {BPF_STMT(BPF_RET | BPF_K, 0)};
    const sock_fprog program = {1, none};
    int count = 0;
    for (int each = 3; each < 256; ++each) {
        sockaddr_in own = {}, other = {};
        socklen_t size = sizeof own;
        if (getsockname(each, reinterpret_cast<sockaddr*>(&own), &size) != 0 || own.sin_family != AF_INET) continue;
        size = sizeof other;
        if (ntohs(own.sin_port) != port || getpeername(each, reinterpret_cast<sockaddr*>(&other), &size) != 0) continue;
        count += setsockopt(each, SOL_SOCKET, SO_ATTACH_FILTER, &program, sizeof program) == 0;
    }
    return count;
}

class Forgotten : public Store {};

TEST_F(Forgotten, ConnectionsAreNoticedInTenSecondsAndReadsAskedAgain)
{
    Store::SetUp();
    ASSERT_EQ(ZV_WS_Status_ok, Initialize());
    ZV_WS_Session other;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&other, &session));
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getTitleListing, 12)(&session));
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getTitleListing, 13)(&other));
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getConfig)(&session));
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getConfig)(&other));
    ASSERT_EQ(4, DropAllFrom(store->HttpsPort()));
    store->ClearLog();
    const auto begin = steady_clock::now();
    auto change = std::async(std::launch::async, [&] { return Asking(ZV_WS_addItemToWishlist, 12)(&other); });
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getTitleListing, 14)(&session));
    EXPECT_NE(ZV_WS_Status_ok, change.get());
    const auto took = steady_clock::now() - begin;
    EXPECT_GE(took, milliseconds(2000));
    EXPECT_LT(took, milliseconds(10000) + 10 * kAbort);
    EXPECT_EQ(std::vector<std::string>{"getTitleListing"}, Asked());
    ZV_WS_release(&other);
}

// ---- Proxies

class Proxied : public FaultMatrix {
protected:
    static constexpr char kUser[] = "home", kPassword[] = "open sesame";

    void SetUp() override
    {
        StorefrontOptions options;
        options.proxyPort = 0;
        options.proxyUser = kUser;
        options.proxyPassword = kPassword;
        ASSERT_NO_FATAL_FAILURE(OpenStore(options));
        setenv("ZV_DEPLOYMENT", store->ProxyDeploymentFile().c_str(), 1);
        ASSERT_NO_FATAL_FAILURE(BeginThrough(store->ProxyPort(), kPassword));
    }

    void BeginThrough(int port, const char* password)
    {
        ZV_WS_release(&session);
        ZV_WS_ProxyParam proxy;
        proxy.Host = "localhost";
        proxy.Port = port;
        proxy.UserName = kUser;
        proxy.Password = password;
        Begin(CacheFolder(), proxy);
    }

    void TearDown() override
    {
        FaultMatrix::TearDown();
        Proxy().MakeCurrent();
    }
};

TEST_P(Proxied, AllTrafficGoesThroughIt)
{
    EXPECT_EQ(0, GetParam().call(session, ++m_Row).status);
    const auto log = store->Log();
    EXPECT_FALSE(log.empty());
    for (const LoggedRequest& request : log) {
        EXPECT_TRUE(request.service == "proxy" || request.proxy != 0) << request.service;
        EXPECT_EQ(request.service == "proxy" ? "right" : "", request.credentials);
        EXPECT_EQ("", request.violation);
        // Only the proxy is shown the credentials, and only it is asked for whole addresses.
        if (request.service != "proxy") {
            EXPECT_EQ("", Header(request, "proxy-authorization"));
            EXPECT_EQ('/', request.target[0]);
        }
    }
}

const struct {
    const char* fault;
    int statuses[5];  // by column
} kProxyRows[] = {
    // clang-format off
    //                   SOAP   discovery    clock    bandwidth  box art
    {"http:407",       {-4407, -1001, -1001,   -1001,     -1001}},
    {"http:502",       {-4502, -1001, -1001,   -1001,     -1001}},
    {"cut",            {-4029, -1001, -1001,   -1001,     -1001}},
    {"cut-header",     {-4029, -1001, -1001,   -1001,     -1001}},
    {"reset",          {-4029, -1001, -1001,   -1001,     -1001}},
    {"no-http",        {-4029, -1001, -1001,   -1001,     -1001}},
    {"endless-header", {-4029, -1001, -1001,   -1001,     -1001}},
    {"stall",          {-2011, -1001, -1001,   -1001,     -1001}},
    {"stall-header",   {-2011, -1001, -1001,   -1001,     -1001}},
    {"long",           {-4029, -1001, 0,       0,         0}},
    {"cut-tunnel",     {-5030, -1001, kCannot, kCannot,   kCannot}},
    {"stall-tunnel",   {-5030, -1001, kCannot, kCannot,   kCannot}},
    {"drip:2",         {0,     0,           kCannot, kCannot,   kCannot}},
    // clang-format on
};

TEST_P(Proxied, Faults)
{
    const Kind& kind = GetParam();
    ASSERT_EQ(0, kind.call(session, ++m_Row).status);
    for (const auto& row : kProxyRows) {
        if (row.statuses[kind.column] == kCannot) continue;
        if (kind.column == kClock && strncmp(row.fault, "stall", 5) == 0) continue;  // 30 s
        SCOPED_TRACE(row.fault);
        ReconnectNext();
        store->ClearLog();
        Fault(std::string("proxy=") + row.fault);
        ExpectOutcome(row.statuses[kind.column]);
    }
}

ZV_FOR_EACH_KIND(Proxied);

class SetUpThroughAProxy : public Store {};

TEST_F(SetUpThroughAProxy, FailsWhenItIsGoneOrLetsNobodyThrough)
{
    StorefrontOptions options;
    options.proxyPort = 0;
    options.proxyUser = "home";
    options.proxyPassword = "open sesame";
    Open(options);
    setenv("ZV_DEPLOYMENT", store->ProxyDeploymentFile().c_str(), 1);
    const int gone = Listener("127.0.0.1", 0, true).Port();
    const struct {
        int port;
        const char* password;
        const char* credentials;
    } rows[] = {{store->ProxyPort(), "wrong", "wrong"}, {gone, "open sesame", nullptr}};
    ZV_WS_SetupParams setup = Setup();
    setup.ProxyParam.Host = "localhost";
    setup.ProxyParam.UserName = "home";
    for (const auto& row : rows) {
        store->ClearLog();
        setup.ProxyParam.Port = row.port;
        setup.ProxyParam.Password = row.password;
        EXPECT_EQ(ZV_WS_Status_connection_error, Initialize(setup));
        EXPECT_EQ(row.credentials == nullptr, store->Log().empty());
        for (const LoggedRequest& request : store->Log())
            EXPECT_EQ(row.credentials, request.credentials);
    }
    setup.ProxyParam.Port = store->ProxyPort();
    setup.ProxyParam.Password = "open sesame";
    EXPECT_EQ(ZV_WS_Status_ok, Initialize(setup));
    Proxy().MakeCurrent();
}

// ---- Breaking off

// How many connections to that port wait for their first answer.
int CountConnecting(int port)
{
    constexpr int kSynSent = 2;
    int count = 0;
    std::ifstream table("/proc/self/net/tcp");
    for (std::string line; std::getline(table, line);) {
        int remote = 0, state = 0;
        const bool isRow = sscanf(line.c_str(), "%*d: %*x:%*x %*x:%x %x", &remote, &state) == 2;
        count += isRow && remote == port && state == kSynSent;
    }
    return count;
}

class BrokenOff : public Named {
protected:
    // Of the call that begins, once `hasBegun` tells that it is where it is to be broken off.
    template <class Begun>
    void ExpectEnd(Begun hasBegun)
    {
        const Kind& kind = GetParam();
        auto call = std::async(std::launch::async, [&] { return kind.call(session, ++m_Row); });
        while (!hasBegun() && call.wait_for(milliseconds(1)) != std::future_status::ready) {
        }
        ASSERT_NE(std::future_status::ready, call.wait_for(milliseconds(0))) << "not held up";
        const auto begin = steady_clock::now();
        ZV_WS_abort(kind.column == kClock ? nullptr : &session);
        const Outcome outcome = call.get();
        EXPECT_LT(steady_clock::now() - begin, kAbort);
        EXPECT_NE(0, outcome.status);
        EXPECT_TRUE(outcome.isEmpty);
        store->ClearFaults();
        // An aborted session stays so.
        ZV_WS_release(&session);
        ServeNames(NameServer::Fault::None);
        ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
        EXPECT_EQ(0, kind.call(session, ++m_Row).status);
    }
};

TEST_P(BrokenOff, WhereverItStands)
{
    const Kind& kind = GetParam();
    const auto isLogged = [&](const char* service) {
        const auto log = store->Log();
        return std::any_of(log.begin(), log.end(), [&](const LoggedRequest& each) {
            return each.service == service || each.operation == service;
        });
    };
    {
        SCOPED_TRACE("name");
        ServeNames(NameServer::Fault::Silent);
        ReconnectNext();
        ExpectEnd([&] { return m_Names->Asked(kName) > 0; });
    }
    {
        SCOPED_TRACE("connect");
        const int port = IsTls(kind) ? store->HttpsPort() : store->HttpPort();
        const Listener silent("127.0.0.2", port, false);
        ServeNames(NameServer::Fault::None, {"127.0.0.2"});
        ReconnectNext();
        const int before = CountConnecting(port);
        ExpectEnd([&] { return CountConnecting(port) > before; });
    }
    for (const char* fault :
         {"connect=stall", "connect=stall-handshake", "=stall", "=stall-header", "=stall-body", "=drip:50"}) {
        SCOPED_TRACE(fault);
        if (fault[0] != '=' && !IsTls(kind)) continue;
        // What is no SOAP takes what the first bytes bring.
        if (fault[0] == '=' && !IsSoap(kind) && strcmp(fault, "=stall") != 0) continue;
        ReconnectNext();
        store->ClearLog();
        const std::string operation = fault[0] == '=' ? kind.operation : "";
        Fault(operation + fault);
        ExpectEnd(
            [&] { return isLogged(operation.empty() ? "connect" : operation.c_str()) || isLogged(kind.operation); });
    }
}

ZV_FOR_EACH_KIND(BrokenOff);

// ---- Clocks

constexpr int64_t kHour = 3600, kYear = 365 * 24 * kHour;
constexpr time_t kLongAgo = 1700000000;

class OffClock : public FaultMatrix {
protected:
    void SetUp() override
    {
        ASSERT_NO_FATAL_FAILURE(OpenStore());
        // Players know no earlier time than that of their making.
        store->SetCertificate(CertificateKind::Good, {kLongAgo, 0});
    }
    void TearDown() override
    {
        Clock::PretendSystemIsOff(0);
        FaultMatrix::TearDown();
    }

    LogLines m_Lines;
};

TEST_P(OffClock, IsMendedOnceAndTold)
{
    const Kind& kind = GetParam();
    for (const int64_t off : {-static_cast<int64_t>(time(nullptr)), -7 * kHour, 5 * kHour, -400l, 0l, 200l}) {
        SCOPED_TRACE(off);
        Clock::PretendSystemIsOff(off);
        ZV_WS_release(&session);
        store->ClearLog();
        m_Lines.Clear();
        ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
        for (int i = 0; i < 2; ++i) {
            const Outcome outcome = kind.call(session, ++m_Row);
            EXPECT_EQ(0, outcome.status);
            EXPECT_TRUE(outcome.isWhole);
        }
        // Only what is signed is refused, and only a refusal tells about the clock; some have no such call.
        const auto log = store->Log();
        const auto isSigned = [](const LoggedRequest& request) { return !request.soap.empty(); };
        const auto isRefused = [](const LoggedRequest& request) { return !request.violation.empty(); };
        const bool isLearned = std::llabs(off) > Clock::kTolerance && std::any_of(log.begin(), log.end(), isSigned);
        EXPECT_TRUE(isLearned || !IsSoap(kind) || std::llabs(off) <= Clock::kTolerance);
        EXPECT_EQ(isLearned ? 1 : 0, std::count_if(log.begin(), log.end(), isRefused));
        EXPECT_EQ(isLearned ? 1 : 0, m_Lines.Count("the clock is "));
        EXPECT_NEAR(isLearned ? -off : 0, Clock::Offset(), 5);
    }
}

TEST_P(OffClock, OfTheServiceOverPlainHttpSaysNothing)
{
    const Kind& kind = GetParam();
    if (IsTls(kind) || kind.column == kBandwidth) GTEST_SKIP() << "asks over TLS";
    ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
    store->SetClock(7 * kHour);
    for (const char* fault : {"=ok", "=http:401", "=http:403"}) {
        Fault(kind.operation + std::string(fault));
        kind.call(session, ++m_Row);
    }
    const auto log = store->Log();
    EXPECT_EQ(3, std::count_if(log.begin(), log.end(), [](const LoggedRequest& request) { return !request.tls; }));
    EXPECT_EQ(0, Clock::Offset());
}

// What no other time can mend.
TEST_P(OffClock, BeyondMending)
{
    const Kind& kind = GetParam();
    if (!IsSoap(kind)) GTEST_SKIP() << "shows no digest";
    const time_t now = time(nullptr);
    const char* const tooNew = "whose certificate is not valid yet";
    const char* const impossible = "whose certificates are not valid at that time";
    const struct {
        const char* what;
        int64_t players, services;
        CertificateDates valid;
        const char* fault;
        int status;
        const char* line;
    } rows[] = {
        {"a certificate of tomorrow", 0, 0, {now + 24 * kHour, 0}, "ok", -7001, tooNew},
        {"one younger than the player", -now, 0, {now + 24 * kHour, 0}, "ok", -7001, tooNew},
        {"one that has expired", 0, 0, {kLongAgo, now - kHour}, "ok", -5030, nullptr},
        {"one that seems expired", 3 * kYear, 0, {kLongAgo, now + kYear}, "ok", -5030, nullptr},
        {"a service beyond its certificate", 0, 2 * kYear, {kLongAgo, now + kYear}, "ok", -7001, impossible},
        {"a service before its certificate", 0, -2 * kYear, {now - kYear, 0}, "ok", -7001, impossible},
        {"an answer from a cache", -7 * kHour, 0, {kLongAgo, 0}, "age:60", -6012, nullptr},
        {"no date", -7 * kHour, 0, {kLongAgo, 0}, "no-date", -6012, nullptr},
        {"no date that one can read", -7 * kHour, 0, {kLongAgo, 0}, "bad-date", -6012, nullptr},
    };
    Clock::PretendSystemIsOff(0);
    ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
    for (const auto& row : rows) {
        SCOPED_TRACE(row.what);
        store->SetCertificate(CertificateKind::Good, row.valid);
        store->SetClock(row.services);
        Clock::PretendSystemIsOff(row.players);
        ReconnectNext();
        m_Lines.Clear();
        Fault(kind.operation + std::string("=") + row.fault);
        const Outcome outcome = kind.call(session, ++m_Row);
        EXPECT_EQ(row.status, outcome.status);
        EXPECT_TRUE(outcome.isEmpty);
        EXPECT_EQ(row.line ? 1 : 0, m_Lines.Count("the clock is "));
        EXPECT_EQ(row.line ? 1 : 0, m_Lines.Count(row.line ? row.line : tooNew));
        EXPECT_EQ(0, Clock::Offset());
        store->SetCertificate(CertificateKind::Good, {kLongAgo, 0});
        store->SetClock(0);
        store->ClearFaults();
        Clock::PretendSystemIsOff(0);
        ReconnectNext();
        ExpectCached(false);
    }
}

TEST_P(OffClock, IsLearnedOnceByAll)
{
    const Kind& kind = GetParam();
    if (!IsSoap(kind)) GTEST_SKIP() << "shows no digest";
    constexpr int kThreads = 6;
    ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
    Clock::PretendSystemIsOff(-7 * kHour);
    store->ClearLog();
    Fault(kind.operation + std::string("=hold,count=6"));  // refused all together
    ZV_WS_Session copies[kThreads];
    std::vector<std::future<Outcome>> calls;
    for (ZV_WS_Session& copy : copies) {
        ASSERT_EQ(0, ZV_WS_duplicate(&copy, &session));
        calls.push_back(std::async(std::launch::async, [&, n = ++m_Row] { return kind.call(copy, n); }));
    }
    EXPECT_TRUE(store->WaitForRequests(kThreads));
    store->ClearFaults();
    for (auto& call : calls)
        EXPECT_EQ(0, call.get().status);
    EXPECT_EQ(2u * kThreads, Asked().size());
    EXPECT_EQ(1, m_Lines.Count("the clock is "));
    for (ZV_WS_Session& copy : copies)
        ZV_WS_release(&copy);
}

ZV_FOR_EACH_KIND(OffClock);

// What it was last known to be, when the system knows less.
TEST(ClockFile, KeepsTheLastGoodTime)
{
    TempFolder folder;
    Deployment deployment = Deployment::Current();
    deployment.clock_file = (folder / "clock").c_str();
    Clock::PretendSystemIsOff(0);
    const time_t now = time(nullptr);
    Clock::NoteGood(now + kYear, deployment);  // the clock does not agree
    EXPECT_FALSE(std::filesystem::exists(folder / "clock"));
    Clock::NoteGood(now, deployment);
    Clock::PretendSystemIsOff(-now);
    EXPECT_EQ(now, Clock::ForCertificates(deployment));
    Clock::PretendSystemIsOff(kHour);
    EXPECT_NEAR(now + kHour, Clock::ForCertificates(deployment), 5);
    Clock::PretendSystemIsOff(0);
}

}  // namespace
