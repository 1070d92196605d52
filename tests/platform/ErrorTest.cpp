// Errors of a movie's script, and movies that cannot be read.
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>

#include "RuntimeFixture.h"

namespace {

// The script begins in line 2 of the movie.
TEST_F(RuntimeTest, ScriptErrorsTellMessageFileAndLine)
{
    const struct {
        const char* pScript;
        bool ends;
        std::vector<std::string> reported;
        Lines logged;
    } rows[] = {
        {"probe.log('before');\nnot.defined;\nprobe.log('never');", true, {"not", "movie.js:3"}, {"before"}},
        {"probe.log('never'); {\n\nvar var;", true, {"SyntaxError", "movie.js:4"}, {}},
        {"\nthrow 'plain text';", true, {"plain text", "movie.js:3"}, {}},
        {"\nthrow undefined;", true, {"undefined", "movie.js:3"}, {}},
        {"throw new Error('gr\\u00fcn \\ud83d\\ude00');", true, {"gr\xC3\xBCn \xF0\x9F\x98\x80", "movie.js:2"}, {}},
        {"throw {toString: function() { throw 1; }};", true, {"movie.js:2"}, {}},
        {"Probe.prototype.run.call({});", true, {"com.example.Probe.run", "movie.js:2"}, {}},
        {"function f() { f(); }\nf();", true, {"RangeError", "movie.js:2"}, {}},
        {"setTimeout(function() {\n throw new Error('in a timer'); }, 0);\n"
         "setTimeout(function() { probe.log('goes on'); }, 0);",
         false,
         {"in a timer", "movie.js:3"},
         {"goes on"}},
        {"var n = 0, i = setInterval(function() { if (++n == 2) clearInterval(i); probe.log(n);\nthrow n; }, 0);",
         false,
         {"script error: 1", "script error: 2", "movie.js:3"},
         {"1", "2"}},
        {"probe.onComplete = function() {\n throw new Error('in a callback'); }; probe.startUpdates();",
         false,
         {"in a callback", "movie.js:3", "com.example.Probe.OnUpdate"},
         {"update"}},
    };
    Probe::s_onUpdate = [](const Invocation& call) {
        ASValue result;
        EXPECT_FALSE(call.object.Call("onComplete", {}, result));
        Probe::s_lines.push_back("update");
        call.object.StopUpdates();
    };
    for (const auto& row : rows) {
        Probe::s_lines.clear();
        EXPECT_EQ(Play(row.pScript).m_nErrorValue, row.ends ? AEError::Generic : AEError::OK) << row.pScript;
        EXPECT_EQ(Probe::s_lines, row.logged) << row.pScript;
        EXPECT_EQ(m_errors.rfind("script error: ", 0), 0u) << m_errors;
        for (const std::string& part : row.reported) {
            EXPECT_NE(m_errors.find(part), std::string::npos) << part << " in " << m_errors;
        }
    }
}

TEST_F(RuntimeTest, UnreadableMoviesAreOneLine)
{
    const std::string folder = m_folder + "/folder";
    const std::string absent = m_folder + "/absent.js";
    const std::string below = m_folder + "/movie.js/below.js";
    const std::string locked = m_folder + "/locked.js";
    std::filesystem::create_directory(folder);
    WriteMovie("probe.log('never');");
    std::filesystem::copy_file(m_movie, locked);
    chmod(locked.c_str(), 0);
    struct {
        std::string path;
        int reason;
    } rows[] = {{folder, EISDIR}, {absent, ENOENT}, {below, ENOTDIR}, {"", ENOENT}, {locked, EACCES}};
    for (auto& row : rows) {
        if (row.reason == EACCES && geteuid() == 0) continue;  // may read everything
        for (const bool byVariable : {false, true}) {
            if (byVariable && row.path.empty()) continue;  // is like none
            const Environment variable("STAGECRAFT_MOVIE", byVariable ? row.path.c_str() : nullptr);
            const char* const arguments[] = {"stagecraft", byVariable ? m_movie.c_str() : row.path.c_str()};
            testing::internal::CaptureStderr();
            const AEError result = m_pRuntime->CreateAndConfigureStageWindowSet(m_set, 2, arguments, 1);
            const std::string line = testing::internal::GetCapturedStderr();
            EXPECT_EQ(result.m_nErrorValue, AEError::NotFound) << row.path;
            EXPECT_TRUE(m_set.empty());
            EXPECT_NE(line.find(row.path), std::string::npos) << line;
            EXPECT_NE(line.find(strerror(row.reason)), std::string::npos) << line;
            EXPECT_EQ(std::count(line.begin(), line.end(), '\n'), 1) << line;
            EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
        }
    }
    EXPECT_EQ(Probe::s_lines, Lines{});
    EXPECT_EQ(Logged("probe.log('readable');"), Lines{"readable"});
}

TEST_F(RuntimeTest, TheVariableReplacesTheMovie)
{
    WriteMovie("probe.log('by variable');");
    const std::string movie = m_movie;
    const Environment variable("STAGECRAFT_MOVIE", movie.c_str());
    m_movie = m_folder + "/absent.js";
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Run().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Probe::s_lines, Lines{"by variable"});
}

TEST_F(RuntimeTest, WrongVectorsAreRefused)
{
    const char* const hole[] = {"stagecraft", nullptr, "movie.js"};
    EXPECT_EQ(m_pRuntime->CreateAndConfigureStageWindowSet(m_set, 3, hole, 1).m_nErrorValue,
              AEError::InvalidParameters);
    EXPECT_EQ(m_pRuntime->CreateAndConfigureStageWindowSet(m_set, 0, hole, 1).m_nErrorValue,
              AEError::InvalidParameters);
    EXPECT_EQ(m_pRuntime->CreateAndConfigureStageWindowSet(m_set, 1, nullptr, 1).m_nErrorValue,
              AEError::InvalidParameters);
    EXPECT_TRUE(m_set.empty());
}

TEST_F(RuntimeTest, OptionsCountOnlyWhenAsked)
{
    WriteMovie("probe.log(flashvars.a);");
    const char* const arguments[] = {"stagecraft", "--flashvars", "a=1", m_movie.c_str()};
    ASSERT_EQ(m_pRuntime->CreateAndConfigureStageWindowSet(m_set, 4, arguments, 0).m_nErrorValue, AEError::OK);
    EXPECT_EQ(Run().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Probe::s_lines, Lines{"undefined"});
}

}  // namespace
