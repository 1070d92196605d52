// The tracer, and the log that a movie sets up.
#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <set>
#include <sstream>
#include <thread>
#include <vector>

#include "MovieRun.h"
#include "TempFolder.h"
#include "ZVWSAELog.h"
#include "ZV_Log.h"

namespace {

class Log : public testing::Test {
protected:
    void TearDown() override
    {
        ZVWSAELog::InitWSLogs(0x3F00, ZVWSAELog::kConsole);  // closes the file
        ZV_LogSetTarget(nullptr, nullptr);
    }

    // The file's lines without their times. The next ones go to a new file.
    std::string File()
    {
        ZVWSAELog::InitWSLogs(0, ZVWSAELog::kConsole);
        std::istringstream file(m_Temp.Read("log.txt"));
        std::filesystem::remove(m_Folder + "log.txt");
        std::string text;
        for (std::string line; std::getline(file, line);)
            text += "[" + line.substr(std::min(line.size(), sizeof "[HH:MM:SS.mmm-" - 1)) + "\n";
        return text;
    }

    const TempFolder m_Temp;
    const std::string m_Folder = m_Temp / "";
};

int AreaId(const char* name)
{
    int id = -1;
    ZV_LogRegisterArea(name, &id);
    return id;
}

TEST_F(Log, EachBitOfTheMaskSwitchesItsArea)
{
    const char* kNames[] = {"ZV_WSAE", "ZV_WSCFGAE", "soap_proxy", "soap_recv", "soap_sent", "soap_test"};
    for (int on = 0; on < 6; ++on) {
        ASSERT_EQ(0, ZVWSAELog::InitWSLogs(0x100u << on, ZVWSAELog::kFile, m_Folder.c_str()));
        for (const char* name : kNames)
            ZV_LogOutput(AreaId(name), ZV_LOG_TRACE, "line\n");
        EXPECT_EQ(std::string("[") + kNames[on] + "] line\n", File());
    }
}

TEST_F(Log, TargetsAndFailures)
{
    EXPECT_EQ(0, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, m_Folder.c_str()));
    EXPECT_EQ(1, ZVWSAELog::InitWSLogs(0x100, 0));
    EXPECT_EQ(2, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, "/no/such/folder/"));
    EXPECT_EQ(2, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, std::string(300, 'x').c_str()));
    {
        const ZVWSAELog scope("Class", "method", AreaId("ZV_WSAE"));
        ZV_LogOutput(AreaId("ZV_WSAE"), ZV_LOG_ERROR, "inside\n");
    }
    // The target that failures left unchanged.
    EXPECT_EQ("[ZV_WSAE] Entering Class::method\n[ZV_WSAE] inside\n[ZV_WSAE] Exiting Class::method\n", File());

    testing::internal::CaptureStdout();
    EXPECT_EQ(0, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kConsole | ZVWSAELog::kFile, m_Folder.c_str()));
    ZV_LogOutput(AreaId("ZV_WSAE"), ZV_LOG_TRACE, "to the console\n");
    EXPECT_NE(std::string::npos, testing::internal::GetCapturedStdout().find("to the console"));
}

TEST_F(Log, AMovieSetsItUpUnlessTheEnvironmentDoes)
{
    const std::pair<std::string, std::string> rows[] = {
        {"", "{LogAreaIDs: '0x100', LogTarget: 2, SettingsFile: '" + m_Folder + "settings.xml'}"},
        {"0x100,02," + m_Folder, "{LogAreaIDs: 0, LogTarget: 1, PreferenceFile: '/no/such/p'}"}};
    for (const auto& [variable, parameters] : rows) {
        variable.empty() ? unsetenv("ZV_LOG") : setenv("ZV_LOG", variable.c_str(), 1);
        const MovieRun run = RunMovie(
            "var lib = com.orvex.ZVWSLib;\n"
            "report([lib.setLogAreaIDsAndTargetConfig(" +
            parameters + "), new lib().getNavigation()]);\n");
        unsetenv("ZV_LOG");
        EXPECT_EQ("0,-1\n", run.Text());
        EXPECT_EQ("[ZV_WSAE] Entering ZVWSLibAE::getNavigation\n[ZV_WSAE] Exiting ZVWSLibAE::getNavigation\n", File());
    }
    // What is refused changes nothing.
    EXPECT_EQ(0, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, m_Folder.c_str()));
    EXPECT_EQ(
        "-3,-3,-3,-3,-3,-3,-3\n",
        RunMovie("var lib = com.orvex.ZVWSLib, names = ['LogAreaIDs', 'LogTarget', 'SettingsFile', 'PreferenceFile'];\n"
                 "report([lib.setLogAreaIDsAndTargetConfig(), lib.setLogAreaIDsAndTargetConfig('0x100'),\n"
                 "    lib.setLogAreaIDsAndTargetConfig([{}, {LogAreaIDs: 0x200, LogTarget: 1}])].concat(\n"
                 "    names.map(function (name) {\n"
                 "        var settings = {LogAreaIDs: 0x200, LogTarget: 1, SettingsFile: '/no/such/s'};\n"
                 "        settings[name] = {toString: function () { throw new Error('on purpose'); }};\n"
                 "        return lib.setLogAreaIDsAndTargetConfig(settings); })));\n"
                 "new lib().getNavigation();\n")
            .Text());
    EXPECT_EQ("[ZV_WSAE] Entering ZVWSLibAE::getNavigation\n[ZV_WSAE] Exiting ZVWSLibAE::getNavigation\n", File());
}

TEST_F(Log, SettingItUpAgainLosesAndGarblesNothing)
{
    const TempFolder other;
    const std::string folders[] = {m_Folder, m_Temp / "./", other / "", m_Folder};
    ASSERT_EQ(0, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, m_Folder.c_str()));
    std::atomic<bool> stop{false};
    std::atomic<int> logged{0};
    std::vector<std::thread> threads;
    for (int i = 0; i < 2; ++i) {
        threads.emplace_back([&] {
            while (!stop)
                ZV_LogOutput(AreaId("ZV_WSAE"), ZV_LOG_TRACE, "line %d.\n", logged++);
        });
    }
    for (int i = 0; i < 40 || logged < 1000; ++i)
        ASSERT_EQ(0, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, folders[i % 4].c_str()));
    stop = true;
    for (std::thread& thread : threads)
        thread.join();

    std::istringstream lines(File() + other.Read("log.txt"));
    std::set<int> seen;
    for (std::string line; std::getline(lines, line);) {
        int number = -1;
        char point = 0;
        const size_t text = line.find("] line ");
        ASSERT_TRUE(text != std::string::npos && sscanf(&line[text], "] line %d%c", &number, &point) == 2) << line;
        EXPECT_TRUE(point == '.' && seen.insert(number).second) << line;
    }
    EXPECT_EQ(static_cast<size_t>(logged), seen.size());
}

TEST_F(Log, ARefusedInitIsNotLeft)
{
    ASSERT_EQ(0, ZVWSAELog::InitWSLogs(0x100, ZVWSAELog::kFile, m_Folder.c_str()));
    EXPECT_EQ("-3,-3\n", RunMovie("var ws = new com.orvex.ZVWSLib(); report([ws.init(), ws.init([{}])]);\n").Text());
    const std::string refused = "[ZV_WSAE] Entering ZVWSLibAE::init\n[ZV_WSAE] Exiting ZVWSLibAE::init\n";
    EXPECT_EQ(refused + refused, File());
}

}  // namespace
