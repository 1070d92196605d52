// How movies end, and how a stop request ends them.
#include <algorithm>
#include <atomic>
#include <chrono>
#include <future>

#include "RuntimeFixture.h"

namespace {

TEST_F(RuntimeTest, MoviesEndAndNothingFollows)
{
    const struct {
        const char* pScript;
        Lines expected;
    } rows[] = {
        {"probe.log('script');", {"script"}},
        {"quit(); probe.log('runs on'); setTimeout(function() { probe.log('never'); }, 0); probe.startUpdates();",
         {"runs on"}},
        {"probe.run('end'); probe.log('runs on'); probe.startUpdates();", {"runs on"}},
        {"probe.run('stop'); probe.log('runs on'); probe.startUpdates();", {"runs on"}},
        {"setInterval(function() { quit(); probe.log('timer'); }, 0); setInterval(function() { probe.log('never'); }, "
         "0);",
         {"timer"}},
        {"setTimeout(function() { probe.run('stop'); probe.log('on'); }, 0);"
         "setTimeout(function() { probe.log('never'); }, 0);",
         {"on"}},
        {"var other = new Probe(); probe.startUpdates(); other.startUpdates();"
         "setTimeout(function() { probe.log('never'); }, 0);",
         {"end in update"}},
    };
    Probe::s_run = [&](const Invocation& call) {
        AEString how;
        call.object.ToText(call.arguments[0], how);
        if (how == "end") call.pWindow->EndMovie();
        if (how == "stop") m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    };
    Probe::s_onUpdate = [](const Invocation& call) {
        Probe::s_lines.push_back("end in update");
        call.pWindow->EndMovie();
    };
    for (const auto& row : rows) {
        EXPECT_EQ(Logged(row.pScript), row.expected) << row.pScript;
    }
}

TEST_F(RuntimeTest, AfterTheEndNothingIsCalled)
{
    ASValue held;
    Probe::s_run = [&](const Invocation& call) { held = call.arguments[0]; };
    WriteMovie("probe.run({f: function() { probe.log('never'); }, v: 5});");
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    ASSERT_EQ(Run().m_nErrorValue, AEError::OK);
    ASValue result;
    EXPECT_FALSE(held.GetObject()->Call("f", {}, result));
    EXPECT_EQ(held.GetObject()->GetInt("v"), 5);
    held = ASValue();
    EXPECT_EQ(Probe::s_lines, Lines{});
}

TEST_F(RuntimeTest, AStopRequestBeforeTheRunStopsTheMovie)
{
    WriteMovie("probe.log('never');");
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    EXPECT_EQ(Run().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Probe::s_lines, Lines{});
}

TEST_F(RuntimeTest, OtherRequestsDoNothing)
{
    // Without a set; then for a set that is gone; then unknown codes.
    m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    EXPECT_EQ(Logged("probe.log('one');"), Lines{"one"});
    m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    EXPECT_EQ(Logged("probe.log('two');"), Lines{"two"});
    Probe::s_run = [&](const Invocation&) {
        for (const uint32_t code : {0u, 0x400000u, 0x400101u, 0xFFFFFFFFu}) {
            m_pRuntime->SendRequest(code);
        }
    };
    EXPECT_EQ(Logged("probe.run(); setTimeout(function() { probe.log('three'); }, 0);"), Lines{"three"});
}

TEST_F(RuntimeTest, AStopRequestFromAnotherThreadEndsTheMovie)
{
    std::promise<void> ticking;
    int updates = 0;
    Probe::s_onUpdate = [&](const Invocation&) {
        if (++updates == 2) ticking.set_value();
    };
    std::thread listener([&] {
        ticking.get_future().wait();
        m_pRuntime->SendRequest(IStagecraft::kRequestStop);
        m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    });
    Logged("probe.startUpdates(); setInterval(function() {}, 0);");
    listener.join();
    EXPECT_GE(updates, 2);
}

TEST_F(RuntimeTest, AStopRequestComesBeforeTheNextTick)
{
    const Environment slow("STAGECRAFT_FPS", "1");
    std::promise<void> running;
    Probe::s_run = [&](const Invocation&) { running.set_value(); };
    std::thread listener([&] {
        running.get_future().wait();
        m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    });
    EXPECT_EQ(Logged("setTimeout(function() { probe.log('never'); }, 0); probe.run();"), Lines{});
    listener.join();
}

// Requests that meet the start and the end of movies.
TEST_F(RuntimeTest, StopRequestsAtAnyTime)
{
    std::atomic<bool> done{false};
    std::thread listener([&] {
        while (!done) {
            m_pRuntime->SendRequest(IStagecraft::kRequestStop);
            std::this_thread::yield();
        }
    });
    for (int round = 0; round < 20; ++round) {
        Logged("probe.startUpdates(); setInterval(function() {}, 0);");
    }
    done = true;
    listener.join();
}

// ---- Scripts that never return

struct EndlessScript {
    const char* pName;
    const char* pScript;  // calls probe.run() where it begins to be endless
};

void PrintTo(const EndlessScript& script, std::ostream* pOut)
{
    *pOut << script.pScript;
}

class EndlessTest : public RuntimeTest, public ::testing::WithParamInterface<EndlessScript> {};

TEST_P(EndlessTest, IsBrokenOffByAStopRequest)
{
#if defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "ThreadSanitizer holds signals back until the thread calls the C library";
#endif
    std::promise<void> endless;
    ASValue held;
    Probe::s_run = [&](const Invocation& call) {
        if (call.arguments.empty()) {
            endless.set_value();
        } else {  // the script below native code does not return: neither does this call succeed
            held = call.arguments[0];
            ASValue result;
            EXPECT_FALSE(held.GetObject()->Call("f", {}, result));
            EXPECT_FALSE(held.GetObject()->GetProperty("v", result));
            Probe::s_lines.push_back("native code goes on");
        }
    };
    Probe::s_onUpdate = [](const Invocation& call) {
        ASValue result;
        EXPECT_FALSE(call.object.Call("f", {}, result));
        Probe::s_lines.push_back("native code goes on");
    };
    std::thread listener([&] {
        endless.get_future().wait();
        m_pRuntime->SendRequest(IStagecraft::kRequestStop);
        m_pRuntime->SendRequest(IStagecraft::kRequestStop);
    });
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(Play(GetParam().pScript).m_nErrorValue, AEError::Generic);
    listener.join();
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(30));
    EXPECT_EQ(m_errors.rfind("script error: ", 0), 0u) << m_errors;
    EXPECT_EQ(std::count(Probe::s_lines.begin(), Probe::s_lines.end(), "never"), 0);
    if (held.IsObject()) {
        EXPECT_EQ(Probe::s_lines, Lines{"native code goes on"});
    }
    held = ASValue();

    // The runtime is as good as new.
    EXPECT_EQ(Logged("probe.log('again');"), Lines{"again"});
}

INSTANTIATE_TEST_SUITE_P(
    Scripts, EndlessTest,
    ::testing::Values(
        EndlessScript{"Empty", "probe.run(); for (;;) {} probe.log('never');"},
        EndlessScript{"Catching", "probe.run(); for (;;) { try { throw 1; } catch (e) {} finally { continue; } }"},
        EndlessScript{"Allocating",
                      "probe.run(); for (;;) { var a = [{}, 'x' + a].concat([1, 2]); a = String(a).length; }"},
        EndlessScript{"CallingNative", "probe.run(); for (;;) { probe.name(); }"},
        EndlessScript{"InATimer",
                      "setTimeout(function() { probe.run(); for (;;) {} }, 0);"
                      "setTimeout(function() { probe.log('never'); }, 0);"},
        EndlessScript{"InAnUpdate", "probe.f = function() { probe.run(); for (;;) {} }; probe.startUpdates();"},
        EndlessScript{"BelowNative",
                      "probe.run({v: 1, f: function() { probe.run(); for (;;) {} }}); probe.log('never');"},
        EndlessScript{"InAConstructor",
                      "function F() { probe.run(); for (;;) {} } try { new F(); } finally { probe.log('never'); }"}),
    [](const testing::TestParamInfo<EndlessScript>& info) { return info.param.pName; });

}  // namespace
