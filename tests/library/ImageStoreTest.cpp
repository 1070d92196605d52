// Row and file of an image never disagree for longer than until the next look at them, and what nobody needs goes.
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <set>

#include "CacheFile.h"
#include "SessionImpl.h"
#include "Store.h"
#include "TempFolder.h"

namespace {

namespace fs = std::filesystem;

constexpr unsigned int kLimit = 358400;

class Images : public Store {
protected:
    ZV_WS_Status Begin(unsigned int limit = 0, const char* key = StorefrontAccount::kApiKey)
    {
        ZV_WS_release(&session);
        ZV_WS_SetupParams setup = Setup();
        setup.APIKey = key;
        setup.EnvNum = ENVNUM_PRODUCTION;
        setup.CacheParam = {CacheType_File, ZV_WS_CacheParam::CacheData_BoxArtImage, limit, folder.c_str()};
        const ZV_WS_Status status = Initialize(setup);
        store->ClearLog();
        return status;
    }

    // The place of the image when it is whole there and can be read.
    std::string Bring(const std::string& prefix, ZV_WS_BoxArtSize size = BOX_ART_SIZE_135S)
    {
        Owned<ZV_WS_String> place;
        if (ZV_WS_getBoxArtImage(&session, size, prefix.c_str(), &place) != ZV_WS_Status_ok) return "failed";
        const std::string bytes = ContentOf(place.data);
        Owned<ZV_WS_Image> image;
        if (ZV_WS_getBoxArtImageData(&session, size, prefix.c_str(), &image) != ZV_WS_Status_ok) return "no data";
        if (image.size < 100 || bytes.size() != image.size || bytes.substr(bytes.size() - 2) != "\xff\xd9")
            return "not whole";
        return place.data;
    }

    std::string Database() const { return session._pSessionImpl->m_Params.CachePath.c_str(); }
    void WriteRows() const { session._pSessionImpl->m_Writer->Flush(); }

    std::set<std::string> Files(const std::string& extension = ".jpg") const
    {
        std::set<std::string> names;
        for (const auto& entry : fs::directory_iterator(folder)) {
            if (entry.path().extension() == extension) names.insert(entry.path().filename());
        }
        return names;
    }

    void SetUp() override
    {
        CacheWriter::SetPatience(3600000);  // rows are written when the test says so
        Store::SetUp();
        fs::create_directory(folder);
    }

    const TempFolder temp;
    const std::string folder = temp / "cache";
};

TEST_F(Images, WhatIsNotWholeIsFetchedAnewInTheSameCall)
{
    const std::pair<const char*, std::function<void(const std::string&)>> damages[] = {
        {"empty", [](const std::string& file) { fs::resize_file(file, 0); }},
        {"cut", [](const std::string& file) { fs::resize_file(file, fs::file_size(file) / 2); }},
        {"longer", [](const std::string& file) { std::ofstream(file, std::ios::app) << "more"; }},
        {"gone", [](const std::string& file) { fs::remove(file); }},
    };
    for (const auto& [name, damage] : damages) {
        for (const bool isNextSession : {false, true}) {
            for (const bool isMarked : {false, true}) {
                SCOPED_TRACE(testing::Message() << name << isNextSession << isMarked);
                ASSERT_EQ(ZV_WS_Status_ok, Begin());
                const std::string file = Bring("ZV00012");
                ASSERT_EQ(folder + "/ZV00012135.jpg", file);
                if (isNextSession) Begin();
                if (isMarked) ZV_WS_updateLocalCache(&session, ZV_WS_CacheParam::CacheData_BoxArtImage);
                damage(file);
                store->ClearLog();
                EXPECT_EQ(file, Bring("ZV00012"));
                const auto log = store->Log();
                ASSERT_EQ(1u, log.size());
                EXPECT_EQ("", Header(log[0], "if-modified-since")) << "a half image must not be asked for as one";
            }
        }
    }
}

// The image that is being written goes last, whatever room is to be made for it.
TEST_F(Images, ARevalidatedImageOutlivesTheEvictionThatItCauses)
{
    for (const char* answer : {"boxart=not-modified", "boxart=modified"}) {
        SCOPED_TRACE(answer);
        fs::remove_all(folder);
        ASSERT_EQ(ZV_WS_Status_ok, Begin(kLimit));
        for (int title = 10; title < 18; ++title)
            ASSERT_NE("failed", Bring("ZV000" + std::to_string(title)));
        WriteRows();
        CacheFile(Database()).Run("UPDATE BoxArt SET Size = Size + 400000 WHERE Prefix = 'ZV00017'");
        ZV_WS_updateLocalCache(&session, ZV_WS_CacheParam::CacheData_BoxArtImage);
        Fault(answer);
        store->ClearLog();
        Owned<ZV_WS_String> place;
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_135S, "ZV00010", &place));
        WriteRows();
        EXPECT_EQ("ZV00010 ", CacheFile(Database()).Query("SELECT Prefix FROM BoxArt")) << "nothing was evicted";
        EXPECT_NE("", ContentOf(place.data));
        EXPECT_EQ(std::set<std::string>{"ZV00010135.jpg"}, Files());
        EXPECT_EQ(folder + "/ZV00010135.jpg", Bring("ZV00010"));
        EXPECT_EQ(1u, store->Log().size());
    }
}

TEST_F(Images, FilesWithoutARowDoNotPileUp)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(kLimit));
    for (int title = 100; title < 180; ++title) {
        for (const ZV_WS_BoxArtSize size : {BOX_ART_SIZE_95, BOX_ART_SIZE_175, BOX_ART_SIZE_321})
            ASSERT_EQ(ZV_WS_Status_ok,
                      Asking(ZV_WS_getBoxArtImage, size, ("ZV00" + std::to_string(title)).c_str())(&session));
    }
    WriteRows();
    const int rows = atoi(CacheFile(Database()).Query("SELECT COUNT(*) FROM BoxArt").c_str());
    EXPECT_GT(rows, 5);
    EXPECT_LE(Files().size(), static_cast<size_t>(rows));
}

TEST_F(Images, OpeningSweepsTheFolder)
{
    const auto touch = [&](const std::string& name, int daysAgo = 0) {
        std::string file = folder + "/" + name;
        if (!fs::exists(file)) std::ofstream(file) << "left over";
        fs::last_write_time(file, fs::file_time_type::clock::now() - std::chrono::hours(24 * daysAgo));
        return file;
    };
    // Caches of three customers: given up, in use, and the one that is opened.
    ASSERT_EQ(ZV_WS_Status_ok, Begin(0, "given up"));
    Bring("ZV00010");
    const std::string givenUp = fs::path(Database()).filename();
    ASSERT_EQ(ZV_WS_Status_ok, Begin(0, "in use"));
    Bring("ZV00011");
    const std::string inUse = fs::path(Database()).filename();
    ASSERT_EQ(ZV_WS_Status_ok, Begin());
    Bring("ZV00012");
    const std::string own = fs::path(Database()).filename();
    ZV_WS_release(&session);

    for (const char* name : {"ZV99999135.jpg", "photo.jpg", "notes.txt", "zvwsabcdef", "zvwsnotes"})
        touch(name);
    const int fetching = open(touch("ZV88888321.jpg").c_str(), O_RDONLY),
              writing = open(touch("zvwsWRITES").c_str(), O_RDONLY);
    ASSERT_TRUE(flock(fetching, LOCK_EX) == 0 && flock(writing, LOCK_EX) == 0);
    touch(givenUp, 31);
    touch(inUse, 29);

    ASSERT_EQ(ZV_WS_Status_ok, Begin());  // used before in this week
    EXPECT_EQ(
        (std::set<std::string>{"ZV00010135.jpg", "ZV00011135.jpg", "ZV00012135.jpg", "ZV88888321.jpg", "photo.jpg"}),
        Files());
    EXPECT_EQ((std::set<std::string>{givenUp, inUse, own}), Files(".zv"));
    EXPECT_EQ((std::set<std::string>{"zvwsnotes", "zvwsWRITES"}), Files(""));
    EXPECT_TRUE(fs::exists(folder + "/notes.txt"));
    close(fetching);
    close(writing);

    ZV_WS_release(&session);
    touch(own, 8);
    ASSERT_EQ(ZV_WS_Status_ok, Begin());
    EXPECT_EQ((std::set<std::string>{inUse, own}), Files(".zv"));
    EXPECT_EQ((std::set<std::string>{"ZV00011135.jpg", "ZV00012135.jpg", "photo.jpg"}), Files());
    EXPECT_EQ(folder + "/ZV00012135.jpg", Bring("ZV00012"));
    EXPECT_TRUE(store->Log().empty());
    EXPECT_GT(fs::last_write_time(Database()), fs::file_time_type::clock::now() - std::chrono::hours(1));
}

// A database that cannot be asked may have a row for anything.
TEST_F(Images, NothingIsSweptWhileADatabaseIsLocked)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(0, "other"));
    const std::string other = Database();
    Bring("ZV00012");
    ZV_WS_release(&session);
    std::ofstream(folder + "/ZV99999135.jpg") << "without a row";
    CacheFile holder(other);
    holder.Run("BEGIN EXCLUSIVE");
    ASSERT_EQ(ZV_WS_Status_ok, Begin());
    EXPECT_EQ(2u, Files().size());
    holder.Run("COMMIT");
    ASSERT_EQ(ZV_WS_Status_ok, Begin());
    EXPECT_EQ(std::set<std::string>{"ZV00012135.jpg"}, Files());
}

TEST_F(Images, TheFolderIsTheOwnersAlone)
{
    fs::remove_all(folder);
    ASSERT_EQ(ZV_WS_Status_ok, Begin());
    EXPECT_EQ(fs::perms(0700), fs::status(folder).permissions());
    EXPECT_EQ(fs::perms(0600), fs::status(Database()).permissions());
    EXPECT_EQ(fs::perms(0600), fs::status(Bring("ZV00012")).permissions());
}

}  // namespace
