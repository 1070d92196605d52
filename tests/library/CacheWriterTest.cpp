// What is kept is there at once for all sessions of the process, and on the disk soon, in few writes.
#include <atomic>
#include <thread>

#include "CacheFile.h"
#include "SessionImpl.h"
#include "Store.h"
#include "TempFolder.h"

namespace {

class Written : public Store {
protected:
    void SetUp() override
    {
        CacheWriter::SetPatience(kForEver);
        Store::SetUp();
        Begin();
    }
    void TearDown() override
    {
        ZV_WS_release(&copy);
        Store::TearDown();
    }

    void Begin()
    {
        ZV_WS_SetupParams setup = Setup();
        setup.CacheParam = {CacheType_File, 7, 0, folder.c_str()};
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&copy, &session));
        database = session._pSessionImpl->m_Params.CachePath.c_str();
        store->ClearLog();
    }

    static void Fetch(ZV_WS_Session* session, int title)
    {
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getRecommendedTitles, title)(session));
    }
    static void FetchImage(ZV_WS_Session* session, int title)
    {
        const std::string prefix = "ZV000" + std::to_string(title);
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getBoxArtImage, BOX_ART_SIZE_95, prefix.c_str())(session));
    }
    // "answers images".
    std::string Rows() const
    {
        CacheFile file(database);
        return file.Query("SELECT COUNT(*) FROM Service") + file.Query("SELECT COUNT(*) FROM BoxArt");
    }

    static constexpr uint64_t kForEver = 3600000;
    const TempFolder temp;
    const std::string folder = temp / "cache";
    std::string database;
    ZV_WS_Session copy;
};

TEST_F(Written, WhatWaitsIsThereForAllSessions)
{
    Fetch(&copy, 12);
    FetchImage(&copy, 12);
    EXPECT_EQ("0 0 ", Rows());
    Fetch(&session, 12);
    FetchImage(&session, 12);
    EXPECT_EQ(2u, store->Log().size());
    ZV_WS_release(&copy);
    EXPECT_EQ("0 0 ", Rows());
    ZV_WS_release(&session);
    EXPECT_EQ("1 1 ", Rows()) << "the last session writes it";
    Begin();
    Fetch(&session, 12);
    FetchImage(&session, 12);
    EXPECT_TRUE(store->Log().empty());
}

TEST_F(Written, AChangeTakesItAlong)
{
    Fetch(&copy, 12);
    FetchImage(&copy, 12);
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_addItemToWishlist, 50)(&session));
    EXPECT_EQ("1 1 ", Rows());
    store->ClearLog();
    Fetch(&session, 12);
    EXPECT_TRUE(store->Log().empty()) << "a change of something else has dropped it";
}

TEST_F(Written, ManyWaitNoLonger)
{
    CacheFile file(database);
    for (int title = 10; title < 10 + 31; ++title)
        Fetch(&session, title);
    EXPECT_EQ("0 0 ", Rows());
    Fetch(&session, 60);
    while (Rows() != "32 0 ")
        std::this_thread::yield();  // the test's own limit ends it
}

TEST_F(Written, NothingWaitsLong)
{
    CacheWriter::SetPatience(1);
    Fetch(&session, 12);
    FetchImage(&session, 12);
    while (Rows() != "1 1 ")
        std::this_thread::yield();
}

// Sessions that keep, change and end beside each other, and a writer in between.
TEST_F(Written, SessionsMeetInIt)
{
    CacheWriter::SetPatience(0);
    std::thread others([&] {
        for (int i = 0; i < 20; ++i) {
            ZV_WS_Session another;
            EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&another, &session));
            Fetch(&another, 10 + i);
            FetchImage(&another, 10 + i);
            ZV_WS_release(&another);
        }
    });
    for (int i = 0; i < 20; ++i) {
        Fetch(&copy, 10 + i);
        EXPECT_EQ(ZV_WS_Status_ok, Asking(i % 2 ? ZV_WS_addItemToWishlist : ZV_WS_removeItemFromWishlist, 7)(&copy));
    }
    others.join();
    EXPECT_EQ("ok ", CacheFile(database).Query("PRAGMA integrity_check"));
}

// A row for a file that was removed meanwhile would be a row without a file.
TEST_F(Written, WhatWasClearedMeanwhileIsNotWritten)
{
    Fetch(&session, 12);
    FetchImage(&session, 12);
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_clearLocalCache(folder.c_str()));
    ZV_WS_release(&copy);
    ZV_WS_release(&session);
    Begin();
    EXPECT_EQ("0 0 ", Rows());
}

}  // namespace
