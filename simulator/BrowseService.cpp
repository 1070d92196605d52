// The browse service: the catalogue.
#include "TitleXml.h"

namespace simulator {

namespace {

constexpr int kMostPerPage = 200;

// A page of the titles whose ids `titles` selects, narrowed by purchase type.
void WriteTitles(Call& call, const std::string& titles, Database::Values values, int genre)
{
    const int page = call.Int("CurrentPageNumber");
    const int perPage = std::min(call.PageSize(), kMostPerPage);
    if (page < 1 || perPage < 1 || page > kHighestPage) return call.Refuse(2, "pages start at 1 and hold an item");
    std::string from = " FROM (" + titles + ") AS listed";
    if (const int type = call.Int("PurchaseType"); type != 2) {
        from += " WHERE EXISTS (SELECT 1 FROM product WHERE title = listed.id AND type = ?)";
        values.emplace_back(type);
    }
    const int total = call.database.Int("SELECT COUNT(*)" + from, values);
    call.Standard();
    call.xml.Element("GenreID", genre);
    WritePage(call, page, perPage, total);
    int position = (page - 1) * perPage;
    values.emplace_back(perPage);
    values.emplace_back(position);
    call.xml.Group("Titles", [&] {
        call.database.Each("SELECT id" + from + " ORDER BY id LIMIT ? OFFSET ?", values, [&](const Database::Row& row) {
            call.xml.Group("TitleListing", [&] { WriteTitle(call, row.Int(0), ++position); });
        });
    });
}

void WriteGenreTitles(Call& call, int genre)
{
    if (call.database.Int("SELECT COUNT(*) FROM genre WHERE id = ?", {genre}) == 0) {
        return call.Refuse(1, "no such genre");
    }
    WriteTitles(call, "SELECT title AS id FROM title_genre WHERE genre = ?", {genre}, genre);
}

void getNavigation(Call& call)
{
    call.xml.Group("Genres", [&] {
        call.database.Each(
            "SELECT id, name, visible, parent FROM genre ORDER BY id", {}, [&](const Database::Row& row) {
                call.xml.Group("Genre", [&] {
                    call.xml.Element("ID", row.Int(0)).Element("Name", row.Text(1)).Flag("Visible", row.Int(2));
                    call.xml.Element("ParentId", row.Int(3));
                });
            });
    });
}

void getGenreLabel(Call& call)
{
    const std::string label = call.database.Text("SELECT label FROM genre WHERE id = ?", {call.Int("GenreID")});
    if (label.empty()) return call.Refuse(1, "no such genre");
    call.Standard();
    call.xml.Element("Label", label).Element("LabelMessage", "All of " + label);
}

void getTitlesByNavigation(Call& call)
{
    WriteGenreTitles(call, call.Int("GenreID"));
}

void getTitlesByGenreArray(Call& call)
{
    for (const int genre : call.arguments.arrays.at("GenreIDs")) {
        call.xml.Group("GetTitlesResponse", [&] { WriteGenreTitles(call, genre); });
    }
}

void Search(Call& call, const char* columns)
{
    static const char* const kByType[] = {"", " AND is_tv = 1", " AND is_tv = 0 AND season = 0"};
    WriteTitles(call,
                std::string("SELECT id FROM title WHERE instr(fold(") + columns + "), fold(?)) > 0" +
                    kByType[call.Int("TitleType")],
                {call.Text("Query")}, 0);
}

void searchForTitle(Call& call)
{
    Search(call, "name");
}
void searchForTitleDetail(Call& call)
{
    Search(call, "name || ' ' || actors || ' ' || directors");
}

void getTitleListing(Call& call)
{
    WriteTitleDetails(call, call.Int("TitleID"));
}

void getTvEpisodeListing(Call& call)
{
    const int episode = call.Int("EpisodeID");
    const int season = call.database.Int("SELECT season FROM title WHERE id = ?", {episode});
    WriteTitleDetails(call, season ? episode : 0);
}

void getTvEpisodeListByTitleID(Call& call)
{
    const int season = call.Int("TitleID");
    if (call.database.Int("SELECT is_tv FROM title WHERE id = ?", {season}) == 0)
        return call.Refuse(1, "no such series");
    call.Standard();
    call.xml.Group("Episodes", [&] {
        call.database.Each("SELECT id, name, episode FROM title WHERE season = ? ORDER BY episode", {season},
                           [&](const Database::Row& row) {
                               call.xml.Group("TvEpisode", [&] {
                                   call.xml.Element("EpisodeID", row.Int(0)).Element("EpisodeName", row.Text(1));
                                   call.xml.Element("EpisodeNumber", row.Int(2));
                               });
                           });
    });
}

void getAllTvEpisodeListings(Call& call)
{
    call.database.Each("SELECT id FROM title WHERE season = ? ORDER BY episode", {call.Int("TitleID")},
                       [&](const Database::Row& row) {
                           call.xml.Group("TitleListingResponse", [&] { WriteTitleDetails(call, row.Int(0)); });
                       });
}

void translateSkuId(Call& call)
{
    const int title = call.database.Int("SELECT title FROM product WHERE sku = ?", {call.Int("SkuId")});
    if (title == 0) return call.Refuse(1, "no such product");
    call.Standard();
    call.xml.Element("TitleId", title);
}

void translateTivoExternalId(Call& call)
{
    const std::string external = call.Text("TivoExternalId");
    const int title = call.database.Int("SELECT id FROM title WHERE external = ?", {external});
    if (title == 0) return call.Refuse(1, "no such title");
    call.Standard();
    call.xml.Element("TivoExternalId", external).Element("TitleId", title);
}

void getRecommendedTitles(Call& call)
{
    const int title = call.Int("TitleId");
    if (call.database.Int("SELECT COUNT(*) FROM title WHERE id = ?", {title}) == 0)
        return call.Refuse(1, "no such title");
    call.Standard();
    call.xml.Group("Titles", [&] {
        int position = 0;
        call.database.Each(
            "SELECT DISTINCT title FROM title_genre WHERE genre IN (SELECT MAX(genre) FROM title_genre WHERE title = "
            "?) AND "
            "title > ? ORDER BY title LIMIT 5",
            {title, title}, [&](const Database::Row& row) {
                call.xml.Group("TitleListing", [&] { WriteTitle(call, row.Int(0), ++position); });
            });
    });
}

void getFileType(Call& call)
{
    call.xml.Element("File_DRMProvider", "WIDEVINE").Element("File_AccessType", "STREAM");
    call.xml.Element("File_FileProfile", "HIGH_DEFINITION").Element("File_VideoFormat", "H264");
    call.xml.Element("File_FileExtension", "MP4");
}

void shouldUpdateCache(Call& call)
{
    const std::string loaded = call.database.Text("SELECT load_time FROM service");
    call.xml.Raw(call.Text("UTCTime") == loaded ? "0" : "1");
}

void getLastCacheLoadTimeUTC(Call& call)
{
    call.xml.Raw(XmlEscape(call.database.Text("SELECT load_time FROM service")));
}

}  // namespace

const Operations& BrowseOperations()
{
    using T = ChildType;
    static const std::vector<Child> paging = {{"ItemsPerPage", T::Int},
                                              {"CurrentPageNumber", T::Int},
                                              {"PurchaseType", T::PurchaseType},
                                              {"TitleType", T::TitleType}};
    static const std::vector<Child> search = {{"Query", T::Text}, paging[0], paging[1], paging[2], paging[3]};
    static const Operations operations = {
        {"getFileType", {}, getFileType, true},
        {"shouldUpdateCache", {{"UTCTime", T::Text}}, shouldUpdateCache, true},
        {"getRecommendedTitles", {{"TitleId", T::Int}}, getRecommendedTitles},
        {"getLastCacheLoadTimeUTC", {}, getLastCacheLoadTimeUTC, true},
        {"translateSkuId", {{"SkuId", T::Int}}, translateSkuId, false, "|<TitleId>0</TitleId>"},
        {"translateTivoExternalId",
         {{"TivoExternalId", T::Text}},
         translateTivoExternalId,
         false,
         "|<TitleId>0</TitleId>"},
        {"getAllTvEpisodeListings", {{"TitleID", T::Int}}, getAllTvEpisodeListings, true},
        {"getTvEpisodeListing", {{"EpisodeID", T::Int}}, getTvEpisodeListing, false, kRefusedTitle},
        {"getTvEpisodeListByTitleID", {{"TitleID", T::Int}}, getTvEpisodeListByTitleID},
        {"getTitleListing", {{"TitleID", T::Int}}, getTitleListing, false, kRefusedTitle},
        {"getTitlesByGenreArray",
         {{"GenreIDs", T::IntArray}, paging[1], paging[0], paging[2]},
         getTitlesByGenreArray,
         true,
         kRefusedPage},
        {"getTitlesByNavigation",
         {{"GenreID", T::Int}, paging[1], paging[0], paging[2]},
         getTitlesByNavigation,
         false,
         kRefusedPage},
        {"getGenreLabel", {{"GenreID", T::Int}}, getGenreLabel},
        {"searchForTitleDetail", search, searchForTitleDetail, false, kRefusedPage},
        {"searchForTitle", search, searchForTitle, false, kRefusedPage},
        {"getNavigation", {}, getNavigation, true},
    };
    return operations;
}

}  // namespace simulator
