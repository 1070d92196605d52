// What goes over the wire, against envelopes written by hand.
#include <regex>

#include "Exchange.h"

namespace {

// A call of the generated method with a request filled by `fill`.
#define CALL(name, ...)                           \
    [](auto& service) {                           \
        _ZV1__##name request;                     \
        _ZV1__##name##Response response;          \
        auto& r = request;                        \
        (void)r;                                  \
        __VA_ARGS__;                              \
        return service.name(&request, &response); \
    }

char* Text(const char* text)
{
    return const_cast<char*>(text);
}

// The body of a request, byte by byte.
template <class Service, class Call>
std::string Body(const char* operation, Call call)
{
    Exchange<Service> exchange;
    exchange.Run(operation, HttpAnswer("", "503 Busy"), call);
    return exchange.Body();
}

// What is odd about the bodies. That each request has its children, in their order, is what the simulator looks at.
TEST(Request, Bodies)
{
    // The searches page the other way round, and their text comes first.
    EXPECT_EQ(
        "<ZV1:searchForTitle><ZV1:Query>Zo\xC3\xAB &amp; &lt;1&gt;</ZV1:Query><ZV1:ItemsPerPage>5</ZV1:ItemsPerPage>"
        "<ZV1:CurrentPageNumber>1</ZV1:CurrentPageNumber><ZV1:PurchaseType>rent</ZV1:PurchaseType>"
        "<ZV1:TitleType>tv</ZV1:TitleType></ZV1:searchForTitle>",
        Body<RealTimeBrowse>(
            "searchForTitle",
            CALL(searchForTitle, r.Query = Text("Zo\xC3\xAB & <1>"); r.ItemsPerPage = 5; r.CurrentPageNumber = 1;
                 r.PurchaseType = ZV1__StreamAPIPurchaseType__rent; r.TitleType = ZV1__TitleTypeFilter__tv)));
    EXPECT_EQ(
        "<ZV1:getTitlesByGenreArray><ZV1:GenreIDs><ZV1:int>3</ZV1:int><ZV1:int>4</ZV1:int></ZV1:GenreIDs>"
        "<ZV1:CurrentPageNumber>1</ZV1:CurrentPageNumber><ZV1:ItemsPerPage>9</ZV1:ItemsPerPage>"
        "<ZV1:PurchaseType>rent</ZV1:PurchaseType></ZV1:getTitlesByGenreArray>",
        Body<RealTimeBrowse>(
            "getTitlesByGenreArray",
            CALL(getTitlesByGenreArray, int ids[2] = {3, 4}; ZV1__ArrayOfInt array; array.__sizeint_ = 2;
                 array.int_ = ids; r.GenreIDs = &array; r.CurrentPageNumber = 1; r.ItemsPerPage = 9)));
    // An absent text is left out.
    EXPECT_EQ("<ZV1:assignGiftCertificateToUser></ZV1:assignGiftCertificateToUser>",
              Body<DownloadAPI>("assignGiftCertificateToUser", CALL(assignGiftCertificateToUser, )));
}

// Everything around the body, with the parts that differ each time taken out.
TEST(Request, EnvelopeAndHeaders)
{
    Exchange<StreamAPI> exchange;
    exchange.Run("getConfig", HttpAnswer("", "503 Busy"), CALL(getConfig, ));
    std::string request = exchange.Request();
    request = std::regex_replace(request, std::regex("(PasswordDigest\">)[A-Za-z0-9+/]{27}="), "$1DIGEST");
    request = std::regex_replace(request, std::regex("(Base64Binary\">)[A-Za-z0-9+/]+=*"), "$1NONCE");
    request = std::regex_replace(request, std::regex("\\d{4}-\\d\\d-\\d\\dT\\d\\d:\\d\\d:\\d\\dZ"), "CREATED");
    const std::string head = request.substr(0, request.find("\r\n\r\n") + 4);
    EXPECT_EQ("POST /api/StreamAPI.asmx HTTP/1.1", head.substr(0, head.find("\r\n")));
    for (const char* line : {"\r\nHost: 127.0.0.1:1\r\n", "\r\nUser-Agent: ZVSDK: F|A\r\n",
                             "\r\nContent-Type: text/xml; charset=utf-8\r\n", "\r\nConnection: keep-alive\r\n",
                             "\r\nAccept-Encoding: gzip\r\n"}) {
        EXPECT_NE(std::string::npos, head.find(line)) << line << head;
    }
    EXPECT_EQ(
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
        "<SOAP-ENV:Envelope"
        " xmlns:SOAP-ENV=\"http://schemas.xmlsoap.org/soap/envelope/\""
        " xmlns:SOAP-ENC=\"http://schemas.xmlsoap.org/soap/encoding/\""
        " xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\""
        " xmlns:xsd=\"http://www.w3.org/2001/XMLSchema\""
        " xmlns:c14n=\"http://www.w3.org/2001/10/xml-exc-c14n#\""
        " xmlns:wsu=\"http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-utility-1.0.xsd\""
        " xmlns:ds=\"http://www.w3.org/2000/09/xmldsig#\""
        " xmlns:wsse=\"http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd\""
        " xmlns:wsa=\"http://schemas.xmlsoap.org/ws/2004/08/addressing\""
        " xmlns:ZV2=\"http://api.zorvane.example/api/StreamAPISoap12\""
        " xmlns:ZV3=\"http://api.zorvane.example/api/RealTimeBrowseSoap12\""
        " xmlns:ZV4=\"http://api.zorvane.example/api/DownloadAPISoap12\""
        " xmlns:ZV1=\"http://api.zorvane.example/api/\""
        " xmlns:ZV5=\"http://api.zorvane.example/api/DownloadAuthenticateSoap12\">"
        "<SOAP-ENV:Header>"
        "<wsse:Security SOAP-ENV:mustUnderstand=\"1\"><wsse:UsernameToken wsu:Id=\"User\">"
        "<wsse:Username>customer</wsse:Username>"
        "<wsse:Password Type=\"http://docs.oasis-open.org/wss/2004/01/"
        "oasis-200401-wss-username-token-profile-1.0#PasswordDigest\">DIGEST</wsse:Password>"
        "<wsse:Nonce EncodingType=\"http://docs.oasis-open.org/wss/2004/01/"
        "oasis-200401-wss-soap-message-security-1.0#Base64Binary\">NONCE</wsse:Nonce>"
        "<wsu:Created>CREATED</wsu:Created></wsse:UsernameToken></wsse:Security>"
        "<wsa:MessageID>uuid:getConfig</wsa:MessageID>"
        "<wsa:ReplyTo SOAP-ENV:mustUnderstand=\"1\"><wsa:Address>"
        "http://schemas.xmlsoap.org/ws/2004/08/addressing/role/anonymous</wsa:Address></wsa:ReplyTo>"
        "<wsa:To SOAP-ENV:mustUnderstand=\"1\">http://127.0.0.1:1/api/StreamAPI.asmx</wsa:To>"
        "<wsa:Action SOAP-ENV:mustUnderstand=\"1\">http://api.zorvane.example/api/getConfig</wsa:Action>"
        "<ZV1:StreamDeviceRequestSettings SOAP-ENV:mustUnderstand=\"1\"><ZV1:APIKey>key&lt;&amp;&gt;1</ZV1:APIKey>"
        "<ZV1:DestinationUniqueID>device-1</ZV1:DestinationUniqueID>"
        "<ZV1:DestinationTypeID>48</ZV1:DestinationTypeID><ZV1:AuthToken>token-1</ZV1:AuthToken>"
        "</ZV1:StreamDeviceRequestSettings>"
        "</SOAP-ENV:Header><SOAP-ENV:Body><ZV1:getConfig></ZV1:getConfig></SOAP-ENV:Body></SOAP-ENV:Envelope>\r\n",
        request.substr(head.size()));
}

}  // namespace
