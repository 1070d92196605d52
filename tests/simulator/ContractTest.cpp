// Every operation's answer against the client's records: children, their order, those that are never left out.
#include <gtest/gtest.h>
#include <libxml/parser.h>

#include <fstream>
#include <map>
#include <regex>
#include <sstream>

#include "RawClient.h"
#include "Records.h"

namespace {

struct Child {
    std::string name, type;
    char occurs;  // '1' always, '0' once at most, '*' any number of times
};

// The records that the client's contract names, by name; a message of an operation begins with "_".
const std::map<std::string, std::vector<Child>>& Contract()
{
    static const auto kContract = [] {
        const std::regex record("class (_?)ZV1__(\\w+)( : public ZV1__(\\w+))? \\{");
        const std::regex child(" +(enum )?(ZV1__)?(\\w+)\\** (\\w+)( [01])?;");
        std::map<std::string, std::vector<Child>> records;
        for (const char* file : {"records.h", "browse.h", "account.h", "stream.h"}) {
            std::ifstream lines(std::string(WIRE_FOLDER) + file);
            std::string name;
            std::smatch parts;
            for (std::string line; std::getline(lines, line);) {
                line = std::regex_replace(line, std::regex("_USCORE"), "_");
                if (std::regex_match(line, parts, record)) {
                    name = parts.str(1) + parts.str(2);
                    records[name] = records[parts.str(4)];
                } else if (std::regex_match(line, parts, child) && parts.str(4).rfind("__size", 0) != 0) {
                    records[name].push_back(
                        {parts.str(4), parts.str(3), parts[5].matched ? *(parts[5].first + 1) : '*'});
                }
            }
        }
        return records;
    }();
    return kContract;
}

std::string NameOf(const xmlNode* node)
{
    return reinterpret_cast<const char*>(node->name);
}

// What is wrong with the element as a value of the type; empty when nothing is.
std::string Check(const xmlNode* element, const std::string& type)
{
    const std::string here = NameOf(element) + ": ";
    const auto record = Contract().find(type);
    const xmlNode* child = xmlFirstElementChild(const_cast<xmlNode*>(element));
    if (record == Contract().end()) return child ? here + "no plain text" : "";
    for (const Child& rule : record->second) {
        int count = 0;
        for (; child && NameOf(child) == rule.name && (count == 0 || rule.occurs == '*'); ++count) {
            if (strcmp("http://api.zorvane.example/api/", reinterpret_cast<const char*>(child->ns->href)) != 0)
                return here + rule.name + " is of another namespace";
            const std::string wrong = Check(child, rule.type);
            if (!wrong.empty()) return here + wrong;
            child = xmlNextElementSibling(const_cast<xmlNode*>(child));
        }
        if (count == 0 && rule.occurs == '1') return here + "no " + rule.name;
    }
    return child ? here + NameOf(child) + " is unknown or out of order" : "";
}

// What is wrong with an answer, which has a result.
std::string CheckAnswer(const Reply& reply, const std::string& operation)
{
    if (reply.status != 200) return "HTTP status " + std::to_string(reply.status) + ": " + reply.body;
    const std::unique_ptr<xmlDoc, void (*)(xmlDoc*)> document(
        xmlReadMemory(reply.body.data(), static_cast<int>(reply.body.size()), nullptr, nullptr, XML_PARSE_NONET),
        xmlFreeDoc);
    if (!document) return "no XML";
    const xmlNode* body = xmlLastElementChild(xmlDocGetRootElement(document.get()));
    const xmlNode* response = xmlFirstElementChild(const_cast<xmlNode*>(body));
    if (!response || NameOf(response) != operation + "Response") return "no " + operation + "Response";
    if (!xmlFirstElementChild(const_cast<xmlNode*>(response))) return "no result";
    return Check(response, "_" + operation + "Response");
}

const char kBrowse[] = "RealTimeBrowse";
const char kAccount[] = "DownloadAPI";
const char kStream[] = "StreamAPI";
const char kBoth[] = "";

#define ARRAY "<z:int>1</z:int><z:int>2</z:int>"
#define PAGE "CurrentPageNumber=1 ItemsPerPage=3 "
#define SEARCH "Query=the ItemsPerPage=3 CurrentPageNumber=1 PurchaseType=any TitleType=any"
#define ALL "PurchaseType=any TitleType=any WatchStatusFilter=Undefined"
#define PASS "PassID=1 FileProfile=STANDARD"
#define LOUD "AudioSetting=Stereo_Standard"

const struct Row {
    const char* service;
    const char* operation;
    const char* children;  // of a request that is answered well; some values are the database's
    const char* refused;   // the one child with which it is not; empty when the operation refuses nothing
    int code = 1;          // of that refusal
} kRows[] = {
    {kBrowse, "getFileType", "", ""},
    {kBrowse, "shouldUpdateCache", "UTCTime=then", ""},
    {kBrowse, "getRecommendedTitles", "TitleId=12", "TitleId=0"},
    {kBrowse, "getLastCacheLoadTimeUTC", "", ""},
    {kBrowse, "translateSkuId", "SkuId=SKU", "SkuId=1"},
    {kBrowse, "translateTivoExternalId", "TivoExternalId=EXT12", "TivoExternalId=none"},
    {kBrowse, "getAllTvEpisodeListings", "TitleID=SEASON", ""},
    {kBrowse, "getTvEpisodeListing", "EpisodeID=EPISODE", "EpisodeID=12"},
    {kBrowse, "getTvEpisodeListByTitleID", "TitleID=SEASON", "TitleID=12"},
    {kBrowse, "getTitleListing", "TitleID=12", "TitleID=0"},
    {kBrowse, "getTitlesByGenreArray", "GenreIDs=" ARRAY " " PAGE "PurchaseType=any", ""},
    {kBrowse, "getTitlesByNavigation", "GenreID=1 " PAGE "PurchaseType=any", "GenreID=77"},
    {kBrowse, "getTitlesByNavigation", "GenreID=1 CurrentPageNumber=9999 ItemsPerPage=3 PurchaseType=any",
     "CurrentPageNumber=0", 2},
    {kBrowse, "getGenreLabel", "GenreID=1", "GenreID=77"},
    {kBrowse, "searchForTitle", SEARCH, "CurrentPageNumber=32768", 2},
    {kBrowse, "searchForTitleDetail", SEARCH, ""},
    {kBrowse, "getNavigation", "", ""},
    {kBoth, "checkRentalExpiration", "PassId=1", "PassId=999"},
    {kBoth, "GetCountryID", "", ""},
    {kBoth, "getConfig", "", ""},
    {kBoth, "checkAdultVerificationPin", "Pin=0042", ""},
    {kBoth, "checkAdultVerificationEnabled", "", ""},
    {kBoth, "addItemToWishlist", "TitleID=12", "TitleID=0"},
    {kBoth, "getWishlistItems", "sortOrder=1 " PAGE "TitleType=any", "CurrentPageNumber=0", 2},
    {kBoth, "getWishlistItems", "sortOrder=3 " PAGE "TitleType=movies", "sortOrder=4", 2},
    {kStream, "removeItemFromWishList", "TitleID=12", "TitleID=12"},
    {kBoth, "removeAllItemsFromWishList", "", ""},
    {kStream, "assignGiftCertificateToUser", "GiftCertificateCode=GIFT1", "GiftCertificateCode=GIFT1"},
    {kBoth, "getSettingsPageInfo", "", ""},
    {kBoth, "getEmailAddress", "", ""},
    {kBoth, "showPrePaidCardBalance", "", ""},
    {kBoth, "getBillingInfo", "", ""},
    {kAccount, "checkForPurchasedTitle", "TitleID=12", ""},
    {kAccount, "getMyVideos", PAGE ALL, "CurrentPageNumber=0", 2},
    {kStream, "getMyStreamingVideos", PAGE ALL, "CurrentPageNumber=0", 2},
    {kBoth, "doPurchaseSavedbilling", "SkuID=SKU IPAddress=10.0.0.1 UsePrePaidFunds=yes", "SkuID=9022", 22},
    {kBoth, "deactivateDevice", "", ""},
    {kBoth, "authorizeDevice", "PIN=123456", "PIN=000000", 2},
    {kBoth, "checkAuthToken", "AuthToken=x", ""},
    {kStream, "getTHXMediaDirectorBonusAsset", "BonusAssetID=BONUS FileProfile=STANDARD BonusAssetType=Trailer",
     "BonusAssetID=1", 2},
    {kStream, "getTHXMediaDirector", PASS " " LOUD, "PassID=999", 2},
    {kStream, "setAudioDefaultProperty", LOUD, ""},
    {kStream, "getAudioDefaultProperty", "", ""},
    {kStream, "calcOrderTax", "SKUID=SKU", "SKUID=9111", 11},
    {kStream, "ReturnTimeout", "", ""},
    {kStream, "ReturnError", "", ""},
    {kStream, "getStreamingAssetLocation", PASS, "PassID=999", 2},
    {kStream, "loadLastStreamingAssetLocationForPass", PASS, "PassID=999", 2},
    {kStream, "getBonusAssetLocation", "BonusAssetID=BONUS", "BonusAssetID=1", 2},
    {kStream, "manageStreamInstanceStatus", "StreamID=stream-1 Status=paused StopTimeSeconds=90", "StreamID=none"},
    {kStream, "getBillingInfoAndPPCBalance", "", ""},
    {kStream, "checkForPurchasedStream", "SkuID=SKU", ""},
    {kStream, "checkForPurchasedStreamByTitleID", "TitleID=12", ""},
    {kStream, "getTitleListingsPurchasedForPasses", "Passes=" ARRAY, ""},
    {kStream, "removeAllMyPurchases", "password=secret", "password=guess"},
};

class ContractTest : public StorefrontTest {
protected:
    // The children of a list of "NAME=VALUE", of which `other` is one with another value.
    std::string Request(const std::string& list, const std::string& other = "") const
    {
        static const std::map<std::string, const char*> kIds = {
            {"SKU", "SELECT MIN(sku) FROM product WHERE price < 5"},
            {"SEASON", "SELECT MIN(id) FROM title WHERE is_tv = 1"},
            {"EPISODE", "SELECT MIN(id) FROM title WHERE season <> 0"},
            {"BONUS", "SELECT MIN(id) FROM bonus"}};
        std::string children;
        std::istringstream words(list);
        for (std::string word; words >> word;) {
            const size_t value = word.find('=') + 1;
            if (other.compare(0, value, word, 0, value) == 0) word = other;
            const auto id = kIds.find(word.substr(value));
            if (id != kIds.end()) word.replace(value, std::string::npos, store->Query(id->second));
            children += Children({{word.substr(0, value - 1).c_str(), word.substr(value)}});
        }
        return children;
    }
    void CheckRow(const std::string& service, const Row& row)
    {
        SCOPED_TRACE(service + " " + row.operation);
        const auto code = [&](const char* other) {
            const Reply reply = Ask(service, row.operation, Request(row.children, other));
            EXPECT_EQ("", CheckAnswer(reply, row.operation));
            return atoi(reply.Element("ResponseCode").c_str());
        };
        EXPECT_EQ(0, code(""));
        if (*row.refused) {
            EXPECT_EQ(row.code, code(row.refused));
        }
        std::string error;
        if (store->AddFault(std::string(row.operation) + "=code:19", error)) {
            EXPECT_EQ(19, code(""));
        }
    }
};

TEST_F(ContractTest, EveryAnswerIsOneOfTheContract)
{
    Begin();
    for (const Row& row : kRows) {
        for (const char* service : {kBrowse, kAccount, kStream}) {
            if (row.service == kBoth ? service != kBrowse : row.service == service) CheckRow(service, row);
        }
    }
}

// The simulator's own table of the records, from which it makes other forms of its answers.
TEST(RecordsTest, AreTheContracts)
{
    const std::map<std::string, std::string> kTypes = {
        {"char", "string"}, {"bool", "boolean"}, {"_XML", "anyType"}, {"xsd__decimal", "decimal"}};
    for (const auto& [name, fields] : simulator::Records()) {
        SCOPED_TRACE(name);
        const auto record = Contract().find(name);
        ASSERT_NE(Contract().end(), record);
        std::string own, contract;
        for (const auto& field : fields) {
            if (field.occurs != '@') own += field.type + " " + field.name + (field.occurs == '?' ? '0' : field.occurs);
        }
        for (const Child& child : record->second) {
            const auto type = kTypes.find(child.type);
            contract += (type == kTypes.end() ? child.type : type->second) + " " + child.name + child.occurs;
        }
        EXPECT_EQ(contract, own);
    }
    for (const Row& row : kRows)
        EXPECT_TRUE(simulator::FindRecord("_" + std::string(row.operation) + "Response")) << row.operation;
}

// Whatever was asked for: the answer says what it holds, and the pages join.
TEST_F(ContractTest, PagesAreNeverLargerThanTheLargest)
{
    StorefrontOptions options;
    options.largestPage = 2;
    Begin(options);
    for (const char* title : {"12", "13", "21"})
        EXPECT_EQ("0",
                  Ask(kStream, "addItemToWishlist", Request(std::string("TitleID=") + title)).Element("ResponseCode"));
    const Row lists[] = {{kBrowse, "getTitlesByNavigation", "GenreID=100 " PAGE "PurchaseType=any", ""},
                         {kBrowse, "searchForTitle", SEARCH, ""},
                         {kStream, "getMyStreamingVideos", PAGE ALL, ""},
                         {kAccount, "getMyVideos", PAGE ALL, ""},
                         {kStream, "getWishlistItems", "sortOrder=0 " PAGE "TitleType=any", ""}};
    for (const Row& list : lists) {
        const Reply first = Ask(list.service, list.operation, Request(list.children));
        const Reply second = Ask(list.service, list.operation, Request(list.children, "CurrentPageNumber=2"));
        const int total = atoi(first.Element("TotalItems").c_str());
        EXPECT_GT(total, 2) << list.operation;
        EXPECT_EQ("2", first.Element("ItemsPerPage")) << list.operation;
        EXPECT_EQ(std::to_string((total + 1) / 2), first.Element("TotalPages")) << list.operation;
        EXPECT_NE(std::string::npos, first.body.find("<TitlePosition>2<")) << list.operation;
        EXPECT_EQ(std::string::npos, first.body.find("<TitlePosition>3<")) << list.operation;
        EXPECT_EQ("3", second.Element("TitlePosition")) << list.operation;
    }
}

TEST_F(ContractTest, SearchesLookAwayFromCase)
{
    Begin();
    const auto found = [&](const char* text) {
        const std::string search = Request(SEARCH, std::string("Query=") + text);
        return atoi(Ask(kBrowse, "searchForTitle", search).Element("TotalItems").c_str());
    };
    EXPECT_GT(found("harbour"), 0);
    EXPECT_EQ(found("harbour"), found("HARBOUR"));
    EXPECT_GT(found("Caf\u00e9"), 0);
    EXPECT_EQ(found("Caf\u00e9"), found("cAF\u00c9"));
    EXPECT_EQ(found("&lt;%&gt;"), 0) << "no pattern";
}

}  // namespace
