// Every fault of a connection or an answer against one call of each kind: the call ends in its time and with its
// status, takes little memory, leaves nothing in the cache, and the next call of the same session works.
#include <chrono>
#include <filesystem>
#include <fstream>

#include "Process.h"
#include "SessionImpl.h"
#include "Store.h"
#include "TempFolder.h"

namespace {

using std::chrono::seconds;
using std::chrono::steady_clock;

constexpr int kTimeout = 1;        // seconds, of the sessions here
constexpr int kClockTimeout = 30;  // the clock has no session, and a timeout of its own
constexpr int kEnvironment = 1;    // what discovery answers: not what it falls back to
constexpr int kSlack = 3;          // for a busy machine

// Instead of a status:
constexpr int kCannot = 1;      // the fault cannot happen to that call, or may be none
constexpr int kFails = 2;       // where the failure is seen first is a matter of timing
constexpr int kProduction = 3;  // discovery: the answer cannot be used, so production it is

// A call's result must be whole when it succeeds, and empty when it fails.
struct Outcome {
    int status;
    bool isWhole;
    bool isEmpty;
};

// `n` makes every row's call another one, so that none is answered by what an earlier row left in the cache.
Outcome Browse(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_TitleListingResponse> listing;
    const ZV_WS_Status status = ZV_WS_getTitleListing(&session, n, &listing);
    return {status, listing.TitleID == n, listing.TitleID == 0 && !listing.Synopsis};
}

Outcome Videos(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_MyVideosResponse> videos;
    const ZV_WS_Pagination page = Page(1, static_cast<unsigned int>(n));
    const ZV_WS_Status status =
        ZV_WS_getMyVideos(&session, &page, PURCHASE_TYPE_ANY, TITLE_TYPE_FILTER_ANY, 0, &videos);
    return {status, videos.Titles.size > 0, videos.Titles.size == 0};
}

Outcome Discovery(ZV_WS_Session& session, int)
{
    ZV_WS_EnvID environment = {};
    const ZV_WS_Status status = ZV_WS_getDefaultEnvID(&session, &environment);
    if (status == ZV_WS_Status_ok && environment == ENVID_PRODUCTION) return {kProduction, false, true};
    return {status, environment == kEnvironment, environment == 0};
}

Outcome ServerTime(ZV_WS_Session&, int)
{
    time_t now = 0;
    const ZV_WS_Status status = ZV_WS_getServerTime(&now);
    return {status, now > 0, now == -1};
}

Outcome Bandwidth(ZV_WS_Session& session, int)
{
    unsigned int bits = 1;
    const ZV_WS_Status status = ZV_WS_checkBandwidth(&session, &bits);
    return {status, bits > 0, bits == 0};
}

// Of the catalogue's title with that number.
std::string PrefixOf(int n)
{
    const std::string digits = std::to_string(n);
    return "ZV" + std::string(5 - digits.size(), '0') + digits;
}

Outcome BoxArtFile(ZV_WS_Session& session, int n)
{
    Owned<ZV_WS_String> file;
    const ZV_WS_Status status = ZV_WS_getBoxArtImage(&session, BOX_ART_SIZE_95, PrefixOf(n).c_str(), &file);
    return {status, file.data && std::filesystem::file_size(file.data) > 0, !file.data};
}

Outcome BoxArtBytes(ZV_WS_Session& session, int n)
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

const Kind kKinds[] = {
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

bool IsTls(const Kind& kind)
{
    return kind.column == kSoap || kind.column == kDiscovery;
}

const struct {
    const char* fault;
    int statuses[5];  // by column
} kRows[] = {
    // clang-format off
    //                    SOAP   discovery    clock    bandwidth  box art
    {"http:302",        {-4302,  kProduction, -1001,   -1001,     -1001}},
    {"http:404",        {-4404,  kProduction, -1001,   -1901,     -1901}},
    {"http:503",        {-4503,  kProduction, -1001,   -1001,     -1001}},
    {"cut",             {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"cut-header",      {kFails, kProduction, -1001,   -1001,     -1001}},
    {"cut-body",        {kFails, kProduction, -1004,   0,         -1001}},  // bandwidth: half is enough to measure
    {"reset",           {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"no-http",         {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"garbage",         {-4200,  kProduction, -1004,   0,         0}},      // bytes are bytes
    {"empty",           {-4200,  kProduction, -1001,   -1001,     -1001}},
    {"zero-length",     {-4200,  kProduction, -1001,   -1001,     -1001}},
    {"no-length",       {0,      kProduction, -1001,   -1001,     -1001}},
    {"short",           {0,      kProduction, -1004,   0,         -1001}},
    {"long",            {0,      0,           0,       0,         0}},
    {"split",           {0,      kCannot,     kCannot, 0,         0}},      // one receive takes one part or both
    {"endless",         {kFails, kProduction, -1001,   -1001,     -1001}},
    {"bomb:8",          {kFails, kProduction, -1004,   0,         0}},
    {"damaged-gzip",    {kFails, kProduction, -1004,   0,         0}},
    {"wrong-checksum",  {kFails, kProduction, -1004,   0,         0}},
    {"stall",           {-2012,  kProduction, -1001,   -1001,     -1001}},
    {"stall-body",      {kFails, kProduction, -1004,   0,         -1001}},
    {"drip:100",        {kFails, kProduction, -1001,   -1001,     -1001}},
    {"fault11",         {-6012,  kCannot,     kCannot, kCannot,   kCannot}},
    {"fault12",         {-6012,  kCannot,     kCannot, kCannot,   kCannot}},
    {"soap12",          {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"code:3",          {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"missing-result",  {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"unknown-enum",    {-1004,  kCannot,     kCannot, kCannot,   kCannot}},
    {"must-understand", {-6008,  kCannot,     kCannot, kCannot,   kCannot}},
    {"extra-header",    {0,      kCannot,     kCannot, kCannot,   kCannot}},
    {"not-modified",    {kCannot, kCannot,    kCannot, kCannot,   -1902}},
    {"modified",        {kCannot, kCannot,    kCannot, kCannot,   0}},
    // clang-format on
};

class FaultMatrix : public Store, public testing::WithParamInterface<Kind> {
protected:
    // A session of the kind with short timeouts, whose service is told by ZV_DEPLOYMENT.
    void Begin(const std::string& cache)
    {
        ZV_WS_SetupParams setup = Setup(GetParam().access);
        setup.CacheParam.Type = GetParam().cache;
        setup.CacheParam.Data = 7;
        setup.CacheParam.Path = cache.c_str();
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
        EachTransport([](Transport& transport) { transport.SetTimeouts(kTimeout, kTimeout); });
    }

    void SetUp() override
    {
        StorefrontOptions options;
        options.environment = kEnvironment;
        Open(options);
        ASSERT_NO_FATAL_FAILURE(Begin(store->DataFolder() + "/cache"));
    }

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
        for (const auto& entry : std::filesystem::directory_iterator(store->DataFolder() + "/cache", none)) {
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
        const auto begin = steady_clock::now();
        const Outcome outcome = kind.call(session, m_Row);
        EXPECT_LT(steady_clock::now() - begin, seconds(limit + kSlack));
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

TEST_P(FaultMatrix, OfAnswers)
{
    const Kind& kind = GetParam();
    for (const auto& row : kRows) {
        if (row.statuses[kind.column] == kCannot) continue;
        SCOPED_TRACE(row.fault);
        // Twice: a read is sent again when a kept connection turns out dead.
        Fault(std::string(kind.operation) + "=" + row.fault + ",count=2");
        ExpectOutcome(row.statuses[kind.column]);
    }
}

TEST_P(FaultMatrix, OfConnections)
{
    const Kind& kind = GetParam();
    if (IsTls(kind)) {
        const int refused = kind.column == kDiscovery ? -1001 : -5030;
        for (const char* fault : {"stall", "stall-handshake", "close", "no-http", "reset"}) {
            SCOPED_TRACE(fault);
            ReconnectNext();
            Fault(std::string("connect=") + fault);
            ExpectOutcome(strcmp(fault, "reset") == 0 ? kFails : refused);
        }
        for (const CertificateKind certificate :
             {CertificateKind::Untrusted, CertificateKind::Expired, CertificateKind::WrongName,
              CertificateKind::WideWildcard, CertificateKind::NameOnly}) {
            SCOPED_TRACE(static_cast<int>(certificate));
            ReconnectNext();
            store->SetCertificate(certificate);
            store->ClearLog();
            EXPECT_EQ(refused, kind.call(session, ++m_Row).status);
            EXPECT_TRUE(store->Log().empty());
            store->SetCertificate(CertificateKind::Good);
            ExpectCached(false);
        }
    }
    ReconnectNext();
    store.reset();
    const Outcome outcome = kind.call(session, ++m_Row);
    EXPECT_EQ(kind.column == kDiscovery ? -1001 : -2011, outcome.status);
    EXPECT_TRUE(outcome.isEmpty);
}

// Sanitizers keep what is freed, and shadows of all.
#ifndef ZV_SANITIZED

long KilobytesOf(const char* name)
{
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(name, 0) == 0) return atol(line.c_str() + strlen(name));
    }
    return -1;
}

// The store is another process here, since it makes what is too large.
class HugeAnswers : public FaultMatrix {
protected:
    void SetUp() override
    {
        m_Store = std::make_unique<Process>(Faults(), Environment());
        ASSERT_TRUE(m_Store->WaitForLine("ready"));
        setenv("ZV_DEPLOYMENT", (m_Folder / "deployment.conf").c_str(), 1);
        ASSERT_NO_FATAL_FAILURE(Begin(m_Folder / "cache"));
    }

    Lines Faults() const
    {
        Lines arguments = {ZV_STOREFRONT, "--data", m_Folder / ""};
        for (const char* fault : {"=ok", "=bomb:64", "=endless"})
            arguments = arguments + Lines{"--fault", std::string(GetParam().operation) + fault};
        return arguments + Lines{"--environment", std::to_string(kEnvironment)};
    }

    TempFolder m_Folder;
    std::unique_ptr<Process> m_Store;
};

TEST_P(HugeAnswers, TakeLittleMemory)
{
    for (int n = 10; n < 13; ++n) {
        std::ofstream("/proc/self/clear_refs") << 5;  // starts the peak anew
        const long before = KilobytesOf("VmRSS:");
        GetParam().call(session, n);
        EXPECT_LT(KilobytesOf("VmHWM:") - before, 32 << 10) << n;
    }
    EXPECT_EQ(0, GetParam().call(session, 12).status);
}

INSTANTIATE_TEST_SUITE_P(Kinds, HugeAnswers, testing::ValuesIn(kKinds),
                         [](const auto& info) { return std::string(info.param.name); });

#endif

INSTANTIATE_TEST_SUITE_P(Kinds, FaultMatrix, testing::ValuesIn(kKinds),
                         [](const auto& info) { return std::string(info.param.name); });

}  // namespace
