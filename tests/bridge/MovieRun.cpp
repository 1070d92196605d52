#include "MovieRun.h"

#include <stdlib.h>

#include <utility>

#include "TempFolder.h"
#include "ZVCfgLibAE.h"
#include "ZVWSLibAEPrefetch.h"
#include "stagecraft/IStagecraft.h"

using namespace ae::stagecraft;

namespace {

MovieRun* s_Run = nullptr;
const Result* s_Shown = nullptr;
const Answer* s_Answer = nullptr;
std::shared_ptr<PrefetchPause> s_Pause;

class TestClass : public ASExtensionClass {
public:
    static const char* GetClassName() { return "test.Native"; }
    static bool FiresEvents() { return false; }
    static void GetMethods(AEArray<Method>& methods)
    {
        methods.Append(MakeMethod("report", Method::kStaticFunction, &TestClass::report));
        methods.Append(MakeMethod("result", Method::kStaticFunction, &TestClass::result));
        methods.Append(MakeMethod("answer", Method::kStaticFunction, &TestClass::answer));
    }
    static ASExtensionClass* ConstructInstance(StageWindow*, ASObject&, ASValueArray&) { return new TestClass; }
    static void DestructInstance(StageWindow*, ASObject& object) { delete object.GetExtensionInstance(); }

private:
    void report(StageWindow*, ASObject& object, ASValueArray& arguments, ASValue&)
    {
        AEString text;
        object.ToText(arguments[0], text);
        s_Run->lines.push_back(text.c_str());
    }
    void result(StageWindow*, ASObject& object, ASValueArray&, ASValue& returnValue)
    {
        ZVWSLib::SetResult(*s_Shown, returnValue, object);
    }
    void answer(StageWindow*, ASObject&, ASValueArray& arguments, ASValue& returnValue)
    {
        returnValue = ASValue::String((*s_Answer)(arguments[0].GetString().c_str()).c_str());
    }
};

class PausedWSLib : public ZVWSLibAE {
public:
    using ZVWSLibAE::ZVWSLibAE;

    static ASExtensionClass* ConstructInstance(StageWindow* window, ASObject& object, ASValueArray& arguments)
    {
        auto* instance = new PausedWSLib(window, object, arguments);
        if (s_Pause) instance->GetPrefetcher().UsePause(std::exchange(s_Pause, nullptr));
        return instance;
    }
};

}  // namespace

std::string MovieRun::Text() const
{
    std::string text;
    for (const std::string& line : lines)
        text += line + "\n";
    return text;
}

MovieRun RunMovie(const std::string& script, const Result& shown, const Answer& answer,
                  std::shared_ptr<PrefetchPause> pause)
{
    MovieRun run;
    s_Run = &run;
    s_Shown = &shown;
    s_Answer = &answer;
    s_Pause = std::move(pause);
    const TempFolder folder;
    const std::string movie = folder.Write("movie.js",
                                           "function report(text) { test.Native.report(text); }\n"
                                           "function result() { return test.Native.result(); }\n"
                                           "function answer(question) { return test.Native.answer(question); }\n" +
                                               script);
    setenv("STAGECRAFT_FPS", "200", 1);
    unsetenv("STAGECRAFT_MOVIE");
    const char* arguments[] = {"test", movie.c_str()};
    IStagecraft* runtime = IStagecraft::InitializeStagecraftLibrary(2, arguments);
    if (!runtime) return run;
    runtime->RegisterExtensionClass<PausedWSLib>();
    runtime->RegisterExtensionClass<ZVCfgLibAE>();
    runtime->RegisterExtensionClass<TestClass>();
    AEArray<StageWindow*> windows;
    runtime->CreateAndConfigureStageWindowSet(windows, 2, arguments, 1);
    run.succeeded = runtime->RunStageWindowSet(windows).m_nErrorValue == AEError::OK;
    runtime->DestroyStageWindowSet(windows);
    IStagecraft::UninitializeStagecraftLibrary();
    return run;
}
