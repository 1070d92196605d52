// What the log shows of the traffic, and what it never shows.
#include "TrafficLog.h"

#include <gtest/gtest.h>
#include <string.h>

#include <regex>

#include "Calls.h"
#include "Peer.h"
#include "Store.h"
#include "ZV_Log.h"

namespace {

TEST(SecretFilter, LeavesSecretsOutWhereverThePiecesEnd)
{
    const struct {
        const char* message;
        const char* logged;
    } rows[] = {
        {"GET / HTTP/1.1\r\nHost: a\r\nproxy-authorization: Basic c2VjcmV0\r\nX: 1\r\n\r\n<a>1</a>",
         "GET / HTTP/1.1\r\nHost: a\r\nproxy-authorization: ***\r\nX: 1\r\n\r\n<a>1</a>"},
        {"HTTP/1.1 200 OK\r\n\r\n<ns:AuthToken x=\"1\">secret</ns:AuthToken><AuthTokens>open</AuthTokens>",
         "HTTP/1.1 200 OK\r\n\r\n<ns:AuthToken x=\"1\">***</ns:AuthToken><AuthTokens>open</AuthTokens>"},
        {"HTTP/1.1 200 OK\r\n\r\n<Password><![CDATA[secret]]></Password><PIN/>x<PIN></PIN>",
         "HTTP/1.1 200 OK\r\n\r\n<Password>***</Password><PIN/>x<PIN>***</PIN>"},
        {"HTTP/1.1 200 OK\r\nSet-Cookie: a=secret\r\nSET-COOKIE : b=secret\r\n  more=secret\r\n\tsecret\r\n X\r\nX: "
         "1\r\n\r\n",
         "HTTP/1.1 200 OK\r\nSet-Cookie: ***\r\nSET-COOKIE : ***\r\n ***\r\n ***\r\n ***\r\nX: 1\r\n\r\n"},
        {"HTTP/1.1 100 Continue\r\nX: 1\r\n\r\nHTTP/1.1 200 OK\r\nSet-Cookie: secret\r\nX-API-Key: "
         "secret\r\n\r\n<a>1</a>",
         "HTTP/1.1 100 Continue\r\nX: 1\r\n\r\nHTTP/1.1 200 OK\r\nSet-Cookie: ***\r\nX-API-Key: ***\r\n\r\n<a>1</a>"},
        {"HTTP/1.1 200 OK\r\nContent-Type: a\r\n b\r\n\r\nSet-Cookie: shown",
         "HTTP/1.1 200 OK\r\nContent-Type: a\r\n b\r\n\r\nSet-Cookie: shown"},
        {"POST / HTTP/1.1\r\n\r\n<ZV1:APIKey>secret</ZV1:APIKey><apiKey\n>secret</apiKey "
         "><checkAuthToken>shown</checkAuthToken>",
         "POST / "
         "HTTP/1.1\r\n\r\n<ZV1:APIKey>***</ZV1:APIKey><apiKey\n>***</apiKey><checkAuthToken>shown</checkAuthToken>"},
        {"GET /\r\n\r\n<Password><a>secret</a>secret<Pass>secret</Password>shown<PIN>&lt;/PIN secret</PIN>shown",
         "GET /\r\n\r\n<Password>***</Password>shown<PIN>***</PIN>shown"},
        {"GET /\r\n\r\n<a b='>' x:PIN = \"se'cret\" c=\"<\" Password='>secret' d='1'/><!-- don't <PIN>secret</PIN> "
         "--><a>1</a>",
         "GET /\r\n\r\n<a b='>' x:PIN = \"***\" c=\"<\" Password='***' d='1'/><!-- don't <PIN>***</PIN> --><a>1</a>"},
        {"GET /\r\n\r\n<faultstring>a &lt; b &lt;AuthToken&gt;secret&lt;/AuthToken&gt; &lt;PIN/&gt;shown "
         "<![CDATA[<Pin>secret</Pin>]]></faultstring>",
         "GET /\r\n\r\n<faultstring>a &lt; b &lt;AuthToken&gt;***&lt;/AuthToken&gt; &lt;PIN/&gt;shown "
         "<![CDATA[<Pin>***</Pin>]]></faultstring>"},
        {"HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n5\r\n<Auth\r\n14\r\nToken>secret</AuthToken>",
         "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n"},
    };
    for (const auto& row : rows) {
        const std::string message = row.message;
        for (size_t cut = 0; cut <= message.size(); ++cut) {
            SecretFilter filter;
            ZVString logged = filter.Filter(message.data(), cut);
            logged += filter.Filter(message.data() + cut, message.size() - cut);
            ASSERT_STREQ(row.logged, logged.c_str()) << cut;
        }
    }
}

// ---- Every call

// All that is logged of the traffic while it lives.
class Traffic {
public:
    Traffic()
    {
        ZV_LogSetTarget(
            [](const char* text, unsigned int length, void* self) {
                static_cast<Traffic*>(self)->text.append(text, length ? length : strlen(text));
            },
            this);
    }
    ~Traffic() { ZV_LogSetTarget(nullptr, nullptr); }
    Traffic(const Traffic&) = delete;
    Traffic& operator=(const Traffic&) = delete;

    size_t Count(const std::string& part) const
    {
        size_t count = 0;
        for (size_t at = 0; (at = text.find(part, at)) != std::string::npos; at += part.size())
            ++count;
        return count;
    }

    std::string text;
};

TEST_F(Store, NoCallLogsTheSecretsThatItSends)
{
    const std::string proxyUser = "proxyuser", proxyPassword = "open sesame", coded = "cHJveHl1c2VyOm9wZW4gc2VzYW1l";
    StorefrontOptions options;
    options.proxyPort = 0;
    options.proxyUser = proxyUser;
    options.proxyPassword = proxyPassword;
    Open(options);
    setenv("ZV_DEPLOYMENT", store->ProxyDeploymentFile().c_str(), 1);
    const Traffic traffic;
    ZV_WS_SetupParams setup = Setup();
    setup.ProxyParam = {"127.0.0.1", store->ProxyPort(), proxyUser.c_str(), proxyPassword.c_str()};
    ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
    Owned<ZV_WS_AuthorizeDeviceResponse> device;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_authorizeDevice(&session, StorefrontAccount::kActivationPin, &device));
    const std::string token = device.AuthToken;
    for (const std::string& name : CallNames()) {
        CallResult result;
        MakeCall(name, &session, result);
    }
    Owned<ZV_WS_Image> image;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getBoxArtImageData(&session, BOX_ART_SIZE_95, "ZV00012", &image));
    time_t now = 0;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getServerTime(&now));
    unsigned int rate = 0;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkBandwidth(&session, &rate));

    size_t sent = 0;
    for (const LoggedRequest& request : store->Log())
        sent += request.soap.empty() ? 0 : 1;
    EXPECT_LT(CallNames().size() / 2, sent);
    EXPECT_LE(sent, traffic.Count("APIKey>***</"));
    EXPECT_LE(3u, traffic.Count("Proxy-Authorization: ***"));
    for (const std::string& secret : {token, proxyPassword, coded, std::string(StorefrontAccount::kApiKey),
                                      std::string(StorefrontAccount::kActivationPin)})
        EXPECT_EQ(0u, traffic.Count(secret)) << secret;
    // The calls' arguments are all the same text.
    const std::regex shown("<([^>/ ]*:)?(APIKey|AuthToken|PIN|Password|GiftCertificateCode)( [^>]*)?>(?!\\*\\*\\*)[^<]",
                           std::regex::icase);
    std::smatch match;
    EXPECT_FALSE(std::regex_search(traffic.text, match, shown)) << match.str();
}

TEST(TrafficOfCalls, ShowsNoSecretThatAServiceTells)
{
    const std::string answer =
        "HTTP/1.1 500 Internal Server Error\r\nContent-Type: text/xml\r\nset-cookie: "
        "secret\r\nX-Auth-Token:secret\r\n\r\n"
        "<SOAP-ENV:Envelope "
        "xmlns:SOAP-ENV=\"http://schemas.xmlsoap.org/soap/envelope/\"><SOAP-ENV:Body><SOAP-ENV:Fault>"
        "<faultcode>SOAP-ENV:Client</faultcode><faultstring>told "
        "&lt;APIKey&gt;secret&lt;/APIKey&gt;</faultstring><detail>"
        "<AuthToken>secret</AuthToken></detail></SOAP-ENV:Fault></SOAP-ENV:Body></SOAP-ENV:Envelope>";
    for (const size_t piece : {size_t(1), answer.size()}) {
        const Traffic traffic;
        Peer peer(answer, piece);
        PeerSession session;
        for (const std::string& name : CallNames()) {
            CallResult result;
            peer.Accept(4);
            MakeCall(name, session.handle(), result);
        }
        EXPECT_LT(CallNames().size() / 2, traffic.Count(piece == 1 ? "] 5" : "told "));
        EXPECT_EQ(0u, traffic.Count("secret"));
        const std::regex prefix("\\[[^\\]]*soap_recv\\] ");
        EXPECT_EQ(std::string::npos, std::regex_replace(traffic.text, prefix, "").find("secret"));
    }
}

}  // namespace
