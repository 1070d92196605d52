// What goes over the wire, against envelopes written by hand.
#include <functional>
#include <regex>

#include "Exchange.h"

namespace {

template <class Service>
struct Row {
    const char* operation;
    std::function<int(Service&)> call;
    const char* body;
};

// The body of each request, byte by byte.
template <class Service>
void CheckBodies(const std::vector<Row<Service>>& rows)
{
    for (const Row<Service>& row : rows) {
        SCOPED_TRACE(row.operation);
        Exchange<Service> exchange;
        exchange.Run(row.operation, HttpAnswer("", "503 Busy"), row.call);
        EXPECT_EQ(row.body, exchange.Body());
        const std::string action = std::string("http://api.zorvane.example/api/") + row.operation;
        EXPECT_EQ("\"" + action + "\"", exchange.Between("\r\nSOAPAction: ", "\r\n"));
        EXPECT_EQ(action, exchange.Between("<wsa:Action SOAP-ENV:mustUnderstand=\"1\">", "<"));
    }
}

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

TEST(Request, BrowseBodies)
{
    CheckBodies<RealTimeBrowse>({
        {"getNavigation", CALL(getNavigation, ), "<ZV1:getNavigation></ZV1:getNavigation>"},
        {"getTitlesByNavigation",
         CALL(getTitlesByNavigation, r.GenreID = 7; r.CurrentPageNumber = 2; r.ItemsPerPage = 20;
              r.PurchaseType = ZV1__StreamAPIPurchaseType__any),
         "<ZV1:getTitlesByNavigation><ZV1:GenreID>7</ZV1:GenreID><ZV1:CurrentPageNumber>2</ZV1:CurrentPageNumber>"
         "<ZV1:ItemsPerPage>20</ZV1:ItemsPerPage><ZV1:PurchaseType>any</ZV1:PurchaseType></ZV1:getTitlesByNavigation>"},
        {"getTitleListing", CALL(getTitleListing, r.TitleID = -1),
         "<ZV1:getTitleListing><ZV1:TitleID>-1</ZV1:TitleID></ZV1:getTitleListing>"},
        // The searches page the other way round, and their text comes first.
        {"searchForTitle",
         CALL(searchForTitle, r.Query = Text("Zo\xC3\xAB & <1>"); r.ItemsPerPage = 5; r.CurrentPageNumber = 1;
              r.PurchaseType = ZV1__StreamAPIPurchaseType__rent; r.TitleType = ZV1__TitleTypeFilter__tv),
         "<ZV1:searchForTitle><ZV1:Query>Zo\xC3\xAB &amp; &lt;1&gt;</ZV1:Query><ZV1:ItemsPerPage>5</ZV1:ItemsPerPage>"
         "<ZV1:CurrentPageNumber>1</ZV1:CurrentPageNumber><ZV1:PurchaseType>rent</ZV1:PurchaseType>"
         "<ZV1:TitleType>tv</ZV1:TitleType></ZV1:searchForTitle>"},
        {"searchForTitleDetail",
         CALL(searchForTitleDetail, r.ItemsPerPage = 5; r.CurrentPageNumber = 1;
              r.PurchaseType = ZV1__StreamAPIPurchaseType__buy; r.TitleType = ZV1__TitleTypeFilter__movies),
         "<ZV1:searchForTitleDetail><ZV1:ItemsPerPage>5</ZV1:ItemsPerPage><ZV1:CurrentPageNumber>1"
         "</ZV1:CurrentPageNumber><ZV1:PurchaseType>buy</ZV1:PurchaseType><ZV1:TitleType>movies</ZV1:TitleType>"
         "</ZV1:searchForTitleDetail>"},
        {"getTitlesByGenreArray",
         CALL(getTitlesByGenreArray, int ids[2] = {3, 4}; ZV1__ArrayOfInt array; array.__sizeint_ = 2; array.int_ = ids;
              r.GenreIDs = &array; r.CurrentPageNumber = 1; r.ItemsPerPage = 9),
         "<ZV1:getTitlesByGenreArray><ZV1:GenreIDs><ZV1:int>3</ZV1:int><ZV1:int>4</ZV1:int></ZV1:GenreIDs>"
         "<ZV1:CurrentPageNumber>1</ZV1:CurrentPageNumber><ZV1:ItemsPerPage>9</ZV1:ItemsPerPage>"
         "<ZV1:PurchaseType>rent</ZV1:PurchaseType></ZV1:getTitlesByGenreArray>"},
        {"translateSkuId", CALL(translateSkuId, r.SkuId = 11),
         "<ZV1:translateSkuId><ZV1:SkuId>11</ZV1:SkuId></ZV1:translateSkuId>"},
        {"getRecommendedTitles", CALL(getRecommendedTitles, r.TitleId = 12),
         "<ZV1:getRecommendedTitles><ZV1:TitleId>12</ZV1:TitleId></ZV1:getRecommendedTitles>"},
    });
}

TEST(Request, AccountBodies)
{
    CheckBodies<DownloadAPI>({
        // Small first letters, and capitals inside, are the service's own.
        {"getWishlistItems",
         CALL(getWishlistItems, r.sortOrder = 2; r.CurrentPageNumber = 1; r.ItemsPerPage = 10;
              r.TitleType = ZV1__TitleTypeFilter__any),
         "<ZV1:getWishlistItems><ZV1:sortOrder>2</ZV1:sortOrder><ZV1:CurrentPageNumber>1</ZV1:CurrentPageNumber>"
         "<ZV1:ItemsPerPage>10</ZV1:ItemsPerPage><ZV1:TitleType>any</ZV1:TitleType></ZV1:getWishlistItems>"},
        {"doPurchaseSavedbilling",
         CALL(doPurchaseSavedbilling, r.SkuID = 5; r.IPAddress = Text("10.0.0.1"); r.UsePrePaidFunds = Text("yes")),
         "<ZV1:doPurchaseSavedbilling><ZV1:SkuID>5</ZV1:SkuID><ZV1:IPAddress>10.0.0.1</ZV1:IPAddress>"
         "<ZV1:UsePrePaidFunds>yes</ZV1:UsePrePaidFunds></ZV1:doPurchaseSavedbilling>"},
        {"checkRentalExpiration", CALL(checkRentalExpiration, r.PassId = 3),
         "<ZV1:checkRentalExpiration><ZV1:PassId>3</ZV1:PassId></ZV1:checkRentalExpiration>"},
        {"GetCountryID", CALL(GetCountryID, ), "<ZV1:GetCountryID></ZV1:GetCountryID>"},
        {"assignGiftCertificateToUser", CALL(assignGiftCertificateToUser, ),
         "<ZV1:assignGiftCertificateToUser></ZV1:assignGiftCertificateToUser>"},
        {"getMyVideos",
         CALL(getMyVideos, r.CurrentPageNumber = 1; r.ItemsPerPage = 2;
              r.PurchaseType = ZV1__StreamAPIPurchaseType__buy; r.TitleType = ZV1__TitleTypeFilter__tv;
              r.WatchStatusFilter = ZV1__WatchStatus(1)),
         "<ZV1:getMyVideos><ZV1:CurrentPageNumber>1</ZV1:CurrentPageNumber><ZV1:ItemsPerPage>2</ZV1:ItemsPerPage>"
         "<ZV1:PurchaseType>buy</ZV1:PurchaseType><ZV1:TitleType>tv</ZV1:TitleType>"
         "<ZV1:WatchStatusFilter>RentAgain</ZV1:WatchStatusFilter></ZV1:getMyVideos>"},
    });
}

TEST(Request, StreamBodies)
{
    CheckBodies<StreamAPI>({
        {"manageStreamInstanceStatus",
         CALL(manageStreamInstanceStatus, r.StreamID = Text("s1"); r.Status = ZV1__StreamStatus(1);
              r.StopTimeSeconds = 90),
         "<ZV1:manageStreamInstanceStatus><ZV1:StreamID>s1</ZV1:StreamID><ZV1:Status>stopped</ZV1:Status>"
         "<ZV1:StopTimeSeconds>90</ZV1:StopTimeSeconds></ZV1:manageStreamInstanceStatus>"},
        {"calcOrderTax", CALL(calcOrderTax, r.SKUID = 5),
         "<ZV1:calcOrderTax><ZV1:SKUID>5</ZV1:SKUID></ZV1:calcOrderTax>"},
        {"removeAllMyPurchases", CALL(removeAllMyPurchases, r.password = Text("p")),
         "<ZV1:removeAllMyPurchases><ZV1:password>p</ZV1:password></ZV1:removeAllMyPurchases>"},
        {"getTHXMediaDirectorBonusAsset",
         CALL(getTHXMediaDirectorBonusAsset, r.BonusAssetID = 4; r.FileProfile = ZV1__FileProfile(2)),
         "<ZV1:getTHXMediaDirectorBonusAsset><ZV1:BonusAssetID>4</ZV1:BonusAssetID>"
         "<ZV1:FileProfile>HIGH_DEFINITION</ZV1:FileProfile><ZV1:BonusAssetType>Trailer</ZV1:BonusAssetType>"
         "</ZV1:getTHXMediaDirectorBonusAsset>"},
        {"ReturnTimeout", CALL(ReturnTimeout, ), "<ZV1:ReturnTimeout></ZV1:ReturnTimeout>"},
    });
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
                             "\r\nAccept-Encoding: gzip,deflate\r\n"}) {
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

TEST(Request, EachServiceSendsItsOwnSettingsBlock)
{
    Exchange<RealTimeBrowse> browse;
    browse.Run("getNavigation", HttpAnswer("", "503 Busy"), CALL(getNavigation, ));
    EXPECT_NE(std::string::npos, browse.Request().find("</wsa:Action><ZV1:DeviceSettings SOAP-ENV:mustUnderstand"));
    EXPECT_EQ(0u, browse.Request().find("POST /api/RealTimeBrowse.asmx HTTP/1.1\r\n"));
    Exchange<DownloadAPI> download;
    download.Run("getConfig", HttpAnswer("", "503 Busy"), CALL(getConfig, ));
    EXPECT_NE(std::string::npos,
              download.Request().find("</wsa:Action><ZV1:DownloadDeviceRequestSettings SOAP-ENV:mustUnderstand"));
    EXPECT_EQ(0u, download.Request().find("POST /api/DownloadAPI.asmx HTTP/1.1\r\n"));
}

// A token is good for one request: the next one, and every retry, must bring another.
TEST(Request, EveryRequestHasAFreshNonce)
{
    Exchange<StreamAPI> exchange;
    std::vector<std::string> nonces;
    for (int i = 0; i < 3; ++i) {
        exchange.Run("getConfig", HttpAnswer("", "503 Busy"), CALL(getConfig, ));
        nonces.push_back(exchange.Between("Base64Binary\">", "<"));
    }
    EXPECT_NE(nonces[0], nonces[1]);
    EXPECT_NE(nonces[1], nonces[2]);
}

}  // namespace
