// One call of each kind, against whatever a connection, an answer or a home's network may do to it: the call ends in
// its time and with its status, leaves nothing in the cache, and the next call of the same session works.
#pragma once

#include <chrono>
#include <filesystem>
#include <ostream>

#include "SessionImpl.h"
#include "Store.h"

inline constexpr int kTimeout = 1;        // seconds, of the sessions here
inline constexpr int kClockTimeout = 30;  // the clock has no session, and a timeout of its own
inline constexpr int kEnvironment = 1;    // what discovery answers: not what it falls back to
inline constexpr int kSlack = 3;          // for a busy machine

// Instead of a status:
inline constexpr int kCannot = 1;      // the fault cannot happen to that call, or may be none
inline constexpr int kFails = 2;       // where the failure is seen first is a matter of timing
inline constexpr int kProduction = 3;  // discovery: the answer cannot be used, so production it is

// A call's result must be whole when it succeeds, and empty when it fails.
struct Outcome {
    int status;
    bool isWhole;
    bool isEmpty;
};

// `n` makes every row's call another one, so that none is answered by what an earlier row left in the cache.
inline Outcome Browse(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_TitleListingResponse> listing;
    const ZV_WS_Status status = ZV_WS_getTitleListing(&session, n, &listing);
    return {status, listing.TitleID == n, listing.TitleID == 0 && !listing.Synopsis};
}

inline Outcome Videos(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_MyVideosResponse> videos;
    const ZV_WS_Pagination page = Page(1, static_cast<unsigned int>(n));
    const ZV_WS_Status status =
        ZV_WS_getMyVideos(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, 0, &videos);
    return {status, videos.Titles.size > 0, videos.Titles.size == 0};
}

inline Outcome Discovery(ZV_WS_Session& session, int)
{
    ZV_WS_EnvID environment = {};
    const ZV_WS_Status status = ZV_WS_getDefaultEnvID(&session, &environment);
    if (status == ZV_WS_Status_ok && environment == ENVID_PRODUCTION) return {kProduction, false, true};
    return {status, environment == kEnvironment, environment == 0};
}

inline Outcome ServerTime(ZV_WS_Session&, int)
{
    time_t now = 0;
    const ZV_WS_Status status = ZV_WS_getServerTime(&now);
    return {status, now > 0, now == -1};
}

inline Outcome Bandwidth(ZV_WS_Session& session, int)
{
    unsigned int bits = 1;
    const ZV_WS_Status status = ZV_WS_checkBandwidth(&session, &bits);
    return {status, bits > 0, bits == 0};
}

// Of the catalogue's title with that number.
inline std::string PrefixOf(int n)
{
    const std::string digits = std::to_string(n);
    return "ZV" + std::string(5 - digits.size(), '0') + digits;
}

inline Outcome BoxArtFile(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_String> file;
    const ZV_WS_Status status = ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_95, PrefixOf(n).c_str(), &file);
    return {status, file.data && std::filesystem::file_size(file.data) > 0, !file.data};
}

inline Outcome BoxArtBytes(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_Image> image;
    const ZV_WS_Status status = ZV_WS_getBoxArtImageData(&session, BOX_ART_SIZE_95, PrefixOf(n).c_str(), &image);
    return {status, image.size > 0, image.size == 0};
}

// Calls that fail alike.
enum Column { kSoap, kDiscovery, kClock, kBandwidth, kBoxArt };

struct Kind {
    const char* name;
    const char* operation;  // as the faults call it
    Column column;
    ZV_WS_AccessType access;
    CacheType cache;
    bool isCached;
    Outcome (*call)(ZV_WS_Session&, int n);
};

inline const Kind kKinds[] = {
    {"Browse", "getTitleListing", kSoap, ACCESS_TYPE_STREAM, CacheType_File, true, Browse},
    {"Account", "getMyVideos", kSoap, ACCESS_TYPE_DOWNLOAD, CacheType_File, false, Videos},
    {"Stream", "getMyStreamingVideos", kSoap, ACCESS_TYPE_STREAM, CacheType_File, true, Videos},
    {"Discovery", "discovery", kDiscovery, ACCESS_TYPE_STREAM, CacheType_None, false, Discovery},
    {"Clock", "clock", kClock, ACCESS_TYPE_STREAM, CacheType_None, false, ServerTime},
    {"Bandwidth", "bandwidth", kBandwidth, ACCESS_TYPE_STREAM, CacheType_None, false, Bandwidth},
    {"BoxArtFile", "boxart", kBoxArt, ACCESS_TYPE_STREAM, CacheType_File, true, BoxArtFile},
    {"BoxArtMemory", "boxart", kBoxArt, ACCESS_TYPE_STREAM, CacheType_Memory, true, BoxArtBytes},
    {"BoxArtUncached", "boxart", kBoxArt, ACCESS_TYPE_STREAM, CacheType_None, false, BoxArtBytes},
};

inline void PrintTo(const Kind& kind, std::ostream* to)
{
    *to << kind.name;
}

inline bool IsTls(const Kind& kind)
{
    return kind.column == kSoap || kind.column == kDiscovery;
}

class FaultMatrix : public Store, public testing::WithParamInterface<Kind> {
protected:
    // A session of the kind with short timeouts, whose service is told by ZV_DEPLOYMENT.
    void Begin(const std::string& cache, const ZV_WS_ProxyParam& proxy = {})
    {
        ZV_WS_SetupParams setup = Setup(GetParam().access);
        setup.ProxyParam = proxy;
        setup.CacheParam.Type = GetParam().cache;
        setup.CacheParam.Data = 7;
        setup.CacheParam.Path = cache.c_str();
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
        EachTransport([](Transport& transport) { transport.SetTimeouts(kTimeout, kTimeout); });
    }

    void SetUp() override
    {
        ASSERT_NO_FATAL_FAILURE(OpenStore());
        ASSERT_NO_FATAL_FAILURE(Begin(CacheFolder()));
    }

    void OpenStore(StorefrontOptions options = {})
    {
        options.environment = kEnvironment;
        Open(options);
    }

    std::string CacheFolder() const { return store->DataFolder() + "/cache"; }

    template <class Act>
    void EachTransport(Act act)
    {
        SessionImpl& own = *session._pSessionImpl;
        for (Transport* transport : {&own.m_Browse.transport(), &own.m_Stream.transport(), &own.m_Download.transport()})
            act(*transport);
    }

    void ReconnectNext()
    {
        EachTransport([](Transport& transport) { transport.Close(); });
    }

    bool HasTemporaryFile() const
    {
        std::error_code none;
        for (const auto& entry : std::filesystem::directory_iterator(CacheFolder(), none)) {
            if (entry.path().filename().string().rfind("zvws", 0) == 0) return true;
        }
        return false;
    }

    // Makes the next call, which meets a fault.
    void ExpectOutcome(int expected)
    {
        const Kind& kind = GetParam();
        ++m_Row;
        const int limit = kind.column == kClock ? kClockTimeout : 2 * kTimeout;
        const auto begin = std::chrono::steady_clock::now();
        const Outcome outcome = kind.call(session, m_Row);
        EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(limit + kSlack));
        if (expected == kFails) {
            EXPECT_NE(0, outcome.status);
        } else {
            EXPECT_EQ(expected, outcome.status);
        }
        EXPECT_TRUE(outcome.status == 0 ? outcome.isWhole : outcome.isEmpty);
        EXPECT_FALSE(HasTemporaryFile());
        store->ClearFaults();
        ExpectCached(outcome.status == 0 && kind.isCached);
        ExpectCached(kind.isCached);  // by now
    }

    // The same call again works, and asks the service when its answer is not cached.
    void ExpectCached(bool isCached)
    {
        store->ClearLog();
        const Outcome outcome = GetParam().call(session, m_Row);
        EXPECT_EQ(0, outcome.status);
        EXPECT_TRUE(outcome.isWhole);
        EXPECT_EQ(isCached, store->Log().empty());
    }

    int m_Row = 9;
};
