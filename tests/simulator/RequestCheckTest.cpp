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

#define INSTANCE "xmlns:i=\"http://www.w3.org/2001/XMLSchema-instance\""

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
        {"charset=utf-8", "charset=iso-8859-1", "content type"},
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
        {"<s:UsernameToken", "<u:Timestamp><u:Expires>2010-01-01T00:00:00Z</u:Expires></u:Timestamp><s:UsernameToken",
         "the message has expired"},
        {"<s:UsernameToken", "<u:Timestamp><u:Created>2100-01-01T00:00:00Z</u:Created></u:Timestamp><s:UsernameToken",
         "the message is not fresh"},
        {"<s:UsernameToken", "<u:Timestamp><u:Created>today</u:Created></u:Timestamp><s:UsernameToken", "no time"},
        {"<s:UsernameToken", "<u:Timestamp/><u:Timestamp/><s:UsernameToken", "user-name token"},
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
        {"<z:GenreID>1<", "<z:GenreID>--1<", "no xsd:int"},
        {"<z:GenreID>1<", "<z:GenreID>1 2<", "no xsd:int"},
        {"<z:PurchaseType>any", "<z:PurchaseType>Any", "PurchaseType has no value \"Any\""},
        {"<z:PurchaseType>any</z:PurchaseType>", "", "PurchaseType is missing"},
        {"</z:PurchaseType>", "</z:PurchaseType><z:Extra/>", "Extra is not expected"},
        {"<z:GenreID>1</z:GenreID>", "<GenreID>1</GenreID>", "GenreID is missing"},
        {"<z:GenreID>1</z:GenreID><z:CurrentPageNumber>1</z:CurrentPageNumber>",
         "<z:CurrentPageNumber>1</z:CurrentPageNumber><z:GenreID>1</z:GenreID>", "GenreID is missing or out of order"},
        {"<z:GenreID>1</z:GenreID>", "text<z:GenreID>1</z:GenreID>", "text beside"},
        {"<e:Body>", "<e:Body><z:getNavigation/>", "no single element"},
        // The envelope's own elements.
        {"<e:Header>", "<e:Body/><e:Header>", "part 1 of the envelope must be Header"},
        {"<e:Header>", "<e:Header/><e:Header>", "part 2 of the envelope must be Body"},
        {"<e:Header>", "<z:Extra/><e:Header>", "part 1 of the envelope must be Header"},
        {"</e:Body>", "</e:Body><e:Body/>", "the envelope holds Body behind its body"},
        {"</e:Body>", "</e:Body><z:Extra/>", "the envelope holds Extra behind its body"},
        {"<e:Header>", "text<e:Header>", "Envelope holds text"},
        {"<e:Header>", "<e:Header>text", "Header holds text"},
        {"<e:Body>", "<e:Body>text", "Body holds text"},
        {"<e:Envelope", "<e:Envelope e:encodingStyle=\"\"", "attribute encodingStyle of the SOAP Envelope"},
        {"<e:Header>", "<e:Header u:Id=\"h\">", "attribute Id of the SOAP Header"},
        {"<e:Body>", "<e:Body id=\"b\">", "attribute id of the SOAP Body"},
        {"<e:Body>", "<e:Body " INSTANCE " i:type=\"z:Body\">", "xsi:type of Body is wrong"},
        {"<e:Header>", "<e:Header><?go on?>", "processing instruction"},
        // The blocks.
        {"<a:To e:mustUnderstand=\"true\"", "<a:To e:mustUnderstand=\"yes\"", "mustUnderstand of To"},
        {"<a:MessageID>", "<a:MessageID e:mustUnderstand=\"no\">", "mustUnderstand of MessageID"},
        {"<a:To ", "<a:To e:actor=\"urn:other\" ", "header block To is for another actor"},
        {"<s:UsernameToken", "text<s:UsernameToken", "Security holds text"},
        {"</s:Username>", "</s:Username>text", "UsernameToken holds text"},
        {"<s:Username>", "<s:Username><z:x/>", "Username has children"},
        {"<a:MessageID>", "<a:MessageID><z:x/>", "MessageID has children"},
        {"<a:Address>", "text<a:Address>", "ReplyTo holds text"},
        {"</a:Address>", "</a:Address><a:ReferenceProperties/>", "ReplyTo is not the anonymous role alone"},
        {"<z:APIKey>", "text<z:APIKey>", "DeviceSettings holds text"},
        {"<z:APIKey>", "<z:APIKey><z:x/>", "APIKey has children"},
        // What an element says of its own type.
        {"<z:GenreID>", "<z:GenreID " INSTANCE " i:type=\"x\">", "xsi:type of GenreID"},
        {"<z:GenreID>", "<z:GenreID " INSTANCE " i:type=\"z:int\">", "xsi:type of GenreID"},
        {"<z:GenreID>", "<z:GenreID " INSTANCE " xmlns=\"http://www.w3.org/2001/XMLSchema\" i:type=\"string\">",
         "xsi:type of GenreID"},
        {"<z:PurchaseType>", "<z:PurchaseType " INSTANCE " i:type=\"z:TitleTypeFilter\">", "xsi:type of PurchaseType"},
        {"<z:DestinationTypeID>", "<z:DestinationTypeID " INSTANCE " i:type=\"z:int\">",
         "xsi:type of DestinationTypeID"},
        {"<a:MessageID>", "<a:MessageID " INSTANCE " i:type=\"s:AttributedURI\">", "xsi:type of MessageID"},
        {"<z:GenreID>", "<z:GenreID " INSTANCE " i:nil=\"true\">", "GenreID cannot be nil"},
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

// Each row changes what is sent in a way that the standards leave open.
TEST_F(RequestCheckTest, EverySpellingOfTheStandardsIsTaken)
{
    const std::pair<const char*, const char*> rows[] = {
        {"POST /", "\r\nPOST /"},
        {"Host: ", "HOST:\t"},
        {"text/xml; charset=utf-8", "Text/XML;charset=UTF-8"},
        {"text/xml; charset=utf-8", "text/xml ; action=x ; charset=\"utf-8\" \t"},
        {"text/xml; charset=utf-8", "text/xml"},
        {"<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n", ""},
        {"<?xml version=\"1.0\" encoding=\"UTF-8\"?>", "\xef\xbb\xbf<?xml version='1.0'?>"},
        {"encoding=\"UTF-8\"", "encoding=\"ISO-8859-1\""},
        {"<e:Header>", "\n<!-- who -->\n<e:Header>"},
        {"e:mustUnderstand=\"1\"", "e:mustUnderstand='true'"},
        {"<a:MessageID>", "<a:MessageID e:mustUnderstand=\"0\">"},
        {"<a:MessageID>uuid:getTitlesByNavigation<", "<a:MessageID>\n uuid:getTitlesByNavigation\n<"},
        {"/role/anonymous<", "/role/anonymous\n<"},
        {"<s:UsernameToken", "<u:Timestamp u:Id=\"t\"/><s:UsernameToken"},
        {"</s:UsernameToken>",
         "</s:UsernameToken><u:Timestamp><u:Expires> 2104-02-29T24:00:00.5-09:30 </u:Expires><z:x/></u:Timestamp>"},
        {"<e:Envelope", "<e:Envelope " INSTANCE " i:schemaLocation=\"urn:x x.xsd\""},
        {"<a:To ", "<a:To e:actor=\"http://schemas.xmlsoap.org/soap/actor/next\" u:Id=\"to\" "},
        {"<a:MessageID>", "<a:MessageID " INSTANCE " i:type=\"a:AttributedURI\">"},
        {"<s:Username>", "<s:Username " INSTANCE " i:type=' s:AttributedString '>"},
        {"<z:GenreID>", "<z:GenreID " INSTANCE " xmlns:d=\"http://www.w3.org/2001/XMLSchema\" i:type=\"d:int\">"},
        {"<z:PurchaseType>",
         "<z:PurchaseType " INSTANCE " xmlns=\"http://api.zorvane.example/api/\" i:type=\"StreamAPIPurchaseType\">"},
        {"<z:getTitlesByNavigation>", "<z:getTitlesByNavigation " INSTANCE " i:type=\"z:getTitlesByNavigation\">"},
        {"</s:Password>", "\n</s:Password>"},
        {"<u:Created>", "<u:Created>\n\t"},
        {"<z:DestinationTypeID>48<", "<z:DestinationTypeID> +48 <"},
        {"<z:GenreID>1<", "<z:GenreID>\n\t&#x31; <"},
        {"<z:GenreID>1<", "<z:GenreID><![CDATA[1]]><"},
        {"<z:GenreID>1</z:GenreID>", "<q:GenreID xmlns:q='http://api.zorvane.example/api/'>1</q:GenreID>"},
        {"<z:GenreID>", "<!-- genre --><z:GenreID>"},
    };
    const int port = store->HttpsPort();
    for (const auto& [from, to] : rows) {
        SCOPED_TRACE(to);
        std::string envelope = Titles().Envelope(port);
        if (envelope.find(from) != std::string::npos) Replace(envelope, from, to);
        std::string head = Titles().Head(port, envelope.size());
        if (head.find(from) != std::string::npos) Replace(head, from, to);
        ASSERT_TRUE(head.find(to) != std::string::npos || envelope.find(to) != std::string::npos);
        EXPECT_EQ(200, SendText(head + envelope).status);
        EXPECT_EQ("", LastLogged().violation);
        EXPECT_EQ("getTitlesByNavigation", LastLogged().operation);
    }
}

// The message's own time, beside the token's: by the simulator's clock, five minutes either way.
TEST_F(RequestCheckTest, AMessageIsFreshByTheSimulatorsClock)
{
    constexpr long long kAhead = 86400;
    store->SetClock(kAhead);
    for (const auto& [offset, violation] : {std::pair<long long, const char*>(0, ""),
                                            {290, ""},
                                            {-290, ""},
                                            {310, "the message is not fresh"},
                                            {-310, "the message is not fresh"}}) {
        const time_t when = time(nullptr) + kAhead + offset;
        tm parts = {};
        char created[64];
        strftime(created, sizeof created, "<u:Created>%Y-%m-%dT%H:%M:%SZ</u:Created>", gmtime_r(&when, &parts));
        SoapRequest request = Titles();
        request.created_offset = kAhead;
        std::string envelope = request.Envelope(store->HttpsPort());
        Replace(envelope, "<s:UsernameToken",
                "<u:Timestamp>" + std::string(created) + "</u:Timestamp><s:UsernameToken");
        SendText(request.Head(store->HttpsPort(), envelope.size()) + envelope);
        EXPECT_EQ(violation, LastLogged().violation) << offset;
    }
}

// One Host, and one of the simulator's own with the right port; what is not for it is no service's to answer.
TEST_F(RequestCheckTest, ARequestSaysWhichHostItIsFor)
{
    const std::string https = std::to_string(store->HttpsPort()), http = std::to_string(store->HttpPort());
    const struct {
        std::string first;  // of the request: method and target
        std::string headers;
        std::string violation;
    } rows[] = {
        {"GET /", "Host: LocalHost:" + http + "\r\n", ""},
        {"GET /", "Host: 127.0.0.1:" + http + "\r\n", ""},
        {"GET /", "Host: images.zorvane.example\r\n", ""},
        {"GET /", "Host: www.zorvane.example:80\r\n", ""},
        {"GET http://localhost:" + http + "/", "Host: elsewhere\r\n", ""},
        {"GET /", "", "no Host"},
        {"GET /", "Host: localhost:" + http + "\r\nHost: localhost:" + http + "\r\n", "more than one Host"},
        {"GET /", "Host: localhost\r\n", "Host localhost is not"},
        {"GET /", "Host: localhost:" + https + "\r\n", "Host localhost:" + https + " is not"},
        {"GET /", "Host: api.zorvane.example\r\n", "Host api.zorvane.example is not"},
        {"GET /", "Host: \r\n", "Host  is not"},
        {"GET http://elsewhere/", "Host: localhost:" + http + "\r\n", "Host elsewhere is not"},
        {"GET https://localhost:" + http + "/", "Host: localhost:" + http + "\r\n", "https://localhost:"},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.first + " " + row.headers);
        const Reply reply =
            SendBytes(store->HttpPort(), false,
                      row.first + "device/time/ HTTP/1.1\r\n" + row.headers + "Connection: close\r\n\r\n");
        EXPECT_EQ(row.violation.empty() ? 200 : 400, reply.status);
        EXPECT_EQ(0u, LastLogged().violation.find(row.violation)) << LastLogged().violation;
        EXPECT_EQ(row.violation.empty(), LastLogged().violation.empty());
    }
    for (const auto& [host, status] : {std::pair<std::string, int>("api.zorvane.example", 200),
                                       {"localhost:" + https, 200},
                                       {"images.zorvane.example:443", 400},
                                       {"localhost:" + http, 400},
                                       {"localhost", 400}}) {
        const SoapRequest request = Titles();
        const std::string envelope = request.Envelope(store->HttpsPort());
        std::string head = request.Head(store->HttpsPort(), envelope.size());
        Replace(head, "Host: localhost:" + https, "Host: " + host);
        EXPECT_EQ(status, SendText(head + envelope).status) << host;
    }
    std::string absolute = Titles().Text(store->HttpsPort());
    Replace(absolute, "POST /", "POST https://localhost:" + https + "/");
    EXPECT_EQ(200, SendText(absolute).status);
}

TEST_F(RequestCheckTest, EveryTimeWithAZoneIsTaken)
{
    const struct {
        long long zone;
        const char* end;
        const char* violation;
    } rows[] = {{0, ".123456Z", ""},
                {7200, "+02:00", ""},
                {-12600, ".5-03:30", ""},
                {0, "+00:00", ""},
                {50400, "+14:00", ""},
                {0, "", "the token is not fresh"},
                {0, ".Z", "the token is not fresh"},
                {7200, "Z", "the token is not fresh"},
                {0, "+02:00", "the token is not fresh"},
                {0, "+0200", "the token is not fresh"}};
    for (const auto& row : rows) {
        SoapRequest request = Titles();
        request.created_zone = row.zone;
        request.created_end = row.end;
        Send(request);
        EXPECT_EQ(row.violation, LastLogged().violation) << row.end;
    }
}

// A body in chunks, however they are cut, and one that waits to be asked for.
TEST_F(RequestCheckTest, BodiesComeAsHttpHasThem)
{
    const int port = store->HttpsPort();
    const std::string envelope = Titles().Envelope(port);
    std::string head = Titles().Head(port, 0);
    Replace(head, "Content-Length: 0\r\n", "Transfer-Encoding: Chunked\r\nExpect: 100-Continue\r\n");
    RawClient client(port, true);
    ASSERT_TRUE(client.Send(head));
    EXPECT_EQ(100, client.ReceiveOne(true).status);
    std::string chunks;
    for (size_t at = 0, size = 1; at < envelope.size(); at += size, size += 7) {
        char line[32];
        snprintf(line, sizeof line, at % 2 ? "%zX;name=\"value\"\r\n" : "%zx \r\n",
                 std::min(size, envelope.size() - at));
        chunks += line + envelope.substr(at, size) + "\r\n";
    }
    chunks += "000\r\nX-Trailer: 1\r\n\r\n";
    for (size_t at = 0; at < chunks.size(); at += 500)
        ASSERT_TRUE(client.Send(chunks.substr(at, 500)));
    EXPECT_EQ(200, client.Receive().status);
    EXPECT_EQ("", LastLogged().violation);

    for (const char* wrong : {"Transfer-Encoding: chunked\r\n\r\nx\r\n", "Transfer-Encoding: gzip\r\n\r\n",
                              "Transfer-Encoding: chunked\r\n\r\n1\r\nab\r\n", "Content-Length: -1\r\n\r\n",
                              "Content-Length: 2000000\r\n\r\n", "no header\r\n\r\n"}) {
        EXPECT_EQ(0, SendText(std::string("POST /api/StreamAPI.asmx HTTP/1.1\r\n") + wrong).status) << wrong;
        EXPECT_EQ("no whole HTTP request", LastLogged().violation) << wrong;
    }
}

// Which answers end their connection, and which have no body or are not compressed.
TEST_F(RequestCheckTest, ConnectionsEndWhenTheRequestSaysSo)
{
    const struct {
        const char* request;
        bool ends;
    } rows[] = {{"GET /device/time/ HTTP/1.1\r\n", false},
                {"GET /device/time/ HTTP/1.1\r\nConnection: TE, Close\r\n", true},
                {"GET /device/time/ HTTP/1.0\r\n", true},
                {"GET /device/time/ HTTP/1.0\r\nConnection: Keep-Alive\r\n", false}};
    for (const auto& row : rows) {
        RawClient client(store->HttpPort(), false);
        ASSERT_TRUE(client.Send(row.request + PlainHost() + "\r\n"));
        EXPECT_EQ(row.ends ? "close" : "keep-alive", client.ReceiveOne().Header("Connection")) << row.request;
        if (row.ends) {
            EXPECT_EQ("", client.Receive().head) << row.request;
        }
    }
    const Reply head = Plain("/bandwidth/test.bin", "", "HEAD");
    EXPECT_EQ("1000000", head.Header("Content-Length"));
    EXPECT_EQ("", head.body);
    for (const auto& [accepted, coding] : {std::pair<const char*, const char*>("GZIP ; q=0.5", "gzip"),
                                           {"deflate, *", "gzip"},
                                           {"gzip;q=0, deflate", ""},
                                           {"x-gzipped", ""}})
        EXPECT_EQ(
            coding,
            Plain("/device/time/", std::string("Accept-Encoding: ") + accepted + "\r\n").Header("Content-Encoding"))
            << accepted;
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

TEST_F(RequestCheckTest, OnlyTheLastRequestsAreRemembered)
{
    StorefrontOptions options;
    options.remembered = 3;
    Begin(options);
    const auto ask = [&](const char* nonce) {
        SoapRequest request = Titles();
        request.nonce = nonce;
        Send(request);
        return LastLogged().violation;
    };
    for (const char* nonce : {"a", "b", "c"})
        EXPECT_EQ("", ask(nonce));
    EXPECT_EQ("the nonce was used before", ask("a"));
    EXPECT_EQ("", ask("d")) << "a is forgotten";
    EXPECT_EQ("", ask("a"));
    EXPECT_EQ("the nonce was used before", ask("d"));
    const auto log = store->Log();
    ASSERT_EQ(3u, log.size());
    EXPECT_EQ(5u, log[0].number);
    EXPECT_TRUE(store->WaitForRequests(7));
    store->ClearLog();
    ask("e");
    EXPECT_TRUE(store->WaitForRequests(1));
    EXPECT_EQ(8u, store->Log().at(0).number);
}

// However much a client sends: an entry stays small, and is cut between two letters.
TEST_F(RequestCheckTest, WhatIsRememberedOfARequestIsBounded)
{
    std::string children = "<z:Query>";
    for (int i = 0; i < 40000; ++i)
        children += "\u00e9\u6771";
    children += "</z:Query>";
    for (int i = 0; i < 1000; ++i)
        children += "<z:Extra/>";
    Send({"RealTimeBrowse", "searchForTitle", children});
    const LoggedRequest entry = LastLogged();
    EXPECT_EQ(100u, entry.children.size());
    const std::string query = Value(entry.children, "Query");
    EXPECT_EQ(4095u, query.size());
    EXPECT_EQ("\u6771", query.substr(query.size() - 3));
    SoapRequest request = Titles();
    request.nonce = std::string(400000, 'n');
    EXPECT_EQ(200, Send(request).status);
    EXPECT_EQ(500, Send(request).status);
    EXPECT_EQ("the nonce was used before", LastLogged().violation);
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
