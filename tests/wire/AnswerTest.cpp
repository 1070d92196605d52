// Answers written by hand, in both versions of SOAP, as far as the library's records.
#include <string.h>

#include "Conversion.h"
#include "Exchange.h"
#include "Records.h"
#include "ZVUtilities.h"

namespace {

const char kSoap11[] = "http://schemas.xmlsoap.org/soap/envelope/";
const char kSoap12[] = "http://www.w3.org/2003/05/soap-envelope";

std::string Envelope(const std::string& body, const std::string& version = kSoap11)
{
    return "<?xml version=\"1.0\" encoding=\"utf-8\"?><s:Envelope xmlns:s=\"" + version +
           "\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\">"
           "<s:Body xmlns=\"http://api.zorvane.example/api/\">" +
           body + "</s:Body></s:Envelope>";
}

const char kListing[] =
    "<getTitleListingResponse><getTitleListingResult>"
    "<TitleID>42</TitleID><TitleName>L\xC3\xA9on &amp; friends</TitleName><TitlePosition>3</TitlePosition>"
    "<BonusAssets><BonusAsset BonusAssetID=\"9\" Profile=\"HIGH_DEFINITION\" BonusType=\"Trailer\"/></BonusAssets>"
    "<IsTvListing>1</IsTvListing>"
    "<AvailableProducts><ProductListing><SkuID>5</SkuID><PurchaseType>buy</PurchaseType><Price>4.90</Price>"
    "<AvailableAssets><FileProfile>STANDARD</FileProfile><FileProfile>HIGH_DEFINITION</FileProfile></AvailableAssets>"
    "<ExpireDate>2026/12/31 23:59:59</ExpireDate></ProductListing><ProductListing xsi:nil=\"true\"/>"
    "</AvailableProducts><ResponseCode>0</ResponseCode><Synopsys>Two &lt;lines&gt;</Synopsys>"
    "<IsAvailInUserWishList>true</IsAvailInUserWishList></getTitleListingResult></getTitleListingResponse>";

struct Listing {
    int result = -1;
    bool answered = false;
    ZV_WS_TitleListingResponse record;

    explicit Listing(const std::string& answer)
    {
        Records::Tag(record);
        Exchange<RealTimeBrowse> exchange;
        _ZV1__getTitleListing request;
        _ZV1__getTitleListingResponse response;
        result = exchange.Run("getTitleListing", answer,
                              [&](RealTimeBrowse& service) { return service.getTitleListing(&request, &response); });
        answered = response.getTitleListingResult != nullptr;
        if (result == SOAP_OK && answered) ZVUtilities::Convert(response.getTitleListingResult, record);
    }
    ~Listing() { ZV_WS_release(&record); }
};

TEST(Answer, RecordsAreReadWholeInBothVersions)
{
    for (const char* version : {kSoap11, kSoap12}) {
        SCOPED_TRACE(version);
        const Listing listing(HttpAnswer(Envelope(kListing, version)));
        ASSERT_EQ(SOAP_OK, listing.result);
        const ZV_WS_TitleListingResponse& r = listing.record;
        EXPECT_EQ(42, r.TitleID);
        EXPECT_STREQ("L\xC3\xA9on & friends", r.TitleName);
        EXPECT_EQ(nullptr, r.BoxArtPrefix);
        EXPECT_TRUE(r.IsTvListing);
        EXPECT_STREQ("Two <lines>", r.Synopsis);
        ASSERT_EQ(1u, r.BonusAssets.size);
        EXPECT_EQ(9, r.BonusAssets.BonusAsset[0].BonusAssetID);
        EXPECT_EQ(FILE_PROFILE_HIGHDEFINITION, r.BonusAssets.BonusAsset[0].Profile);
        ASSERT_EQ(2u, r.AvailableProducts.size);
        const ZV_WS_ProductListing& product = r.AvailableProducts.ProductListing[0];
        ASSERT_EQ(2u, product.AvailableAssets.size);
        EXPECT_EQ(FILE_PROFILE_HIGHDEFINITION, product.AvailableAssets.FileProfile[1]);
        EXPECT_EQ(0u, product.AvailableAudioProfiles.size);
        EXPECT_EQ(nullptr, r.AvailableProducts.ProductListing[1].Price);
    }
}

// What damage does to an answer, the library's tests see with the simulator's faults; these are whole and not the
// answer.
TEST(Answer, AnswersToSomethingElseFail)
{
    for (const char* body : {"<getNothingResponse/>", "<getTitleListingResult/>"}) {
        const Listing listing(HttpAnswer(Envelope(body)));
        EXPECT_NE(SOAP_OK, listing.result) << body;
        EXPECT_FALSE(listing.answered) << body;
    }
    const Listing empty(HttpAnswer(Envelope("<getTitleListingResponse/>")));
    EXPECT_EQ(SOAP_OK, empty.result);
    EXPECT_FALSE(empty.answered);
}

std::string Replaced(std::string text, const std::string& from, const std::string& to)
{
    for (size_t at = 0; (at = text.find(from, at)) != std::string::npos; at += to.size())
        text.replace(at, from.size(), to);
    return text;
}

// It is well-formed, and says nothing; without it the rest of each record would not be read.
TEST(Answer, TextBetweenElementsIsReadOver)
{
    for (const char* text :
         {" x ", "&amp;", "<![CDATA[<y>]]>", "<!-- c -->z<!-- d -->", "\xE2\x82\xAC>'\"", "<?p q?>"}) {
        SCOPED_TRACE(text);
        std::string body = kListing;
        for (const char* tag :
             {"<getTitleListingResult>", "<TitleID>", "</TitleID>", "<BonusAsset ", "<ProductListing>", "</SkuID>",
              "<FileProfile>", "</AvailableAssets>", "</IsAvailInUserWishList>"}) {
            const bool isBefore = tag[1] != '/' && strstr(tag, "Result>") == nullptr;
            body = Replaced(body, tag, isBefore ? text + std::string(tag) : tag + std::string(text));
        }
        const Listing listing(HttpAnswer(Envelope(body)));
        ASSERT_EQ(SOAP_OK, listing.result);
        const ZV_WS_TitleListingResponse& r = listing.record;
        EXPECT_EQ(42, r.TitleID);
        ASSERT_EQ(1u, r.BonusAssets.size);
        ASSERT_EQ(2u, r.AvailableProducts.size);
        EXPECT_EQ(2u, r.AvailableProducts.ProductListing[0].AvailableAssets.size);
        EXPECT_STREQ("2026/12/31 23:59:59", r.AvailableProducts.ProductListing[0].ExpireDate);
        EXPECT_STREQ("Two <lines>", r.Synopsis);
    }
    const Listing cut(HttpAnswer(Envelope(Replaced(kListing, "</TitleID>", "</TitleID> x")).substr(0, 500)));
    EXPECT_NE(SOAP_OK, cut.result);
}

TEST(Answer, ValuesOutsideTheContractFailTheWhole)
{
    const struct {
        const char* from;
        const char* to;
        int result;
    } rows[] = {
        {"<PurchaseType>buy", "<PurchaseType>\n buy ", SOAP_OK},
        {"<PurchaseType>buy", "<PurchaseType>1", SOAP_TYPE},  // a number is no text of the list
        {"<PurchaseType>buy", "<PurchaseType>Buy", SOAP_TYPE},
        {"<PurchaseType>buy", "<PurchaseType>lease", SOAP_TYPE},
        {"\"HIGH_DEFINITION\"", "\"2\"", SOAP_TYPE},
        {"<TitlePosition>3", "<TitlePosition> 32767 ", SOAP_OK},
        {"<TitlePosition>3", "<TitlePosition>32768", SOAP_TYPE},
        {"<TitleID>42", "<TitleID>2147483648", SOAP_TYPE},
        {"<IsTvListing>1", "<IsTvListing>2", SOAP_TYPE},
    };
    for (const auto& row : rows) {
        const Listing listing(HttpAnswer(Envelope(Replaced(kListing, row.from, row.to))));
        EXPECT_EQ(row.result, listing.result) << row.to;
    }
}

// The service's yes or no is XML of any kind. What is neither must not pass for a no: it is about what children see.
TEST(Answer, TheAdultFlagIsYesOrNo)
{
    enum Reads { No, Yes, Not };
    const struct {
        const char* content;
        Reads reads;
    } rows[] = {
        {"true", Yes},
        {"1", Yes},
        {" \t\n true \r\n", Yes},
        {"<![CDATA[true]]>", Yes},
        {"<![CDATA[ tr]]>ue", Yes},
        {"&#116;rue", Yes},
        {"t<!-- r -->rue", Yes},
        {"false", No},
        {" 0", No},
        {"<![CDATA[0]]>", No},
        {nullptr, No},
        {"", Not},
        {" ", Not},
        {"True", Not},
        {"yes", Not},
        {"01", Not},
        {"tru e", Not},
        {"true false", Not},
        {"&amp;", Not},
        {"<flag>true</flag>", Not},
        {"true<flag/>", Not},
    };
    for (const auto& row : rows) {
        const std::string name = "IsAdultVerificationEnabled";
        std::string element;
        if (row.content) element.append("<").append(name).append(">").append(row.content).append("</" + name + ">");
        SCOPED_TRACE(element);
        Exchange<DownloadAPI> exchange;
        _ZV1__checkAdultVerificationEnabled request;
        _ZV1__checkAdultVerificationEnabledResponse response;
        const std::string body =
            "<checkAdultVerificationEnabledResponse><checkAdultVerificationEnabledResult><ResponseCode>0</"
            "ResponseCode>" +
            element + "</checkAdultVerificationEnabledResult></checkAdultVerificationEnabledResponse>";
        ASSERT_EQ(SOAP_OK,
                  exchange.Run("checkAdultVerificationEnabled", HttpAnswer(Envelope(body)), [&](DownloadAPI& service) {
                      return service.checkAdultVerificationEnabled(&request, &response);
                  }));
        const char* const xml = response.checkAdultVerificationEnabledResult->IsAdultVerificationEnabled;
        bool flag = true;
        EXPECT_EQ(row.reads != Not, ZVUtilities::ReadFlag(xml, flag));
        EXPECT_EQ(row.reads == Yes, flag);
        ZV_WS_CheckAdultVerificationEnabledResponse record;
        Records::Tag(record);
        ZVUtilities::Convert(response.checkAdultVerificationEnabledResult, record);
        EXPECT_EQ(row.reads == Yes, record.IsAdultVerificationEnabled);
        ZV_WS_release(&record);
    }
}

}  // namespace
