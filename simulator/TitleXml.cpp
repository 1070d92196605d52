#include "TitleXml.h"

#include <algorithm>

namespace simulator {

namespace {

std::string EnumText(ChildType type, int number)
{
    return EnumTexts(type).at(static_cast<size_t>(number));
}

void WriteBonusAssets(Call& call, int title)
{
    call.xml.Group("BonusAssets", [&] {
        call.database.Each("SELECT id, profile FROM bonus WHERE title = ?", {title}, [&](const Database::Row& row) {
            call.xml.Empty("BonusAsset", "BonusAssetID=\"" + row.Text(0) + "\" Profile=\"" +
                                             EnumText(ChildType::FileProfile, row.Int(1)) + "\" BonusType=\"Trailer\"");
        });
    });
}

void WriteProduct(Call& call, const Database::Row& row)
{
    XmlWriter& xml = call.xml;
    xml.Element("SkuID", row.Int(0)).Element("PurchaseType", EnumText(ChildType::PurchaseType, row.Int(1)));
    xml.Element("Price", row.Text(2));
    xml.Group("AvailableAssets",
              [&] { xml.Element("FileProfile", "STANDARD").Element("FileProfile", "HIGH_DEFINITION"); });
    xml.Element("ExpireDate", row.Text(3));
    xml.Group("AvailableAudioProfiles", [&] {
        xml.Group("AudioFile", [&] {
            xml.Element("AssetAudioID", row.Int(0) * 2).Element("FileLocation", "audio/" + row.Text(0) + ".ac3");
            xml.Flag("ContainsVideo", false).Element("AudioAssetProfile", EnumText(ChildType::AudioProfile, 1));
        });
    });
    xml.Element("RentalPeriod", row.Int(4));
}

void WriteProducts(Call& call, int title)
{
    call.xml.Group("AvailableProducts", [&] {
        call.database.Each(
            "SELECT sku, type, price, expires, period FROM product WHERE title = ? ORDER BY sku", {title},
            [&](const Database::Row& row) { call.xml.Group("ProductListing", [&] { WriteProduct(call, row); }); });
    });
}

}  // namespace

void WriteTitle(Call& call, int title, int position)
{
    call.database.Each(
        "SELECT name, prefix, episode, is_tv, rating, thx, chvrs FROM title WHERE id = ?", {title},
        [&](const Database::Row& row) {
            call.xml.Element("TitleID", title).Element("TitleName", row.Text(0)).Element("BoxArtPrefix", row.Text(1));
            call.xml.Element("TitlePosition", position).Element("EpisodeNumber", row.Int(2));
            WriteBonusAssets(call, title);
            call.xml.Flag("IsTvListing", row.Int(3)).Optional("MPAARating", row.Text(4));
            WriteProducts(call, title);
            call.xml.Flag("IsTHXMediaDirectorEnabled", row.Int(5)).Flag("IsTHXMediaDirectorEnabledForTrailer", false);
            call.xml.Optional("CHVRSRating", row.Text(6));
            call.xml.Element("LoyaltyPointsForBuy", title % 100).Element("LoyaltyPointsForRent", title % 10);
        });
}

void WriteTitleDetails(Call& call, int title)
{
    if (call.database.Int("SELECT COUNT(*) FROM title WHERE id = ?", {title}) == 0) {
        return call.Refuse(1, "no such title");
    }
    WriteTitle(call, title, 1);
    call.Standard();
    call.database.Each(
        "SELECT synopsis, stars, directors, actors, writers, producers, copyright, runtime, reason FROM title WHERE id "
        "= ?",
        {title}, [&](const Database::Row& row) {
            call.xml.Optional("Synopsys", row.Text(0))
                .Element("UserRating", row.Int(1))
                .Optional("Directors", row.Text(2));
            call.xml.Optional("Actors", row.Text(3))
                .Optional("Writers", row.Text(4))
                .Optional("Producers", row.Text(5));
            call.xml.Optional("Copyright", row.Text(6)).Optional("RunTime", row.Text(7));
            call.xml.Flag(
                "IsAvailInUserWishList",
                call.database.Int("SELECT COUNT(*) FROM wish WHERE account = ? AND title = ?", {call.account, title}));
            call.xml.Optional("RatingReason", row.Text(8));
        });
}

void WritePurchased(Call& call, int title, int pass, int position)
{
    WriteTitle(call, title, position);
    const auto write = [&](int type, int watch, int status, int seconds) {
        const int season = call.database.Int("SELECT season FROM title WHERE id = ?", {title});
        call.xml.Element("EpisodeID", season ? title : 0).Element("TvListingTitleID", season);
        call.xml.Element("PurchaseType", EnumText(ChildType::PurchaseType, type));
        call.xml.Element("Status", EnumText(ChildType::WatchStatus, watch));
        call.xml.Element("RentalPeriod", type == 0 ? "48 hours" : "").Element("PassID", pass);
        call.xml.Element("PlayStatus", EnumText(ChildType::StreamStatus, status)).Element("StartTimeSeconds", seconds);
    };
    if (pass == 0) return write(0, 3, 0, 0);
    call.database.Each("SELECT type, watch, status, position FROM pass WHERE id = ?", {pass},
                       [&](const Database::Row& row) { write(row.Int(0), row.Int(1), row.Int(2), row.Int(3)); });
}

void WritePage(Call& call, int page, int perPage, int total)
{
    perPage = std::max(perPage, 1);
    call.xml.Element("CurrentPageNumber", page).Element("ItemsPerPage", perPage);
    call.xml.Element("TotalPages", (total + perPage - 1) / perPage).Element("TotalItems", total);
}

}  // namespace simulator
