// Loads a script runtime and plays movies in it that each test writes.
//
// The movie talks to the test through the extension class "com.example.Probe": log(text...) notes a line, run(...)
// calls the native code that the test gave. Each movie starts with a probe of its own, `var probe`.
#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "TempFolder.h"
#include "stagecraft/IAEKernel.h"
#include "stagecraft/IStagecraft.h"

using namespace ae::stagecraft;

using Lines = std::vector<std::string>;

// What native code gets that runs for the script.
struct Invocation {
    StageWindow* pWindow;
    ASObject& object;
    ASValueArray& arguments;
    ASValue& result;
};

class Probe final : public ASExtensionClass {
public:
    explicit Probe(std::string name) : m_Name(std::move(name)) {}
    ~Probe() override { ++s_deleted; }

    static const char* GetClassName() { return "com.example.Probe"; }
    static bool FiresEvents() { return false; }
    static void GetMethods(AEArray<Method>& methodArrayToFill);
    // new Probe(name): a name is noted when the instance comes and goes; "refused" is not constructed.
    static ASExtensionClass* ConstructInstance(StageWindow* pWindow, ASObject& object, ASValueArray& arguments);
    static void DestructInstance(StageWindow* pWindow, ASObject& object);

    void OnUpdate(StageWindow* pWindow, ASObject& object) override;

    static inline Lines s_lines;
    static inline std::function<void(const Invocation&)> s_run;  // what run() does; empty: nothing
    static inline std::function<void(const Invocation&)> s_onUpdate;
    static inline std::thread::id s_mainThread;
    static inline int s_constructed;
    static inline int s_deleted;

private:
    void Log(StageWindow* pWindow, ASObject& object, ASValueArray& arguments, ASValue& result);
    void Run(StageWindow* pWindow, ASObject& object, ASValueArray& arguments, ASValue& result);
    void Name(StageWindow*, ASObject&, ASValueArray&, ASValue& result) { result = ASValue::String(m_Name.c_str()); }
    void StartUpdates(StageWindow*, ASObject& object, ASValueArray&, ASValue&) { object.StartUpdates(); }
    void StopUpdates(StageWindow*, ASObject& object, ASValueArray&, ASValue&) { object.StopUpdates(); }

    const std::string m_Name;
};

class RuntimeTest : public ::testing::Test {
protected:
    RuntimeTest();
    void SetUp() override;
    void TearDown() override;

    // Writes the script, after the line that makes the probe, as the movie's file.
    void WriteMovie(const std::string& script);
    AEError Create(const std::vector<const char*>& options = {});
    AEError Run() { return m_PRuntime->RunStageWindowSet(m_Set); }
    AEError Destroy() { return m_PRuntime->DestroyStageWindowSet(m_Set); }
    // All of it; the result is that of Run. What the movie printed to the error stream is in m_Errors.
    AEError Play(const std::string& script, const std::vector<const char*>& options = {});
    // Likewise for a movie in which nothing may fail; returns the lines it logged.
    Lines Logged(const std::string& script, const std::vector<const char*>& options = {});

    void* m_PLibrary = nullptr;
    IAEKernel* m_PKernel = nullptr;
    IStagecraft* m_PRuntime = nullptr;
    IAEModule_LoadModuleFunction m_LoadModule = nullptr;
    IAEModule_UnloadModuleFunction m_UnloadModule = nullptr;
    AEArray<StageWindow*> m_Set;
    const TempFolder m_Folder;
    std::string m_Movie = m_Folder / "movie.js";
    std::string m_Errors;
};

inline const char* TypeName(const ASValue& value)
{
    static const char* const kNames[] = {"undefined", "null", "boolean", "number", "string", "object"};
    return kNames[value.GetType()];
}
