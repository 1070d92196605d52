// The plain exchanges, the end and the next start, and the program.
#include <sys/wait.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <map>

#include "Database.h"
#include "Process.h"
#include "RawClient.h"
#include "TempFolder.h"

namespace {

class ServerTest : public StorefrontTest {};

TEST_F(ServerTest, WhatIsNotThereIsSaid)
{
    Begin();
    const std::string image = "/images/boxart/135s/ZV00012135.jpg";
    const Reply first = Plain(image);
    const std::string known = "If-Modified-Since: " + first.Header("Last-Modified") + "\r\n";
    EXPECT_EQ(304, Plain(image, known).status);
    Order("boxart=modified");
    EXPECT_EQ(200, Plain(image, known).status);
    EXPECT_NE(first.body, Plain("/images/boxart/135s/ZV00013135.jpg").body);
    const std::pair<const char*, const char*> rows[] = {
        {"/images/boxart/135/ZV00012135.jpg", "box art has no size 135"},
        {"/images/boxart/96/ZV0001296.jpg", "box art has no size 96"},
        {"/images/boxart/", "box art has no size "},
        {"/images/boxart/135s/ZV00012136.jpg", "box art of that size ends with 135.jpg"},
        {"/images/boxart/95/95.jpg", "box art of that size ends with 95.jpg"},
        {"/images/boxart/95", "box art of that size ends with 95.jpg"},
        {"/images/boxart/95/ZV9999995.jpg", "no title has box art ZV99999"},
        {"/images/boxart/95/zv0001295.jpg", "no title has box art zv00012"},
        {"/device/env/?d=x&dt=48", "nothing is at /device/env/"},
        {"/elsewhere", "nothing is at /elsewhere"}};
    for (const auto& [path, violation] : rows) {
        EXPECT_EQ(404, Plain(path, known).status) << path;
        EXPECT_EQ(violation, LastLogged().violation) << path;
    }
}

// The end comes at once in whatever state connections are.
TEST_F(ServerTest, TheEndDoesNotWaitForConnections)
{
    const auto start = std::chrono::steady_clock::now();
    for (const char* fault : {"stall", "stall-body", "ok,delay=60000", "drip:60000", "endless", "connect=stall",
                              "connect=stall-handshake"}) {
        SCOPED_TRACE(fault);
        Begin();
        const RawClient idle(store->HttpPort(), false);
        const bool early = std::string(fault).compare(0, 7, "connect") == 0;
        Order(early ? fault : std::string("getConfig=") + fault);
        RawClient client(store->HttpsPort(), !early);
        if (!early) {
            ASSERT_TRUE(client.Send(SoapRequest{"StreamAPI", "getConfig"}.Text(store->HttpsPort())));
        }
        ASSERT_TRUE(store->WaitForRequests(1));
        store.reset();
    }
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(60));
}

TEST_F(ServerTest, WhatChangedIsThereAfterARestart)
{
    const TempFolder folder;
    StorefrontOptions options;
    options.dataFolder = folder / "data";
    Begin(options);
    EXPECT_EQ("0", Ask("StreamAPI", "addItemToWishlist", Children({{"TitleID", "21"}})).Element("ResponseCode"));
    EXPECT_EQ("0", Ask("StreamAPI", "setAudioDefaultProperty", Children({{"AudioSetting", "DTS_Express_51"}}))
                       .Element("ResponseCode"));
    const std::string gift = Children({{"GiftCertificateCode", "GIFT2"}});
    EXPECT_EQ("4500", Ask("StreamAPI", "assignGiftCertificateToUser", gift).Element("Balance"));
    store.reset();
    Begin(options);
    EXPECT_EQ("true",
              Ask("RealTimeBrowse", "getTitleListing", Children({{"TitleID", "21"}})).Element("IsAvailInUserWishList"));
    EXPECT_EQ("DTS_Express_51", Ask("StreamAPI", "getAudioDefaultProperty").Element("getAudioDefaultPropertyResult"));
    EXPECT_EQ("4500", Ask("DownloadAPI", "showPrePaidCardBalance").Element("Balance"));
    EXPECT_EQ("1", Ask("StreamAPI", "assignGiftCertificateToUser", gift).Element("ResponseCode"));
    store.reset();
}

class DataFolderTest : public ServerTest {
protected:
    DataFolderTest() { options.dataFolder = folder / "data"; }
    // On the folder's database, while no simulator has it.
    void Run(const char* statement)
    {
        std::string error;
        EXPECT_LE(0, simulator::Database::Open(options.dataFolder + "/storefront.db", error)->Run(statement)) << error;
    }
    std::map<std::string, std::string> Files() const
    {
        std::map<std::string, std::string> files;
        for (const auto& entry : std::filesystem::directory_iterator(options.dataFolder)) {
            std::ifstream file(entry.path(), std::ios::binary);
            files[entry.path().filename()].assign(std::istreambuf_iterator<char>(file), {});
        }
        return files;
    }

    const TempFolder folder;
    StorefrontOptions options;
};

TEST_F(DataFolderTest, OfTheVersionBeforeIsBroughtUpToDate)
{
    Begin(options);
    EXPECT_EQ("0", Ask("StreamAPI", "addItemToWishlist", Children({{"TitleID", "21"}})).Element("ResponseCode"));
    const auto schema = [this] { return store->Rows("SELECT name, sql FROM sqlite_master ORDER BY name"); };
    const auto made = schema();
    const std::string version = store->Query("PRAGMA user_version");
    store.reset();
    Run("DROP INDEX title_prefix");
    Run("DROP INDEX product_title_type");
    Run("CREATE INDEX product_title ON product (title)");
    Run("PRAGMA user_version = 2");
    Begin(options);
    EXPECT_EQ(made, schema());
    EXPECT_EQ(version, store->Query("PRAGMA user_version"));
    EXPECT_EQ("1", store->Query("SELECT COUNT(*) FROM wish WHERE title = 21"));
    store.reset();
}

TEST_F(DataFolderTest, OfAnotherVersionIsRefusedAndStaysAsItIs)
{
    std::filesystem::create_directory(options.dataFolder);
    Run("CREATE TABLE account (user TEXT)");
    const std::pair<const char*, const char*> rows[] = {
        {"PRAGMA user_version = 1", "storefront.db: has tables of version 1, which cannot be brought to 3: remove it"},
        {"PRAGMA user_version = 4",
         "storefront.db: has tables of version 4, and this simulator knows 3: run the newer"}};
    for (const auto& [statement, reason] : rows) {
        Run(statement);
        const auto before = Files();
        EXPECT_EQ(1u, before.size());
        std::string error;
        EXPECT_FALSE(Storefront::Start(options, error));
        EXPECT_NE(std::string::npos, error.find(reason)) << error;
        EXPECT_EQ(std::string::npos, error.find('\n'));
        EXPECT_TRUE(before == Files());
    }
}

// Statements are kept, and are no other's when they are used inside of themselves.
TEST(DatabaseTest, AStatementMayBeUsedInsideOfItself)
{
    std::string error;
    const auto database = simulator::Database::Open(":memory:", error);
    database->Run("CREATE TABLE number (value INTEGER)");
    for (const int value : {1, 2, 3})
        database->Run("INSERT INTO number VALUES (?)", {value});
    std::function<std::string(int)> below = [&](int most) {
        std::string text;
        database->Each("SELECT value FROM number WHERE value < ? ORDER BY value", {most},
                       [&](const simulator::Database::Row& row) { text += row.Text(0) + below(row.Int(0)); });
        return text;
    };
    for (int i = 0; i < 2; ++i)
        EXPECT_EQ("1213121", below(4));
    {
        simulator::Database::Transaction transaction(*database);
        database->Run("DELETE FROM number");
        transaction.Undo();
    }
    EXPECT_EQ("1213121", below(4));
}

TEST(ProgramTest, SaysWhereItServesAndEndsOnATermSignal)
{
    Process program({STOREFRONT_PROGRAM}, {});
    ASSERT_TRUE(program.WaitForLine("ready"));
    const std::string file = program.Output().at(2).substr(strlen("deployment file "));
    EXPECT_TRUE(std::filesystem::exists(file)) << file;
    kill(program.Pid(), SIGTERM);
    EXPECT_EQ(0, program.WaitForEnd());
    EXPECT_FALSE(std::filesystem::exists(file)) << "the temporary folder is gone";
}

TEST_F(ServerTest, TheProgramRefusesWithOneLineAndItsOwnCode)
{
    Begin();
    const std::string taken = std::to_string(store->HttpPort());
    const TempFolder old;
    std::ofstream(old / "storefront.db") << "no database";
    const struct {
        Lines arguments;
        int code;
        std::string text;
    } rows[] = {{{"--port", "1"}, 2, "unknown option --port"},
                {{"--latency"}, 2, "--latency needs MS"},
                {{"--latency", "soon"}, 2, "--latency needs MS"},
                {{"--https-port", "65536"}, 2, "--https-port needs N"},
                {{"--largest-page", "-1"}, 2, "--largest-page needs N"},
                {{"--proxy-user", ":secret"}, 2, "--proxy-user needs USER:PASSWORD"},
                {{"--certificate", "bad"}, 2, "--certificate needs KIND"},
                {{"--clock", "1h"}, 2, "--clock needs SECONDS"},
                {{"--valid-from", "2026-02-29T00:00:00Z"}, 2, "--valid-from needs TIME"},
                {{"--fault", "getConfig=sever"}, 1, "sever"},
                {{"--http-port", taken}, 1, "port " + taken},
                {{"--proxy-port", taken}, 1, "port " + taken},
                {{"--data", "/proc/storefront"}, 1, "/proc/storefront"},
                {{"--data", old / ""}, 1, "storefront.db: cannot open the database"}};
    for (const auto& row : rows) {
        Process program(Lines{STOREFRONT_PROGRAM} + row.arguments, {});
        EXPECT_EQ(row.code, WEXITSTATUS(program.WaitForEnd())) << row.text;
        ASSERT_EQ(1u, program.Errors().size()) << row.text;
        EXPECT_NE(std::string::npos, program.Errors()[0].find(row.text)) << program.Errors()[0];
    }
}

}  // namespace
