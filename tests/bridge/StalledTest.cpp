// The movie ends while a call hangs in the network, at every stage at which it can hang: soon all the same.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <chrono>

#include "MovieRun.h"
#include "Storefront.h"

namespace {

struct Stage {
    const char* fault;
    const char* method;  // the call that hangs
};

class Stalled : public testing::TestWithParam<Stage> {};

TEST_P(Stalled, TheMovieEndsSoon)
{
    const Stage& stage = GetParam();
    std::string error;
    const auto store = Storefront::Start(StorefrontOptions(), error);
    ASSERT_TRUE(store) << error;
    setenv("ZV_DEPLOYMENT", store->DeploymentFile().c_str(), 1);
    // Connections are made one after the other: the first is the one of "init" unless that makes none.
    ASSERT_TRUE(store->AddFault(stage.fault, error)) << error;
    const bool isInit = std::string(stage.method) == "init";
    const auto started = std::chrono::steady_clock::now();
    const MovieRun run =
        RunMovie(std::string("var ws = new com.orvex.ZVWSLib();"
                             "function call(method, parameters, then) {"
                             "    ws[method]([{onComplete: function () { then(); }}, parameters]); }"
                             "call('init', {APIKey: 'desktop', UserName: 'customer', Password: 'secret',"
                             "    DestinationUniqueID: 'd', DestinationTypeID: 1, AccessType: 2, EnvNum: ") +
                 (isInit ? "3" : "2") + "}, function () { call('" + stage.method +
                 "', {boxartsize: 0, boxartprefix: 'ZV00012'}, function () { report('answered'); quit(); }); });"
                 "setTimeout(function () { report('leaves'); quit(); }, 400);");
    EXPECT_EQ("leaves\n", run.Text());
    EXPECT_LT(std::chrono::steady_clock::now() - started, std::chrono::seconds(3));
}

INSTANTIATE_TEST_SUITE_P(Stages, Stalled,
                         testing::Values(Stage{"connect=stall", "init"}, Stage{"connect=stall-handshake", "init"},
                                         Stage{"discovery=stall", "init"}, Stage{"connect=stall", "getNavigation"},
                                         Stage{"connect=stall-handshake", "getNavigation"},
                                         Stage{"getNavigation=stall", "getNavigation"},
                                         Stage{"getNavigation=stall-body", "getNavigation"},
                                         Stage{"getNavigation=drip:300", "getNavigation"},
                                         Stage{"bandwidth=stall", "checkBandwidth"}));

}  // namespace
