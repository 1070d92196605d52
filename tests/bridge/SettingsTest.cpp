// The settings class as a movie sees it.
#include <sstream>

#include "MovieRun.h"
#include "SettingsFolder.h"

namespace {

class MovieSettings : public SettingsFolder {
protected:
    std::string Report(const std::string& script) const
    {
        const MovieRun run = RunMovie("var folder = '" + folder +
                                      "';\n"
                                      "var cfg = new com.orvex.ZVCfgLib();\n"
                                      "function show(value) { report(JSON.stringify(value)); }\n" +
                                      script);
        EXPECT_TRUE(run.succeeded);
        return run.Text();
    }
};

TEST_F(MovieSettings, AreKeptFromMovieToMovie)
{
    EXPECT_EQ("0\n0\nnull\n0\n0\n\"v\\n<\"\n\"t\"\n",
              Report("show(cfg.init()); show(cfg.setFile(folder + 'settings.xml')); show(cfg.read('k', false));\n"
                     "show(cfg.write('k', 'v\\n<', false)); show(cfg.write('token', 't', true));\n"
                     "show(cfg.read('k', false)); show(cfg.read('token', true));\n"));
    EXPECT_EQ("\"v\\n<\"\n\"t\"\nnull\nnull\n",
              Report("cfg.setFile(folder + 'settings.xml');\n"
                     "show(cfg.read('k', false)); show(cfg.read('token', true)); show(cfg.read('k', true));\n"
                     "cfg.setFile(folder + 'deployment'); show(cfg.read('k', false));\n"));
}

TEST_F(MovieSettings, ArgumentsMustBeThereAndOfTheirKind)
{
    std::istringstream wrong(
        "setFile() setFile(5) setFile(null) setFile('') setFile('a\\0b') read() read('k') read('k',1) read(1,true) "
        "read('k\\0',true) read({},true) write('k','v') write('k',5,true) write('k',null,false) write('k','v','true') "
        "write('k','v\\0w',true) selectEnv() selectEnv('1') selectEnv(1.5) selectEnv(NaN) selectEnv(4294967296)");
    std::string script = "cfg.setFile(folder + 'settings.xml');\n", expected;
    for (std::string call; wrong >> call;) {
        script += "report(cfg." + call + ");\n";
        expected += "-3\n";
    }
    EXPECT_EQ(expected, Report(script));
    EXPECT_FALSE(std::filesystem::exists(file));
}

TEST_F(MovieSettings, WithoutAFileThereIsNothingToReadOrWrite)
{
    EXPECT_EQ("null\n-1\n-1\n-1\n", Report("show(cfg.read('k', false)); show(cfg.write('k', 'v', false));\n"
                                           "show(cfg.selectEnv(1)); show(cfg.clearEnv());\n"));
}

TEST_F(MovieSettings, TheEnvironmentStandsInAFileBesideTheSettings)
{
    EXPECT_EQ("0\n\"1\"\n0\n\"2\"\n-1907\n\"2\"\n\"v\"\n0\nnull\n\"v\"\n0\n",
              Report("var env = new com.orvex.ZVCfgLib(); env.setFile(folder + 'env.xml');\n"
                     "cfg.setFile(folder + 'settings.xml'); cfg.write('k', 'v', false);\n"
                     "show(cfg.selectEnv(1)); show(env.read('EnvNum', false));\n"
                     "show(cfg.selectEnv(2)); show(env.read('EnvNum', false));\n"
                     "show(cfg.selectEnv(4)); show(env.read('EnvNum', false)); show(cfg.read('k', false));\n"
                     "show(cfg.clearEnv()); show(env.read('EnvNum', false)); show(cfg.read('k', false));\n"
                     "show(cfg.clearEnv());\n"));
    EXPECT_FALSE(std::filesystem::exists(folder + "env.xml"));
}

}  // namespace
