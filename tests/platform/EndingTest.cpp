// How movies end, and how a stop request ends them.
#include <atomic>
#include <future>

#include "RuntimeFixture.h"

namespace {

TEST_F(RuntimeTest, MoviesEndAndNothingFollows)
{
    const std::pair<const char*, Lines> rows[] = {
        {"probe.log('script');", {"script"}},
        {"quit(); probe.log('on'); setTimeout(function() { probe.log('never'); }, 0); probe.startUpdates();", {"on"}},
        {"probe.run('end'); probe.log('on'); probe.startUpdates();", {"on"}},
        {"probe.run('stop'); probe.log('on'); probe.startUpdates();", {"on"}},
        {"setInterval(function() { quit(); probe.log('on'); }, 0); setInterval(function() { probe.log('never'); }, 0);",
         {"on"}},
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
        if (how == "stop") m_PRuntime->SendRequest(IStagecraft::kRequestStop);
    };
    Probe::s_onUpdate = [](const Invocation& call) {
        Probe::s_lines.push_back("end in update");
        call.pWindow->EndMovie();
    };
    for (const auto& [pScript, expected] : rows)
        EXPECT_EQ(Logged(pScript), expected) << pScript;
}

// Before there is a set, when it is gone, and before it runs; and unknown codes.
TEST_F(RuntimeTest, StopRequestsAreForTheSetThatIsThere)
{
    m_PRuntime->SendRequest(IStagecraft::kRequestStop);
    EXPECT_EQ(Logged("probe.log('one');"), Lines{"one"});
    m_PRuntime->SendRequest(IStagecraft::kRequestStop);
    EXPECT_EQ(Logged("probe.log('two');"), Lines{"two"});
    Probe::s_run = [&](const Invocation&) {
        for (const uint32_t code : {0u, 0x400000u, 0x400101u, 0xFFFFFFFFu}) {
            m_PRuntime->SendRequest(code);
        }
    };
    EXPECT_EQ(Logged("probe.run(); setTimeout(function() { probe.log('three'); }, 0);"), Lines{"three"});
    WriteMovie("probe.log('never');");
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    m_PRuntime->SendRequest(IStagecraft::kRequestStop);
    EXPECT_EQ(Run().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Probe::s_lines, Lines{"three"});
}

TEST_F(RuntimeTest, AStopRequestComesBeforeTheNextTick)
{
    setenv("STAGECRAFT_FPS", "1", 1);
    std::promise<void> running;
    Probe::s_run = [&](const Invocation&) { running.set_value(); };
    std::thread listener([&] {
        running.get_future().wait();
        m_PRuntime->SendRequest(IStagecraft::kRequestStop);
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
            m_PRuntime->SendRequest(IStagecraft::kRequestStop);
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

TEST_F(RuntimeTest, EndlessScriptsAreBrokenOffByAStopRequest)
{
#if defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "ThreadSanitizer holds signals back until the thread calls the C library";
#endif
    const char* const scripts[] = {
        "probe.run(); for (;;) {} probe.log('never');",
        "probe.run(); for (;;) { try { throw 1; } catch (e) {} finally { continue; } }",
        "probe.run(); for (;;) { var a = [{}, 'x' + a].concat([1, 2]); a = String(a).length; }",
        "probe.run(); for (;;) { probe.name(); }",
        "setTimeout(function() { probe.run(); for (;;) {} }, 0); setTimeout(function() { probe.log('never'); }, 0);",
        "probe.f = function() { probe.run(); for (;;) {} }; probe.startUpdates();",
        "probe.run({v: 1, f: function() { probe.run(); for (;;) {} }}); probe.log('never');",
        "function F() { probe.run(); for (;;) {} } try { new F(); } finally { probe.log('never'); }",
    };
    for (const char* pScript : scripts) {
        SCOPED_TRACE(pScript);
        std::promise<void> endless;
        Lines expected;
        const auto callsScript = [&](ASObject& object) {  // the script does not return: neither does the call succeed
            ASValue result;
            EXPECT_FALSE(object.Call("f", {}, result));
            EXPECT_FALSE(object.GetProperty("v", result));
            Probe::s_lines.push_back("native code goes on");
            expected = Probe::s_lines;
        };
        Probe::s_run = [&](const Invocation& call) {
            call.arguments.empty() ? endless.set_value() : callsScript(*call.arguments[0].GetObject());
        };
        Probe::s_onUpdate = [&](const Invocation& call) { callsScript(call.object); };
        std::thread listener([&] {
            endless.get_future().wait();
            m_PRuntime->SendRequest(IStagecraft::kRequestStop);
            m_PRuntime->SendRequest(IStagecraft::kRequestStop);
        });
        Probe::s_lines.clear();
        EXPECT_EQ(Play(pScript).m_nErrorValue, AEError::Generic);
        listener.join();
        EXPECT_EQ(m_Errors.rfind("script error: ", 0), 0u) << m_Errors;
        EXPECT_EQ(Probe::s_lines, expected);

        // The runtime is as good as new.
        EXPECT_EQ(Logged("probe.log('again');"), Lines{"again"});
    }
}

}  // namespace
