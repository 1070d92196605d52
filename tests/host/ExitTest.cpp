// Every way in which the host ends, with the whole console output and the messages that the player system gets.
#include <errno.h>
#include <sys/stat.h>

#include <chrono>
#include <filesystem>
#include <fstream>

#include "HostConsole.h"
#include "HostLines.h"
#include "IpcChannel.h"
#include "Storefront.h"
#include "TempFolder.h"

namespace {

class ExitTest : public testing::Test {
protected:
    Environment WithMovie(const std::string& movie)
    {
        return {{"ZV_IPC_SOCKET", m_Folder / "player"}, {"STAGECRAFT_MOVIE", m_Folder.Write("movie.js", movie)}};
    }

    // Everything that the player system must have got, up to the end of the connection.
    void ExpectReceived(const std::vector<uint32_t>& types)
    {
        for (const uint32_t type : types) {
            EXPECT_EQ(Player::Message(type), m_Player.Receive());
        }
        EXPECT_EQ("", m_Player.Receive());
    }

    TempFolder m_Folder;
    Player m_Player{m_Folder / "player"};
};

TEST_F(ExitTest, ActiveExit)
{
    Process host({ZV_STAGECRAFT, "5"}, WithMovie(kEndsAtOnce));
    m_Player.Accept();
    m_Player.Send(1);
    EXPECT_EQ(Player::Message(5), m_Player.Receive());
    m_Player.Send(6);
    EXPECT_EQ(0, host.WaitForEnd());
    EXPECT_TRUE(IsMerge(host.Output(), StartLines() + MovieLines({"hello"}) + ActiveExitLines(),
                        ListenLines({InitMessage(), DoneMessage()})));
    EXPECT_EQ(Lines{"movie ended: ok"}, host.Errors());
    ExpectReceived({});
}

// Nothing follows the line that says what the movie did, not even what comes after the runtime is gone.
TEST_F(ExitTest, TheErrorStreamEndsWithWhatTheMovieDid)
{
    const std::pair<const char*, const char*> rows[] = {{"", "ok"},
                                                        {"throw new Error('1');", "script error"},
                                                        {"setTimeout(nothing, 0);", "script error"},
                                                        {"setTimeout(function () { nothing(); }, 0);", "script error"}};
    for (const auto& [movie, end] : rows) {
        Process host({ZV_STAGECRAFT, "5"}, WithMovie(movie));
        m_Player.Accept();
        ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] ZV FLASH Run End "));
        m_Player.SendBytes("x");
        m_Player.Send(6);
        EXPECT_EQ(0, host.WaitForEnd());
        const Lines errors = host.Errors();
        ASSERT_GE(errors.size(), 2u);
        EXPECT_EQ("player: dropped a packet of 1 bytes, a message has 16", errors[errors.size() - 2]);
        EXPECT_EQ(std::string("movie ended: ") + end, errors.back());
        m_Player.Close();
    }
}

TEST_F(ExitTest, ActiveExitThatNobodyAcknowledges)
{
    Process host({ZV_STAGECRAFT, "5"}, WithMovie(kEndsAtOnce));
    m_Player.Accept();
    EXPECT_EQ(0, host.WaitForEnd());
    ExpectReceived({5});
}

// Nothing that the network does keeps the process: it is gone within three seconds, and the player system hears of it.
TEST_F(ExitTest, RequestedCloseWhileACallHangs)
{
    const struct {
        const char* fault;
        size_t requests;  // that the store has seen when the fault bites
    } rows[] = {{"connect=stall", 1},       {"discovery=stall", 1},          {"getFileType=stall", 2},
                {"getNavigation=stall", 3}, {"getNavigation=stall-body", 3}, {"getNavigation=drip:200", 3}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fault);
        std::string error;
        const auto store = Storefront::Start(StorefrontOptions(), error);
        ASSERT_TRUE(store && store->AddFault(row.fault, error)) << error;
        Environment environment = WithMovie(
            "var ws = new com.orvex.ZVWSLib();"
            "ws.init([{onComplete: function () { ws.getNavigation([{}, {}]); }}, {APIKey: 'desktop', UserName: "
            "'customer',"
            "    Password: 'secret', DestinationUniqueID: 'd', DestinationTypeID: 1, EnvNum: 3}]);"
            "setInterval(function () {}, 10);");
        environment.emplace_back("ZV_DEPLOYMENT", store->DeploymentFile());
        Process host({ZV_STAGECRAFT, "5"}, environment);
        m_Player.Accept();
        ASSERT_TRUE(store->WaitForRequests(row.requests));
        const auto asked = std::chrono::steady_clock::now();
        m_Player.Send(3);
        EXPECT_EQ(0, host.WaitForEnd());
        EXPECT_LT(std::chrono::steady_clock::now() - asked, std::chrono::seconds(3));
        ExpectReceived({4});
        m_Player.Close();
    }
}

// The movie is a FIFO: reading it holds the start up until the close has been requested.
TEST_F(ExitTest, RequestedCloseBeforeTheMovieHasBegun)
{
    Environment environment = WithMovie("");
    environment.back().second = m_Folder / "fifo";
    ASSERT_EQ(0, mkfifo((m_Folder / "fifo").c_str(), 0600));
    Process host({ZV_STAGECRAFT, "5"}, environment);
    m_Player.Accept();
    m_Player.Send(3);
    ASSERT_TRUE(host.WaitForLine("<ZV_FLASH> ipc listener thread main has exit!"));
    std::ofstream(m_Folder / "fifo") << kRunsOn;
    EXPECT_EQ(0, host.WaitForEnd());
    EXPECT_TRUE(IsMerge(host.Output(), StartLines() + MovieLines() + ReleaseLines(), ListenLines({UninitMessage()})));
    ExpectReceived({4});
}

TEST_F(ExitTest, PlayerSystemGoes)
{
    Process host({ZV_STAGECRAFT, "5"}, WithMovie(kRunsOn));
    m_Player.Accept();
    ASSERT_TRUE(host.WaitForLine("running"));
    m_Player.Close();
    EXPECT_EQ(0, host.WaitForEnd());
    const Lines nothingSent = {"[ZV_FLASH] ipc thread already exit, now do nothing! ", "[ZV_FLASH] ZV FLASH Run End "};
    EXPECT_TRUE(IsMerge(host.Output(), StartLines() + MovieLines({"running"}) + FinalizeLines() + nothingSent,
                        ListenLines({ReceiveFailure(ECONNRESET)})));
}

// Whatever came before it: a network error and unknown messages change nothing.
TEST_F(ExitTest, RequestedClose)
{
    Process host({ZV_STAGECRAFT, "5"}, WithMovie(kRunsOn));
    m_Player.Accept();
    ASSERT_TRUE(host.WaitForLine("running"));
    m_Player.Send(7);
    m_Player.SendBytes(std::string(15, 'x'));
    m_Player.Send(2);
    m_Player.SendBytes(Player::Message(3) + "x");
    m_Player.Send(0xFFFFFFFFu);
    m_Player.SendBytes(Player::Message(3).substr(0, 4) + std::string(12, '\x7f'));  // words 1 to 3 do not count
    EXPECT_EQ(0, host.WaitForEnd());
    EXPECT_TRUE(IsMerge(
        host.Output(), StartLines() + MovieLines({"running"}) + ReleaseLines(),
        ListenLines({NetworkErrorMessage(), {"[ZV_FLASH] IPC get 2 "}, {"[ZV_FLASH] IPC get -1 "}, UninitMessage()})));
    EXPECT_EQ((Lines{"player: dropped a packet of 15 bytes, a message has 16",
                     "player: dropped a packet of 17 bytes, a message has 16", "movie ended: stopped"}),
              host.Errors());
    ExpectReceived({4});
}

TEST_F(ExitTest, FloodOfMessages)
{
    Process host({ZV_STAGECRAFT, "5"}, WithMovie(kRunsOn));
    m_Player.Accept();
    ASSERT_TRUE(host.WaitForLine("running"));
    const size_t kMany = 500;  // fewer bytes of output than its pipe holds
    for (size_t i = 0; i < kMany; ++i) {
        m_Player.Send(8);
    }
    m_Player.Send(3);
    EXPECT_EQ(0, host.WaitForEnd());
    std::vector<Lines> messages(kMany, Lines{"[ZV_FLASH] IPC get 8 "});
    messages.push_back(UninitMessage());
    EXPECT_TRUE(IsMerge(host.Output(), StartLines() + MovieLines({"running"}) + ReleaseLines(), ListenLines(messages)));
}

TEST_F(ExitTest, NoQueue)
{
    Environment environment = WithMovie("setInterval(function () {}, 10);");
    environment.front().second = m_Folder / "nobody";
    Process host({ZV_STAGECRAFT, "5"}, environment);
    EXPECT_EQ(0, host.WaitForEnd());
    Lines start = StartLines();
    start.insert(start.begin() + 4, "[ZV_FLASH] zv_stagecraft_ipc_init Error ");
    const Lines nothingSent = {"[ZV_FLASH] ipc thread already exit, now do nothing! ", "[ZV_FLASH] ZV FLASH Run End "};
    EXPECT_TRUE(IsMerge(host.Output(), start + MovieLines() + FinalizeLines() + nothingSent,
                        ListenLines({ReceiveFailure(ENOTCONN)})));
    EXPECT_EQ((Lines{"player: no queue to the player system at " + m_Folder / "nobody" + ": No such file or directory",
                     "movie ended: stopped"}),
              host.Errors());
}

TEST_F(ExitTest, StageWindowSetFails)
{
    Environment environment = WithMovie("");
    environment.back().second = m_Folder / "no movie";
    Process host({ZV_STAGECRAFT, "5"}, environment);
    m_Player.Accept();
    EXPECT_EQ(Player::Message(5), m_Player.Receive());
    m_Player.Send(6);
    EXPECT_EQ(0, host.WaitForEnd());
    EXPECT_TRUE(IsMerge(host.Output(),
                        StartLines() + Lines{"[ZV_FLASH]CreateAndConfigureStageWindowSet fail "} + ActiveExitLines(),
                        ListenLines({DoneMessage()})));
}

// A copy of the program that finds no runtime beside itself; the second time without a queue either.
TEST_F(ExitTest, RuntimeLibraryMissing)
{
    std::filesystem::copy_file(ZV_STAGECRAFT, m_Folder / "zv_stagecraft");
    const Lines arguments = {m_Folder / "zv_stagecraft", "5"};
    Process host(arguments, WithMovie(kEndsAtOnce));
    m_Player.Accept();
    EXPECT_EQ(0, host.WaitForEnd());
    EXPECT_TRUE(IsMerge(host.Output(), StartLines() + ReleaseLines(), ListenLines({ReceiveFailure(ENOTCONN)})));
    EXPECT_EQ(Lines{"Failed to load libIAEKernel.so: libIAEKernel.so: cannot open shared object file: No such file or "
                    "directory"},
              host.Errors());
    ExpectReceived({4});

    Process alone(arguments, {{"ZV_IPC_SOCKET", m_Folder / "nobody"}});
    EXPECT_TRUE(alone.WaitForLine("[ZV_FLASH] IPC:,NETWORK_MSG_STUB_UNINIT_RET failed! ERR = "));
    EXPECT_EQ(0, alone.WaitForEnd());
}

// The console for people plays the other side as scripts do, through pipes.
TEST(PlayerSystemTest, DrivesAHost)
{
    const TempFolder folder;
    const std::string socket = folder / "player";
    Process player({ZV_PLAYER_SYSTEM, socket}, {});
    ASSERT_TRUE(player.WaitForLine("listening"));
    player.Type("init\nnonsense\nneter");
    Process host({ZV_STAGECRAFT, "5"},
                 {{"ZV_IPC_SOCKET", socket}, {"STAGECRAFT_MOVIE", folder.Write("m.js", kRunsOn)}});
    ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] NETWORK_MSG_STUB_INIT !"));
    player.Type("ror\n");
    ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] IPC get 7 "));
    player.Type("uninit\n");
    EXPECT_EQ(0, host.WaitForEnd());
    ASSERT_TRUE(player.WaitForLine("disconnected"));
    player.Type("quit\n");
    EXPECT_EQ(0, player.WaitForEnd());
    EXPECT_EQ((Lines{"listening", "connected", "received 4 NETWORK_MSG_STUB_UNINIT_RET 0 0 0", "disconnected"}),
              player.Output());
    EXPECT_EQ(Lines{"zv_player_system: unknown input \"nonsense\"; known are init, uninit, done, neterror, quit"},
              player.Errors());
    EXPECT_FALSE(std::filesystem::exists(socket));
}

// It waits for a holder and keeps nothing: a second call would block for ever if it did.
TEST(ProcessLockTest, IsNotKept)
{
    testing::internal::CaptureStdout();
    zv_stagecraft_lock_init();
    zv_stagecraft_lock();
    zv_stagecraft_lock();
    zv_stagecraft_lock_uninit();
    const std::string once = "ZV_FLASH] zv_stagecraft_lock enter ! \nZV_FLASH] zv_stagecraft_lock leave ! \n";
    EXPECT_EQ(once + once, testing::internal::GetCapturedStdout());
}

}  // namespace
