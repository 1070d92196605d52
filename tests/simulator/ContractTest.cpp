// Every operation's answer against the contract's records: children, their order, those that are never left out.
#include <gtest/gtest.h>
#include <libxml/parser.h>

#include <map>
#include <sstream>

#include "RawClient.h"

namespace {

// A child as "Name" or "Name:Record" with "*" behind one that may be left out; "ArrayOf" makes a record of any type.
// "<" takes another record's children first. What their texts must be is the client's to notice, which reads every
// answer.
const std::map<std::string, std::string> kRecords = {
    {"StandardResponse", "ResponseCode ResponseMessage*"},
    {"Genre", "ID Name* Visible ParentId"},
    {"GenreRequest", "Genres:ArrayOfGenre*"},
    {"GetGenreLabelResponse", "<StandardResponse Label* LabelMessage*"},
    {"TitleListing",
     "TitleID TitleName* BoxArtPrefix* TitlePosition EpisodeNumber BonusAssets:ArrayOfBonusAsset* IsTvListing "
     "MPAARating* AvailableProducts:ArrayOfProductListing* IsTHXMediaDirectorEnabled "
     "IsTHXMediaDirectorEnabledForTrailer CHVRSRating* LoyaltyPointsForBuy* LoyaltyPointsForRent*"},
    {"TitleListingResponse",
     "<TitleListing ResponseCode ResponseMessage* Synopsys* UserRating Directors* Actors* Writers* Producers* "
     "Copyright* RunTime* IsAvailInUserWishList RatingReason*"},
    {"TitleListingPurchased",
     "<TitleListing EpisodeID TvListingTitleID PurchaseType Status RentalPeriod* PassID PlayStatus "
     "StartTimeSeconds"},
    {"TitleListingPurchasedForPass", "<TitleListingPurchased ResponseCode ResponseMessage*"},
    {"BonusAsset", ""},
    {"ProductListing",
     "SkuID PurchaseType Price* AvailableAssets:ArrayOfFileProfile* ExpireDate* "
     "AvailableAudioProfiles:ArrayOfAudioFile* RentalPeriod"},
    {"AudioFile", "AssetAudioID FileLocation* ContainsVideo AudioAssetProfile"},
    {"GetTitlesResponse",
     "<StandardResponse GenreID CurrentPageNumber ItemsPerPage TotalPages TotalItems Titles:ArrayOfTitleListing*"},
    {"TvEpisode", "EpisodeID EpisodeName* EpisodeNumber"},
    {"TvEpisodeList", "<StandardResponse Episodes:ArrayOfTvEpisode*"},
    {"RecommendedTitlesResponse", "<StandardResponse Titles:ArrayOfTitleListing*"},
    {"TranslateSkuIdResponse", "<StandardResponse TitleId"},
    {"TranslatedTivoExternalIdResponse", "<StandardResponse TivoExternalId* TitleId"},
    {"FileTypeRecord", "File_DRMProvider File_AccessType File_FileProfile File_VideoFormat File_FileExtension"},
    {"GetMyVideosResponse",
     "<StandardResponse Titles:ArrayOfTitleListingPurchased* CurrentPageNumber ItemsPerPage TotalPages TotalItems"},
    {"GetWishlistItemsResponse", "<GetMyVideosResponse SortOrder"},
    {"Configuration", "Value*"},
    {"GetConfigResponse", "<StandardResponse ConfigurationSet:ArrayOfConfiguration*"},
    {"SettingsPageInfo", "<StandardResponse Account* DeviceID* DeviceName*"},
    {"GetEmailAddressResponse", "<StandardResponse EmailAddress*"},
    {"BillingInfoResponse", "<StandardResponse CCLastFour* CCTypeId CCType*"},
    {"BalanceResponse", "<StandardResponse Balance"},
    {"BillingInfoAndPPCBalanceResponse", "BillingInfo:BillingInfoResponse* PPCardBalance:BalanceResponse*"},
    {"CalcOrderTaxResponse", "<StandardResponse SubTotal* TotalPrice* Tax*"},
    {"PurchaseResponse", "<StandardResponse PassID TransactionId TransactionAuthNum*"},
    {"CheckRentalExpirationResponse", "<StandardResponse ShouldDisplay HoursRemaining"},
    {"CheckAdultVerificationEnabledResponse", "<StandardResponse IsAdultVerificationEnabled*"},
    {"CheckAdultVerificationPinResponse", "<StandardResponse IsPinVerified"},
    {"GetStreamingAssetLocationResponse",
     "<StandardResponse StreamingAssetLocation* AssetID StreamID* DRMServerURL* DRMACKServerURL* Status "
     "StartTimeSeconds HeartbeatURL* HeartbeatPollInSeconds"},
    {"THXMediaDirectorResponse", "<StandardResponse LongFormat* ShortFormat*"},
    {"AuthorizeDeviceResponse", "<StandardResponse AuthToken*"},
};

struct ChildRule {
    std::string name, type;
    bool optional, repeated;
};

bool IsArray(const std::string& type)
{
    return type.compare(0, 7, "ArrayOf") == 0;
}

std::vector<ChildRule> RulesOf(const std::string& record)
{
    if (IsArray(record)) return {{record.substr(7), record.substr(7), false, true}};
    std::vector<ChildRule> rules;
    std::istringstream words(kRecords.at(record));
    for (std::string word; words >> word;) {
        if (word[0] == '<') {
            rules = RulesOf(word.substr(1));
            continue;
        }
        ChildRule rule{word, "", word.back() == '*', false};
        if (rule.optional) rule.name.pop_back();
        const size_t colon = rule.name.find(':');
        if (colon != std::string::npos) {
            rule.type = rule.name.substr(colon + 1);
            rule.name.resize(colon);
        }
        rules.push_back(rule);
    }
    return rules;
}

std::string NameOf(const xmlNode* node)
{
    return reinterpret_cast<const char*>(node->name);
}

// What is wrong with the element as a value of the type; empty when nothing is.
std::string Check(const xmlNode* element, const std::string& type)
{
    const std::string here = NameOf(element) + ": ";
    if (!IsArray(type) && !kRecords.count(type))
        return xmlChildElementCount(const_cast<xmlNode*>(element)) ? here + "no plain text" : "";
    const xmlNode* child = xmlFirstElementChild(const_cast<xmlNode*>(element));
    for (const ChildRule& rule : RulesOf(type)) {
        int count = 0;
        for (; child && NameOf(child) == rule.name && (count == 0 || rule.repeated); ++count) {
            if (strcmp("http://api.zorvane.example/api/", reinterpret_cast<const char*>(child->ns->href)) != 0)
                return here + rule.name + " is of another namespace";
            const std::string wrong = Check(child, rule.type);
            if (!wrong.empty()) return here + wrong;
            child = xmlNextElementSibling(const_cast<xmlNode*>(child));
        }
        if (count == 0 && !rule.optional && !rule.repeated) return here + "no " + rule.name;
    }
    return child ? here + NameOf(child) + " is unknown or out of order" : "";
}

// What is wrong with an answer whose result is of the type.
std::string CheckAnswer(const Reply& reply, const std::string& operation, const std::string& type)
{
    if (reply.status != 200) return "HTTP status " + std::to_string(reply.status) + ": " + reply.body;
    const std::unique_ptr<xmlDoc, void (*)(xmlDoc*)> document(
        xmlReadMemory(reply.body.data(), static_cast<int>(reply.body.size()), nullptr, nullptr, XML_PARSE_NONET),
        xmlFreeDoc);
    if (!document) return "no XML";
    const xmlNode* body = xmlLastElementChild(xmlDocGetRootElement(document.get()));
    const xmlNode* response = xmlFirstElementChild(const_cast<xmlNode*>(body));
    if (!response || NameOf(response) != operation + "Response") return "no " + operation + "Response";
    const xmlNode* result = xmlFirstElementChild(const_cast<xmlNode*>(response));
    if (!result || NameOf(result) != operation + "Result") return "no " + operation + "Result";
    return Check(result, type);
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
    const char* type;      // of the result; empty when that is a text
    const char* children;  // of a request that is answered well; some values are the database's
    const char* refused;   // the one child with which it is not; empty when the operation refuses nothing
    int code = 1;          // of that refusal
} kRows[] = {
    {kBrowse, "getFileType", "FileTypeRecord", "", ""},
    {kBrowse, "shouldUpdateCache", "", "UTCTime=then", ""},
    {kBrowse, "getRecommendedTitles", "RecommendedTitlesResponse", "TitleId=12", "TitleId=0"},
    {kBrowse, "getLastCacheLoadTimeUTC", "", "", ""},
    {kBrowse, "translateSkuId", "TranslateSkuIdResponse", "SkuId=SKU", "SkuId=1"},
    {kBrowse, "translateTivoExternalId", "TranslatedTivoExternalIdResponse", "TivoExternalId=EXT12",
     "TivoExternalId=none"},
    {kBrowse, "getAllTvEpisodeListings", "ArrayOfTitleListingResponse", "TitleID=SEASON", ""},
    {kBrowse, "getTvEpisodeListing", "TitleListingResponse", "EpisodeID=EPISODE", "EpisodeID=12"},
    {kBrowse, "getTvEpisodeListByTitleID", "TvEpisodeList", "TitleID=SEASON", "TitleID=12"},
    {kBrowse, "getTitleListing", "TitleListingResponse", "TitleID=12", "TitleID=0"},
    {kBrowse, "getTitlesByGenreArray", "ArrayOfGetTitlesResponse", "GenreIDs=" ARRAY " " PAGE "PurchaseType=any", ""},
    {kBrowse, "getTitlesByNavigation", "GetTitlesResponse", "GenreID=1 " PAGE "PurchaseType=any", "GenreID=77"},
    {kBrowse, "getTitlesByNavigation", "GetTitlesResponse",
     "GenreID=1 CurrentPageNumber=9999 ItemsPerPage=3 PurchaseType=any", "CurrentPageNumber=0", 2},
    {kBrowse, "getGenreLabel", "GetGenreLabelResponse", "GenreID=1", "GenreID=77"},
    {kBrowse, "searchForTitle", "GetTitlesResponse", SEARCH, "CurrentPageNumber=32768", 2},
    {kBrowse, "searchForTitleDetail", "GetTitlesResponse", SEARCH, ""},
    {kBrowse, "getNavigation", "GenreRequest", "", ""},
    {kBoth, "checkRentalExpiration", "CheckRentalExpirationResponse", "PassId=1", "PassId=999"},
    {kBoth, "GetCountryID", "", "", ""},
    {kBoth, "getConfig", "GetConfigResponse", "", ""},
    {kBoth, "checkAdultVerificationPin", "CheckAdultVerificationPinResponse", "Pin=0042", ""},
    {kBoth, "checkAdultVerificationEnabled", "CheckAdultVerificationEnabledResponse", "", ""},
    {kBoth, "addItemToWishlist", "StandardResponse", "TitleID=12", "TitleID=0"},
    {kBoth, "getWishlistItems", "GetWishlistItemsResponse", "sortOrder=1 " PAGE "TitleType=any", "CurrentPageNumber=0",
     2},
    {kBoth, "getWishlistItems", "GetWishlistItemsResponse", "sortOrder=3 " PAGE "TitleType=movies", "sortOrder=4", 2},
    {kStream, "removeItemFromWishList", "StandardResponse", "TitleID=12", "TitleID=12"},
    {kBoth, "removeAllItemsFromWishList", "StandardResponse", "", ""},
    {kStream, "assignGiftCertificateToUser", "BalanceResponse", "GiftCertificateCode=GIFT1",
     "GiftCertificateCode=GIFT1"},
    {kBoth, "getSettingsPageInfo", "SettingsPageInfo", "", ""},
    {kBoth, "getEmailAddress", "GetEmailAddressResponse", "", ""},
    {kBoth, "showPrePaidCardBalance", "BalanceResponse", "", ""},
    {kBoth, "getBillingInfo", "BillingInfoResponse", "", ""},
    {kAccount, "checkForPurchasedTitle", "", "TitleID=12", ""},
    {kAccount, "getMyVideos", "GetMyVideosResponse", PAGE ALL, "CurrentPageNumber=0", 2},
    {kStream, "getMyStreamingVideos", "GetMyVideosResponse", PAGE ALL, "CurrentPageNumber=0", 2},
    {kBoth, "doPurchaseSavedbilling", "PurchaseResponse", "SkuID=SKU IPAddress=10.0.0.1 UsePrePaidFunds=yes",
     "SkuID=9022", 22},
    {kBoth, "deactivateDevice", "StandardResponse", "", ""},
    {kBoth, "authorizeDevice", "AuthorizeDeviceResponse", "PIN=123456", "PIN=000000", 2},
    {kBoth, "checkAuthToken", "", "AuthToken=x", ""},
    {kStream, "getTHXMediaDirectorBonusAsset", "THXMediaDirectorResponse",
     "BonusAssetID=BONUS FileProfile=STANDARD BonusAssetType=Trailer", "BonusAssetID=1", 2},
    {kStream, "getTHXMediaDirector", "THXMediaDirectorResponse", PASS " " LOUD, "PassID=999", 2},
    {kStream, "setAudioDefaultProperty", "StandardResponse", LOUD, ""},
    {kStream, "getAudioDefaultProperty", "", "", ""},
    {kStream, "calcOrderTax", "CalcOrderTaxResponse", "SKUID=SKU", "SKUID=9111", 11},
    {kStream, "ReturnTimeout", "StandardResponse", "", ""},
    {kStream, "ReturnError", "StandardResponse", "", ""},
    {kStream, "getStreamingAssetLocation", "GetStreamingAssetLocationResponse", PASS, "PassID=999", 2},
    {kStream, "loadLastStreamingAssetLocationForPass", "GetStreamingAssetLocationResponse", PASS, "PassID=999", 2},
    {kStream, "getBonusAssetLocation", "GetStreamingAssetLocationResponse", "BonusAssetID=BONUS", "BonusAssetID=1", 2},
    {kStream, "manageStreamInstanceStatus", "StandardResponse", "StreamID=stream-1 Status=paused StopTimeSeconds=90",
     "StreamID=none"},
    {kStream, "getBillingInfoAndPPCBalance", "BillingInfoAndPPCBalanceResponse", "", ""},
    {kStream, "checkForPurchasedStream", "", "SkuID=SKU", ""},
    {kStream, "checkForPurchasedStreamByTitleID", "", "TitleID=12", ""},
    {kStream, "getTitleListingsPurchasedForPasses", "ArrayOfTitleListingPurchasedForPass", "Passes=" ARRAY, ""},
    {kStream, "removeAllMyPurchases", "StandardResponse", "password=secret", "password=guess"},
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
            EXPECT_EQ("", CheckAnswer(reply, row.operation, row.type));
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
