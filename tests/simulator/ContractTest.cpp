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

struct Row {
    const char* service;
    const char* operation;
    const char* type;      // of the result; empty when that is a text
    std::string children;  // of a request that is answered well
    std::string refused;   // of one that is not; empty when the operation refuses nothing
    int code = 1;          // of that refusal
};

std::string Paged(const std::string& before, int page, const std::string& after, bool sizeFirst = false)
{
    const std::string size = "<z:ItemsPerPage>3</z:ItemsPerPage>";
    const std::string number = "<z:CurrentPageNumber>" + std::to_string(page) + "</z:CurrentPageNumber>";
    return before + (sizeFirst ? size + number : number + size) + after;
}

std::vector<Row> Rows()
{
    const auto one = [](const char* name, const std::string& value) { return Children({{name, value}}); };
    const std::string any = one("PurchaseType", "any");
    const std::string anyAny = any + one("TitleType", "any");
    const std::string all = anyAny + one("WatchStatusFilter", "Undefined");
    const std::string pass = one("PassID", "1") + one("FileProfile", "STANDARD");
    const std::string noPass = one("PassID", "999") + one("FileProfile", "STANDARD");
    const std::string loud = one("AudioSetting", "Stereo_Standard");
    const std::string bonus = one("FileProfile", "STANDARD") + one("BonusAssetType", "Trailer");
    const std::string buy = one("IPAddress", "10.0.0.1") + one("UsePrePaidFunds", "yes");
    const std::string ints = "<z:int>1</z:int><z:int>2</z:int>";
    return {
        {kBrowse, "getFileType", "FileTypeRecord", "", ""},
        {kBrowse, "shouldUpdateCache", "", one("UTCTime", "then"), ""},
        {kBrowse, "getRecommendedTitles", "RecommendedTitlesResponse", one("TitleId", "12"), one("TitleId", "0")},
        {kBrowse, "getLastCacheLoadTimeUTC", "", "", ""},
        {kBrowse, "translateSkuId", "TranslateSkuIdResponse", one("SkuId", "SKU"), one("SkuId", "1")},
        {kBrowse, "translateTivoExternalId", "TranslatedTivoExternalIdResponse", one("TivoExternalId", "EXT12"),
         one("TivoExternalId", "none")},
        {kBrowse, "getAllTvEpisodeListings", "ArrayOfTitleListingResponse", one("TitleID", "SEASON"), ""},
        {kBrowse, "getTvEpisodeListing", "TitleListingResponse", one("EpisodeID", "EPISODE"), one("EpisodeID", "12")},
        {kBrowse, "getTvEpisodeListByTitleID", "TvEpisodeList", one("TitleID", "SEASON"), one("TitleID", "12")},
        {kBrowse, "getTitleListing", "TitleListingResponse", one("TitleID", "12"), one("TitleID", "0")},
        {kBrowse, "getTitlesByGenreArray", "ArrayOfGetTitlesResponse",
         Paged("<z:GenreIDs>" + ints + "</z:GenreIDs>", 1, any), ""},
        {kBrowse, "getTitlesByNavigation", "GetTitlesResponse", Paged(one("GenreID", "1"), 2, any),
         Paged(one("GenreID", "77"), 1, any)},
        {kBrowse, "getTitlesByNavigation", "GetTitlesResponse", Paged(one("GenreID", "1"), 9999, any),
         Paged(one("GenreID", "1"), 0, any), 2},
        {kBrowse, "getGenreLabel", "GetGenreLabelResponse", one("GenreID", "1"), one("GenreID", "77")},
        {kBrowse, "searchForTitle", "GetTitlesResponse", Paged(one("Query", "the"), 1, anyAny, true),
         Paged(one("Query", "the"), 32768, anyAny, true), 2},
        {kBrowse, "searchForTitleDetail", "GetTitlesResponse", Paged(one("Query", "the"), 1, anyAny, true), ""},
        {kBrowse, "getNavigation", "GenreRequest", "", ""},
        {kBoth, "checkRentalExpiration", "CheckRentalExpirationResponse", one("PassId", "1"), one("PassId", "999")},
        {kBoth, "GetCountryID", "", "", ""},
        {kBoth, "getConfig", "GetConfigResponse", "", ""},
        {kBoth, "checkAdultVerificationPin", "CheckAdultVerificationPinResponse", one("Pin", "0042"), ""},
        {kBoth, "checkAdultVerificationEnabled", "CheckAdultVerificationEnabledResponse", "", ""},
        {kBoth, "addItemToWishlist", "StandardResponse", one("TitleID", "12"), one("TitleID", "0")},
        {kBoth, "getWishlistItems", "GetWishlistItemsResponse",
         Paged(one("sortOrder", "1"), 1, one("TitleType", "any")),
         Paged(one("sortOrder", "1"), 0, one("TitleType", "any")), 2},
        {kBoth, "getWishlistItems", "GetWishlistItemsResponse",
         Paged(one("sortOrder", "3"), 1, one("TitleType", "movies")),
         Paged(one("sortOrder", "4"), 1, one("TitleType", "any")), 2},
        {kStream, "removeItemFromWishList", "StandardResponse", one("TitleID", "12"), one("TitleID", "12")},
        {kBoth, "removeAllItemsFromWishList", "StandardResponse", "", ""},
        {kStream, "assignGiftCertificateToUser", "BalanceResponse", one("GiftCertificateCode", "GIFT1"),
         one("GiftCertificateCode", "GIFT1")},
        {kBoth, "getSettingsPageInfo", "SettingsPageInfo", "", ""},
        {kBoth, "getEmailAddress", "GetEmailAddressResponse", "", ""},
        {kBoth, "showPrePaidCardBalance", "BalanceResponse", "", ""},
        {kBoth, "getBillingInfo", "BillingInfoResponse", "", ""},
        {kAccount, "checkForPurchasedTitle", "", one("TitleID", "12"), ""},
        {kAccount, "getMyVideos", "GetMyVideosResponse", Paged("", 1, all), Paged("", 0, all), 2},
        {kStream, "getMyStreamingVideos", "GetMyVideosResponse", Paged("", 1, all), Paged("", 0, all), 2},
        {kBoth, "doPurchaseSavedbilling", "PurchaseResponse", one("SkuID", "SKU") + buy, one("SkuID", "9022") + buy,
         22},
        {kBoth, "deactivateDevice", "StandardResponse", "", ""},
        {kBoth, "authorizeDevice", "AuthorizeDeviceResponse", one("PIN", "123456"), one("PIN", "000000"), 2},
        {kBoth, "checkAuthToken", "", one("AuthToken", "x"), ""},
        {kStream, "getTHXMediaDirectorBonusAsset", "THXMediaDirectorResponse", one("BonusAssetID", "BONUS") + bonus,
         one("BonusAssetID", "1") + bonus, 2},
        {kStream, "getTHXMediaDirector", "THXMediaDirectorResponse", pass + loud, noPass + loud, 2},
        {kStream, "setAudioDefaultProperty", "StandardResponse", loud, ""},
        {kStream, "getAudioDefaultProperty", "", "", ""},
        {kStream, "calcOrderTax", "CalcOrderTaxResponse", one("SKUID", "SKU"), one("SKUID", "9111"), 11},
        {kStream, "ReturnTimeout", "StandardResponse", "", ""},
        {kStream, "ReturnError", "StandardResponse", "", ""},
        {kStream, "getStreamingAssetLocation", "GetStreamingAssetLocationResponse", pass, noPass, 2},
        {kStream, "loadLastStreamingAssetLocationForPass", "GetStreamingAssetLocationResponse", pass, noPass, 2},
        {kStream, "getBonusAssetLocation", "GetStreamingAssetLocationResponse", one("BonusAssetID", "BONUS"),
         one("BonusAssetID", "1"), 2},
        {kStream, "manageStreamInstanceStatus", "StandardResponse",
         Children({{"StreamID", "stream-1"}, {"Status", "paused"}, {"StopTimeSeconds", "90"}}),
         Children({{"StreamID", "none"}, {"Status", "paused"}, {"StopTimeSeconds", "90"}})},
        {kStream, "getBillingInfoAndPPCBalance", "BillingInfoAndPPCBalanceResponse", "", ""},
        {kStream, "checkForPurchasedStream", "", one("SkuID", "SKU"), ""},
        {kStream, "checkForPurchasedStreamByTitleID", "", one("TitleID", "12"), ""},
        {kStream, "getTitleListingsPurchasedForPasses", "ArrayOfTitleListingPurchasedForPass",
         "<z:Passes>" + ints + "</z:Passes>", ""},
        {kStream, "removeAllMyPurchases", "StandardResponse", one("password", "secret"), one("password", "guess")},
    };
}

class ContractTest : public StorefrontTest {
protected:
    // The children with the database's ids in the places of their names.
    std::string WithIds(std::string children)
    {
        const std::pair<const char*, const char*> ids[] = {{"SKU<", "SELECT MIN(sku) FROM product WHERE price < 5"},
                                                           {"SEASON<", "SELECT MIN(id) FROM title WHERE is_tv = 1"},
                                                           {"EPISODE<", "SELECT MIN(id) FROM title WHERE season <> 0"},
                                                           {"BONUS<", "SELECT MIN(id) FROM bonus"}};
        for (const auto& id : ids) {
            const size_t place = children.find(std::string(">") + id.first);
            if (place != std::string::npos) children.replace(place + 1, strlen(id.first) - 1, store->Query(id.second));
        }
        return children;
    }
    void CheckRow(const std::string& service, const Row& row)
    {
        SCOPED_TRACE(service + " " + row.operation);
        const Reply good = Ask(service, row.operation, WithIds(row.children));
        EXPECT_EQ("", CheckAnswer(good, row.operation, row.type));
        const std::string code = good.Element("ResponseCode");
        EXPECT_TRUE(code.empty() || code == "0") << good.body;
        if (!row.refused.empty()) {
            const Reply refused = Ask(service, row.operation, WithIds(row.refused));
            EXPECT_EQ("", CheckAnswer(refused, row.operation, row.type));
            EXPECT_EQ(std::to_string(row.code), refused.Element("ResponseCode")) << refused.body;
        }
        std::string error;
        if (!store->AddFault(std::string(row.operation) + "=code:19", error)) return;
        const Reply ordered = Ask(service, row.operation, WithIds(row.children));
        EXPECT_EQ("", CheckAnswer(ordered, row.operation, row.type));
        EXPECT_EQ("19", ordered.Element("ResponseCode"));
    }
};

TEST_F(ContractTest, EveryAnswerIsOneOfTheContract)
{
    Begin();
    for (const Row& row : Rows()) {
        for (const char* service : {kBrowse, kAccount, kStream}) {
            if (row.service == kBoth ? service != kBrowse : row.service == service) CheckRow(service, row);
        }
    }
}

TEST_F(ContractTest, SearchesLookAwayFromCase)
{
    Begin();
    const auto found = [&](const char* text) {
        const std::string any = Children({{"PurchaseType", "any"}, {"TitleType", "any"}});
        const std::string search = Paged(Children({{"Query", text}}), 1, any, true);
        return atoi(Ask(kBrowse, "searchForTitle", search).Element("TotalItems").c_str());
    };
    EXPECT_GT(found("harbour"), 0);
    EXPECT_EQ(found("harbour"), found("HARBOUR"));
    EXPECT_GT(found("Caf\u00e9"), 0);
    EXPECT_EQ(found("Caf\u00e9"), found("cAF\u00c9"));
    EXPECT_EQ(found("&lt;%&gt;"), 0) << "no pattern";
}

}  // namespace
