// Ticks, update calls and timers.
#include <chrono>

#include "RuntimeFixture.h"

namespace {

TEST_F(RuntimeTest, UpdatesComeBeforeTimersInTheOrderOfRegistration)
{
    const Lines lines = Logged(
        "var a = new Probe('a'), b = new Probe('b'); b.startUpdates(); a.startUpdates(); b.startUpdates();"
        "var ticks = 0; setInterval(function() { probe.log('timer'); if (++ticks == 3) quit(); }, 0);"
        "probe.log('script');");
    Lines expected{"constructed a", "constructed b", "script"};
    for (int tick = 0; tick < 3; ++tick) {
        expected.insert(expected.end(), {"update b", "update a", "timer"});
    }
    ASSERT_GE(lines.size(), expected.size());
    EXPECT_EQ(Lines(lines.begin(), lines.begin() + static_cast<std::ptrdiff_t>(expected.size())), expected);
}

TEST_F(RuntimeTest, UpdatesChangeDuringATick)
{
    ASValue other;
    int step = 0;
    Probe::s_run = [&](const Invocation& call) { other = call.arguments[0]; };
    Probe::s_onUpdate = [&](const Invocation& call) {
        ++step;
        Probe::s_lines.push_back(std::to_string(step) + (&call.object == other.GetObject() ? " other" : " probe"));
        if (step == 1) other.GetObject()->StopUpdates();   // it would have been next
        if (step == 2) other.GetObject()->StartUpdates();  // from the next tick on
        if (step == 4) {
            other.GetObject()->StopUpdates();
            other = ASValue();
        }
        if (step == 5) call.object.StopUpdates();
    };
    EXPECT_EQ(
        Logged("var other = new Probe(); probe.run(other); probe.startUpdates(); other.startUpdates();"
               "var n = 0, t = setInterval(function() { probe.log('tick'); if (++n == 4) clearInterval(t); }, 0);"),
        (Lines{"1 probe", "tick", "2 probe", "tick", "3 probe", "4 other", "tick", "5 probe", "tick"}));
}

// Those of one tick, which comes late.
TEST_F(RuntimeTest, TimersRunInTheOrderTheyAreDue)
{
    EXPECT_EQ(Logged("function log(text) { return function() { probe.log(text); }; }"
                     "setTimeout(log('late'), 20); setTimeout(log('first'), 0); setTimeout(log('second'), 0);"
                     "setTimeout(log('middle'), 10); setTimeout(log('negative'), -5); setTimeout(log('nan'), 'x');"
                     "setTimeout(log('none'));"
                     "setTimeout(function(a, b) { probe.log(a, b, arguments.length); }, 30, 'extra', 2);"
                     "var start = Date.now(); while (Date.now() < start + 60) {}"),
              (Lines{"first", "second", "negative", "nan", "none", "middle", "late", "extra 2 2"}));
}

TEST_F(RuntimeTest, TimersAreCleared)
{
    EXPECT_EQ(
        Logged("var a = setTimeout(function() { probe.log('never'); }, 0); clearTimeout(a); clearTimeout(a);"
               // Cleared by one that is due in the same tick.
               "var c; setTimeout(function() { clearTimeout(c); probe.log('clears'); }, 0);"
               "c = setTimeout(function() { probe.log('never'); }, 0);"
               // An interval that clears itself, with the other function.
               "var n = 0, i = setInterval(function() { probe.log('interval'); if (++n == 2) clearTimeout(i); }, 0);"
               // Numbers that stand for nothing.
               "clearTimeout(); clearInterval(null); clearTimeout(99999); clearTimeout(-1); clearTimeout('x');"
               "clearTimeout({});"),
        (Lines{"clears", "interval", "interval"}));
}

TEST_F(RuntimeTest, TimersStartedByTimersWaitForALaterTick)
{
    EXPECT_EQ(Logged("probe.startUpdates();"
                     "setTimeout(function() { probe.log('outer');"
                     "  setTimeout(function() { probe.log('inner'); probe.stopUpdates(); }, 0); }, 0);"),
              (Lines{"update ", "outer", "update ", "inner"}));
}

// Bounds from below only: a machine may always be slower.
TEST_F(RuntimeTest, TimeIsKept)
{
    const struct {
        const char* pRate;
        const char* pScript;
        int least;  // milliseconds
    } rows[] = {{"50", "var n = 0, i = setInterval(function() { if (++n == 10) clearInterval(i); }, 0);", 190},
                {"200", "var n = 0, i = setInterval(function() { if (++n == 3) clearInterval(i); }, 50);", 150},
                {nullptr, "var n = 0, i = setInterval(function() { if (++n == 6) clearInterval(i); }, 0);", 190}};
    for (const auto& row : rows) {
        row.pRate ? setenv("STAGECRAFT_FPS", row.pRate, 1) : unsetenv("STAGECRAFT_FPS");
        const auto start = std::chrono::steady_clock::now();
        Logged(row.pScript);
        EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(row.least)) << row.pScript;
    }
}

}  // namespace
