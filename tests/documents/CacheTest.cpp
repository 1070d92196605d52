// docs/cache.md, and what the public headers say of the cache, against what the calls keep and drop.
#include <algorithm>
#include <map>
#include <regex>

#include "CacheFile.h"
#include "Calls.h"
#include "Document.h"
#include "Peer.h"
#include "PublicHeaders.h"
#include "Store.h"
#include "TempFolder.h"
#include "Text.h"

namespace {

const char kDocument[] = "docs/cache.md";

// Notes what a call does with it.
class NotedCache : public MemoryCache {
public:
    explicit NotedCache(std::vector<std::string>& notes) : m_Notes(notes) {}

    bool WriteMetaData(const ZVString& name, const ZVString& key, const ZVString&) override
    {
        return Keep("Service", name.c_str(), key.c_str());
    }
    bool WriteUserData(const ZVString& name, const ZVString& key, const ZVString&) override
    {
        return Keep("Userdata", name.c_str(), key.c_str());
    }
    bool WriteWishlistFlag(int titleId, bool) override { return Keep("Userdata", "WishlistFlag", titleId); }
    bool WriteWishlistFlags(const ZVWS_IntVector& titleIds, const ZVWS_BoolVector&) override
    {
        return std::all_of(titleIds.begin(), titleIds.end(), [&](int id) { return WriteWishlistFlag(id, true); });
    }
    bool PurgeUserData(const ZVString& name) override
    {
        m_Notes.push_back(Row({m_Call, "drops", Code("Userdata"), name.empty() ? "all" : Code(name.c_str()), "all"}));
        return true;
    }
    bool RemoveAllWishlistFlags() override { return PurgeUserData("WishlistFlag"); }

    void SetCall(const std::string& name) { m_Call = Code(name); }

private:
    bool Keep(const std::string& table, const std::string& name, const std::string& key)
    {
        m_Notes.push_back(Row({m_Call, "keeps", Code(table), Code(name), Code(key)}));
        return true;
    }
    bool Keep(const std::string& table, const std::string& name, int key)
    {
        return Keep(table, name, std::to_string(key));
    }

    std::vector<std::string>& m_Notes;
    std::string m_Call;
};

// What each call does with the cache, by its name, after an answer of success.
std::map<std::string, std::vector<std::string>> NotesOfCalls()
{
    std::map<std::string, std::vector<std::string>> all;
    for (const std::string& name : CallNames()) {
        if (name == "checkBandwidth") continue;  // asks two hosts
        const std::string seed = std::string(ZV_ANSWERS) + "/" + name;
        const std::string kept = ContentOf(std::filesystem::exists(seed + "-full") ? seed + "-full" : seed);
        std::string_view answer = kept;
        EXPECT_EQ(name, TakeLine(answer));
        Peer peer(answer);
        PeerSession session;
        auto cache = std::make_unique<NotedCache>(all[name]);
        cache->SetCall(name);
        session.session().m_Cache = std::move(cache);
        Account& customer = *session.session().m_Params.Customer;
        customer.PurgedAll(customer.Generation());  // as set-up leaves it
        CallResult result;
        if (name != "checkTitlesInWishlist") {
            MakeCall(name, session.handle(), result);
            continue;
        }
        // A list that is narrowed tells nothing of the titles that it leaves out.
        const int title = 7;
        Owned<ZV_WS_TitlesInWishlist> answers;
        ZV_WS_checkTitlesInWishlist(session.handle(), &title, 1, TITLE_TYPE_FILTER_ANY, &answers);
    }
    return all;
}

TEST(CacheDocument, WhatCallsKeepAndDrop)
{
    std::string table = Head({"call", "", "table", "`Name`", "`Key`, for example"});
    for (const auto& [name, notes] : NotesOfCalls()) {
        for (const std::string& note : notes)
            table += note;
    }
    ExpectBlock(kDocument, "calls", table);
}

TEST(CacheDocument, HeadersSayWhatIsCached)
{
    std::map<std::string, std::vector<std::string>> all = NotesOfCalls();
    int cached = 0;
    for (const PublicCall& call : PublicCalls("ZV_WS_")) {
        static const std::regex kCached("Cached: (catalogue and wishes|catalogue|customer|wish-list flags|images)\\b");
        std::smatch said;
        const std::string kind = std::regex_search(call.comment, said, kCached) ? said.str(1) : "";
        if (kind == "images") continue;  // kept by another way: tests/library/ImageStoreTest.cpp
        std::string name = call.name.substr(sizeof "ZV_WS_" - 1), kept;
        for (const std::string& note : all[name]) {
            if (note.find("| keeps |") == std::string::npos) continue;
            const bool tellsOfWishes = name == "getTitleListing" || name.find("TvEpisodeListing") != std::string::npos;
            kept = note.find("`Service`") != std::string::npos ? (tellsOfWishes ? "catalogue and wishes" : "catalogue")
                   : note.find("WishlistFlag") != std::string::npos ? "wish-list flags"
                                                                    : "customer";
        }
        // A change notes a flag and answers nothing from it.
        if (name == "addItemToWishlist" || name == "removeItemFromWishlist") kept = "";
        EXPECT_EQ(kept, kind) << name;
        cached += !kind.empty();
    }
    EXPECT_EQ(18, cached);
}

TEST(CacheDocument, Tables)
{
    const TempFolder folder;
    ZV_WS_CacheParam2 param;
    param.type = CacheType_File;
    param.flags = 7;
    param.path = (folder / "cache.zv").c_str();
    CacheMgr cache;
    ASSERT_EQ(0, cache.Open(param));
    CacheFile file(param.path.c_str());
    std::string table = Head({"table", "columns", "primary key"});
    for (const char* name : {"Service", "Userdata", "BoxArt", "Cache"}) {
        const auto columns = [&](const std::string& what, const std::string& which) {
            const std::string from = " || ',' FROM pragma_table_info('" + std::string(name) + "') ";
            const std::string list = file.Query(std::string("SELECT ").append(what).append(from).append(which));
            return list.substr(0, list.rfind(','));
        };
        table += Row({Code(name), columns("name || ' ' || type", ""), columns("name", "WHERE pk > 0 ORDER BY pk")});
    }
    ExpectBlock(kDocument, "tables", table);
    EXPECT_EQ("4 ", file.Query("SELECT count(*) FROM sqlite_master WHERE type = 'table'"));
}

}  // namespace
