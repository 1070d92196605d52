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
    if (!pProbe->m_name.empty()) s_lines.push_back("destructed " + pProbe->m_name);
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
        s_lines.push_back("update " + m_name);
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
    m_pLibrary = dlopen(pLibrary, RTLD_NOW | RTLD_GLOBAL);
    ASSERT_NE(m_pLibrary, nullptr) << dlerror();
    const auto initialize =
        reinterpret_cast<IAEModule_InitializeKernelFunction>(dlsym(m_pLibrary, IAEMODULE_INITIALIZE_KERNEL));
    m_loadModule = reinterpret_cast<IAEModule_LoadModuleFunction>(dlsym(m_pLibrary, IAEMODULE_LOAD_MODULE));
    m_unloadModule = reinterpret_cast<IAEModule_UnloadModuleFunction>(dlsym(m_pLibrary, IAEMODULE_UNLOAD_MODULE));
    ASSERT_TRUE(initialize && m_loadModule && m_unloadModule);

    const char* const arguments[] = {"stagecraft"};
    m_pKernel = initialize(1, arguments);
    ASSERT_NE(m_pKernel, nullptr);
    EXPECT_EQ(initialize(1, arguments), m_pKernel);
    m_pRuntime = static_cast<IStagecraft*>(m_loadModule(IAEMODULE_STAGECRAFT));
    ASSERT_NE(m_pRuntime, nullptr);
    ASSERT_EQ(m_pRuntime->RegisterExtensionClass<Probe>().m_nErrorValue, AEError::OK);
}

void RuntimeTest::TearDown()
{
    if (m_pRuntime) {
        Destroy();
        m_unloadModule(IAEMODULE_STAGECRAFT);
    }
    EXPECT_EQ(Probe::s_deleted, Probe::s_constructed) << "each instance is destructed once";
    if (m_pLibrary) dlclose(m_pLibrary);
}

void RuntimeTest::WriteMovie(const std::string& script)
{
    m_folder.Write("movie.js", "var Probe = com.example.Probe, probe = new Probe();\n" + script);
}

AEError RuntimeTest::Create(const std::vector<const char*>& options)
{
    std::vector<const char*> arguments{"stagecraft"};
    arguments.insert(arguments.end(), options.begin(), options.end());
    arguments.push_back(m_movie.c_str());
    return m_pRuntime->CreateAndConfigureStageWindowSet(m_set, static_cast<int>(arguments.size()), arguments.data(), 1);
}

AEError RuntimeTest::Play(const std::string& script, const std::vector<const char*>& options)
{
    WriteMovie(script);
    testing::internal::CaptureStderr();
    AEError result = Create(options);
    if (result.m_nErrorValue == AEError::OK) result = Run();
    EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
    m_errors = testing::internal::GetCapturedStderr();
    EXPECT_TRUE(m_set.empty());
    return result;
}

Lines RuntimeTest::Logged(const std::string& script, const std::vector<const char*>& options)
{
    Probe::s_lines.clear();
    EXPECT_EQ(Play(script, options).m_nErrorValue, AEError::OK) << script;
    EXPECT_EQ(m_errors, "") << script;
    return Probe::s_lines;
}
