
#include <atomic>
#include <fstream>
#include <thread>

#include "Store.h"
#include "TempFolder.h"

namespace {

using Session = Store;

void Cache(ZV_WS_SetupParams& setup, CacheType type, unsigned int limit, const char* path = nullptr)
{
    setup.CacheParam = {type, 1, limit, path};
}

TEST_F(Session, SetupIsValidatedBeforeAnythingIsSent)
{
    static const std::string id350(350, 'd'), id351(351, 'd');
    const struct {
        const char* what;
        void (*change)(ZV_WS_SetupParams&);
        ZV_WS_Status status;
    } rows[] = {
        {"no key", [](auto& s) { s.APIKey = nullptr; }, ZV_WS_Status_invalid_param},
        {"empty key", [](auto& s) { s.APIKey = ""; }, ZV_WS_Status_invalid_param},
        {"no id", [](auto& s) { s.DestinationUniqueID = ""; }, ZV_WS_Status_invalid_param},
        {"no user", [](auto& s) { s.UserName = nullptr; }, ZV_WS_Status_invalid_param},
        {"no password", [](auto& s) { s.Password = ""; }, ZV_WS_Status_invalid_param},
        {"longest id", [](auto& s) { s.DestinationUniqueID = id350.c_str(); }, ZV_WS_Status_ok},
        {"too long id", [](auto& s) { s.DestinationUniqueID = id351.c_str(); }, ZV_WS_Status_invalid_param},
        {"file cache without path", [](auto& s) { Cache(s, CacheType_File, 0); }, ZV_WS_Status_invalid_param},
        {"small cache", [](auto& s) { Cache(s, CacheType_Memory, 358399); }, ZV_WS_Status_invalid_param},
        {"smallest cache", [](auto& s) { Cache(s, CacheType_Memory, 358400); }, ZV_WS_Status_ok},
        {"unlimited cache", [](auto& s) { Cache(s, CacheType_Memory, 0); }, ZV_WS_Status_ok},
        {"no cache, any limit", [](auto& s) { Cache(s, CacheType_None, 5); }, ZV_WS_Status_ok},
        {"folder below a file", [](auto& s) { Cache(s, CacheType_File, 0, "/dev/null/cache"); },
         ZV_WS_Status_failed_to_create_cache_folder},
        {"line end in a header value", [](auto& s) { s.ModelCode = "X\r\nEvil: 1"; }, ZV_WS_Status_invalid_param},
    };
    for (const auto& row : rows) {
        store->ClearLog();
        ZV_WS_SetupParams setup = Setup();
        row.change(setup);
        EXPECT_EQ(row.status, Initialize(setup)) << row.what;
        EXPECT_EQ(row.status == ZV_WS_Status_ok, session._pImpl != nullptr) << row.what;
        EXPECT_EQ(row.status == ZV_WS_Status_ok, !store->Log().empty()) << row.what;
        ZV_WS_release(&session);
    }
}

TEST_F(Session, DiscoveryAsksTheDeviceEnvironment)
{
    ZV_WS_SetupParams setup = Setup();
    setup.FirmwareRevision = "F";
    setup.ApplicationRevision = "A";
    setup.ModelCode = "X1";
    ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
    const std::vector<LoggedRequest> log = store->Log();
    ASSERT_EQ(1u, log.size());
    const std::vector<std::pair<std::string, std::string>> parameters = {{"d", "test/device 1"}, {"dt", "48"}};
    EXPECT_EQ(parameters, log[0].children);
    // This order, and nothing else.
    ASSERT_EQ(2u, log[0].headers.size());
    EXPECT_EQ(std::make_pair(std::string("user-agent"), std::string("ZVWSLib")), log[0].headers[0]);
    EXPECT_EQ("host", log[0].headers[1].first);

    ASSERT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getFileType)(&session));
    EXPECT_EQ("ZVSDK: F|A ZVMODEL:X1", Header(store->Log().back(), "user-agent"));
}

// Workers get their sessions while others are at work.
TEST_F(Session, ASessionInTheMiddleOfACallIsDuplicated)
{
    ASSERT_EQ(ZV_WS_Status_ok, Initialize());
    store->ClearLog();
    Fault("authorizeDevice=hold");
    std::thread calling([&] {
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_authorizeDevice, StorefrontAccount::kActivationPin)(&session));
    });
    ASSERT_TRUE(store->WaitForRequests(1));
    ZV_WS_Session copy;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&copy, &session));
    EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getNavigation)(&copy));
    store->ClearFaults();
    calling.join();
    bool isValid = false;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_checkAuthToken(&copy, &isValid));
    EXPECT_TRUE(isValid) << "the copy has the token that came later";
    ZV_WS_release(&copy);
}

// Every answer that is not exactly one digit is production; no answer at all is a failure.
TEST_F(Session, DiscoveryAnswers)
{
    const struct {
        const char* fault;
        ZV_WS_Status status;
        int env;
    } rows[] = {{"discovery=ok", ZV_WS_Status_ok, 7},
                {"discovery=split:200", ZV_WS_Status_ok, 2},
                {"discovery=cut", ZV_WS_Status_ok, 2},
                {"connect=close", ZV_WS_Status_connection_error, 0}};
    StorefrontOptions options;
    options.environment = 7;
    options.gzip = false;
    Open(options);
    for (const auto& row : rows) {
        Fault(row.fault);
        ASSERT_EQ(row.status, Initialize()) << row.fault;
        ZV_WS_EnvID env = ENVID_APISTG;
        ZV_WS_getDeviceEnv(&session, &env);
        EXPECT_EQ(row.env, env) << row.fault;
        ZV_WS_release(&session);
    }
}

TEST_F(Session, NamedEnvironmentsNeedNoDiscovery)
{
    for (const ZV_WS_EnvNum env : {ENVNUM_APISTG, ENVNUM_INTERNALSTG, ENVNUM_PRODUCTION}) {
        ZV_WS_SetupParams setup = Setup();
        setup.EnvNum = env;
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
        EXPECT_EQ(ZV_WS_Status_ok, Asking(ZV_WS_getNavigation)(&session));
        ZV_WS_release(&session);
    }
    for (const LoggedRequest& request : store->Log())
        EXPECT_EQ("browse", request.service);
}

TEST_F(Session, UnknownAccessTypeIsAsked)
{
    ASSERT_EQ(ZV_WS_Status_ok, Initialize(Setup(ACCESS_TYPE_UNKNOWN)));
    EXPECT_EQ(std::vector<std::string>{"getFileType"}, Asked());
    ZV_WS_release(&session);
    Fault("getFileType=http:503");
    EXPECT_EQ(ZV_WS_Status_ok, Initialize(Setup(ACCESS_TYPE_UNKNOWN)));
}

TEST_F(Session, OldTlsIsRefused)
{
    StorefrontOptions options;
    options.oldTls = true;
    Open(options);
    ZV_WS_SetupParams setup = Setup();
    setup.EnvNum = ENVNUM_PRODUCTION;  // without discovery
    ASSERT_EQ(ZV_WS_Status_ok, Initialize(setup));
    EXPECT_EQ(-5030, Asking(ZV_WS_getNavigation)(&session));
    EXPECT_TRUE(store->Log().empty());
}

TEST_F(Session, DuplicatesWorkOnTheirOwn)
{
    ASSERT_EQ(ZV_WS_Status_ok, Initialize());
    ZV_WS_Session copy;
    store->ClearLog();
    ASSERT_EQ(ZV_WS_Status_ok, ZV_WS_duplicate(&copy, &session));
    EXPECT_TRUE(store->Log().empty());
    ZV_WS_release(&session);
    Owned<ZV_WS_GenreArray> genres;
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_getNavigation(&copy, &genres));
    EXPECT_EQ(Number("SELECT COUNT(*) FROM genre"), static_cast<int>(genres.size));
    ZV_WS_release(&copy);
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_duplicate(&copy, &session));
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_release(&copy));
}

TEST_F(Session, DeploymentFileMistakesAreRefused)
{
    const std::string file = store->DataFolder() + "/broken.conf";
    const auto expectRefused = [this](const std::string& deployment, const std::string& complaint) {
        setenv("ZV_DEPLOYMENT", deployment.c_str(), 1);
        testing::internal::CaptureStderr();
        EXPECT_EQ(ZV_WS_Status_file_operation_error, Initialize()) << complaint;
        EXPECT_EQ(0u, testing::internal::GetCapturedStderr().find(complaint));
        EXPECT_EQ(nullptr, session._pImpl);
    };
    for (const char* text : {"production_host localhost\n", "no_such_key = 1\n", "production_host = a b\n",
                             "production_host = localhost:99999\n"}) {
        std::ofstream(file) << "# comment\n\n" << text;
        expectRefused(file, file + ":3: ");
    }
    expectRefused("/nowhere/deployment.conf", "/nowhere/deployment.conf: ");
    std::ofstream(file) << "ca_file = /nowhere/ca.pem\n";
    setenv("ZV_DEPLOYMENT", file.c_str(), 1);
    EXPECT_EQ(ZV_WS_Status_ssl_error, Initialize());
    EXPECT_NE(nullptr, session._pImpl);
    // What is left of it is no session that could ask anything.
    ZV_WS_Session copy;
    EXPECT_EQ(ZV_WS_Status_invalid_param, Asking(ZV_WS_getNavigation)(&session));
    EXPECT_EQ(ZV_WS_Status_invalid_param, Asking(ZV_WS_getBoxArtImage, BOX_ART_SIZE_95, "ZV00012")(&session));
    EXPECT_EQ(ZV_WS_Status_invalid_param, Asking(ZV_WS_getUserAgent)(&session));
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_duplicate(&copy, &session));
}

TEST_F(Session, CallsWithoutASessionTagTheirOutput)
{
    const ZV_WS_Pagination page = Page(1, 5);
    Owned<ZV_WS_TitlesResponse> titles;
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_getTitles(&session, 1, &page, 2, &titles));
    ASSERT_NE(nullptr, titles._pImpl);
    EXPECT_EQ(18u, *titles._pImpl);
    EXPECT_EQ(15u, *titles.Titles._pImpl);
    bool flag = true;
    EXPECT_EQ(ZV_WS_Status_invalid_param, ZV_WS_checkForPurchasedSku(&session, 1, &flag));
    EXPECT_FALSE(flag);
    for (const auto call : {ZV_WS_getDeviceEnv, ZV_WS_getDefaultEnvID}) {
        ZV_WS_EnvID env = ENVID_PRODUCTION;
        EXPECT_EQ(ZV_WS_Status_invalid_param, call(&session, &env));
        EXPECT_EQ(0, env);
    }
    EXPECT_EQ(ZV_WS_Status_ok, ZV_WS_release(nullptr));
}

TEST_F(Session, InstancesThatStartAtOnceShareANewCacheFolder)
{
    const TempFolder folder;
    const int kTogether = 3;
    std::string levels;  // many, so that the instances meet in some of them
    while (levels.size() < 200)
        levels += "/a";
    for (int round = 0; round < 10; ++round) {
        const std::string path = folder / (std::to_string(round) + levels);
        std::atomic<int> ready{0};
        std::vector<ZV_WS_Status> statuses(kTogether, ZV_WS_Status_general_error);
        std::vector<std::thread> threads;
        for (ZV_WS_Status& status : statuses) {
            threads.emplace_back([&] {
                ZV_WS_SetupParams setup = Setup();
                setup.EnvNum = ENVNUM_PRODUCTION;
                Cache(setup, CacheType_File, 0, path.c_str());
                Owned<ZV_WS_Session> own;
                for (++ready; ready < kTogether;)
                    std::this_thread::yield();
                status = ZV_WS_initialize(&own, &setup);
            });
        }
        for (std::thread& thread : threads)
            thread.join();
        EXPECT_EQ(std::vector<ZV_WS_Status>(kTogether, ZV_WS_Status_ok), statuses) << round;
    }
}

}  // namespace
