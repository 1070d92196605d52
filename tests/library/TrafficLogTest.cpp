// What the log shows of the traffic, and what it never shows.
#include "TrafficLog.h"

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

void Append(const char* text, unsigned int length, void* user)
{
    static_cast<std::string*>(user)->append(text, length ? length : strlen(text));
}

using Traffic = Store;

TEST_F(Traffic, IsShownWithoutPasswordAndToken)
{
    std::string log;
    ZV_LogSetTarget(Append, &log);
    ASSERT_EQ(ZV_WS_Status_ok, Initialize());
    Owned<ZV_WS_AuthorizeDeviceResponse> device;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_authorizeDevice(&session, StorefrontAccount::kActivationPin, &device));
    Owned<ZV_WS_TitleListingResponse> listing;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getTitleListing(&session, 12, &listing));
    Owned<ZV_WS_StandardResponse> removed;
    ZV_WS_removeAllMyPurchases(&session, StorefrontAccount::kPassword, &removed);
    ZV_LogSetTarget(nullptr, nullptr);

    EXPECT_NE(std::string::npos, log.find("-soap_sent] "));
    EXPECT_NE(std::string::npos, log.find("<ZV1:TitleID>12</ZV1:TitleID>"));
    EXPECT_NE(std::string::npos, log.find(std::string("<TitleName>") + listing.TitleName));  // inflated
    for (const std::string& secret : {std::string(StorefrontAccount::kPassword), std::string(device.AuthToken),
                                      std::string(StorefrontAccount::kActivationPin)}) {
        EXPECT_EQ(std::string::npos, log.find(secret)) << secret;
    }
}

}  // namespace
