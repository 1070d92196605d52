// The stream service: playback, and the operations that streaming devices have to themselves.
#include "PurchaseList.h"

namespace simulator {

namespace {

std::string EnumText(ChildType type, int number)
{
    return EnumTexts(type).at(static_cast<size_t>(number));
}

// ---- Lists of purchases

void getMyStreamingVideos(Call& call)
{
    WriteMyVideos(call);
}

void getTitleListingsPurchasedForPasses(Call& call)
{
    for (const int pass : call.arguments.arrays.at("Passes")) {
        const int title =
            call.database.Int("SELECT title FROM pass WHERE id = ? AND account = ?", {pass, call.account});
        if (title == 0) continue;
        call.xml.Group("TitleListingPurchasedForPass", [&] {
            WritePurchased(call, title, pass, 1);
            call.Standard();
        });
    }
}

void checkForPurchasedStream(Call& call)
{
    call.xml.Raw(HasPass(call, "sku", call.Int("SkuID")) ? "true" : "false");
}
void checkForPurchasedStreamByTitleID(Call& call)
{
    call.xml.Raw(HasPass(call, "title", call.Int("TitleID")) ? "true" : "false");
}

void removeAllMyPurchases(Call& call)
{
    if (call.Text("password") != call.database.Text("SELECT password FROM service"))
        return call.Refuse(1, "wrong password");
    call.database.Run("DELETE FROM pass WHERE account = ?", {call.account});
    call.Standard();
}

// ---- Playback

void WriteLocation(Call& call, const std::string& file, int asset, const std::string& stream, int status, int position)
{
    const std::string base = "http://" + call.address;
    call.Standard();
    call.xml.Element("StreamingAssetLocation", base + "/media/" + file)
        .Element("AssetID", asset)
        .Element("StreamID", stream);
    call.xml.Element("DRMServerURL", base + "/drm/licence").Element("DRMACKServerURL", base + "/drm/ack");
    call.xml.Element("Status", EnumText(ChildType::StreamStatus, status)).Element("StartTimeSeconds", position);
    call.xml.Element("HeartbeatURL", base + "/heartbeat?stream=" + stream).Element("HeartbeatPollInSeconds", 60);
}

void LocatePass(Call& call, bool resume)
{
    const int pass = call.Int("PassID");
    bool found = false;
    call.database.Each("SELECT title, status, position FROM pass WHERE id = ? AND account = ?", {pass, call.account},
                       [&](const Database::Row& row) {
                           found = true;
                           const std::string stream = "stream-" + std::to_string(pass);
                           const std::string profile = call.Text("FileProfile");
                           WriteLocation(call, row.Text(0) + "-" + profile + ".mp4",
                                         pass * 100 + call.Int("FileProfile"), stream, row.Int(1),
                                         resume ? row.Int(2) : 0);
                       });
    if (!found) return call.Refuse(2, "no such pass");
    call.database.Run("UPDATE pass SET stream = 'stream-' || id WHERE id = ?", {pass});
}

void getStreamingAssetLocation(Call& call)
{
    LocatePass(call, false);
}
void loadLastStreamingAssetLocationForPass(Call& call)
{
    LocatePass(call, true);
}

void getBonusAssetLocation(Call& call)
{
    const int bonus = call.Int("BonusAssetID");
    if (call.database.Int("SELECT COUNT(*) FROM bonus WHERE id = ?", {bonus}) == 0)
        return call.Refuse(2, "no such trailer");
    WriteLocation(call, "trailer-" + std::to_string(bonus) + ".mp4", bonus, "trailer-" + std::to_string(bonus), 0, 0);
}

void manageStreamInstanceStatus(Call& call)
{
    const std::string stream = call.Text("StreamID");
    const bool known = stream.rfind("trailer-", 0) == 0 ||
                       call.database.Run("UPDATE pass SET status = ?, position = ? WHERE stream = ? AND account = ?",
                                         {call.Int("Status"), call.Int("StopTimeSeconds"), stream, call.account}) == 1;
    call.Standard(known ? 0 : 1, known ? "OK" : "no such stream");
}

void getTHXMediaDirector(Call& call)
{
    if (!HasPass(call, "id", call.Int("PassID"))) return call.Refuse(2, "no such pass");
    call.Standard();
    call.xml.Element("LongFormat", "THX-LONG-" + call.Text("AudioSetting")).Element("ShortFormat", "THX-S");
}

void getTHXMediaDirectorBonusAsset(Call& call)
{
    if (call.database.Int("SELECT COUNT(*) FROM bonus WHERE id = ?", {call.Int("BonusAssetID")}) == 0) {
        return call.Refuse(2, "no such trailer");
    }
    call.Standard();
    call.xml.Element("LongFormat", "THX-LONG-" + call.Text("BonusAssetType")).Element("ShortFormat", "THX-S");
}

// ---- Settings, tax, reports

void setAudioDefaultProperty(Call& call)
{
    call.database.Run("UPDATE account SET audio = ? WHERE id = ?", {call.Int("AudioSetting"), call.account});
    call.Standard();
}

void getAudioDefaultProperty(Call& call)
{
    call.xml.Raw(EnumText(ChildType::AudioProfile, call.AccountInt("audio")));
}

void calcOrderTax(Call& call)
{
    const int sku = call.Int("SKUID");
    // Like the purchase's: 9101 answers 1 ... 9122 answers 22.
    if (sku > 9100 && sku <= 9122) return call.Refuse(sku - 9100, "refused as asked");
    const std::string price = call.database.Text("SELECT price FROM product WHERE sku = ?", {sku});
    if (price.empty()) return call.Refuse(1, "no such product");
    call.Standard();
    call.xml.Element("SubTotal", price).Element("TotalPrice", price).Element("Tax", "0.00");
}

void getBillingInfoAndPPCBalance(Call& call)
{
    call.xml.Group("BillingInfo", [&] {
        call.Standard();
        call.xml.Element("CCLastFour", call.AccountText("card"));
        call.xml.Element("CCTypeId", call.AccountInt("card_type"));
        call.xml.Element("CCType", call.AccountText("card_name"));
    });
    call.xml.Group("PPCardBalance", [&] {
        call.Standard();
        call.xml.Element("Balance", call.AccountInt("prepaid"));
    });
}

void Report(Call& call, const char* kind)
{
    call.database.Run("INSERT INTO report VALUES (?)", {kind});
    call.Standard();
}

void ReturnTimeout(Call& call)
{
    Report(call, "timeout");
}
void ReturnError(Call& call)
{
    Report(call, "error");
}

}  // namespace

const Operations& StreamOperations()
{
    using T = ChildType;
    static const std::vector<Child> passAndProfile = {{"PassID", T::Int}, {"FileProfile", T::FileProfile}};
    static const Operations operations = {
        {"getTHXMediaDirectorBonusAsset",
         {{"BonusAssetID", T::Int}, {"FileProfile", T::FileProfile}, {"BonusAssetType", T::BonusAssetType}},
         getTHXMediaDirectorBonusAsset},
        {"getTHXMediaDirector",
         {passAndProfile[0], passAndProfile[1], {"AudioSetting", T::AudioProfile}},
         getTHXMediaDirector},
        {"setAudioDefaultProperty", {{"AudioSetting", T::AudioProfile}}, setAudioDefaultProperty},
        {"getAudioDefaultProperty", {}, getAudioDefaultProperty, true},
        {"calcOrderTax", {{"SKUID", T::Int}}, calcOrderTax},
        {"ReturnTimeout", {}, ReturnTimeout},
        {"ReturnError", {}, ReturnError},
        {"removeAllMyPurchases", {{"password", T::Text}}, removeAllMyPurchases},
        {"loadLastStreamingAssetLocationForPass", passAndProfile, loadLastStreamingAssetLocationForPass, false,
         kRefusedLocation},
        {"getBonusAssetLocation", {{"BonusAssetID", T::Int}}, getBonusAssetLocation, false, kRefusedLocation},
        {"getStreamingAssetLocation", passAndProfile, getStreamingAssetLocation, false, kRefusedLocation},
        {"manageStreamInstanceStatus",
         {{"StreamID", T::Text}, {"Status", T::StreamStatus}, {"StopTimeSeconds", T::Int}},
         manageStreamInstanceStatus},
        {"getBillingInfoAndPPCBalance", {}, getBillingInfoAndPPCBalance, true},
        {"checkForPurchasedStream", {{"SkuID", T::Int}}, checkForPurchasedStream, true},
        {"checkForPurchasedStreamByTitleID", {{"TitleID", T::Int}}, checkForPurchasedStreamByTitleID, true},
        {"getTitleListingsPurchasedForPasses", {{"Passes", T::IntArray}}, getTitleListingsPurchasedForPasses, true},
        {"getMyStreamingVideos", MyVideosChildren(), getMyStreamingVideos, false, kRefusedVideos},
    };
    return operations;
}

}  // namespace simulator
