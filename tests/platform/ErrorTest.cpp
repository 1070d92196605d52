// Errors of a movie's script, and movies that cannot be read.
#include <algorithm>
#include <cerrno>
#include <cstring>

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
        {"throw new Error('gr\\u00fcn \\ud83d\\ude00');", true, {"gr\xC3\xBCn \xF0\x9F\x98\x80", "movie.js:2"}, {}},
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
        EXPECT_EQ(m_Errors.rfind("script error: ", 0), 0u) << m_Errors;
        for (const std::string& part : row.reported) {
            EXPECT_NE(m_Errors.find(part), std::string::npos) << part << " in " << m_Errors;
        }
    }
}

TEST_F(RuntimeTest, UnreadableMoviesAreOneLine)
{
    const std::string movie = m_Movie;
    WriteMovie("probe.log('readable');");
    const std::pair<std::string, int> rows[] = {
        {m_Folder / "", EISDIR}, {m_Folder / "absent.js", ENOENT}, {movie + "/below.js", ENOTDIR}, {"", ENOENT}};
    for (const auto& [path, reason] : rows) {
        m_Movie = path;
        testing::internal::CaptureStderr();
        const AEError result = Create();
        const std::string line = testing::internal::GetCapturedStderr();
        EXPECT_EQ(result.m_nErrorValue, AEError::NotFound) << path;
        EXPECT_TRUE(m_Set.empty());
        EXPECT_NE(line.find(path), std::string::npos) << line;
        EXPECT_NE(line.find(strerror(reason)), std::string::npos) << line;
        EXPECT_EQ(std::count(line.begin(), line.end(), '\n'), 1) << line;
        EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
    }
    m_Movie = movie;
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Run().m_nErrorValue, AEError::OK);
    EXPECT_EQ(Probe::s_lines, Lines{"readable"});
}

}  // namespace
