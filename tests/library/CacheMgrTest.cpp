#include "CacheMgr.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <string>
#include <vector>

#include "CacheFile.h"
#include "FakeSleep.h"
#include "LogLines.h"
#include "TempFolder.h"

namespace {

constexpr int kService = 1, kBoxArt = 2, kUserData = 4, kAll = 7;

ZVString Bytes(const std::string& text)
{
    return ZVString(text.data(), text.size());
}

class CacheMgrTest : public ::testing::Test {
protected:
    ZV_WS_CacheParam2 Param(int type, int flags = kAll, unsigned int size = 0) const
    {
        ZV_WS_CacheParam2 param;
        param.type = type;
        param.flags = flags;
        param.size = size;
        param.path = m_Path.c_str();
        return param;
    }
    void Open(int type, int flags = kAll, unsigned int size = 0)
    {
        ASSERT_EQ(0, m_Cache.Open(Param(type, flags, size)));
    }

    // One row of a kind that counts `size` bytes.
    bool Put(int kind, const ZVString& key, unsigned int size)
    {
        const ZVString value = Bytes(std::string(kind == kBoxArt ? 0 : size, 'v'));
        if (kind == kService) return m_Cache.WriteMetaData("getTitles", key, value);
        if (kind == kUserData) return m_Cache.WriteUserData("getMyVideos", key, value);
        return m_Cache.WriteBoxArt(key, BOX_ART_SIZE_95, size, "", 0, "");
    }
    bool Has(int kind, const ZVString& key)
    {
        ZVString text, data;
        unsigned int size, needUpdate;
        if (kind == kService) return m_Cache.ReadMetaData("getTitles", key, text);
        if (kind == kUserData) return m_Cache.ReadUserData("getMyVideos", key, text);
        return m_Cache.ReadBoxArt(key, BOX_ART_SIZE_95, size, text, needUpdate, data);
    }
    // "size,last modified,needs update,bytes".
    std::string Image(ZV_WS_BoxArtSize dimension)
    {
        unsigned int size = 9, needUpdate = 9;
        ZVString modified = "x", data = "x";
        const bool found = m_Cache.ReadBoxArt("ABC", dimension, size, modified, needUpdate, data);
        return (found ? "" : "none:") + std::to_string(size) + "," + modified.c_str() + "," +
               std::to_string(needUpdate) + "," + std::string(data.c_str(), data.length());
    }
    bool Flag(int titleId)
    {
        bool flag = true;
        return m_Cache.ReadWishlistFlag(titleId, flag) && flag;
    }

    TempFolder m_Folder;
    std::string m_Path = m_Folder / "cache.zv";
    LogLines m_Log;
    CacheMgr m_Cache;
};

// ---- What every operation refuses

struct Operation {
    const char* name;
    int kind;
    std::function<bool(CacheMgr&)> run;
};

const std::vector<Operation>& Operations()
{
    static ZVString text;
    static unsigned int number;
    static bool flag;
    static const std::vector<Operation> operations = {
        {"WriteMetaData", kService, [](CacheMgr& c) { return c.WriteMetaData("n", "k", "v"); }},
        {"ReadMetaData", kService, [](CacheMgr& c) { return c.ReadMetaData("n", "k", text); }},
        {"UpdateLastCacheLoadTime", kService, [](CacheMgr& c) { return c.UpdateLastCacheLoadTime("t"); }},
        {"WriteBoxArt", kBoxArt, [](CacheMgr& c) { return c.WriteBoxArt("p", BOX_ART_SIZE_95, 1, "", 0, ""); }},
        {"ReadBoxArt", kBoxArt,
         [](CacheMgr& c) { return c.ReadBoxArt("p", BOX_ART_SIZE_95, number, text, number, text); }},
        {"SetBoxArtNeedUpdate", kBoxArt, [](CacheMgr& c) { return c.SetBoxArtNeedUpdate(); }},
        {"WriteUserData", kUserData, [](CacheMgr& c) { return c.WriteUserData("n", "k", "v"); }},
        {"ReadUserData", kUserData, [](CacheMgr& c) { return c.ReadUserData("n", "k", text); }},
        {"WriteWishlistFlag", kUserData, [](CacheMgr& c) { return c.WriteWishlistFlag(1, true); }},
        {"ReadWishlistFlag", kUserData, [](CacheMgr& c) { return c.ReadWishlistFlag(1, flag); }},
        {"WriteWishlistFlags", kUserData, [](CacheMgr& c) { return c.WriteWishlistFlags({1}, {true}); }},
        {"RemoveWishlistFlag", kUserData, [](CacheMgr& c) { return c.RemoveWishlistFlag(1); }},
        {"RemoveAllWishlistFlags", kUserData, [](CacheMgr& c) { return c.RemoveAllWishlistFlags(); }},
        {"PurgeUserData", kUserData, [](CacheMgr& c) { return c.PurgeUserData(""); }},
    };
    return operations;
}

void ExpectAll(CacheMgr& cache, int kinds, const char* when)
{
    for (const Operation& operation : Operations()) {
        EXPECT_EQ((operation.kind & kinds) != 0, operation.run(cache)) << operation.name << ", " << when;
    }
}

TEST_F(CacheMgrTest, OperationsNeedAnOpenCacheOfTheirKind)
{
    ExpectAll(m_Cache, 0, "never opened");
    for (const int type : {CacheType_Memory, CacheType_File}) {
        for (int kinds = 0; kinds <= kAll; ++kinds) {
            Open(type, kinds);
            ExpectAll(m_Cache, kinds, "open");
        }
        m_Cache.Close();
        ExpectAll(m_Cache, 0, "closed");
    }
    Open(CacheType_None);
    ExpectAll(m_Cache, 0, "no cache");
}

TEST_F(CacheMgrTest, RefusesEmptyNamesAndValues)
{
    Open(CacheType_File);
    ZVString text;
    unsigned int number;
    for (const char* key : {"k", ""}) {
        EXPECT_FALSE(m_Cache.WriteMetaData("", key, "v") || m_Cache.WriteMetaData("n", key, ""));
        EXPECT_FALSE(m_Cache.WriteUserData("", key, "v") || m_Cache.WriteUserData("n", key, ""));
        EXPECT_FALSE(m_Cache.ReadMetaData("", key, text) || m_Cache.ReadUserData("", key, text));
    }
    EXPECT_FALSE(m_Cache.UpdateLastCacheLoadTime(""));
    EXPECT_FALSE(m_Cache.WriteBoxArt("", BOX_ART_SIZE_95, 1, "m", 0, "d"));
    EXPECT_FALSE(m_Cache.ReadBoxArt("", BOX_ART_SIZE_95, number, text, number, text));
    EXPECT_FALSE(m_Cache.WriteWishlistFlags({}, {}) || m_Cache.WriteWishlistFlags({1, 2, 3}, {true, true}));
    EXPECT_EQ("0 ", CacheFile(m_Path).Query("SELECT (SELECT COUNT(*) FROM Service) + (SELECT COUNT(*) FROM Userdata) + "
                                            "(SELECT COUNT(*) FROM BoxArt) + (SELECT COUNT(*) FROM Cache)"));
    EXPECT_TRUE(m_Cache.WriteMetaData("n", "", "v")) << "an empty key is a key";
}

// ---- What is stored

TEST_F(CacheMgrTest, MakesItsTables)
{
    Open(CacheType_File);
    EXPECT_EQ(
        "CREATE TABLE Service (Name TEXT NOT NULL, Key TEXT NOT NULL, Value TEXT NOT NULL, Size INTEGER, PRIMARY KEY "
        "(Name, Key)) "
        "CREATE TABLE BoxArt (Prefix TEXT NOT NULL, Dim INTEGER NOT NULL, Size INTEGER, LastModified TEXT, NeedUpdate "
        "INTEGER NOT NULL, TS DATETIME DEFAULT CURRENT_TIMESTAMP, Data BLOB, PRIMARY KEY (Prefix, Dim)) "
        "CREATE TABLE Cache (ID INTEGER, LastLoadTime TEXT NOT NULL, PRIMARY KEY (ID)) "
        "CREATE TABLE Userdata (Name TEXT NOT NULL, Key TEXT NOT NULL, Value TEXT NOT NULL, Size INTEGER, PRIMARY KEY "
        "(Name, Key)) ",
        CacheFile(m_Path).Query("SELECT sql FROM sqlite_master WHERE type = 'table' ORDER BY rowid"));
}

TEST_F(CacheMgrTest, KeepsEveryByte)
{
    const std::string bytes("\x1f\x8b\0\xff\xc3(\0", 7);
    const ZVString value = Bytes(bytes);
    const ZVString key1 = Bytes(std::string("k\0a", 3)), key2 = Bytes(std::string("k\0b", 3));
    for (const int type : {CacheType_Memory, CacheType_File}) {
        SCOPED_TRACE(type);
        Open(type);
        ZVString read = "before";
        EXPECT_TRUE(m_Cache.WriteMetaData("n", key1, value));
        EXPECT_FALSE(m_Cache.ReadMetaData("n", key2, read));
        EXPECT_TRUE(read == "before");
        EXPECT_TRUE(m_Cache.ReadMetaData("n", key1, read));
        EXPECT_TRUE(read == value);
        EXPECT_TRUE(m_Cache.WriteUserData("n", key2, value));
        EXPECT_TRUE(m_Cache.ReadUserData("n", key2, read));
        EXPECT_TRUE(read == value);
        EXPECT_FALSE(m_Cache.ReadUserData("n", key1, read)) << "answers and user data are apart";

        EXPECT_EQ("none:0,,0,", Image(BOX_ART_SIZE_175));
        EXPECT_TRUE(m_Cache.WriteBoxArt("ABC", BOX_ART_SIZE_175, 4000000000u, "Mon, 1 Jan", 0, value));
        EXPECT_EQ("4000000000,Mon, 1 Jan,0," + bytes, Image(BOX_ART_SIZE_175));
        EXPECT_EQ("none:0,,0,", Image(BOX_ART_SIZE_95));
        EXPECT_TRUE(m_Cache.WriteBoxArt("ABC", BOX_ART_SIZE_175, 5, "", 0, ""));
        EXPECT_TRUE(m_Cache.SetBoxArtNeedUpdate());
        EXPECT_EQ("5,,1,", Image(BOX_ART_SIZE_175));
    }
    EXPECT_EQ("7 7 ", CacheFile(m_Path).Query("SELECT Size FROM Service UNION ALL SELECT Size FROM Userdata"));
}

// ---- Budgets

TEST_F(CacheMgrTest, SplitsTheBudget)
{
    constexpr unsigned int kNoLimit = 0;
    const struct {
        unsigned int size;
        int flags, kind;
        unsigned int limit;
    } rows[] = {
        {1000, kAll, kService, 150},
        {1000, kAll, kBoxArt, 700},
        {1000, kAll, kUserData, 150},
        {1005, kService | kUserData, kService, 150},
        {1005, kService | kUserData, kUserData, 855},
        {1005, kAll, kBoxArt, 705},  // 703 and what truncating has left
        {1009, kService, kService, 1009},
        {1009, kService | kBoxArt, kBoxArt, 858},
        {1009, kUserData, kUserData, 1009},
        {4000000000u, kBoxArt, kBoxArt, 4000000000u},
        {6, kService | kBoxArt, kService, kNoLimit},  // 15 % of it is no whole byte
        {0, kAll, kService, kNoLimit},
        {0, kAll, kBoxArt, kNoLimit},
        {0, kAll, kUserData, kNoLimit},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(testing::Message() << row.size << " bytes, flags " << row.flags << ", kind " << row.kind);
        Open(CacheType_Memory, row.flags, row.size);
        const bool unlimited = row.limit == kNoLimit;
        EXPECT_TRUE(Put(row.kind, "first", unlimited ? 5000 : row.limit - 1));
        // The limit is looked at before an insert: the row that goes over it stays, and the next one evicts.
        EXPECT_TRUE(Put(row.kind, "fills", 1) && Put(row.kind, "over", 1));
        EXPECT_TRUE(Has(row.kind, "first"));
        EXPECT_TRUE(Put(row.kind, "next", 1));
        EXPECT_EQ(unlimited, Has(row.kind, "first"));
        EXPECT_TRUE(Has(row.kind, "next"));
    }
}

TEST_F(CacheMgrTest, AnswersAndUserDataAreEvictedTogether)
{
    for (const int kind : {kService, kUserData, kBoxArt}) {
        SCOPED_TRACE(kind);
        Open(CacheType_Memory, kAll, 1000);
        for (const int other : {kService, kUserData, kBoxArt})
            EXPECT_TRUE(Put(other, "old", 10));
        EXPECT_TRUE(m_Cache.WriteWishlistFlag(1, true));
        EXPECT_TRUE(Put(kind, "old2", 700) && Put(kind, "new", 1));
        for (const int other : {kService, kUserData, kBoxArt})
            EXPECT_EQ((kind == kBoxArt) != (other == kBoxArt), Has(other, "old")) << other;
        EXPECT_EQ(kind == kBoxArt, Flag(1));
        EXPECT_TRUE(Has(kind, "new"));
    }
}

TEST_F(CacheMgrTest, EvictsTheTenOldestImagesWithAllSizesOfTheirTitles)
{
    Open(CacheType_File, kBoxArt, 1000);
    // Title 0 has three sizes, two of them young; titles 1 to 11 have one each and grow younger.
    const auto add = [this](int title, ZV_WS_BoxArtSize dimension, const char* suffix, unsigned int size) {
        const std::string prefix = "T" + std::to_string(title) + "_";
        EXPECT_TRUE(m_Cache.WriteBoxArt(Bytes(prefix), dimension, size, "", 0, ""));
        m_Folder.Write(prefix + suffix, "image");
    };
    for (int title = 0; title < 12; ++title)
        add(title, BOX_ART_SIZE_135S, "135.jpg", 10);
    add(0, BOX_ART_SIZE_95, "95.jpg", 10);
    add(0, BOX_ART_SIZE_321, "321.jpg", 2000);
    CacheFile(m_Path).Run(
        "UPDATE BoxArt SET TS = '2001-01-' || printf('%02d', 1 + CAST(substr(Prefix, 2) AS INTEGER));"
        "UPDATE BoxArt SET TS = '2002-01-01' WHERE Prefix = 'T0_' AND Dim <> 6");

    std::filesystem::remove(m_Folder / "T5_135.jpg");  // somebody else has
    EXPECT_TRUE(m_Cache.WriteBoxArt("N_", BOX_ART_SIZE_95, 1, "", 0, ""));
    EXPECT_EQ("N_ T10_ T11_ ", CacheFile(m_Path).Query("SELECT Prefix FROM BoxArt ORDER BY Prefix"));
    for (int i = 0; i < 12; ++i)
        EXPECT_EQ(i >= 10, m_Folder.Has("T" + std::to_string(i) + "_135.jpg")) << i;
    EXPECT_TRUE(m_Folder.Has("T0_95.jpg") && m_Folder.Has("T0_321.jpg")) << "only files of the rows selected go";
}

TEST_F(CacheMgrTest, EvictsOncePerInsert)
{
    Open(CacheType_File, kBoxArt, 1000);
    for (int i = 0; i < 15; ++i)
        EXPECT_TRUE(Put(kBoxArt, Bytes(std::to_string(100 + i)), i < 14 ? 60 : 5000));
    CacheFile(m_Path).Run("UPDATE BoxArt SET TS = Prefix");
    EXPECT_TRUE(Put(kBoxArt, "new", 1));
    EXPECT_EQ("110 111 112 113 114 new ", CacheFile(m_Path).Query("SELECT Prefix FROM BoxArt ORDER BY Prefix"));
}

// ---- Refreshing and purging

TEST_F(CacheMgrTest, ANewLoadTimeDropsAnswers)
{
    Open(CacheType_File);
    EXPECT_TRUE(Put(kUserData, "k", 1));
    std::string before;
    for (const char* time : {"1", "1", "2", "1", "1"}) {
        EXPECT_TRUE(Put(kService, "k", 1));
        EXPECT_TRUE(m_Cache.UpdateLastCacheLoadTime(time));
        EXPECT_EQ(time == before, Has(kService, "k")) << before << time;
        before = time;
        EXPECT_EQ(before + " ", CacheFile(m_Path).Query("SELECT LastLoadTime FROM Cache WHERE ID = 1"));
    }
    EXPECT_TRUE(Has(kUserData, "k"));
}

TEST_F(CacheMgrTest, PurgingTakesTheAnswersThatShowWishlistState)
{
    const std::string all = "getAllTvEpisodeListings getTitleListing getTitles getTvEpisodeListing ";
    const struct {
        const char* name;
        int flags;
        std::string answers;   // left in Service
        const char* userData;  // left in Userdata
    } rows[] = {
        {"", kAll, "getTitles ", ""},
        {"WishlistFlag", kAll, "getTitles ", "getMyVideos "},
        {"", kUserData, all, ""},
        {"getMyVideos", kAll, all, "WishlistFlag "},
        {"nothing", kAll, all, "WishlistFlag getMyVideos "},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(testing::Message() << row.name << ", flags " << row.flags);
        Open(CacheType_File);
        for (const char* name : {"getTitles", "getTitleListing", "getTvEpisodeListing", "getAllTvEpisodeListings"})
            EXPECT_TRUE(m_Cache.WriteMetaData(name, "1", "v"));
        EXPECT_TRUE(Put(kUserData, "1", 1));
        EXPECT_TRUE(m_Cache.WriteWishlistFlag(1, true));
        Open(CacheType_File, row.flags);
        EXPECT_TRUE(m_Cache.PurgeUserData(row.name));
        CacheFile database(m_Path);
        EXPECT_EQ(row.answers, database.Query("SELECT Name FROM Service ORDER BY Name"));
        EXPECT_EQ(row.userData, database.Query("SELECT Name FROM Userdata ORDER BY Name"));
    }
}

// ---- Wish-list flags

TEST_F(CacheMgrTest, KeepsAFlagForEachTitle)
{
    Open(CacheType_File);
    bool flag = true;
    EXPECT_FALSE(m_Cache.ReadWishlistFlag(1, flag));
    EXPECT_FALSE(flag);
    EXPECT_TRUE(m_Cache.WriteWishlistFlags({1, -2, 2147483647}, {true, false, true}));
    EXPECT_TRUE(Flag(1) && Flag(2147483647));
    EXPECT_TRUE(m_Cache.ReadWishlistFlag(-2, flag));
    EXPECT_FALSE(flag);
    EXPECT_TRUE(m_Cache.WriteWishlistFlag(1, false));
    EXPECT_FALSE(Flag(1));
    EXPECT_TRUE(m_Cache.RemoveWishlistFlag(1));
    EXPECT_EQ("-2=0/1 2147483647=1/1 ",
              CacheFile(m_Path).Query("SELECT Key || '=' || Value || '/' || Size FROM Userdata ORDER BY Key"));
    EXPECT_TRUE(m_Cache.RemoveAllWishlistFlags());
    EXPECT_FALSE(Flag(2147483647));
}

TEST_F(CacheMgrTest, WritesFlagsFromTheLastToTheFirst)
{
    Open(CacheType_File, kUserData, 100);
    EXPECT_TRUE(m_Cache.WriteWishlistFlags({7, 7}, {true, false}));
    EXPECT_TRUE(Flag(7));

    CacheFile(m_Path).Run(
        "CREATE TRIGGER refuse BEFORE INSERT ON Userdata WHEN NEW.Key = '2' BEGIN SELECT RAISE(ABORT, 'no'); END");
    EXPECT_FALSE(m_Cache.WriteWishlistFlags({1, 2, 3}, {true, true, true}));
    EXPECT_EQ("7 ", CacheFile(m_Path).Query("SELECT Key FROM Userdata ORDER BY Key")) << "all of them or none";

    EXPECT_TRUE(Put(kUserData, "big", 200));
    EXPECT_TRUE(m_Cache.WriteWishlistFlags({4}, {true}));
    EXPECT_TRUE(Flag(7)) << "the budget is not looked at";
    EXPECT_TRUE(m_Cache.WriteWishlistFlag(5, true));
    EXPECT_FALSE(Flag(7)) << "here it is";
    EXPECT_TRUE(Flag(5));
}

// ---- Trouble

TEST_F(CacheMgrTest, WaitsTenSecondsForALockedFile)
{
    Open(CacheType_File);
    EXPECT_TRUE(Put(kService, "before", 1));
    CacheFile holder(m_Path);
    bool releases = false;
    const FakeSleep sleep([&] {
        if (releases) holder.Run("COMMIT");
        releases = false;
    });
    holder.Run("BEGIN EXCLUSIVE");
    EXPECT_FALSE(Put(kService, "k", 1));
    EXPECT_EQ(10000000, FakeSleep::s_Slept);
    EXPECT_FALSE(Has(kService, "before"));
    EXPECT_NE(0, CacheMgr().Open(Param(CacheType_File)));

    EXPECT_EQ(1, m_Log.Count("locked")) << "left alone from the first time on, without a further wait";

    releases = true;
    Open(CacheType_File);
    EXPECT_FALSE(releases);
    holder.Run("BEGIN EXCLUSIVE");
    releases = true;
    EXPECT_TRUE(Put(kService, "k", 1)) << "the lock went while it waited";
    EXPECT_FALSE(releases);
    EXPECT_TRUE(Has(kService, "k") && Has(kService, "before"));

    holder.Run("BEGIN IMMEDIATE");
    EXPECT_TRUE(Has(kService, "k")) << "a writer that has not committed yet does not keep readers out";
    holder.Run("COMMIT");
}

TEST_F(CacheMgrTest, AnUnusablePathIsACode)
{
    m_Folder.Write("file", "");
    std::filesystem::create_directory(m_Folder / "folder.zv");
    for (const char* name : {"file/x.zv", "none/x.zv", "folder.zv", ""}) {
        ZV_WS_CacheParam2 param = Param(CacheType_File);
        param.path = Bytes(m_Folder / name);
        EXPECT_NE(0, m_Cache.Open(param)) << name;
        ExpectAll(m_Cache, 0, name);
    }
    EXPECT_EQ(0, m_Cache.Open(Param(CacheType_File))) << "a failure leaves nothing behind";
    ExpectAll(m_Cache, kAll, "opened after failures");
}

// Damage in every page of a file, also in those that no opening looks at: whichever operation meets it is a miss, the
// next one has a whole cache, and one line says why. What no operation meets harms nobody.
TEST_F(CacheMgrTest, DamageAnywhereIsMetOnceAndMended)
{
    Open(CacheType_File, kAll, 100000000);  // with limits, for which every row is looked at
    const ZVString keys[] = {"a", "b", "c"};
    for (const ZVString& key : keys)
        EXPECT_TRUE(Put(kService, key, 9000) && Put(kBoxArt, key, 9000) && Put(kUserData, key, 3000));
    CacheFile(m_Path).Run("DELETE FROM Service WHERE Key = 'b'");
    const std::string whole = m_Folder.Read("cache.zv");
    const int pages = static_cast<int>(whole.size() / 4096);
    ASSERT_GT(pages, 15);
    int met = 0;
    for (const char byte : {'\0', '\xee'}) {
        for (int page = 0; page < pages; ++page) {
            SCOPED_TRACE(testing::Message() << "page " << page << " of bytes " << int(byte));
            std::string damaged = whole;
            damaged.replace(4096u * static_cast<unsigned int>(page), 4096, 4096, byte);
            m_Folder.Write("cache.zv", damaged);
            m_Log.Clear();
            for (const int kind : {kService, kBoxArt, kUserData}) {
                for (const ZVString& key : keys)
                    Has(kind, key);
                Put(kind, "new", 9000);
            }
            for (const Operation& operation : Operations())
                operation.run(m_Cache);
            ExpectAll(m_Cache, kAll, "mended");
            EXPECT_LE(m_Log.Count("broken"), 1);
            if (m_Log.Count("broken") == 0) continue;
            ++met;
            EXPECT_EQ("ok ", CacheFile(m_Path).Query("PRAGMA integrity_check"));
        }
    }
    EXPECT_GT(met, pages) << "hardly any damage was met";
}

TEST_F(CacheMgrTest, AFileThatIsNoDatabaseOrWentIsMadeAnew)
{
    Open(CacheType_File, kAll, 1000);
    EXPECT_TRUE(Put(kService, "k", 600));
    const std::string whole = m_Folder.Read("cache.zv");
    const struct {
        const char* damage;
        std::string content;
        bool isBroken;
    } rows[] = {
        {"no database", "no database", true},
        {"overwritten", std::string(whole.size(), 'x'), true},
        {"cut", whole.substr(0, 5000), true},
        {"emptied", "", false},
        {"removed", "-", false},
    };
    for (const auto& row : rows) {
        for (const bool isOpen : {true, false}) {
            SCOPED_TRACE(testing::Message() << row.damage << isOpen);
            Open(CacheType_File, kAll, 1000);
            if (!isOpen) m_Cache.Close();
            m_Folder.Write("cache.zv-journal", "left over");
            m_Folder.Write("cache.zv", row.content);
            if (row.content == "-") std::filesystem::remove(m_Path);
            m_Log.Clear();
            if (!isOpen) Open(CacheType_File, kAll, 1000);
            EXPECT_FALSE(Has(kService, "k"));
            ExpectAll(m_Cache, kAll, "made anew");
            EXPECT_EQ(row.isBroken, m_Log.Count("broken"));
            EXPECT_FALSE(m_Folder.Has("cache.zv-journal"));
        }
    }
}

TEST_F(CacheMgrTest, IsTheOwnersAlone)
{
    namespace fs = std::filesystem;
    const auto isPrivate = [&] { return (fs::status(m_Path).permissions() & fs::perms(077)) == fs::perms(0); };
    Open(CacheType_File);
    EXPECT_TRUE(isPrivate());
    fs::permissions(m_Path, fs::perms(0644));  // of an earlier version
    Open(CacheType_File);
    EXPECT_TRUE(isPrivate());
    fs::remove(m_Path);
    EXPECT_TRUE(Put(kService, "k", 1));
    EXPECT_TRUE(isPrivate());
}

// ---- Several operations as one

TEST_F(CacheMgrTest, WhatFailsInTheMiddleLeavesNothing)
{
    for (const int type : {CacheType_Memory, CacheType_File}) {
        SCOPED_TRACE(type);
        Open(type);
        EXPECT_TRUE(Put(kUserData, "old", 1));
        const unsigned int generation = m_Cache.Generation();
        EXPECT_FALSE(m_Cache.Together(
            [&] { return m_Cache.PurgeUserData("") && Put(kService, "new", 1) && m_Cache.WriteMetaData("", "", ""); }));
        EXPECT_TRUE(Has(kUserData, "old"));
        EXPECT_FALSE(Has(kService, "new"));
        EXPECT_EQ(generation, m_Cache.Generation());
        EXPECT_TRUE(m_Cache.Together([&] { return m_Cache.PurgeUserData("") && Put(kService, "new", 1); }));
        EXPECT_TRUE(!Has(kUserData, "old") && Has(kService, "new"));
    }
}

TEST_F(CacheMgrTest, GenerationsTellWhatWasDroppedByWhomever)
{
    Open(CacheType_File);
    CacheMgr other;
    ASSERT_EQ(0, other.Open(Param(CacheType_File)));
    const struct {
        const char* change;
        std::function<bool()> make;
        bool isNew;
    } rows[] = {
        {"an answer", [&] { return other.WriteMetaData("n", "k", "v"); }, false},
        {"the same load time", [&] { return other.UpdateLastCacheLoadTime("1"); }, false},
        {"a new load time", [&] { return other.UpdateLastCacheLoadTime("2"); }, true},
        {"user data of a name", [&] { return other.PurgeUserData("getMyVideos"); }, true},
        {"all flags", [&] { return other.RemoveAllWishlistFlags(); }, true},
        {"another file", [&] { return std::filesystem::remove(m_Path) && other.WriteMetaData("n", "k", "v"); }, true},
    };
    EXPECT_TRUE(other.UpdateLastCacheLoadTime("1"));
    for (const auto& row : rows) {
        const unsigned int before = m_Cache.Generation();
        const uint64_t drops = CacheInterface::Drops();
        EXPECT_TRUE(row.make()) << row.change;
        EXPECT_EQ(row.isNew, m_Cache.Generation() != before) << row.change;
        EXPECT_EQ(row.isNew, CacheInterface::Drops() != drops) << row.change;
        EXPECT_NE(0u, m_Cache.Generation());
    }
}

}  // namespace
