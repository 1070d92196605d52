// The media player's stand-in, its script class in a movie.
#include "Process.h"
#include "TempFolder.h"

namespace {

// Runs the movie with `p`, a player object, and `say`, which joins its arguments to a line.
Lines Traces(const std::string& movie)
{
    const TempFolder folder;
    const std::string text =
        "var p = new com.orvex.ZVPlayerLibAE();"
        "function say() { trace('> ' + JSON.stringify([].slice.call(arguments))); }" +
        movie;
    Process host({ZV_STAGECRAFT, "5"}, {{"STAGECRAFT_MOVIE", folder.Write("movie.js", text)}});
    EXPECT_EQ(0, host.WaitForEnd());
    EXPECT_EQ(Lines{"movie ended: ok"}, host.Errors());
    Lines traces;
    for (const std::string& line : host.Output()) {
        if (line.compare(0, 2, "> ") == 0) traces.push_back(line.substr(2));
    }
    return traces;
}

TEST(ZVPlayerLibAETest, Codes)
{
    EXPECT_EQ(
        (Lines{"[-1,-1,-1,-1,-1,-1,-1]", "[0,-2,-2,-2,-2,-2,0]", "[-3,-3,-3,-3,-3,-3]", "[0,-2,1,0,1500,0]",
               "[-3,-3,-3,-3,1]", "[-3,-3,-3,-3,0,3]", "[-3,0,0,-3,0,false]", "[[0,1,2,3],\"desktop 1.0\"]", "[0,0,-2]",
               "[0,-1,-1]"}),
        Traces(
            "say(p.Shutdown(), p.CreatePlayer('a'), p.ReleasePlayer(), p.Play(), p.GetPlaybackState(),"
            "    p.RegisterEventHandler({}), p.set3DMode(1));"
            "say(p.Initialize(), p.Play(), p.Pause(), p.Stop(), p.GetDuration(), p.ReleasePlayer(),"
            "    p.GetPlaybackState());"
            "say(p.CreatePlayer(), p.CreatePlayer(''), p.CreatePlayer(5), p.CreatePlayer('a', 0),"
            "    p.CreatePlayer('a', 'b'), p.CreatePlayer('a', NaN));"
            "say(p.CreatePlayer('a', 1500), p.CreatePlayer('b'), p.GetPlaybackState(), p.GetPlaybackTime(),"
            "    p.GetDuration(), p.GetCurrentBandwidth());"
            "say(p.Play(-1), p.Play(1501), p.Play('x'), p.Play(Infinity), p.GetPlaybackState());"
            "say(p.set3DMode(), p.set3DMode(-1), p.set3DMode(4), p.set3DMode(1.5), p.set3DMode(3),"
            "    p.getConfigured3DFormat());"
            "say(p.THX_ProcessContentDescriptors(), p.THX_ProcessContentDescriptors('d'), p.SetLogAreaIDsConfig([1]),"
            "    p.RegisterEventHandler(5), p.RegisterEventHandler(null), p.THX_IsSupportedOnDevice());"
            "say(p.getSupported3DFormats(), p.GetVersion());"
            "say(p.Stop(), p.ReleasePlayer(), p.ReleasePlayer());"
            "say(p.Shutdown(), p.GetPlaybackState(), p.set3DMode(1));"));
}

// The registered handler keeps the movie running until the film has ended, and no longer.
TEST(ZVPlayerLibAETest, Events)
{
    EXPECT_EQ((Lines{"[2]", "[3,true]", "[4,3600000]", "[1,0]"}),
              Traces("p.Initialize(); p.CreatePlayer('a', 3600000);"
                     "var resumed = false;"
                     "p.RegisterEventHandler({onPlayerEvent: function (state, position) {"
                     "    if (state === 2 && !resumed) { say(state); p.Pause(); }"
                     "    if (state === 3) { say(state, position < 3600000); resumed = true; p.Play(3599990); }"
                     "    if (state === 4) { say(state, position); p.Stop(); }"
                     "    if (state === 1) say(state, position);"
                     "}});"
                     "p.Play();"));
}

}  // namespace
