#include "ScriptRun.h"

#include "MemoryFile.h"

using namespace ae::stagecraft;

namespace {

IStagecraft& Started(void (*prepare)(IStagecraft& runtime))
{
    unsetenv("STAGECRAFT_MOVIE");
    const char* arguments[] = {"fuzz"};
    IStagecraft* runtime = IStagecraft::InitializeStagecraftLibrary(1, arguments);
    Require(runtime != nullptr, "the runtime starts");
    atexit(IStagecraft::UninitializeStagecraftLibrary);
    if (prepare) prepare(*runtime);
    return *runtime;
}

}  // namespace

void RunScript(const std::string& script, const std::string& flashVars, void (*prepare)(IStagecraft& runtime))
{
    static IStagecraft& runtime = Started(prepare);
    const MemoryFile movie(script);
    const char* arguments[] = {"fuzz", "--flashvars", flashVars.c_str(), movie.Path()};
    AEArray<StageWindow*> windows;
    const AEError created = runtime.CreateAndConfigureStageWindowSet(windows, 4, arguments, 1);
    Require(created.m_nErrorValue == AEError::OK, "the movie is created");
    Require(runtime.RunStageWindowSet(windows).m_nErrorValue == AEError::OK, "the script runs to its end");
    runtime.DestroyStageWindowSet(windows);
}
