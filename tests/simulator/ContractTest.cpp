// Every operation's answer against the published contract: children, their order and types, those that are never left
// out; and the pages that publish it.
#include <gtest/gtest.h>

#include <map>
#include <sstream>

#include "ContractFiles.h"
#include "ContractSchema.h"
#include "RawClient.h"

namespace {

// What is wrong with an answer that has a result; empty when nothing is.
std::string CheckAnswer(const Reply& reply, const std::string& operation)
{
    static const ContractSchema kAnswers("answer.xsd");
    if (reply.status != 200) return "HTTP status " + std::to_string(reply.status) + ": " + reply.body;
    for (const std::string& element : {operation + "Response ", operation + "Result>"}) {
        if (reply.body.find("<" + element) == std::string::npos) return "no " + element;
    }
    return kAnswers.Check(reply.body);
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

TEST_F(ContractTest, FaultsAreOnesOfTheContract)
{
    Begin();
    const struct {
        const char* fault;
        const char* schema;
        int status;
    } rows[] = {{"fault11", "answer.xsd", 500},
                {"fault12", "answer12.xsd", 500},
                {"soap12", "answer12.xsd", 200},
                {"extra-header", "answer.xsd", 200},
                {"missing-result", "answer.xsd", 200}};
    for (const auto& row : rows) {
        Order(std::string("getConfig=") + row.fault);
        const Reply reply = Ask(kStream, "getConfig");
        EXPECT_EQ(row.status, reply.status) << row.fault;
        EXPECT_EQ("", ContractSchema(row.schema).Check(reply.body)) << row.fault;
    }
    const Reply refusal = Ask(kStream, "getNavigation");
    EXPECT_EQ(500, refusal.status);
    EXPECT_EQ("", ContractSchema("answer.xsd").Check(refusal.body));
}

TEST_F(ContractTest, TheContractIsServedWithTheAddressInUse)
{
    Begin();
    const std::string host = "https://localhost:" + std::to_string(store->HttpsPort());
    const auto get = [&](const std::string& target, const char* method = "GET") {
        return SendBytes(store->HttpsPort(), true,
                         method + (" " + target) + " HTTP/1.1\r\nHost: " + host.substr(strlen("https://")) +
                             "\r\nConnection: close\r\n\r\n");
    };
    for (const std::string base : {"/api/", "/kac/api/"}) {
        for (const std::string service : {kBrowse, kAccount, kStream}) {
            for (const char* query : {"?wsdl", "?WSDL"}) {
                const Reply reply = get(base + service + ".asmx" + query);
                EXPECT_EQ("text/xml; charset=utf-8", reply.Header("Content-Type"));
                EXPECT_NE(std::string::npos,
                          reply.body.find("<SOAP:address location=\"" + host + base + service + ".asmx\"/>"));
            }
        }
        for (const auto& [name, content] : ContractFiles()) {
            const bool isServed = name.find(".xsd") != std::string::npos;
            EXPECT_EQ(isServed ? content : "", get(base + name).body) << name;
        }
    }
    EXPECT_EQ("contract", LastLogged().service);
    EXPECT_EQ("", LastLogged().violation);
    for (const char* target : {"/api/none.xsd", "/api/x/api.xsd", "/api/Other.asmx?wsdl"}) {
        EXPECT_EQ(404, get(target).status) << target;
    }
    EXPECT_EQ(404, get("/api/api.xsd", "POST").status);
    EXPECT_EQ(500, get("/api/StreamAPI.asmx?what").status);
    EXPECT_EQ(404, Plain("/api/api.xsd").status) << "not without TLS";
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
