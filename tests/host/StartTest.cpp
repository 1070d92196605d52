// What the host makes of its arguments and environment before the movie runs.
#include <filesystem>

#include "HostLines.h"
#include "TempFolder.h"

namespace {

#define FILES(start) \
    "configurationFile=/misc/zorvane/" start "credentials.xml&settingsFile=/misc/zorvane/" start "preference.xml"

const struct {
    const char* argument;  // null: none, so that the program's path is the last one
    const char* printed;
    const char* movie;
    const char* flashVars;
} kVariants[] = {{"0", "0", "alpha", FILES("north/alpha") "&defaultCountryID=1&defaultRegionCode=00"},
                 {"1", "1", "alpha", FILES("south/alpha") "&defaultCountryID=41&defaultRegionCode=00"},
                 {"2", "2", "beta", FILES("beta")},
                 {"3rest", "3", "gamma", FILES("gamma")},
                 {"4", "4", "delta", FILES("delta")},
                 {"5", "5", "gen", FILES("gen")},
                 {"6", "6", "gen", FILES("gen")},
                 {"/", "-1", "gen", FILES("gen")},
                 {"", "-48", "gen", FILES("gen")},
                 {nullptr, "-1", "gen", FILES("gen")}};

TEST(VariantTest, ChoosesMovieAndFlashVariables)
{
    const TempFolder folder;
    const std::string movie = folder.Write("movie.js",
                                           "var pairs = []; for (var name in flashvars) "
                                           "pairs.push(name + '=' + flashvars[name]); trace(pairs.join('&'));");
    for (const auto& row : kVariants) {
        const Lines command = row.argument ? Lines{ZV_STAGECRAFT, "first", row.argument} : Lines{ZV_STAGECRAFT};
        // The movie that the player would show is named by the runtime, which does not find it here.
        Process host(command, {});
        EXPECT_EQ(0, host.WaitForEnd());
        EXPECT_EQ(std::string("[ZV_FLASH]ZV UI type = ") + row.printed + " ", host.Output().at(0));
        EXPECT_EQ(Lines{std::string("stagecraft: cannot read the movie /usr/share/zorvane/zvcesdk2_") + row.movie +
                        ".swf: No such file or directory"},
                  host.Errors());
        Process other(command, {{"STAGECRAFT_MOVIE", movie}});
        EXPECT_TRUE(other.WaitForLine(row.flashVars));
        EXPECT_EQ(0, other.WaitForEnd());
    }
    Process replaced({ZV_STAGECRAFT, "0"}, {{"STAGECRAFT_MOVIE", movie}, {"ZV_FLASHVARS", "a=%31&b=x"}});
    EXPECT_TRUE(replaced.WaitForLine("a=1&b=x"));
    EXPECT_EQ(0, replaced.WaitForEnd());
    EXPECT_EQ("** a=%31&b=x **", replaced.Output().at(0));
}

// No file, socket or database of the process takes the place of its console.
TEST(StreamsTest, ClosedOnesAreFilled)
{
    const TempFolder folder;
    Player player(folder / "player");
    Process host({"/bin/sh", "-c", "exec \"$0\" 5 <&- >&- 2>&-", ZV_STAGECRAFT},
                 {{"ZV_IPC_SOCKET", folder / "player"}, {"STAGECRAFT_MOVIE", folder.Write("movie.js", kRunsOn)}});
    player.Accept();
    for (const char* stream : {"0", "1", "2"}) {
        const std::string file = "/proc/" + std::to_string(host.Pid()) + "/fd/" + stream;
        std::error_code none;
        EXPECT_EQ("/dev/null", std::filesystem::read_symlink(file, none)) << stream;
    }
    player.Send(3);
    EXPECT_EQ(Player::Message(4), player.Receive());
    EXPECT_EQ(0, host.WaitForEnd());
}

TEST(DrmTest, FailureStartsNothingElse)
{
    const TempFolder folder;
    const Player player(folder / "player");
    Process host({ZV_STAGECRAFT, "5"}, {{"ZV_IPC_SOCKET", folder / "player"}, {"ZV_DRM_INIT_RESULT", "-7"}});
    EXPECT_EQ(255, WEXITSTATUS(host.WaitForEnd()));
    EXPECT_EQ((Lines{"[ZV_FLASH]ZV UI type = 5 ", "", "[ZV_FLASH] Ipriv_drm_Init fail.ret = -7 "}), host.Output());
    EXPECT_FALSE(player.HasCaller());
}

TEST(DrmTest, FailureAtTheEndIsSaid)
{
    const TempFolder folder;
    Process host({ZV_STAGECRAFT, "5"},
                 {{"STAGECRAFT_MOVIE", folder.Write("movie.js", kEndsAtOnce)}, {"ZV_DRM_TERMINATE_RESULT", "0x1f"}});
    EXPECT_EQ(0, host.WaitForEnd());
    const Lines failure = {"", "[ZV_FLASH] Ipriv_drm_Terminate fail.ret = 31 "};
    EXPECT_TRUE(IsMerge(host.Output(), StartLines() + MovieLines({"hello"}) + failure + ActiveExitLines(),
                        ListenLines({InitMessage(), DoneMessage()})));
}

}  // namespace
