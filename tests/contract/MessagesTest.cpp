// What the client sends and the simulator answers, against the schemas of the published contract.
#include <filesystem>
#include <map>
#include <set>

#include "Calls.h"
#include "ContractSchema.h"
#include "Exchanges.h"
#include "Process.h"
#include "TempFolder.h"

namespace {

class Messages : public Exchanges {
protected:
    // Everything the client can ask, on either side of its choice of services.
    std::vector<SoapExchange> Everything()
    {
        std::vector<SoapExchange> all;
        for (const ZV_WS_AccessType access : {ACCESS_TYPE_STREAM, ACCESS_TYPE_DOWNLOAD}) {
            Begin(access);
            Owned<ZV_WS_AuthorizeDeviceResponse> device;  // further requests carry its token
            EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_authorizeDevice(&session, StorefrontAccount::kActivationPin, &device));
            Owned<ZV_WS_TitlesResponse> titles;
            const ZV_WS_Pagination page = Page(1, 2);
            for (const char* text : {"Zo\xC3\xAB & <1> \"quoted\"", static_cast<const char*>(nullptr)}) {
                ZV_WS_searchForTitle(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_TV, text, &titles);
                ZV_WS_release(&titles);
            }
            for (const std::string& name : CallNames()) {
                CallResult result;
                MakeCall(name, &session, result);
            }
            for (SoapExchange& exchange : Take())
                all.push_back(std::move(exchange));
        }
        return all;
    }

    // A good request, or a good answer with a title in it.
    SoapExchange Listing()
    {
        Begin(ACCESS_TYPE_STREAM);
        Owned<ZV_WS_TitleListingResponse> listing;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getTitleListing(&session, 13, &listing));
        return Take().at(0);
    }
};

std::string WsdlOf(const SoapExchange& exchange)
{
    static const std::map<std::string, std::string> kNames = {
        {"browse", "RealTimeBrowse"}, {"account", "DownloadAPI"}, {"stream", "StreamAPI"}};
    return kNames.at(exchange.service);
}

TEST_F(Messages, EveryRequestAndAnswerIsOneOfTheContract)
{
    const ContractSchema requests("request.xsd"), answers("answer.xsd");
    std::set<std::string> asked, published;
    bool hasToken = false;
    for (const SoapExchange& exchange : Everything()) {
        EXPECT_EQ("", requests.Check(exchange.request)) << exchange.request;
        EXPECT_EQ("", answers.Check(exchange.answer)) << exchange.answer;
        asked.insert(WsdlOf(exchange) + " " + exchange.operation);
        hasToken |= exchange.request.find("<ZV1:AuthToken>") != std::string::npos;
    }
    EXPECT_TRUE(hasToken);
    for (const ContractOperation& operation : ContractOperations())
        published.insert(operation.service + " " + operation.name);
    EXPECT_EQ(published, asked);
}

TEST_F(Messages, AreThatForXmllintToo)
{
    const TempFolder folder;
    Lines requests, answers;
    for (const SoapExchange& exchange : Everything()) {
        const std::string name = exchange.service + exchange.operation;
        requests.push_back(folder.Write(name + ".request.xml", exchange.request));
        answers.push_back(folder.Write(name + ".answer.xml", exchange.answer));
    }
    const auto lint = [](const std::string& schema, const Lines& files) {
        Process program(Lines{ZV_XMLLINT, "--nonet", "--noout", "--schema", schema} + files, {});
        EXPECT_EQ(0, program.WaitForEnd());
        EXPECT_EQ(files.size(), program.Errors().size()) << "FILE validates";
    };
    lint(ZV_CONTRACT "request.xsd", requests);
    lint(ZV_CONTRACT "answer.xsd", answers);
    lint(ZV_SOAP_SCHEMA, requests + answers);  // what is written here of SOAP itself is no other SOAP
}

// The schemas would not let these pass: each row is one replacement in a good message.
TEST_F(Messages, DeparturesAreSeen)
{
    struct Row {
        const char* from;
        const char* to;
    };
    const SoapExchange good = Listing();
    const auto check = [](const char* schema, const std::string& message, const std::vector<Row>& rows) {
        const ContractSchema contract(schema);
        EXPECT_EQ("", contract.Check(message));
        for (const Row& row : rows) {
            const size_t at = message.find(row.from);
            ASSERT_NE(std::string::npos, at) << row.from << " in " << message;
            EXPECT_NE("", contract.Check(std::string(message).replace(at, strlen(row.from), row.to))) << row.from;
        }
    };
    check("request.xsd", good.request,
          {{"<wsse:Security SOAP-ENV:mustUnderstand=\"1\">", "<wsse:Security>"},
           {"<ZV1:DeviceSettings SOAP-ENV:mustUnderstand=\"1\">", "<ZV1:DeviceSettings>"},
           {"<wsa:To SOAP-ENV:mustUnderstand=\"1\">", "<wsa:To>"},
           {"<wsa:MessageID>uuid:getTitleListing</wsa:MessageID>", ""},
           {"<wsa:ReplyTo", "<wsa:From><wsa:Address>a</wsa:Address></wsa:From><wsa:ReplyTo"},
           {"/role/anonymous", "/anonymous"},
           {"wsu:Id=\"User\"", "wsu:Id=\"user\""},
           {"#PasswordDigest", "#PasswordText"},
           {"=</wsse:Password>", "</wsse:Password>"},
           {"Z</wsu:Created>", "+00:00</wsu:Created>"},
           {"<ZV1:DestinationTypeID>48", "<ZV1:DestinationTypeID>TV"},
           {"<ZV1:TitleID>13</ZV1:TitleID>", ""},
           {"<ZV1:TitleID>13</ZV1:TitleID>", "<ZV1:TitleId>13</ZV1:TitleId>"},
           {"<ZV1:TitleID>13", "<ZV1:TitleID>2147483648"},
           {"</SOAP-ENV:Body>", "<ZV1:getNavigation/></SOAP-ENV:Body>"}});
    check("answer.xsd", good.answer,
          {{"<TitlePosition>1<", "<TitlePosition>32768<"},
           {"<IsTvListing>false<", "<IsTvListing>no<"},
           {"<IsTvListing>false</IsTvListing>", ""},
           {"<PurchaseType>", "<PurchaseType>New_"},
           {"<Price>", "<Price>USD "},
           {"BonusType=\"Trailer\"", "BonusType=\"Poster\""},
           {"<ResponseCode>0</ResponseCode>", "<ResponseMessage/><ResponseCode>0</ResponseCode>"},
           {"</getTitleListingResult>", "<New>1</New></getTitleListingResult>"},
           {"<getTitleListingResponse ", "<getListingResponse "}});
}

}  // namespace
