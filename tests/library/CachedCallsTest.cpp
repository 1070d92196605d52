// What was seen once comes back without the network.
#include <filesystem>
#include <fstream>
#include <functional>

#include "Serializer.h"
#include "SessionImpl.h"
#include "Store.h"
#include "TempFolder.h"

namespace {

namespace fs = std::filesystem;

constexpr unsigned int kAll = ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_BoxArtImage |
                              ZV_WS_CacheParam::CacheData_Userdata;

class Cached : public Store {
protected:
    ZV_WS_Status Begin(CacheType type, unsigned int data = kAll, unsigned int limit = 0)
    {
        ZV_WS_release(&session);
        folder = store->DataFolder() + "/cache";
        ZV_WS_SetupParams setup = Setup();
        setup.CacheParam = {type, data, limit, folder.c_str()};
        const ZV_WS_Status status = Initialize(setup);
        store->ClearLog();
        return status;
    }

    std::string Database() const
    {
        for (const auto& entry : fs::directory_iterator(folder)) {
            if (entry.path().extension() == ".zv") return entry.path().string();
        }
        return "";
    }

    ZV_WS_Status Listing()
    {
        Owned<ZV_WS_TitleListingResponse> listing;
        const ZV_WS_Status status = ZV_WS_getTitleListing(&session, 12, &listing);
        EXPECT_EQ(status == ZV_WS_Status_ok ? store->Query("SELECT name FROM title WHERE id = 12") : "",
                  listing.TitleName ? listing.TitleName : "");
        return status;
    }

    std::string folder;
};

// All sixteen caching calls: the second time nothing is sent, whatever kind of cache it is.
TEST_F(Cached, TheSecondTimeNothingIsSent)
{
    const ZV_WS_Pagination page = Page(1, 5);
    const int season = Number("SELECT MIN(id) FROM title WHERE is_tv = 1");
    const auto any = PURCHASE_TYPE_ANY;
    const auto all = TITLE_TYPE_FILTER_ANY;
    const AnyCall calls[] = {
        Asking(ZV_WS_getNavigation),
        Asking(ZV_WS_getTitles, 1, &page, any),
        Asking(ZV_WS_getTitleListing, 12),
        Asking(ZV_WS_getTvEpisodeListing, Number("SELECT MIN(id) FROM title WHERE season > 0")),
        Asking(ZV_WS_getTvEpisodeListByTitleID, season),
        Asking(ZV_WS_getAllTvEpisodeListings, season),
        Asking(ZV_WS_translateTivoExternalID, "EXT31"),
        Asking(ZV_WS_translateSkuID, Number("SELECT MIN(sku) FROM product")),
        Asking(ZV_WS_searchForTitle, &page, any, all, "harbour"),
        Asking(ZV_WS_searchForTitleDetail, &page, any, all, "harbour"),
        Asking(ZV_WS_getRecommendedTitles, 12),
        Asking(ZV_WS_getEmailAddress),
        Asking(ZV_WS_getBillingInfo),
        Asking(ZV_WS_getSettingsPageInfo),
        Asking(ZV_WS_getWishlistItems, SORT_ORDER_RATING, &page, all),
        Asking(ZV_WS_getMyVideos, &page, any, all, WATCH_STATUS_UNDEFINED),
    };
    for (const CacheType type : {CacheType_Memory, CacheType_File}) {
        ASSERT_EQ(ZV_WS_Status_ok, Begin(type));
        for (size_t i = 0; i < std::size(calls); ++i) {
            store->ClearLog();
            EXPECT_EQ(ZV_WS_Status_ok, calls[i](&session)) << i;
            EXPECT_EQ(1u, store->Log().size()) << i;
            EXPECT_EQ(ZV_WS_Status_ok, calls[i](&session)) << i;
            EXPECT_EQ(1u, store->Log().size()) << i;
        }
        ASSERT_EQ(ZV_WS_Status_ok, Begin(type));
        for (const AnyCall& call : calls)
            EXPECT_EQ(ZV_WS_Status_ok, call(&session));
        // A new session keeps what a file holds of the catalogue, and nothing that shows the user's state.
        const std::vector<std::string> asked = Asked();
        EXPECT_EQ(type == CacheType_File ? 8 : std::size(calls), asked.size());
        EXPECT_EQ(type != CacheType_File, asked[0] == "getNavigation");
    }
}

TEST_F(Cached, KindsThatTheSessionDoesNotCacheAreAskedEachTime)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_Memory, ZV_WS_CacheParam::CacheData_Userdata));
    for (int i = 0; i < 2; ++i)
        EXPECT_EQ(ZV_WS_Status_ok, Listing());
    EXPECT_EQ(2u, store->Log().size());
}

TEST_F(Cached, WishlistChangesMakeItsPagesStale)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File));
    const ZV_WS_Pagination page = Page(1, 9);
    const auto items = [&] {
        Owned<ZV_WS_WishlistItemsResponse> record;
        EXPECT_EQ(ZV_WS_Status_ok,
                  ZV_WS_getWishlistItems(&session, SORT_ORDER_DATEADDED, &page, TITLE_TYPE_FILTER_ANY, &record));
        return record.TotalItems;
    };
    const auto wished = [&](int title) {
        bool flag = false;
        EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitleInWishlist(&session, title, &flag));
        return flag;
    };
    EXPECT_EQ(3, items());
    EXPECT_FALSE(wished(50));
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_addItemToWishlist, 50)(&session));
    store->ClearLog();
    EXPECT_TRUE(wished(50));  // from the flag
    EXPECT_TRUE(store->Log().empty());
    EXPECT_EQ(4, items());
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_removeItemFromWishlist, 50)(&session));
    const int titles[] = {50, 7, 19};
    for (const size_t requests : {2u, 2u}) {  // a walk through the list and the pages above; then flags alone
        Owned<ZV_WS_TitlesInWishlist> flags;
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_checkTitlesInWishlist(&session, titles, 3, TITLE_TYPE_FILTER_ANY, &flags));
        EXPECT_EQ((std::vector<bool>{false, true, true}),
                  std::vector<bool>(flags.IsAvailInUserWishlist, flags.IsAvailInUserWishlist + 3));
        EXPECT_LE(store->Log().size(), requests + 1);
    }
    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_removeAllItemsFromWishlist)(&session));
    EXPECT_FALSE(wished(7));
    EXPECT_EQ(0, items());
}

TEST_F(Cached, ANewCatalogueDropsTheAnswers)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File));
    Owned<ZV_WS_String> time;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getLastCacheLoadTimeUTC(&session, &time));
    bool should = true;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_shouldUpdateCache(&session, time.data, &should));
    EXPECT_FALSE(should);
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_shouldUpdateCache(&session, "", &should));
    Listing();
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_updateLocalCache(&session, ZV_WS_CacheParam::CacheData_Metadata));
    store->ClearLog();
    Listing();
    EXPECT_TRUE(store->Log().empty());
    store->Query("UPDATE service SET load_time = '11/21/2026 6:00:00 AM'");
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_shouldUpdateCache(&session, time.data, &should));
    EXPECT_TRUE(should);
    // A new session looks by itself.
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File));
    Listing();
    EXPECT_EQ(std::vector<std::string>{"getTitleListing"}, Asked());
}

TEST_F(Cached, DuplicatesShareAFileAndNotTheMemory)
{
    for (const CacheType type : {CacheType_File, CacheType_Memory}) {
        ASSERT_EQ(ZV_WS_Status_ok, Begin(type));
        Listing();
        ZV_WS_Session copy;
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&copy, &session));
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getTitleListing, 12)(&copy));
        EXPECT_EQ(type == CacheType_File ? 1u : 2u, store->Log().size());
        ZV_WS_release(&copy);
    }
}

// What cannot be used in a call's place is asked anew, once.
TEST_F(Cached, WhatSaysNothingIsReplaced)
{
    ZVString noResult;
    ASSERT_TRUE(Serializer(true, false).Write(_ZV1__getTitleListingResponse(), noResult));
    for (const ZVString& text : {noResult, ZVString("no answer of ours")}) {
        SCOPED_TRACE(text.length());
        ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_Memory));
        ASSERT_TRUE(session._pSessionImpl->m_Cache->WriteMetaData("getTitleListing", "12", text));
        for (int i = 0; i < 2; ++i)
            EXPECT_EQ(ZV_WS_Status_ok, Listing());
        EXPECT_EQ(1u, store->Log().size());
    }
}

// Whatever happens to the cache, the call answers as if there were none.
TEST_F(Cached, ABrokenCacheIsNoCache)
{
    const std::function<void(const std::string&)> breaks[] = {
        [](const std::string& file) { std::ofstream(file) << "this is no database at all, but long enough"; },
        [](const std::string& file) { fs::resize_file(file, fs::file_size(file) / 2); },
        [](const std::string& file) { fs::resize_file(file, 0); },
        [](const std::string& file) { fs::remove_all(fs::path(file).parent_path()); },
        [](const std::string& file) {
            fs::remove(file);
            fs::create_directory(file);
        },
    };
    for (size_t i = 0; i < std::size(breaks); ++i) {
        ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File)) << i;
        Listing();
        const std::string file = Database();
        breaks[i](file);
        EXPECT_EQ(ZV_WS_Status_ok, Listing()) << i;
        Asking(ZV_WS_getBoxArtImage, BOX_ART_SIZE_95, "ZV00012")(&session);
        if (i < 4) {  // the next session makes it anew, unless a folder is in its place
            EXPECT_EQ(ZV_WS_Status_ok, Begin(CacheType_File)) << i;
            EXPECT_EQ(ZV_WS_Status_ok, Listing());
        }
        ZV_WS_release(&session);
        fs::remove_all(folder);
    }
}

// ---- Box art

class BoxArt : public Cached {
protected:
    ZV_WS_Status Image(ZV_WS_Image* image)
    {
        return ZV_WS_getBoxArtImageData(&session, BOX_ART_SIZE_135S, "ZV00012", image);
    }
    std::string File() const { return folder + "/ZV00012135.jpg"; }
    void Revalidate()
    {
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_updateLocalCache(&session, ZV_WS_CacheParam::CacheData_BoxArtImage));
    }
};

TEST_F(BoxArt, IsFetchedOnceAndRevalidated)
{
    for (const CacheType type : {CacheType_Memory, CacheType_File}) {
        ASSERT_EQ(ZV_WS_Status_ok, Begin(type));
        std::string first;
        for (int i = 0; i < 4; ++i) {
            if (i == 2) Revalidate();  // to which the answer is 304
            Owned<ZV_WS_Image> image;
            ASSERT_EQ(ZV_WS_Status_ok, Image(&image));
            const std::string bytes(reinterpret_cast<const char*>(image.data), image.size);
            if (i == 0) first = bytes;
            EXPECT_EQ("\xff\xd8", bytes.substr(0, 2));
            EXPECT_TRUE(bytes == first) << i;
            EXPECT_EQ(i < 2 ? 1u : 2u, store->Log().size());
        }
        EXPECT_EQ("Mon, 02 Nov 2026 06:00:00 GMT", Header(store->Log().back(), "if-modified-since"));
    }
}

// A revalidation that fails leaves the image that there is; one that finds a newer image takes it.
TEST_F(BoxArt, AFailedRevalidationLosesNothing)
{
    for (const CacheType type : {CacheType_File, CacheType_Memory}) {
        ASSERT_EQ(ZV_WS_Status_ok, Begin(type));
        Owned<ZV_WS_Image> first;
        ASSERT_EQ(ZV_WS_Status_ok, Image(&first));
        for (const char* fault :
             {"cut", "cut-body", "short", "http:404", "http:503", "no-length", "zero-length", "reset", "modified"}) {
            Revalidate();
            Fault(std::string("boxart=") + fault);
            Owned<ZV_WS_Image> image;
            EXPECT_EQ(ZV_WS_Status_ok, Image(&image)) << fault;
            EXPECT_EQ(first.size, image.size) << fault;
        }
        for (const auto& entry : fs::directory_iterator(folder))
            EXPECT_NE(0u, entry.path().filename().string().rfind("zvws", 0)) << "a temporary file is left";
    }
}

TEST_F(BoxArt, IsAFileOrAnAddress)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_Memory));
    Owned<ZV_WS_String> address;
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_135S, "A b", &address));
    EXPECT_EQ("http://localhost:" + std::to_string(store->HttpPort()) + "/images/boxart/135s/A%20b135.jpg",
              address.data);
    EXPECT_TRUE(store->Log().empty());

    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File));
    std::ofstream(File()) << "no image";  // a file without its row is not trusted
    for (int i = 0; i < 3; ++i) {
        Owned<ZV_WS_String> place;
        ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_135S, "ZV00012", &place));
        EXPECT_EQ(File(), place.data);
        EXPECT_EQ("\xff\xd8", ContentOf(File()).substr(0, 2));
        if (i == 1) fs::remove(File());  // a row without its file is fetched again
    }
    EXPECT_EQ(2u, store->Log().size());
    std::ofstream(folder + "/zvwsLEFT") << "left over";
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_clearLocalCache(folder.c_str()));
    EXPECT_TRUE(fs::is_empty(folder));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_clearLocalCache(""));
}

TEST_F(BoxArt, OldImagesMakeRoom)
{
    const unsigned int limit = 358400;
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File, ZV_WS_CacheParam::CacheData_BoxArtImage, limit));
    for (int title = 10; title < 50; ++title) {
        const std::string prefix = "ZV000" + std::to_string(title);
        ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getBoxArtImage, BOX_ART_SIZE_321, prefix.c_str())(&session)) << title;
    }
    session._pSessionImpl->m_Writer->Flush();  // its thread makes room, too
    size_t bytes = 0;
    for (const auto& entry : fs::directory_iterator(folder))
        bytes += entry.file_size();
    EXPECT_LT(bytes, limit + 100000);
}

TEST_F(BoxArt, PrefixesThatLeaveTheFolderAreRefused)
{
    ASSERT_EQ(ZV_WS_Status_ok, Begin(CacheType_File));
    for (const char* prefix : {"", "../evil", "a/b", "a\\b", "..", "a\nb"}) {
        SCOPED_TRACE(prefix);
        EXPECT_EQ(ZV_WS_Status_invalid_param, Asking(ZV_WS_getBoxArtImageData, BOX_ART_SIZE_95, prefix)(&session));
        EXPECT_EQ(ZV_WS_Status_invalid_param, Asking(ZV_WS_getBoxArtImage, BOX_ART_SIZE_95, prefix)(&session));
    }
    EXPECT_TRUE(store->Log().empty());
}

}  // namespace
