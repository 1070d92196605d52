// docs/contract.md against the code: what it lists is made here, from the contract, the client's own behaviour and real
// messages. With ZV_WRITE_DOCUMENTS set in the environment the document is brought up to date instead.
#include <filesystem>
#include <map>
#include <pugixml.hpp>
#include <regex>
#include <set>
#include <sstream>

#include "Additions.h"
#include "Calls.h"
#include "ContractSchema.h"
#include "Deployment.h"
#include "DocumentBlock.h"
#include "Exchanges.h"
#include "ReadLimits.h"
#include "Service.h"
#include "ZVUtilities.h"

namespace {

const std::string kDocument = ZV_SOURCES "docs/contract.md";

// "general_error (-1004)"; the number alone where only its family has a name.
std::string Named(int status)
{
    static const auto kNames = [] {
        std::map<int, std::string> names;
        const std::string header = ContentOf(ZV_SOURCES "Public/ZV_WS_Status.h");
        const std::regex row("ZV_WS_Status_(\\w+) = (-?\\d+)");
        for (std::sregex_iterator at(header.begin(), header.end(), row), end; at != end; ++at)
            names[std::stoi(at->str(2))] = at->str(1);
        return names;
    }();
    const auto name = kNames.find(status);
    return name == kNames.end() ? std::to_string(status) : name->second + " (" + std::to_string(status) + ")";
}

class Document : public Exchanges {
protected:
    static void ExpectBlock(const std::string& name, const std::string& content)
    {
        ::ExpectBlock(kDocument, name, content);
    }

    // The status of the call after the service refused the operation with that code.
    ZV_WS_Status Refused(const std::string& call, const std::string& operation, int code)
    {
        Fault(operation + "=code:" + std::to_string(code));
        CallResult result;
        MakeCall(call, &session, result);
        return result.status;
    }
};

// What the response codes of an operation mean to its call.
struct Refusals {
    std::string meaning;                   // in the table of operations
    std::map<int, ZV_WS_Status> statuses;  // by code, but for general errors
};

class Operations : public Document {
protected:
    void SetUp() override
    {
        Document::SetUp();
        for (const ZV_WS_AccessType access : {ACCESS_TYPE_STREAM, ACCESS_TYPE_DOWNLOAD}) {
            ASSERT_NO_FATAL_FAILURE(Begin(access));
            for (const std::string& call : CallNames()) {
                CallResult result;
                MakeCall(call, &session, result);
                const std::vector<SoapExchange> exchanges = Take();
                const std::string operation = exchanges.empty() ? "" : exchanges[0].operation;
                if (exchanges.size() != 1 || m_Refusals.count(operation)) continue;
                m_Refusals[operation] = Try(call, operation);
                Take();
            }
        }
    }

    Refusals Try(const std::string& call, const std::string& operation)
    {
        constexpr int kMost = 25;  // more than any operation has
        std::string error;
        if (!store->AddFault(operation + "=code:1", error)) return {"", {}};
        store->ClearFaults();
        Refusals refusals;
        for (int code = 1; code <= kMost; ++code) {
            const ZV_WS_Status status = Refused(call, operation, code);
            if (status != ZV_WS_Status_general_error) refusals.statuses[code] = status;
        }
        refusals.meaning = "own codes";
        if (refusals.statuses.empty()) refusals.meaning = "general";
        if (refusals.statuses.count(kMost)) {
            EXPECT_EQ(ZV_WS_Status_ok, refusals.statuses[kMost]) << operation;
            refusals = {"in the record", {}};
        }
        return refusals;
    }

    std::map<std::string, Refusals> m_Refusals;
};

TEST_F(Operations, AndTheirRefusals)
{
    static const std::map<std::string, std::string> kServices = {
        {"RealTimeBrowse", "browse"}, {"DownloadAPI", "account"}, {"StreamAPI", "stream"}};
    std::map<std::string, std::string> services;
    for (const ContractOperation& operation : ContractOperations()) {
        std::string& names = services[operation.name];
        names += (names.empty() ? "" : ", ") + kServices.at(operation.service);
    }
    std::string operations = "| operation | service | refusals | what it is for |\n|---|---|---|---|\n";
    std::string codes = "| operation | code | status |\n|---|---|---|\n";
    std::set<std::string> written;
    for (const ContractOperation& operation : ContractOperations()) {
        if (!written.insert(operation.name).second) continue;
        ASSERT_EQ(1u, m_Refusals.count(operation.name)) << operation.name;
        const Refusals& refusals = m_Refusals[operation.name];
        operations += Row({Code(operation.name), services[operation.name], refusals.meaning, operation.documentation});
        for (const auto& [code, status] : refusals.statuses)
            codes += Row({Code(operation.name), std::to_string(code), Named(status)});
    }
    ExpectBlock("operations", operations);
    ExpectBlock("codes", codes);
}

TEST_F(Document, Failures)
{
    const struct {
        const char* fault;
        const char* answer;
    } rows[] = {
        {"fault11", "a SOAP 1.1 fault, whatever its code"},
        {"fault12", "a SOAP 1.2 fault"},
        {"http:404", "HTTP 404 without a fault; every other HTTP status but 200 likewise, -4000 less the status"},
        {"http:503", "HTTP 503 without a fault"},
        {"http:302", "a redirection: none is followed"},
        {"missing-result", "a response element without its result"},
        {"empty", "an empty body"},
        {"garbage", "a body that is no XML"},
        {"cut", "none: the connection ends, or nothing comes in time"}};
    Begin(ACCESS_TYPE_STREAM);
    std::string table = "| answer | status |\n|---|---|\n";
    for (const auto& row : rows) {
        Fault(std::string("getConfig=") + row.fault + ",count=2");  // a read is sent again on a new connection
        CallResult result;
        MakeCall("getConfig", &session, result);
        EXPECT_EQ(row.fault, store->Log().back().fault);
        store->ClearFaults();
        table += Row({row.answer, Named(result.status)});
    }
    ExpectBlock("failures", table);
}

TEST_F(Document, Addresses)
{
    std::string table = "| service | its address ends with | WSDL | its settings block |\n|---|---|---|---|\n";
    for (const simulator::ServiceRow& service : simulator::Services()) {
        const std::string path = service.path;
        const std::string wsdl = path.substr(0, path.find('.')) + ".wsdl";
        EXPECT_TRUE(std::filesystem::exists(ZV_CONTRACT + wsdl));
        table += Row({service.name, Code(path), Code(wsdl), Code(service.settingsBlock)});
    }
    ExpectBlock("addresses", table);
}

TEST_F(Document, Environments)
{
    unsetenv("ZV_DEPLOYMENT");
    const Deployment& deployment = *Deployment::Load();  // as compiled in
    std::string table = "| digit | addresses begin with | for adult titles |\n|---|---|---|\n";
    for (int digit = 0; digit < 3; ++digit) {
        table += Row({std::to_string(digit), Code(deployment.BaseUrl(ContentType_ZV, digit)),
                      Code(deployment.BaseUrl(ContentType_KAC, digit))});
    }
    ExpectBlock("environments", table);
}

TEST_F(Document, Limits)
{
    const auto context = std::make_unique<soap>();
    LimitReading(*context);
    ExpectBlock("limits", "| what | most |\n|---|---|\n" +
                              Row({"bytes of an answer, uncompressed", std::to_string(context->recv_maxlength)}) +
                              Row({"bytes of a text", std::to_string(context->maxlength)}) +
                              Row({"elements of an array", std::to_string(context->maxoccurs)}) +
                              Row({"elements inside of each other", std::to_string(context->maxlevel)}));
}

TEST_F(Document, Additions)
{
    std::string table = "| change | a player in the field |\n|---|---|\n";
    for (const Addition& row : ::Additions()) {
        table += Row({row.change, *row.effect ? row.effect : "**fails**: " + Named(row.status)});
    }
    ExpectBlock("additions", table);
}

// Indented, and without what differs each time.
std::string Shown(const std::string& message)
{
    pugi::xml_document document;
    EXPECT_TRUE(document.load_string(message.c_str(), pugi::parse_default | pugi::parse_declaration));
    std::ostringstream stream;
    document.save(stream, "  ");
    std::string text = stream.str();
    for (const auto& [changing, shown] :
         std::initializer_list<std::pair<const char*, const char*>>{{"(PasswordDigest\">)[^<]*", "$1DIGEST"},
                                                                    {"(Base64Binary\">)[^<]*", "$1NONCE"},
                                                                    {"(<wsu:Created>)[^<]*", "$1CREATED"},
                                                                    {"localhost:[0-9]+", "HOST"},
                                                                    {" (xmlns:)", "\n    $1"}}) {
        text = std::regex_replace(text, std::regex(changing), shown);
    }
    return "```xml\n" + text + "```\n";
}

TEST_F(Document, Messages)
{
    Begin(ACCESS_TYPE_STREAM);
    Owned<ZV_WS_AuthorizeDeviceResponse> device;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_authorizeDevice(&session, StorefrontAccount::kActivationPin, &device));
    Owned<ZV_WS_GenreLabelResponse> label;
    Take();
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getGenreLabel(&session, 1, &label));
    const SoapExchange exchange = Take().at(0);
    ExpectBlock("request", Shown(exchange.request));
    ExpectBlock("answer", Shown(exchange.answer));
}

// What is said to be held by a test names one: `Suite.Name`.
TEST(DocumentReferences, AreTests)
{
    std::string tests;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(ZV_SOURCES "tests"))
        if (entry.path().extension() == ".cpp") tests += ContentOf(entry.path());
    const std::string text = ContentOf(kDocument);
    const std::regex reference("`([A-Z]\\w+)\\.([A-Z]\\w+)`");
    int count = 0;
    for (std::sregex_iterator at(text.begin(), text.end(), reference), end; at != end; ++at, ++count) {
        EXPECT_NE(std::string::npos, tests.find("(" + at->str(1) + ", " + at->str(2) + ")")) << at->str();
    }
    EXPECT_GT(count, 5);
}

}  // namespace
