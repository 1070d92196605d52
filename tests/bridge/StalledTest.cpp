// The movie goes on while the services hang, and ends soon while a call does, at every stage at which it can hang.
#include <ctype.h>

#include <chrono>

#include "StoreMovie.h"

namespace {

struct Stage {
    const char* fault;
    const char* method;  // the call that hangs

    // Letters, digits and "_".
    std::string Name() const
    {
        std::string name = std::string(method) + "_" + fault;
        for (char& c : name) {
            if (!isalnum(static_cast<unsigned char>(c))) c = '_';
        }
        return name;
    }
};
void PrintTo(const Stage& stage, std::ostream* stream)
{
    *stream << stage.Name();
}

class Stalled : public StoreMovie, public testing::WithParamInterface<Stage> {};

TEST_P(Stalled, TheMovieEndsSoon)
{
    const Stage& stage = GetParam();
    // Connections are made one after the other: the first is the one of "init" unless that makes none.
    Fault(stage.fault);
    const auto started = std::chrono::steady_clock::now();
    EXPECT_EQ("leaves\n",
              Report(std::string("setup.EnvNum = '") + stage.method + "' === 'init' ? 3 : 2;" +
                     "ready(function () { call(ws, '" + stage.method +
                     "', {boxartsize: 0, boxartprefix: 'ZV00012'}, function () { report('answered'); quit(); }); });"
                     "setTimeout(function () { report('leaves'); quit(); }, 400);"));
    EXPECT_LT(std::chrono::steady_clock::now() - started, std::chrono::seconds(3));
}

INSTANTIATE_TEST_SUITE_P(Stages, Stalled,
                         testing::Values(Stage{"connect=stall", "init"}, Stage{"connect=stall-handshake", "init"},
                                         Stage{"discovery=stall", "init"}, Stage{"connect=stall", "getNavigation"},
                                         Stage{"connect=stall-handshake", "getNavigation"},
                                         Stage{"getNavigation=stall", "getNavigation"},
                                         Stage{"getNavigation=stall-body", "getNavigation"},
                                         Stage{"getNavigation=drip:300", "getNavigation"},
                                         Stage{"bandwidth=stall", "checkBandwidth"}),
                         [](const auto& info) { return info.param.Name(); });

// ---- Methods that answer at once, with nothing under way and beside a call that hangs. Those that are not here reach
// no session: the static ones, which have no instance, getSysInfo and quitFlash.

struct AtOnce {
    const char* method;
    const char* script;  // an expression
    const char* value;
};

class StalledAtOnce : public StoreMovie, public testing::WithParamInterface<AtOnce> {
protected:
    std::string AnswerTo(const std::string& name) override
    {
        if (name != "stall") return StoreMovie::AnswerTo(name);
        Fault("connect=stall,count=5");
        return "";
    }
};

TEST_P(StalledAtOnce, AnswersWithoutTheNetwork)
{
    const AtOnce& method = GetParam();
    const auto started = std::chrono::steady_clock::now();
    EXPECT_EQ(std::string(method.value) + "\n" + method.value + "\nleaves\n",
              Report(std::string("function look() { report(") + method.script +
                     "); }"
                     "ready(function () {"
                     "    answer('stall');"
                     "    look();"
                     "    call(ws, 'getNavigation', {}, function () { report('answered'); });"
                     "    look();"
                     "    setTimeout(function () { report('leaves'); quit(); }, 200);"
                     "});"));
    EXPECT_LT(std::chrono::steady_clock::now() - started, std::chrono::seconds(3));
    EXPECT_EQ("1", AnswerTo("discovery")) << "asked for by init alone";
}

INSTANTIATE_TEST_SUITE_P(
    Methods, StalledAtOnce,
    testing::Values(AtOnce{"clone", "new com.orvex.ZVWSLib().clone(ws)", "0"}, AtOnce{"idle", "ws.idle()", "0"},
                    AtOnce{"getUserAgent", "ws.getUserAgent()", "ZVSDK: F|A ZVMODEL:M"},
                    AtOnce{"getDeviceEnv", "ws.getDeviceEnv()", "2"},
                    AtOnce{"getAvailableEnvLists",
                           "ws.getAvailableEnvLists().filter(function (e) { return e.isDefault; })[0].endpoint",
                           "production"},
                    AtOnce{"init again", "ws.init([{}, {}])", "0"}),
    [](const auto& info) {
        std::string name = info.param.method;
        name.erase(std::remove(name.begin(), name.end(), ' '), name.end());
        return name;
    });

// The environment that a movie has chosen is not the service's choice.
TEST_F(StoreMovie, NoEnvironmentIsTheDefaultWithoutHavingAsked)
{
    EXPECT_EQ("0\n0 0\n",
              Report("function count(object) {"
                     "    return object.getAvailableEnvLists().filter(function (e) { return e.isDefault; }).length;"
                     "}"
                     "report(count(ws));"
                     "setup.EnvNum = 2;"
                     "ready(function () {"
                     "    var other = new com.orvex.ZVWSLib(); other.clone(ws);"
                     "    report(count(ws) + ' ' + count(other)); quit();"
                     "});"));
}

}  // namespace
