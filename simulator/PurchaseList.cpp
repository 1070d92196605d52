#include "PurchaseList.h"

namespace simulator {

bool WritePurchaseList(Call& call, const std::string& from, const std::string& titleColumn,
                       const std::string& passColumn, const std::string& order)
{
    const int page = call.Int("CurrentPageNumber");
    const int perPage = call.PageSize();
    if (page < 1 || perPage < 1 || page > kHighestPage || perPage > kHighestPage) {
        call.Refuse(2, "pages start at 1 and hold an item");
        return false;
    }
    int position = (page - 1) * perPage;
    call.Standard();
    call.xml.Group("Titles", [&] {
        call.database.Each(
            "SELECT " + titleColumn + ", " + passColumn + " FROM " + from + " ORDER BY " + order + " LIMIT ? OFFSET ?",
            {perPage, position}, [&](const Database::Row& row) {
                call.xml.Group("TitleListingPurchased",
                               [&] { WritePurchased(call, row.Int(0), row.Int(1), ++position); });
            });
    });
    WritePage(call, page, perPage, call.database.Int("SELECT COUNT(*) FROM " + from));
    return true;
}

bool HasPass(Call& call, const char* column, int value)
{
    return call.database.Int(std::string("SELECT COUNT(*) FROM pass WHERE account = ? AND ") + column + " = ?",
                             {call.account, value}) != 0;
}

void WriteMyVideos(Call& call)
{
    static const char* const kByType[] = {"", " AND is_tv = 1", " AND is_tv = 0"};
    std::string from = "pass JOIN title ON title.id = pass.title WHERE account = " + std::to_string(call.account) +
                       kByType[call.Int("TitleType")];
    if (call.Int("PurchaseType") != 2) from += " AND type = " + std::to_string(call.Int("PurchaseType"));
    if (call.Int("WatchStatusFilter") != 3) from += " AND watch = " + std::to_string(call.Int("WatchStatusFilter"));
    WritePurchaseList(call, from, "pass.title", "pass.id", "pass.id");
}

const std::vector<Child>& MyVideosChildren()
{
    using T = ChildType;
    static const std::vector<Child> children = {{"CurrentPageNumber", T::Int},
                                                {"ItemsPerPage", T::Int},
                                                {"PurchaseType", T::PurchaseType},
                                                {"TitleType", T::TitleType},
                                                {"WatchStatusFilter", T::WatchStatus}};
    return children;
}

}  // namespace simulator
