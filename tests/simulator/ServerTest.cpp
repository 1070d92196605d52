// Ports, connections, certificates, the plain exchanges, and the end.
#include <sys/wait.h>

#include <atomic>
#include <chrono>
#include <filesystem>
#include <list>
#include <thread>

#include "RawClient.h"

namespace {

class ServerTest : public StorefrontTest {};

TEST_F(ServerTest, AConnectionIsKeptAndATlsSessionResumed)
{
    Begin();
    const SoapRequest request{"StreamAPI", "getConfig"};
    RawClient client(store->HttpsPort(), CaFile());
    ASSERT_TRUE(client.Connect());
    for (int i = 0; i < 2; ++i) {
        ASSERT_TRUE(client.Send(request.Text(store->HttpsPort())));
        EXPECT_EQ(200, client.Receive().status);
    }
    ASSERT_TRUE(client.Connect());
    ASSERT_TRUE(client.Send(request.Text(store->HttpsPort())));
    EXPECT_EQ(200, client.Receive().status);
    const std::vector<LoggedRequest> log = store->Log();
    ASSERT_EQ(3u, log.size());
    EXPECT_EQ(log[0].connection, log[1].connection);
    EXPECT_NE(log[0].connection, log[2].connection);
    EXPECT_FALSE(log[0].resumed);
    EXPECT_TRUE(log[2].resumed);
}

TEST_F(ServerTest, AnswersAreCompressedForThoseWhoAcceptIt)
{
    Begin();
    SoapRequest request{"StreamAPI", "getConfig"};
    EXPECT_EQ("", Send(request).Header("Content-Encoding"));
    request.http_headers = "Accept-Encoding: gzip,deflate\r\n";
    const Reply packed = Send(request);
    EXPECT_EQ("gzip", packed.Header("Content-Encoding"));
    EXPECT_EQ("\x1f\x8b", packed.body.substr(0, 2));
}

TEST_F(ServerTest, OnlyTheGoodCertificatePassesACarefulClient)
{
    const struct {
        CertificateKind kind;
        long result;
    } rows[] = {{CertificateKind::Untrusted, X509_V_ERR_CERT_SIGNATURE_FAILURE},
                {CertificateKind::Expired, X509_V_ERR_CERT_HAS_EXPIRED},
                {CertificateKind::WrongName, X509_V_ERR_HOSTNAME_MISMATCH},
                {CertificateKind::WideWildcard, X509_V_ERR_HOSTNAME_MISMATCH},
                {CertificateKind::NameOnly, X509_V_ERR_HOSTNAME_MISMATCH}};
    Begin();
    for (const auto& row : rows) {
        SCOPED_TRACE(static_cast<int>(row.kind));
        store->SetCertificate(row.kind);
        RawClient client(store->HttpsPort(), CaFile());
        EXPECT_FALSE(client.Connect());
        EXPECT_EQ(row.result, client.verify_result) << X509_verify_cert_error_string(client.verify_result);
    }
    store->SetCertificate(CertificateKind::Good);
    EXPECT_EQ(200, Ask("StreamAPI", "getConfig").status);
}

TEST_F(ServerTest, OldTlsIsNotSpokenWithACarefulClient)
{
    StorefrontOptions options;
    options.oldTls = true;
    Begin(options);
    RawClient client(store->HttpsPort(), CaFile());
    EXPECT_FALSE(client.Connect());
}

TEST_F(ServerTest, PlainExchanges)
{
    Begin();
    const Reply clock = Plain("/device/time/");
    EXPECT_EQ("HTTP/1.1 200 OK", clock.head.substr(0, 15));
    int part[6];
    char half[3];
    EXPECT_EQ(7, sscanf(clock.body.c_str(), "%d/%d/%d %d:%d:%d %2s", &part[0], &part[1], &part[2], &part[3], &part[4],
                        &part[5], half));
    EXPECT_EQ(1000000u, Plain("/bandwidth/test.bin").body.size());
    EXPECT_EQ(404, Plain("/device/env/?d=x&dt=48").status) << "discovery is over TLS alone";
    EXPECT_EQ(404, Plain("/elsewhere").status);
    EXPECT_EQ("nothing is at /elsewhere", LastLogged().violation);

    const Reply image = Plain("/images/boxart/135s/ZV00012135.jpg");
    EXPECT_EQ("image/jpeg", image.Header("Content-Type"));
    EXPECT_EQ("\xff\xd8\xff", image.body.substr(0, 3));
    EXPECT_EQ(image.body, Plain("/images/boxart/135s/ZV00012135.jpg").body);
    EXPECT_NE(image.body, Plain("/images/boxart/135s/ZV00013135.jpg").body);
    const std::string known = "If-Modified-Since: " + image.Header("Last-Modified") + "\r\n";
    EXPECT_EQ(304, Plain("/images/boxart/135s/ZV00012135.jpg", known).status);
    Order("boxart=modified");
    EXPECT_EQ(200, Plain("/images/boxart/135s/ZV00012135.jpg", known).status);
    for (const char* path : {"135/ZV00012135.jpg", "135s/ZV00012136.jpg", "96/ZV0001296.jpg", "95/95.jpg", "95"}) {
        EXPECT_EQ(404, Plain(std::string("/images/boxart/") + path).status) << path;
    }
}

TEST_F(ServerTest, DiscoveryAnswersOneDigit)
{
    StorefrontOptions options;
    options.environment = 7;
    Begin(options);
    RawClient client(store->HttpsPort(), CaFile());
    ASSERT_TRUE(client.Connect());
    ASSERT_TRUE(client.Send("GET /device/env/?d=a%20b&dt=48 HTTP/1.1\r\nHost: localhost\r\n\r\n"));
    const Reply reply = client.Receive();
    EXPECT_EQ("1", reply.Header("Content-Length"));
    EXPECT_EQ("7", reply.body);
    EXPECT_EQ("a b", Value(LastLogged().children, "d"));
}

TEST_F(ServerTest, WhatIsNoRequestIsLogged)
{
    Begin();
    RawClient client(store->HttpPort());
    ASSERT_TRUE(client.Connect());
    ASSERT_TRUE(client.Send("not HTTP\r\n\r\n"));
    EXPECT_EQ("", client.ReceiveSome());
    ASSERT_TRUE(store->WaitForRequests(1));
    EXPECT_EQ("no whole HTTP request", LastLogged().violation);
}

// The end comes at once in whatever state connections are.
TEST_F(ServerTest, TheEndDoesNotWaitForConnections)
{
    const auto start = std::chrono::steady_clock::now();
    for (const char* fault :
         {"getConfig=stall", "getConfig=stall-body", "getConfig=ok,delay=60000", "getConfig=drip:60000",
          "getConfig=endless", "connect=stall", "connect=stall-handshake", "connect=reset", ""}) {
        SCOPED_TRACE(fault);
        Begin();
        RawClient idle(store->HttpPort());
        ASSERT_TRUE(idle.Connect());
        if (*fault) Order(fault);
        const bool early = std::string(fault).compare(0, 7, "connect") == 0;
        RawClient client(store->HttpsPort(), early ? "" : CaFile());
        ASSERT_TRUE(client.Connect());
        if (!early) {
            ASSERT_TRUE(client.Send(SoapRequest{"StreamAPI", "getConfig"}.Text(store->HttpsPort())));
        }
        ASSERT_TRUE(store->WaitForRequests(1));
        store.reset();
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(60));
}

TEST_F(ServerTest, ManyConnectionsAtOnce)
{
    Begin();
    std::list<std::thread> threads;
    std::atomic<int> good{0};
    for (int i = 0; i < 8; ++i) {
        threads.emplace_back([&] {
            for (int round = 0; round < 5; ++round) {
                if (Ask("RealTimeBrowse", "getTitleListing", Children({{"TitleID", "12"}})).Element("TitleID") == "12")
                    ++good;
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(40, good);
    EXPECT_EQ(40u, store->Log().size());
}

TEST_F(ServerTest, WhatChangedIsThereAfterARestart)
{
    std::string folder = (std::filesystem::temp_directory_path() / "storefront-test-XXXXXX").string();
    ASSERT_TRUE(mkdtemp(&folder[0]));
    StorefrontOptions options;
    options.dataFolder = folder;
    Begin(options);
    EXPECT_EQ("0", Ask("StreamAPI", "addItemToWishlist", Children({{"TitleID", "21"}})).Element("ResponseCode"));
    EXPECT_EQ("0", Ask("StreamAPI", "setAudioDefaultProperty", Children({{"AudioSetting", "DTS_Express_51"}}))
                       .Element("ResponseCode"));
    const std::string gift = Children({{"GiftCertificateCode", "GIFT2"}});
    EXPECT_EQ("4500", Ask("StreamAPI", "assignGiftCertificateToUser", gift).Element("Balance"));
    store.reset();
    Begin(options);
    EXPECT_EQ("true",
              Ask("RealTimeBrowse", "getTitleListing", Children({{"TitleID", "21"}})).Element("IsAvailInUserWishList"));
    EXPECT_EQ("DTS_Express_51", Ask("StreamAPI", "getAudioDefaultProperty").Element("getAudioDefaultPropertyResult"));
    EXPECT_EQ("4500", Ask("DownloadAPI", "showPrePaidCardBalance").Element("Balance"));
    EXPECT_EQ("1", Ask("StreamAPI", "assignGiftCertificateToUser", gift).Element("ResponseCode"));
    store.reset();
    std::filesystem::remove_all(folder);
}

TEST_F(ServerTest, WhatCannotStartSaysWhyInOneLine)
{
    Begin();
    StorefrontOptions taken;
    taken.httpPort = store->HttpPort();
    StorefrontOptions unwritable;
    unwritable.dataFolder = "/proc/storefront";
    StorefrontOptions fault;
    fault.faults = {"getConfig=sever"};
    const std::pair<StorefrontOptions, std::string> rows[] = {
        {taken, "port " + std::to_string(taken.httpPort)}, {unwritable, "/proc/storefront"}, {fault, "sever"}};
    for (const auto& row : rows) {
        std::string error;
        EXPECT_FALSE(Storefront::Start(row.first, error));
        EXPECT_NE(std::string::npos, error.find(row.second)) << error;
        EXPECT_EQ(std::string::npos, error.find('\n'));
    }
}

// ---- The program

struct Output {
    int code;
    std::string text;
};

// Runs the program with both streams in the text, to its end or, with `end`, to its "ready" and then a SIGTERM.
Output RunProgram(std::vector<const char*> arguments, bool end = false)
{
    int ends[2];
    if (pipe(ends) != 0) return {-1, ""};
    arguments.insert(arguments.begin(), STOREFRONT_PROGRAM);
    arguments.push_back(nullptr);
    const pid_t child = fork();
    if (child == 0) {
        dup2(ends[1], 1);
        dup2(ends[1], 2);
        execv(STOREFRONT_PROGRAM, const_cast<char* const*>(arguments.data()));
        _exit(127);
    }
    close(ends[1]);
    Output output{-1, ""};
    char piece[4096];
    for (ssize_t size; (size = read(ends[0], piece, sizeof piece)) > 0;) {
        output.text.append(piece, static_cast<size_t>(size));
        if (end && output.text.find("ready\n") != std::string::npos) kill(child, SIGTERM);
    }
    close(ends[0]);
    int status = 0;
    waitpid(child, &status, 0);
    output.code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return output;
}

TEST(ProgramTest, SaysWhereItServesAndEndsOnATermSignal)
{
    const Output output = RunProgram({}, true);
    EXPECT_EQ(0, output.code);
    int https = 0;
    int http = 0;
    char file[512] = "";
    EXPECT_EQ(3, sscanf(output.text.c_str(), "https port %d\nhttp port %d\ndeployment file %511s\nready\n", &https,
                        &http, file))
        << output.text;
    EXPECT_FALSE(std::filesystem::exists(file)) << "the temporary folder is gone";
}

TEST(ProgramTest, RefusesWithOneLineAndItsOwnCode)
{
    const struct {
        std::vector<const char*> arguments;
        int code;
        const char* text;
    } rows[] = {{{"--port", "1"}, 2, "unknown option --port"},
                {{"--latency"}, 2, "--latency needs MS"},
                {{"--latency", "soon"}, 2, "--latency needs MS"},
                {{"--https-port", "65536"}, 2, "--https-port needs N"},
                {{"--certificate", "bad"}, 2, "--certificate needs KIND"},
                {{"--fault", "getConfig=sever"}, 1, "sever"},
                {{"--data", "/proc/storefront"}, 1, "/proc/storefront"}};
    for (const auto& row : rows) {
        const Output output = RunProgram(row.arguments);
        EXPECT_EQ(row.code, output.code) << output.text;
        EXPECT_NE(std::string::npos, output.text.find(row.text)) << output.text;
        EXPECT_EQ(output.text.size() - 1, output.text.find('\n')) << output.text;
    }
}

TEST(ProgramTest, HelpTellsOptionsFaultsAndWhatIsNotChecked)
{
    const Output output = RunProgram({"--help"});
    EXPECT_EQ(0, output.code);
    for (const char* text :
         {"--https-port", "--certificate", "stall-handshake", "POST /control/faults", "Not checked"}) {
        EXPECT_NE(std::string::npos, output.text.find(text)) << text;
    }
}

}  // namespace
