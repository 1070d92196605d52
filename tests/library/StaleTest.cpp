// What a change has made stale is shown to nobody, and what belongs to one customer not to another: whichever session
// asked, and whenever its answer came.
#include <algorithm>
#include <filesystem>
#include <thread>

#include "CacheFile.h"
#include "FakeSleep.h"
#include "LogLines.h"
#include "SessionImpl.h"
#include "Store.h"

namespace {

constexpr unsigned int kAll = ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_BoxArtImage |
                              ZV_WS_CacheParam::CacheData_Userdata;

const ZV_WS_Pagination kPage = Page(1, 9);
constexpr int kTitle = 50;  // in no wish list

class Stale : public Store {
protected:
    void TearDown() override
    {
        ZV_WS_release(&other);
        Store::TearDown();
    }

    ZV_WS_SetupParams CachedSetup(CacheType type = CacheType_File)
    {
        folder = store->DataFolder() + "/cache";
        ZV_WS_SetupParams setup = Setup();
        setup.CacheParam = {type, kAll, 0, folder.c_str()};
        return setup;
    }

    // Two sessions on one cache: the second one a duplicate, or with a set-up of its own, as another process has it.
    void Begin(bool isDuplicate, CacheType type = CacheType_File)
    {
        ZV_WS_release(&other);
        ZV_WS_release(&session);
        Open(StorefrontOptions());
        const ZV_WS_SetupParams setup = CachedSetup(type);
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
        ASSERT_EQ(ZV_WS_Status_ok, isDuplicate ? ZV_WS_duplicate(&other, &session) : ZV_WS_initialize(&other, &setup));
        store->ClearLog();
    }

    static short WishlistItems(ZV_WS_Session* session)
    {
        Owned<ZV_WS_WishlistItemsResponse> items;
        EXPECT_EQ(ZV_WS_Status_ok,
                  ZV_WS_getWishlistItems(session, SORT_ORDER_DATEADDED, &kPage, TITLE_TYPE_FILTER_ANY, &items));
        return items.TotalItems;
    }

    ZV_WS_Session other;
    std::string folder;
};

// An answer on its way while something changes is not kept: neither by the session that made the change nor by any
// other on the same file.
TEST_F(Stale, AnAnswerThatAChangeOvertakesIsNotKept)
{
    const int sku = Number("SELECT MIN(sku) FROM product");
    const auto titles = [](ZV_WS_Session* session) { return Asking(ZV_WS_getTitles, 1, &kPage, 2)(session); };
    const auto flag = [](ZV_WS_Session* session) {
        bool is = false;
        return ZV_WS_checkTitleInWishlist(session, kTitle, &is);
    };
    const auto flags = [](ZV_WS_Session* session) {
        Owned<ZV_WS_TitlesInWishlist> are;
        return ZV_WS_checkTitlesInWishlist(session, &kTitle, 1, TITLE_TYPE_FILTER_ANY, &are);
    };
    const AnyCall wishlist = Asking(ZV_WS_getWishlistItems, SORT_ORDER_DATEADDED, &kPage, TITLE_TYPE_FILTER_ANY);
    const AnyCall videos =
        Asking(ZV_WS_getMyVideos, &kPage, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, WATCH_STATUS_UNDEFINED);
    const AnyCall add = Asking(ZV_WS_addItemToWishlist, kTitle);
    const AnyCall activate = Asking(ZV_WS_authorizeDevice, StorefrontAccount::kActivationPin);
    const AnyCall refresh = [&](ZV_WS_Session* session) {
        store->Query("UPDATE service SET load_time = load_time || '1'");
        return ZV_WS_updateLocalCache(session, kAll);
    };
    const struct {
        const char* name;
        const char* operation;  // of what is asked
        AnyCall ask, change;
        bool isToldByChange = false;
    } rows[] = {
        {"wish list, adding", "getWishlistItems", wishlist, add},
        {"wish list, removing", "getWishlistItems", wishlist, Asking(ZV_WS_removeItemFromWishlist, 7)},
        {"wish list, removing all", "getWishlistItems", wishlist, Asking(ZV_WS_removeAllItemsFromWishlist)},
        {"a title's flag", "getTitleListing", flag, add, true},
        {"titles' flags", "getWishlistItems", flags, add, true},
        {"videos, buying", "getMyStreamingVideos", videos,
         Asking(ZV_WS_doPurchaseSavedBilling, sku, "10.0.0.1", false)},
        {"e-mail, activating", "getEmailAddress", Asking(ZV_WS_getEmailAddress), activate},
        {"billing, deactivating", "getBillingInfo", Asking(ZV_WS_getBillingInfo), Asking(ZV_WS_deactivateDevice)},
        {"titles, a new catalogue", "getTitlesByNavigation", titles, refresh},
    };
    for (const auto& row : rows) {
        // A session and its duplicate; two of their own; one with a cache in memory, whose duplicate has none.
        for (const auto& [isDuplicate, type] :
             {std::pair(true, CacheType_File), {false, CacheType_File}, {true, CacheType_Memory}}) {
            SCOPED_TRACE(testing::Message() << row.name << ", duplicate " << isDuplicate << ", cache " << type);
            const bool isMemory = type == CacheType_Memory;
            if (isMemory && row.operation == std::string("getTitlesByNavigation")) continue;  // it has none to refresh
            ASSERT_NO_FATAL_FAILURE(Begin(isDuplicate, type));
            Fault(std::string(row.operation) + "=hold");
            ZV_WS_Status asked = ZV_WS_Status_general_error;
            std::thread asking([&] { asked = row.ask(isMemory ? &session : &other); });
            ASSERT_TRUE(store->WaitForRequests(1));
            EXPECT_EQ(ZV_WS_Status_ok, row.change(isMemory ? &other : &session));
            store->ClearFaults();  // the answer of before the change goes out
            asking.join();
            EXPECT_EQ(ZV_WS_Status_ok, asked);
            EXPECT_EQ("hold", store->Log().front().fault);
            store->ClearLog();
            EXPECT_EQ(ZV_WS_Status_ok, row.ask(&session));
            EXPECT_EQ(row.isToldByChange && !isMemory ? 0u : 1u, store->Log().size()) << "the stale answer was kept";
        }
    }
}

TEST_F(Stale, FlagsAreThoseOfTheLastChange)
{
    ASSERT_NO_FATAL_FAILURE(Begin(true));
    Fault("getTitleListing=hold");
    std::thread asking([&] {
        bool flag = true;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitleInWishlist(&other, kTitle, &flag));
        EXPECT_FALSE(flag) << "as it was when it was asked";
    });
    ASSERT_TRUE(store->WaitForRequests(1));
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_addItemToWishlist, kTitle)(&session));
    store->ClearFaults();
    asking.join();
    for (ZV_WS_Session* each : {&session, &other}) {
        bool flag = false;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitleInWishlist(each, kTitle, &flag));
        EXPECT_TRUE(flag);
    }
}

// Whether the service has made a change whose answer was lost, nobody knows; what is cached is not trusted then.
TEST_F(Stale, AChangeWithoutAnAnswerMayHaveBeenMade)
{
    const struct {
        const char* fault;
        bool isKept;
    } rows[] = {
        {"addItemToWishlist=cut,after", false},
        {"addItemToWishlist=missing-result", false},
        {"addItemToWishlist=code:1", true},
        {"connect=close", true},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fault);
        ASSERT_NO_FATAL_FAILURE(Begin(true));
        const short before = WishlistItems(&session);
        bool flag = true;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitleInWishlist(&session, kTitle, &flag));
        if (row.fault[0] == 'c') session._pSessionImpl->m_Stream.transport().Close();
        store->ClearLog();
        Fault(row.fault);
        EXPECT_NE(ZV_WS_Status_ok, Asking(ZV_WS_addItemToWishlist, kTitle)(&session));
        EXPECT_EQ(1u, store->Log().size());
        const bool isMade = Number("SELECT COUNT(*) FROM wish WHERE title = 50") == 1;
        EXPECT_EQ(before + isMade, WishlistItems(&session));
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitleInWishlist(&session, kTitle, &flag));
        EXPECT_EQ(isMade, flag);
        EXPECT_EQ(row.isKept ? 1u : 3u, store->Log().size());
    }
}

// A memory cache is one session's own: what a duplicate changes, it learns from the account that they share.
TEST_F(Stale, ADuplicatesChangeReachesAMemoryCache)
{
    ASSERT_NO_FATAL_FAILURE(Begin(true, CacheType_Memory));
    EXPECT_EQ(3, WishlistItems(&session));
    EXPECT_EQ(3, WishlistItems(&session));
    EXPECT_EQ(1u, store->Log().size());
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_addItemToWishlist, kTitle)(&other));
    EXPECT_EQ(4, WishlistItems(&session));
}

// What cannot be dropped is not shown.
TEST_F(Stale, WhatCannotBePurgedIsNotShown)
{
    ASSERT_NO_FATAL_FAILURE(Begin(true));
    const std::string file = session._pSessionImpl->m_Params.CachePath.c_str();
    EXPECT_EQ(3, WishlistItems(&session));
    session._pSessionImpl->m_Writer->Flush();
    CacheFile(file).Run(
        "CREATE TRIGGER refuse BEFORE DELETE ON Userdata BEGIN SELECT RAISE(ABORT, 'the disk is full'); END");
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_addItemToWishlist, kTitle)(&session));
    for (ZV_WS_Session* each : {&session, &other})
        EXPECT_EQ(4, WishlistItems(each));
    CacheFile(file).Run("DROP TRIGGER refuse");
    store->ClearLog();
    for (int i = 0; i < 2; ++i)
        EXPECT_EQ(4, WishlistItems(&other));
    EXPECT_EQ(1u, store->Log().size()) << "cached again";
}

// ---- Customers

// Whoever activates the device, and from whichever of its sessions: from the next request on all of them are the new
// customer's, and show nothing of the one before.
TEST_F(Stale, AnotherCustomerOnTheSamePlayer)
{
    const auto seen = [](ZV_WS_Session* session) {
        Owned<ZV_WS_EmailAddressResponse> address;
        Owned<ZV_WS_BillingInfoResponse> billing;
        Owned<ZV_WS_SettingsPageInfoResponse> settings;
        Owned<ZV_WS_MyVideosResponse> videos;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getEmailAddress(session, &address));
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getBillingInfo(session, &billing));
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getSettingsPageInfo(session, &settings));
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getMyVideos(session, &kPage, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY,
                                                     WATCH_STATUS_UNDEFINED, &videos));
        std::string all;
        for (const char* text : {address.EmailAddress, billing.CCLastFour, settings.Account})
            all += std::string(text ? text : "null") + " ";
        for (unsigned int i = 0; i < videos.Titles.size; ++i)
            all += std::to_string(videos.Titles.TitleListingPurchased[i].PassID) + " ";
        return all + std::to_string(WishlistItems(session));
    };
    const AnyCall second = Asking(ZV_WS_authorizeDevice, StorefrontAccount::kSecondActivationPin);
    for (const CacheType type : {CacheType_File, CacheType_Memory, CacheType_None}) {
        for (const bool isByDuplicate : {false, true}) {
            SCOPED_TRACE(testing::Message() << "cache " << type << ", by the duplicate " << isByDuplicate);
            ASSERT_NO_FATAL_FAILURE(Begin(true, type));
            ZV_WS_Session* const actor = isByDuplicate ? &other : &session;
            const auto all = [&](const char* standing) {
                store->ClearLog();
                std::string one = seen(&session);
                const std::string two = seen(&other);
                EXPECT_EQ(one, two);
                for (const LoggedRequest& request : store->Log())
                    EXPECT_NE(0, std::count(request.soap.begin(), request.soap.end(),
                                            std::make_pair(std::string("token"), std::string(standing))))
                        << request.operation;
                EXPECT_LE(5u, store->Log().size()) << "nothing was asked for the customer";
                return one;
            };
            const std::string first = all("none");
            EXPECT_EQ(ZV_WS_Status_ok, second(actor));
            const std::string theirs = all("current");
            EXPECT_NE(first, theirs);
            EXPECT_NE(std::string::npos, theirs.find(store->Query("SELECT email FROM account WHERE id = 2")));
            EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_deactivateDevice)(actor));
            EXPECT_EQ(first, all("none"));
        }
    }
}

// ---- Trouble with the file

TEST_F(Stale, AFileThatWasClearedWhileOpenWorksAgain)
{
    ASSERT_NO_FATAL_FAILURE(Begin(true));
    for (const bool clears : {true, false}) {
        for (ZV_WS_Session* each : {&session, &other})
            WishlistItems(each);
        if (clears) {
            EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_clearLocalCache(folder.c_str()));
        } else {
            std::filesystem::remove_all(folder);
            std::filesystem::create_directory(folder);
        }
        EXPECT_TRUE(std::filesystem::is_empty(folder));
        store->ClearLog();
        for (int i = 0; i < 2; ++i) {
            for (ZV_WS_Session* each : {&session, &other})
                EXPECT_EQ(3, WishlistItems(each));
        }
        EXPECT_EQ(1u, store->Log().size());
    }
}

TEST_F(Stale, ALockedFileIsLeftToItsHolder)
{
    ASSERT_NO_FATAL_FAILURE(Begin(true));
    const std::string file = session._pSessionImpl->m_Params.CachePath.c_str();
    WishlistItems(&session);
    ZV_WS_release(&other);
    ZV_WS_release(&session);
    {
        CacheFile holder(file);
        holder.Run("BEGIN EXCLUSIVE");
        const FakeSleep sleep([] {});
        const LogLines log;
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(CachedSetup()));
        EXPECT_EQ(10000000, FakeSleep::s_Slept);
        EXPECT_EQ(1, log.Count("locked"));
        for (int i = 0; i < 2; ++i)
            EXPECT_EQ(3, WishlistItems(&session));
        EXPECT_EQ(10000000, FakeSleep::s_Slept) << "it waits once";
        holder.Run("COMMIT");
    }
    EXPECT_EQ("getWishlistItems ", CacheFile(file).Query("SELECT Name FROM Userdata")) << "the holder's file is whole";
}

}  // namespace
