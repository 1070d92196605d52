// The operations of the customer's account, which the account and the stream service share, and those of the account
// service alone.
#include <ctime>

#include "PurchaseList.h"
#include "Tokens.h"

namespace simulator {

namespace {

// ---- The device

void authorizeDevice(Call& call)
{
    const std::string pin = call.Text("PIN");
    if (pin == "000000") return call.Refuse(2, "device locked out");
    const int account = call.database.Int("SELECT id FROM account WHERE pin = ?", {pin});
    if (account == 0) return call.Refuse(1, "invalid PIN");
    call.Standard();
    call.xml.Element("AuthToken", GiveToken(call.database, account, call.device));
}

void deactivateDevice(Call& call)
{
    WithdrawTokens(call.database, call.device);
    call.Standard();
}

void checkAuthToken(Call& call)
{
    call.xml.Raw(StandingOf(call.database, call.Text("AuthToken")).isGood ? "true" : "false");
}

void getConfig(Call& call)
{
    call.Standard();
    call.xml.Group("ConfigurationSet", [&] {
        const std::pair<std::string, std::string> standard[] = {
            {"BandwithCheckURL", "http://" + call.address + "/bandwidth/test.bin"}, {"Region", "00"}};
        const auto write = [&](const std::string& key, const std::string& value) {
            call.xml.Raw("<Configuration Key=\"" + XmlEscape(key) + "\">");
            call.xml.Optional("Value", value).Raw("</Configuration>");
        };
        for (const auto& item : standard) {
            if (call.database.Int("SELECT COUNT(*) FROM config WHERE key = ? COLLATE NOCASE", {item.first}) == 0)
                write(item.first, item.second);
        }
        call.database.Each("SELECT key, value FROM config", {},
                           [&](const Database::Row& row) { write(row.Text(0), row.Text(1)); });
        call.xml.Raw("<Configuration Key=\"Unset\"/>");
    });
}

void getSettingsPageInfo(Call& call)
{
    call.Standard();
    call.xml.Element("Account", call.AccountText("name")).Element("DeviceID", "1").Element("DeviceName", "Living room");
}

void GetCountryID(Call& call)
{
    call.xml.Raw(call.AccountText("country"));
}

// ---- Wish list

void addItemToWishlist(Call& call)
{
    const int title = call.Int("TitleID");
    if (call.database.Int("SELECT COUNT(*) FROM title WHERE id = ?", {title}) == 0)
        return call.Refuse(1, "no such title");
    call.database.Run("INSERT OR IGNORE INTO wish SELECT ?, ?, COALESCE(MAX(added), 0) + 1 FROM wish WHERE account = ?",
                      {call.account, title, call.account});
    call.Standard();
}

void removeItemFromWishList(Call& call)
{
    const bool removed =
        call.database.Run("DELETE FROM wish WHERE account = ? AND title = ?", {call.account, call.Int("TitleID")}) == 1;
    call.Standard(removed ? 0 : 1, removed ? "OK" : "not in the wish list");
}

void removeAllItemsFromWishList(Call& call)
{
    call.database.Run("DELETE FROM wish WHERE account = ?", {call.account});
    call.Standard();
}

void getWishlistItems(Call& call)
{
    static const char* const kOrders[] = {"added", "name", "rating", "stars DESC"};
    static const char* const kByType[] = {"", " AND is_tv = 1", " AND is_tv = 0"};
    const int order = call.Int("sortOrder");
    if (order < 0 || order > 3) return call.Refuse(2, "no such order");
    const std::string from =
        "wish JOIN title ON title.id = wish.title WHERE account = " + std::to_string(call.account) +
        kByType[call.Int("TitleType")];
    const bool written = WritePurchaseList(call, from, "wish.title", "0", std::string(kOrders[order]) + ", wish.title");
    if (written) call.xml.Element("SortOrder", order);
}

// ---- Money

void getEmailAddress(Call& call)
{
    call.Standard();
    call.xml.Element("EmailAddress", call.AccountText("email"));
}

void getBillingInfo(Call& call)
{
    if (call.AccountText("card").empty()) return call.Refuse(2, "no card on file");
    call.Standard();
    call.xml.Element("CCLastFour", call.AccountText("card")).Element("CCTypeId", call.AccountInt("card_type"));
    call.xml.Element("CCType", call.AccountText("card_name"));
}

void showPrePaidCardBalance(Call& call)
{
    call.Standard();
    call.xml.Element("Balance", call.AccountInt("prepaid"));
}

void assignGiftCertificateToUser(Call& call)
{
    const std::string code = call.Text("GiftCertificateCode");
    if (code.empty()) return call.Refuse(2, "no code");
    const int amount = call.database.Int("SELECT amount FROM gift WHERE code = ? AND used = 0", {code});
    if (amount == 0) return call.Refuse(1, "unknown or used code");
    call.database.Run("UPDATE gift SET used = 1 WHERE code = ?", {code});
    call.database.Run("UPDATE account SET prepaid = prepaid + ? WHERE id = ?", {amount, call.account});
    call.Standard();
    call.xml.Element("Balance", call.AccountInt("prepaid"));
}

int Cents(const std::string& price)
{
    const size_t point = price.find('.');
    return atoi(price.substr(0, point).c_str()) * 100 + atoi(price.substr(point + 1).c_str());
}

void doPurchaseSavedbilling(Call& call)
{
    const int sku = call.Int("SkuID");
    // The first refusals can be asked for by product: 9001 answers 1, 9002 answers 2 ... 9022 answers 22.
    if (sku > 9000 && sku <= 9022) return call.Refuse(sku - 9000, "refused as asked");
    const std::string funds = call.Text("UsePrePaidFunds");
    const std::string price = call.database.Text("SELECT price FROM product WHERE sku = ?", {sku});
    if (price.empty()) return call.Refuse(1, "no such product");
    if (funds != "yes" && funds != "no") return call.Refuse(7, "neither yes nor no");
    if (funds == "yes") {
        if (call.AccountInt("prepaid") < Cents(price)) return call.Refuse(12, "not enough prepaid money");
        call.database.Run("UPDATE account SET prepaid = prepaid - ? WHERE id = ?", {Cents(price), call.account});
    } else if (call.AccountText("card").empty()) {
        return call.Refuse(11, "no card on file");
    }
    call.database.Run(
        "INSERT INTO pass (account, title, sku, type, watch, status, position, hours, stream) SELECT ?, title, sku, "
        "type, 0, 1, 0, period, '' FROM product WHERE sku = ?",
        {call.account, sku});
    const int pass = call.database.LastId();
    call.Standard();
    call.xml.Element("PassID", pass)
        .Element("TransactionId", pass + 5000)
        .Element("TransactionAuthNum", "A" + std::to_string(pass));
}

void checkRentalExpiration(Call& call)
{
    const int pass = call.Int("PassId");
    if (!HasPass(call, "id", pass)) return call.Refuse(1, "no such pass");
    const int hours = call.database.Int("SELECT hours FROM pass WHERE id = ?", {pass});
    call.Standard();
    call.xml.Flag("ShouldDisplay", hours > 0 && hours < 48).Element("HoursRemaining", hours);
}

// ---- Parental control

void checkAdultVerificationEnabled(Call& call)
{
    call.Standard();
    call.xml.Flag("IsAdultVerificationEnabled", call.AccountInt("adult_enabled"));
}

void checkAdultVerificationPin(Call& call)
{
    call.Standard();
    call.xml.Flag("IsPinVerified", call.Text("Pin") == call.AccountText("adult_pin"));
}

// ---- The account service alone

void checkForPurchasedTitle(Call& call)
{
    call.xml.Raw(HasPass(call, "title", call.Int("TitleID")) ? "true" : "false");
}

void getMyVideos(Call& call)
{
    WriteMyVideos(call);
}

}  // namespace

const Operations& SharedOperations()
{
    using T = ChildType;
    static const Operations operations = {
        {"checkRentalExpiration",
         {{"PassId", T::Int}},
         checkRentalExpiration,
         false,
         "|<ShouldDisplay>false</ShouldDisplay><HoursRemaining>0</HoursRemaining>"},
        {"GetCountryID", {}, GetCountryID, true},
        {"getConfig", {}, getConfig},
        {"checkAdultVerificationPin",
         {{"Pin", T::Text}},
         checkAdultVerificationPin,
         false,
         "|<IsPinVerified>false</IsPinVerified>"},
        {"checkAdultVerificationEnabled", {}, checkAdultVerificationEnabled},
        {"addItemToWishlist", {{"TitleID", T::Int}}, addItemToWishlist},
        {"removeAllItemsFromWishList", {}, removeAllItemsFromWishList},
        {"removeItemFromWishList", {{"TitleID", T::Int}}, removeItemFromWishList},
        {"getWishlistItems",
         {{"sortOrder", T::Int}, {"CurrentPageNumber", T::Int}, {"ItemsPerPage", T::Int}, {"TitleType", T::TitleType}},
         getWishlistItems,
         false,
         kRefusedWishes},
        {"assignGiftCertificateToUser",
         {{"GiftCertificateCode", T::Text}},
         assignGiftCertificateToUser,
         false,
         "|<Balance>0</Balance>"},
        {"getSettingsPageInfo", {}, getSettingsPageInfo},
        {"getEmailAddress", {}, getEmailAddress},
        {"showPrePaidCardBalance", {}, showPrePaidCardBalance, false, "|<Balance>0</Balance>"},
        {"getBillingInfo", {}, getBillingInfo, false, "|<CCTypeId>0</CCTypeId>"},
        {"doPurchaseSavedbilling",
         {{"SkuID", T::Int}, {"IPAddress", T::Text}, {"UsePrePaidFunds", T::Text}},
         doPurchaseSavedbilling,
         false,
         "|<PassID>0</PassID><TransactionId>0</TransactionId>"},
        {"authorizeDevice", {{"PIN", T::Text}}, authorizeDevice},
        {"deactivateDevice", {}, deactivateDevice},
        {"checkAuthToken", {{"AuthToken", T::Text}}, checkAuthToken, true},
    };
    return operations;
}

const Operations& AccountOperations()
{
    static const Operations operations = {
        {"checkForPurchasedTitle", {{"TitleID", ChildType::Int}}, checkForPurchasedTitle, true},
        {"getMyVideos", MyVideosChildren(), getMyVideos, false, kRefusedVideos},
    };
    return operations;
}

}  // namespace simulator
