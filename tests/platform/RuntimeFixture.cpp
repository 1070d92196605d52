#include "RuntimeFixture.h"

#include <dlfcn.h>

// ---- Probe

void Probe::GetMethods(AEArray<Method>& methodArrayToFill)
{
    const Method rows[] = {
        MakeMethod("log", Method::kMemberFunction, &Probe::Log),
        MakeMethod("run", Method::kMemberFunction, &Probe::Run),
        MakeMethod("name", Method::kMemberFunction, &Probe::Name),
        MakeMethod("startUpdates", Method::kMemberFunction, &Probe::StartUpdates),
        MakeMethod("stopUpdates", Method::kMemberFunction, &Probe::StopUpdates),
        MakeMethod("staticLog", Method::kStaticFunction, &Probe::Log),
        MakeMethod("staticName", Method::kStaticFunction, &Probe::Name),
    };
    for (const Method& row : rows) {
        methodArrayToFill.InsertAt(methodArrayToFill.size(), row);
    }
}

ASExtensionClass* Probe::ConstructInstance(StageWindow*, ASObject& object, ASValueArray& arguments)
{
    EXPECT_EQ(std::this_thread::get_id(), s_mainThread);
    EXPECT_EQ(object.GetExtensionInstance(), nullptr);
    AEString name;
    if (!arguments.empty()) object.ToText(arguments[0], name);
    if (name == "refused") return nullptr;
    if (!name.empty()) s_lines.push_back("constructed " + std::string(name.c_str()));
    ++s_constructed;
    return new Probe(name.c_str());
}

void Probe::DestructInstance(StageWindow*, ASObject& object)
{
    EXPECT_EQ(std::this_thread::get_id(), s_mainThread);
    auto* pProbe = static_cast<Probe*>(object.GetExtensionInstance());
    ASSERT_NE(pProbe, nullptr);
    if (!pProbe->m_Name.empty()) s_lines.push_back("destructed " + pProbe->m_Name);
    delete pProbe;
}

void Probe::OnUpdate(StageWindow* pWindow, ASObject& object)
{
    EXPECT_EQ(std::this_thread::get_id(), s_mainThread);
    EXPECT_EQ(object.GetExtensionInstance(), this);
    if (s_onUpdate) {
        ASValueArray none;
        ASValue unused;
        s_onUpdate({pWindow, object, none, unused});
    } else {
        s_lines.push_back("update " + m_Name);
    }
}

void Probe::Log(StageWindow*, ASObject& object, ASValueArray& arguments, ASValue&)
{
    std::string line;
    for (const ASValue& argument : arguments) {
        AEString text;
        EXPECT_TRUE(object.ToText(argument, text));
        if (!line.empty()) line += ' ';
        line.append(text.c_str(), text.length());
    }
    s_lines.push_back(line);
}

void Probe::Run(StageWindow* pWindow, ASObject& object, ASValueArray& arguments, ASValue& result)
{
    EXPECT_EQ(std::this_thread::get_id(), s_mainThread);
    EXPECT_EQ(object.GetExtensionInstance(), this);
    EXPECT_EQ(result.GetType(), ASValue::kUndefined);
    const auto run = s_run;  // it may set another
    if (run) run({pWindow, object, arguments, result});
}

// ---- RuntimeTest

RuntimeTest::RuntimeTest()
{
    Probe::s_lines.clear();
    Probe::s_run = nullptr;
    Probe::s_onUpdate = nullptr;
    Probe::s_mainThread = std::this_thread::get_id();
    Probe::s_constructed = Probe::s_deleted = 0;

    setenv("STAGECRAFT_FPS", "200", 1);  // ticks come fast, so that tests end soon
    unsetenv("STAGECRAFT_MOVIE");
}

void RuntimeTest::SetUp()
{
    const char* pOther = getenv("STAGECRAFT_RUNTIME_LIBRARY");
    const char* pLibrary = pOther && *pOther ? pOther : RUNTIME_LIBRARY;
    m_PLibrary = dlopen(pLibrary, RTLD_NOW | RTLD_GLOBAL);
    ASSERT_NE(m_PLibrary, nullptr) << dlerror();
    const auto initialize =
        reinterpret_cast<IAEModule_InitializeKernelFunction>(dlsym(m_PLibrary, IAEMODULE_INITIALIZE_KERNEL));
    m_LoadModule = reinterpret_cast<IAEModule_LoadModuleFunction>(dlsym(m_PLibrary, IAEMODULE_LOAD_MODULE));
    m_UnloadModule = reinterpret_cast<IAEModule_UnloadModuleFunction>(dlsym(m_PLibrary, IAEMODULE_UNLOAD_MODULE));
    ASSERT_TRUE(initialize && m_LoadModule && m_UnloadModule);

    const char* const arguments[] = {"stagecraft"};
    m_PKernel = initialize(1, arguments);
    ASSERT_NE(m_PKernel, nullptr);
    EXPECT_EQ(initialize(1, arguments), m_PKernel);
    m_PRuntime = static_cast<IStagecraft*>(m_LoadModule(IAEMODULE_STAGECRAFT));
    ASSERT_NE(m_PRuntime, nullptr);
    ASSERT_EQ(m_PRuntime->RegisterExtensionClass<Probe>().m_nErrorValue, AEError::OK);
}

void RuntimeTest::TearDown()
{
    if (m_PRuntime) {
        Destroy();
        m_UnloadModule(IAEMODULE_STAGECRAFT);
    }
    EXPECT_EQ(Probe::s_deleted, Probe::s_constructed) << "each instance is destructed once";
    if (m_PLibrary) dlclose(m_PLibrary);
}

void RuntimeTest::WriteMovie(const std::string& script)
{
    m_Folder.Write("movie.js", "var Probe = com.example.Probe, probe = new Probe();\n" + script);
}

AEError RuntimeTest::Create(const std::vector<const char*>& options)
{
    std::vector<const char*> arguments{"stagecraft"};
    arguments.insert(arguments.end(), options.begin(), options.end());
    arguments.push_back(m_Movie.c_str());
    return m_PRuntime->CreateAndConfigureStageWindowSet(m_Set, static_cast<int>(arguments.size()), arguments.data(), 1);
}

AEError RuntimeTest::Play(const std::string& script, const std::vector<const char*>& options)
{
    WriteMovie(script);
    testing::internal::CaptureStderr();
    AEError result = Create(options);
    if (result.m_nErrorValue == AEError::OK) result = Run();
    EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
    m_Errors = testing::internal::GetCapturedStderr();
    EXPECT_TRUE(m_Set.empty());
    return result;
}

Lines RuntimeTest::Logged(const std::string& script, const std::vector<const char*>& options)
{
    Probe::s_lines.clear();
    EXPECT_EQ(Play(script, options).m_nErrorValue, AEError::OK) << script;
    EXPECT_EQ(m_Errors, "") << script;
    return Probe::s_lines;
}
