// The strictness of the services: a good request passes, and each departure from the contract is refused by name.
#include <gtest/gtest.h>

#include "RawClient.h"

namespace {

void Replace(std::string& text, const std::string& from, const std::string& to)
{
    const size_t place = text.find(from);
    ASSERT_NE(std::string::npos, place) << from;
    text.replace(place, from.size(), to);
}

class RequestCheckTest : public StorefrontTest {
protected:
    void SetUp() override { Begin(); }

    static SoapRequest Titles()
    {
        return {
            "RealTimeBrowse", "getTitlesByNavigation",
            Children({{"GenreID", "1"}, {"CurrentPageNumber", "1"}, {"ItemsPerPage", "2"}, {"PurchaseType", "any"}})};
    }
    Reply SendText(const std::string& text) { return SendBytes(store->HttpsPort(), true, text); }
};

TEST_F(RequestCheckTest, AGoodRequestIsAnsweredAndLogged)
{
    const Reply reply = Send(Titles());
    EXPECT_EQ(200, reply.status);
    EXPECT_EQ("0", reply.Element("ResponseCode"));
    const LoggedRequest entry = LastLogged();
    EXPECT_EQ("", entry.violation);
    EXPECT_EQ("browse", entry.service);
    EXPECT_EQ("getTitlesByNavigation", entry.operation);
    EXPECT_EQ("any", Value(entry.children, "PurchaseType"));
    EXPECT_EQ("customer", Value(entry.soap, "user"));
    EXPECT_EQ("uuid:getTitlesByNavigation", Value(entry.soap, "messageID"));
    EXPECT_EQ("DeviceSettings", Value(entry.soap, "settings"));
    EXPECT_EQ("desktop-player", Value(entry.soap, "DestinationUniqueID"));
}

// Each row is one replacement in a good request, HTTP header or envelope, whichever holds the text first.
TEST_F(RequestCheckTest, EachDepartureIsRefusedByName)
{
    const struct {
        const char* from;
        const char* to;
        const char* reason;
    } rows[] = {
        {"POST ", "PUT ", "not POST"},
        {"text/xml; charset=utf-8", "application/soap+xml; charset=utf-8", "content type"},
        {"User-Agent: raw\r\n", "", "no user agent"},
        {"SOAPAction: \"", "X-Action: \"", "SOAPAction"},
        {"e=\"http://schemas.xmlsoap.org/soap/envelope/\"", "e=\"http://www.w3.org/2003/05/soap-envelope\"",
         "no SOAP 1.1 envelope"},
        {"</e:Envelope>", "</e:Envelop>", "no XML"},
        {"encoding=\"UTF-8\"?>", "encoding=\"UTF-8\"?><!DOCTYPE x [<!ENTITY y \"z\">]>", "document type"},
        {"<s:Security e:mustUnderstand=\"1\"", "<s:Security", "mustUnderstand of Security"},
        {"<a:MessageID>", "<a:MessageID e:mustUnderstand=\"1\">", "mustUnderstand of MessageID"},
        {"u:Id=\"User\"", "u:Id=\"user\"", "wsu:Id"},
        {"<s:Username>customer", "<s:Username>nobody", "authentication failed"},
        {"</s:Username>", "</s:Username><s:Extra/>", "user-name token"},
        {"#PasswordDigest", "#PasswordText", "no digest"},
        {"#Base64Binary", "#HexBinary", "Base64Binary"},
        {"<a:MessageID>uuid:getTitles", "<a:MessageID>getTitles", "MessageID"},
        {"/role/anonymous", "/anonymous", "ReplyTo"},
        {"<a:To e:mustUnderstand=\"true\">https:", "<a:To e:mustUnderstand=\"true\">http:", "wsa:To"},
        {"<a:Action e:mustUnderstand=\"1\">http", "<a:Action e:mustUnderstand=\"1\">HTTP", "wsa:Action"},
        {"<a:MessageID>uuid:getTitlesByNavigation</a:MessageID>", "", "block 2 must be MessageID"},
        {"<a:To e:", "<z:Extra>x</z:Extra><a:To e:", "block 4 must be To"},
        {"<z:APIKey>desktop", "<z:APIKey>laptop", "API key"},
        {"<z:DestinationUniqueID>desktop-player", "<z:DestinationUniqueID>", "DestinationUniqueID"},
        {"<z:DestinationTypeID>48", "<z:DestinationTypeID>forty", "DestinationTypeID"},
        {"<z:APIKey>desktop</z:APIKey>", "<z:AuthToken>t</z:AuthToken><z:APIKey>desktop</z:APIKey>", "out of order"},
        {"<z:GenreID>1<", "<z:GenreID>one<", "no xsd:int"},
        {"<z:GenreID>1<", "<z:GenreID>99999999999<", "no xsd:int"},
        {"<z:PurchaseType>any", "<z:PurchaseType>Any", "PurchaseType has no value \"Any\""},
        {"<z:PurchaseType>any</z:PurchaseType>", "", "PurchaseType is missing"},
        {"</z:PurchaseType>", "</z:PurchaseType><z:Extra/>", "Extra is not expected"},
        {"<z:GenreID>1</z:GenreID>", "<GenreID>1</GenreID>", "GenreID is missing"},
        {"<z:GenreID>1</z:GenreID><z:CurrentPageNumber>1</z:CurrentPageNumber>",
         "<z:CurrentPageNumber>1</z:CurrentPageNumber><z:GenreID>1</z:GenreID>", "GenreID is missing or out of order"},
        {"<z:GenreID>1</z:GenreID>", "text<z:GenreID>1</z:GenreID>", "text beside"},
        {"<e:Body>", "<e:Body><z:getNavigation/>", "no single element"},
    };
    const int port = store->HttpsPort();
    for (const auto& row : rows) {
        SCOPED_TRACE(row.to);
        const SoapRequest request = Titles();
        std::string envelope = request.Envelope(port);
        std::string head = request.Head(port, envelope.size());
        if (head.find(row.from) != std::string::npos) {
            Replace(head, row.from, row.to);
        } else {
            Replace(envelope, row.from, row.to);
            head = request.Head(port, envelope.size());
        }
        const Reply reply = SendText(head + envelope);
        EXPECT_EQ(500, reply.status);
        EXPECT_NE(std::string::npos, reply.body.find("<faultcode>soap:Client</faultcode>"));
        EXPECT_NE(std::string::npos, LastLogged().violation.find(row.reason)) << LastLogged().violation;
        EXPECT_NE(std::string::npos, reply.body.find("<faultstring>"));
    }
}

TEST_F(RequestCheckTest, TheOtherServicesBlocksAndOperationsAreRefused)
{
    SoapRequest request = Titles();
    const int port = store->HttpsPort();
    std::string envelope = request.Envelope(port);
    for (const char* tag : {"<z:", "</z:"}) {
        Replace(envelope, std::string(tag) + "DeviceSettings", std::string(tag) + "StreamDeviceRequestSettings");
    }
    EXPECT_EQ(500, SendText(request.Head(port, envelope.size()) + envelope).status);
    EXPECT_EQ("header block 6 must be DeviceSettings", LastLogged().violation);

    for (const char* service : {"DownloadAPI", "StreamAPI"})
        EXPECT_EQ(500, Ask(service, "getNavigation").status) << service;
    EXPECT_EQ(500, Ask("StreamAPI", "getMyVideos").status);
    EXPECT_EQ(500, Ask("DownloadAPI", "getMyStreamingVideos").status);
    EXPECT_EQ(200, Ask("DownloadAPI", "getConfig").status);
    EXPECT_EQ(200, Ask("StreamAPI", "getConfig").status);
}

// A refused digest does not use up the nonce of the request that follows with the right one.
TEST_F(RequestCheckTest, ATokenIsGoodOnceAndNotForLong)
{
    const struct {
        const char* nonce;  // "": a fresh one
        const char* password;
        int offset;
        const char* violation;
    } rows[] = {
        {"once", "guess", 0, "authentication failed"},
        {"once", "secret", 0, ""},
        {"once", "secret", 0, "the nonce was used before"},
        {"", "secret", -290, ""},
        {"", "secret", 290, ""},
        {"", "secret", -310, "the token is not fresh"},
        {"", "secret", 310, "the token is not fresh"},
    };
    for (const auto& row : rows) {
        SoapRequest request = Titles();
        request.nonce = row.nonce;
        request.password = row.password;
        request.created_offset = row.offset;
        EXPECT_EQ(*row.violation ? 500 : 200, Send(request).status) << row.offset;
        EXPECT_EQ(row.violation, LastLogged().violation) << row.offset;
    }
}

TEST_F(RequestCheckTest, OptionalChildrenMayBeLeftOutAndStagingHasAPathOfItsOwn)
{
    SoapRequest request = Titles();
    request.base = "/kac/api/";
    EXPECT_EQ(200, Send(request).status);
    const std::string search =
        Children({{"ItemsPerPage", "2"}, {"CurrentPageNumber", "1"}, {"PurchaseType", "any"}, {"TitleType", "any"}});
    EXPECT_EQ(200, Ask("RealTimeBrowse", "searchForTitle", search).status);
    const std::string paging = Children({{"CurrentPageNumber", "1"}, {"ItemsPerPage", "2"}, {"PurchaseType", "any"}});
    const Reply array = Ask("RealTimeBrowse", "getTitlesByGenreArray", "<z:GenreIDs></z:GenreIDs>" + paging);
    EXPECT_EQ(200, array.status);
    EXPECT_EQ(std::string::npos, array.body.find("<GetTitlesResponse>"));
}

TEST_F(RequestCheckTest, SecretsStayOutOfTheLog)
{
    const Reply reply = Ask("StreamAPI", "removeAllMyPurchases", Children({{"password", "swordfish"}}));
    EXPECT_EQ("1", reply.Element("ResponseCode"));
    EXPECT_EQ("***", Value(LastLogged().children, "password"));
    const Reply log = Plain("/control/log");
    EXPECT_NE(std::string::npos, log.body.find("removeAllMyPurchases"));
    EXPECT_EQ(std::string::npos, log.body.find("swordfish"));
}

}  // namespace
