// Two customers on one player: for whom a request is answered, and what the log tells of its token.
#include <gtest/gtest.h>

#include "RawClient.h"

namespace {

class CustomerTest : public StorefrontTest {
protected:
    void SetUp() override { Begin(); }

    Reply AskAs(const std::string& token, const std::string& operation, const std::string& children = "",
                const char* service = "StreamAPI")
    {
        SoapRequest request = {service, operation, children};
        request.token = token;
        return Send(request);
    }
    std::string Activate(const std::string& pin, const std::string& device = "desktop-player")
    {
        SoapRequest request = {"StreamAPI", "authorizeDevice", Children({{"PIN", pin}})};
        request.device = device;
        return Send(request).Element("AuthToken");
    }
    std::string First() { return Activate(StorefrontAccount::kActivationPin); }
    std::string Second() { return Activate(StorefrontAccount::kSecondActivationPin); }

    // How the token of a request stands that is answered for the account.
    std::string Standing(const std::string& token, int account)
    {
        EXPECT_EQ(store->Query("SELECT email FROM account WHERE id = " + std::to_string(account)),
                  AskAs(token, "getEmailAddress").Element("EmailAddress"));
        const LoggedRequest entry = LastLogged();
        EXPECT_EQ(token.empty() ? "" : "***", Value(entry.soap, "AuthToken"));
        std::string standing = Value(entry.soap, "token");
        const bool isGood = standing == "current" || standing == "replaced";
        EXPECT_EQ(isGood ? "true" : "false",
                  AskAs("", "checkAuthToken", Children({{"AuthToken", token}})).Element("checkAuthTokenResult"));
        return standing;
    }
};

const std::string kPage = "<z:CurrentPageNumber>1</z:CurrentPageNumber><z:ItemsPerPage>9</z:ItemsPerPage>";
const std::string kVideos = kPage +
                            "<z:PurchaseType>any</z:PurchaseType><z:TitleType>any</z:TitleType><z:WatchStatusFilter>"
                            "Undefined</z:WatchStatusFilter>";
const std::string kWishes = "<z:sortOrder>0</z:sortOrder>" + kPage + "<z:TitleType>any</z:TitleType>";

TEST_F(CustomerTest, TheTokenDecidesWhoIsAnswered)
{
    const struct {
        const char* operation;
        std::string children;
        const char* element;
        std::string expected;  // SQL, with "?" for the account
        const char* service = "StreamAPI";
    } rows[] = {
        {"getEmailAddress", "", "EmailAddress", "SELECT email FROM account WHERE id = ?"},
        {"getSettingsPageInfo", "", "Account", "SELECT name FROM account WHERE id = ?"},
        {"getBillingInfo", "", "CCLastFour", "SELECT card FROM account WHERE id = ?"},
        {"getBillingInfoAndPPCBalance", "", "CCType", "SELECT card_name FROM account WHERE id = ?"},
        {"getBillingInfoAndPPCBalance", "", "Balance", "SELECT prepaid FROM account WHERE id = ?"},
        {"showPrePaidCardBalance", "", "Balance", "SELECT prepaid FROM account WHERE id = ?"},
        {"checkAdultVerificationEnabled", "", "IsAdultVerificationEnabled",
         "SELECT CASE adult_enabled WHEN 1 THEN 'true' ELSE 'false' END FROM account WHERE id = ?"},
        {"getMyStreamingVideos", kVideos, "TitleID", "SELECT title FROM pass WHERE account = ? ORDER BY id"},
        {"getMyStreamingVideos", kVideos, "TotalItems", "SELECT COUNT(*) FROM pass WHERE account = ?"},
        {"getWishlistItems", kWishes, "TitleID", "SELECT title FROM wish WHERE account = ? ORDER BY added"},
        {"getWishlistItems", kWishes, "TotalItems", "SELECT COUNT(*) FROM wish WHERE account = ?"},
        {"checkForPurchasedStreamByTitleID", Children({{"TitleID", "12"}}), "checkForPurchasedStreamByTitleIDResult",
         "SELECT CASE ? WHEN 1 THEN 'true' ELSE 'false' END"},
        {"getMyVideos", kVideos, "PassID", "SELECT id FROM pass WHERE account = ? ORDER BY id", "DownloadAPI"},
        {"getTitleListing", Children({{"TitleID", "19"}}), "IsAvailInUserWishList",
         "SELECT CASE ? WHEN 1 THEN 'true' ELSE 'false' END", "RealTimeBrowse"},
    };
    const auto expected = [&](std::string sql, int account) {
        return store->Query(sql.replace(sql.find('?'), 1, std::to_string(account)));
    };
    const std::pair<std::string, int> tokens[] = {{First(), 1}, {Second(), 2}, {"", 1}, {"token-of-nobody", 1}};
    for (const auto& row : rows) {
        EXPECT_NE(expected(row.expected, 1), expected(row.expected, 2)) << row.operation;
        for (const auto& [token, account] : tokens) {
            EXPECT_EQ(expected(row.expected, account),
                      AskAs(token, row.operation, row.children, row.service).Element(row.element))
                << row.operation << " " << token;
        }
    }
}

// Each row changes something of the second customer's, or is refused for a pass of the first one's.
TEST_F(CustomerTest, NothingOfTheOthersIsReached)
{
    const auto all = [&](const std::string& account) {
        return std::tuple(store->Rows("SELECT * FROM account WHERE id = " + account),
                          store->Rows("SELECT * FROM wish WHERE account = " + account),
                          store->Rows("SELECT * FROM pass WHERE account = " + account));
    };
    const std::string profile = "<z:FileProfile>STANDARD</z:FileProfile>";
    const std::string theirs = Children({{"PassID", "1"}}) + profile;
    AskAs("", "getStreamingAssetLocation", theirs);  // "stream-1" begins
    const struct {
        const char* operation;
        std::string children;
        const char* code = "0";
    } rows[] = {
        {"addItemToWishlist", Children({{"TitleID", "7"}})},
        {"removeItemFromWishList", Children({{"TitleID", "7"}})},
        {"removeAllItemsFromWishList", ""},
        {"assignGiftCertificateToUser", Children({{"GiftCertificateCode", "GIFT4"}})},
        {"doPurchaseSavedbilling", Children({{"SkuID", store->Query("SELECT MIN(sku) FROM product WHERE price < 5")},
                                             {"IPAddress", "10.0.0.1"},
                                             {"UsePrePaidFunds", "yes"}})},
        {"setAudioDefaultProperty", Children({{"AudioSetting", "DTS_Express_51"}})},
        {"removeAllMyPurchases", Children({{"password", "secret"}})},
        {"removeItemFromWishList", Children({{"TitleID", "19"}}), "1"},
        {"checkRentalExpiration", Children({{"PassId", "1"}}), "1"},
        {"getStreamingAssetLocation", theirs, "2"},
        {"loadLastStreamingAssetLocationForPass", theirs, "2"},
        {"getTHXMediaDirector", theirs + Children({{"AudioSetting", "Stereo_Standard"}}), "2"},
        {"manageStreamInstanceStatus",
         Children({{"StreamID", "stream-1"}, {"Status", "paused"}, {"StopTimeSeconds", "5"}}), "1"},
        {"getTitleListingsPurchasedForPasses", "<z:Passes><z:int>1</z:int></z:Passes>", ""},
    };
    const std::string token = Second();
    const auto first = all("1");
    for (const auto& row : rows) {
        const auto before = all("2");
        EXPECT_EQ(row.code, AskAs(token, row.operation, row.children).Element("ResponseCode")) << row.operation;
        EXPECT_EQ(*row.code == '0', before != all("2")) << row.operation;
        EXPECT_EQ(first, all("1")) << row.operation;
    }
}

TEST_F(CustomerTest, TheLogTellsHowATokenStands)
{
    EXPECT_EQ("none", Standing("", 1));
    EXPECT_EQ("unknown", Standing("token-2", 1));
    const std::string first = First();
    EXPECT_EQ("current", Standing(first, 1));
    const std::string second = Second();
    EXPECT_EQ("current", Standing(second, 2));
    EXPECT_EQ("replaced", Standing(first, 1));
    EXPECT_EQ("", Activate("111111"));
    Order("authorizeDevice=code:1");
    EXPECT_EQ("", First());
    EXPECT_EQ("current", Standing(second, 2)) << "a refusal gives no token out";
    const std::string elsewhere = Activate(StorefrontAccount::kSecondActivationPin, "bedroom");
    EXPECT_EQ("current", Standing(second, 2)) << "each device has its last one";
    AskAs("", "deactivateDevice");
    for (const std::string& token : {first, second})
        EXPECT_EQ("withdrawn", Standing(token, 1)) << token;
    EXPECT_EQ("current", Standing(elsewhere, 2));

    SoapRequest wrong = {"StreamAPI", "getConfig", "<z:Extra/>"};
    wrong.token = second;
    EXPECT_EQ(500, Send(wrong).status);
    EXPECT_EQ("withdrawn", Value(LastLogged().soap, "token")) << "of refused requests, too";
    EXPECT_EQ(std::string::npos, Plain("/control/log").body.find(second));
}

}  // namespace
