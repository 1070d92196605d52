// The movie ends while a call hangs in the network, at every stage at which it can hang: soon all the same.
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

}  // namespace
