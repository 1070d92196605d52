#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

#include "TempFolder.h"
#include "ZV_Log.h"

// The process has one logger: every test uses areas of its own, and takes its target away again.

namespace {

struct Line {
    std::string text;
    unsigned int length;
};

class LogTest : public ::testing::Test {
protected:
    LogTest() { ZV_LogSetTarget(Keep, &m_Lines); }
    ~LogTest() override { ZV_LogSetTarget(nullptr, nullptr); }

    static void Keep(const char* text, unsigned int length, void* lines)
    {
        static_cast<std::vector<Line>*>(lines)->push_back({length ? std::string(text, length) : text, length});
    }

    std::vector<Line> m_Lines;
};

int Register(const char* name)
{
    int id = -2;
    EXPECT_EQ(0, ZV_LogRegisterArea(name, &id));
    return id;
}

TEST_F(LogTest, ALineHasTimeAndArea)
{
    const int id = Register("form");
    ZV_LogOutput(id, ZV_LOG_TRACE, "%s-%d\n", "text", 5);
    ZV_LogOutputwithLen(id, ZV_LOG_TRACE, "a\0b??", 3);
    ASSERT_EQ(2u, m_Lines.size());
    std::string form = m_Lines[0].text;
    for (char& c : form) {
        if (isdigit(static_cast<unsigned char>(c))) c = '9';
    }
    EXPECT_EQ("[99:99:99.999-form] text-9\n", form);
    EXPECT_EQ(0u, m_Lines[0].length) << "a text that ends at its NUL";
    EXPECT_EQ(std::string("-form] a\0b", 10), m_Lines[1].text.substr(m_Lines[1].text.size() - 10));
    EXPECT_EQ(m_Lines[1].text.size(), m_Lines[1].length);
}

TEST_F(LogTest, CutsFormattedTextsOnly)
{
    const int id = Register("cut");
    for (const size_t length : {510u, 511u, 512u, 5000u}) {
        m_Lines.clear();
        const std::string text(length, 'x');
        ZV_LogOutput(id, ZV_LOG_ERROR, "%s", text.c_str());
        ZV_LogOutputwithLen(id, ZV_LOG_ERROR, text.data(), length);
        ASSERT_EQ(2u, m_Lines.size());
        const auto payload = [](const Line& line) { return line.text.size() - line.text.find("] ") - 2; };
        EXPECT_EQ(std::min<size_t>(length, 511), payload(m_Lines[0]));
        EXPECT_EQ(length, payload(m_Lines[1]));
    }
}

TEST_F(LogTest, PrintsWhatTheAreaLetsThrough)
{
    const int id = Register("filter");
    const struct {
        int mask, severity;
        bool active, prints;
    } rows[] = {
        {5, ZV_LOG_TRACE, true, true},  {5, ZV_LOG_ERROR, true, true}, {5, ZV_LOG_VERBOSE, true, false},
        {0, ZV_LOG_ERROR, true, false}, {-1, 0x7fffffff, true, true},  {-1, ZV_LOG_ERROR, false, false},
    };
    for (const auto& row : rows) {
        ZV_LogActivateArea(id, row.active);
        ZV_LogSetAreaSeverityMask(id, row.mask);
        EXPECT_EQ(id, Register("filter")) << "registering again changes nothing";
        m_Lines.clear();
        ZV_LogOutput(id, row.severity, "x");
        EXPECT_EQ(row.prints, !m_Lines.empty()) << row.active << " " << row.mask << " " << row.severity;
        EXPECT_EQ(row.prints, ZV_LogWouldOutput(id, row.severity));
    }
    m_Lines.clear();
    for (const int unknown : {-1, 49, 50, 1 << 30}) {
        ZV_LogActivateArea(unknown, true);
        ZV_LogSetAreaSeverityMask(unknown, -1);
        ZV_LogOutput(unknown, ZV_LOG_ERROR, "x");
    }
    EXPECT_TRUE(m_Lines.empty());
}

// Fills the table, and so runs in a process that ends.
TEST(LogDeathTest, TakesFiftyAreas)
{
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    const auto fill = [] {
        static ZV_LogArea s_Late("late");
        int id = 0, registered = 0;
        for (int i = 0; i < 60; ++i) {
            if (ZV_LogRegisterArea(("area" + std::to_string(i)).c_str(), &id) != 0) break;
            ++registered;
        }
        const bool full = registered == 50 && id == -1 && s_Late.Id() == -1 && s_Late.Id() == -1;
        const bool known = ZV_LogRegisterArea("area7", &id) == 0 && id == 7;
        exit(full && known ? 0 : 1);
    };
    EXPECT_EXIT(fill(), testing::ExitedWithCode(0), "");
}

TEST_F(LogTest, FileTargetsEndAtTheirSize)
{
    const TempFolder folder;
    const std::string name = folder / "log.txt";
    const struct {
        unsigned int maxSize;
        bool wrap;
        std::vector<const char*> lines;
        const char* content;
    } rows[] = {
        {0, true, {"aaaa", "bbbb"}, "aaaabbbb"},  {6, false, {"aaaa", "bbbb", "c"}, "aaaabb"},
        {6, true, {"aaaa", "bb", "c"}, "caaabb"}, {6, true, {"aaaa", "bbb"}, "bbba"},
        {6, true, {"a", "bcdefghi"}, "bcdefg"},
    };
    for (const auto& row : rows) {
        for (const bool withLength : {false, true}) {
            folder.Write("log.txt", "of the process before");
            ZV_LogTarget target;
            void* user;
            ASSERT_EQ(0, ZV_LogGetFileTarget(name.c_str(), &target, &user, row.maxSize, row.wrap));
            for (const char* line : row.lines)
                target(line, withLength ? strlen(line) : 0, user);
            ZV_LogReleaseFileTarget(target, user);
            EXPECT_EQ(row.content, folder.Read("log.txt")) << row.maxSize << " " << row.wrap;
        }
    }
    ZV_LogTarget target = Keep;
    void* user = this;
    for (const char* bad : {static_cast<const char*>(nullptr), "/none/log.txt"}) {
        EXPECT_EQ(2, ZV_LogGetFileTarget(bad, &target, &user, 0, true));
        EXPECT_TRUE(!target && !user);
    }
    ZV_LogReleaseFileTarget(target, user);
}

// An error takes along what came before it; the rest waits for a full buffer.
TEST_F(LogTest, ErrorsReachTheFileAtOnce)
{
    const TempFolder folder;
    const int id = Register("errors");
    ZV_LogTarget target;
    void* user;
    ASSERT_EQ(0, ZV_LogGetFileTarget((folder / "log.txt").c_str(), &target, &user, 0, true));
    ZV_LogSetTarget(target, user);
    const std::pair<int, bool> rows[] = {{ZV_LOG_TRACE, false}, {ZV_LOG_ERROR, true}, {ZV_LOG_VERBOSE, false}};
    for (const auto& [severity, flushes] : rows) {
        const std::string text = "severity " + std::to_string(severity) + "\n";
        for (const bool withLength : {false, true}) {
            withLength ? ZV_LogOutputwithLen(id, severity, text.data(), static_cast<unsigned int>(text.size()))
                       : ZV_LogOutput(id, severity, "%s", text.c_str());
            const std::string file = folder.Read("log.txt");
            EXPECT_EQ(flushes, file.size() >= text.size() && file.substr(file.size() - text.size()) == text) << text;
        }
    }
    ZV_LogSetTarget(nullptr, nullptr);
    ZV_LogReleaseFileTarget(target, user);
}

// Under changes of the area's state and of the target: lines stay whole, and none reaches a target once replaced.
TEST_F(LogTest, ServesSeveralThreads)
{
    std::atomic<bool> stop{false};
    std::vector<std::thread> threads;
    for (char letter : {'a', 'b', 'c'}) {
        threads.emplace_back([&stop, letter] {
            const int id = Register(letter == 'a' ? "threads0" : "threads1");
            while (!stop) {
                ZV_LogActivateArea(id, true);
                ZV_LogOutput(id, ZV_LOG_TRACE, "%s", std::string(300, letter).c_str());
            }
        });
    }
    size_t kept = 0;
    for (int i = 0; i < 200 || kept == 0; ++i) {
        auto lines = std::make_unique<std::vector<Line>>();
        ZV_LogSetTarget(Keep, lines.get());
        sched_yield();
        ZV_LogSetTarget(nullptr, nullptr);
        kept += lines->size();
        for (const Line& line : *lines) {
            const std::string text = line.text.substr(line.text.find("] ") + 2);
            EXPECT_EQ(std::string(300, text[0]), text);
        }
    }
    stop = true;
    for (std::thread& thread : threads)
        thread.join();
}

}  // namespace
