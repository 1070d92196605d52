// Kernel, registration, dispatch to native methods, and the life of instances.
#include <algorithm>
#include <csignal>

#include "RuntimeFixture.h"

namespace {

TEST_F(RuntimeTest, ModulesAreLoadedByName)
{
    EXPECT_EQ(m_LoadModule(IAEMODULE_STAGECRAFT), static_cast<void*>(m_PRuntime));
    EXPECT_EQ(m_LoadModule("IStagecraft2"), nullptr);
    EXPECT_EQ(m_LoadModule(nullptr), nullptr);
    m_UnloadModule("IStagecraft2");
}

TEST_F(RuntimeTest, KernelMutexesExclude)
{
    constexpr int kRounds = 20000;
    IAEKernel::Mutex* pMutex = m_PKernel->CreateMutex();
    int count = 0;
    const auto work = [&] {
        for (int i = 0; i < kRounds; ++i) {
            pMutex->Lock();
            ++count;
            pMutex->Unlock();
        }
    };
    std::thread other(work);
    work();
    other.join();
    EXPECT_EQ(count, 2 * kRounds);
    m_PKernel->DestroyMutex(pMutex);
}

using KernelDeathTest = RuntimeTest;

TEST_F(KernelDeathTest, UsageFaultsAbort)
{
    EXPECT_EXIT(m_PKernel->AssertionFailed("pMutex != 0", "./Some.cpp", 47, "SetMutex"),
                testing::KilledBySignal(SIGABRT), "pMutex != 0.*\\./Some.cpp.*47.*SetMutex");
}

TEST_F(RuntimeTest, RegistrationIsChecked)
{
    const auto add = [this](const char* pName, IStagecraft::GetMethodsFunction getMethods = &Probe::GetMethods,
                            IStagecraft::FiresEventsFunction firesEvents = &Probe::FiresEvents,
                            IStagecraft::ConstructInstanceFunction construct = &Probe::ConstructInstance,
                            IStagecraft::DestructInstanceFunction destruct = &Probe::DestructInstance) {
        return m_PRuntime->RegisterExtensionClass(pName, getMethods, firesEvents, construct, destruct).m_nErrorValue;
    };
    for (const char* pName : {static_cast<const char*>(nullptr), "", ".com", "com.", "com..Other", "com.example.Probe"})
        EXPECT_EQ(add(pName), AEError::InvalidParameters) << (pName ? pName : "null");
    EXPECT_EQ(add("com.Other", nullptr), AEError::InvalidParameters);
    EXPECT_EQ(add("com.Other", &Probe::GetMethods, &Probe::FiresEvents, nullptr), AEError::InvalidParameters);
    const auto withoutName = [](AEArray<ASExtensionClass::Method>& methods) {
        Probe::GetMethods(methods);
        methods[methods.size() - 1].m_pName = nullptr;
    };
    EXPECT_EQ(add("com.Other", withoutName), AEError::InvalidParameters);

    // The same name again, now with everything. The name is copied. A name without dots, and one below another class.
    std::string name = "com.Other";
    for (const char* pName : {name.c_str(), "Plain", "com.example.Probe.Inner"})
        EXPECT_EQ(add(pName), AEError::OK);
    name.assign(name.size(), '?');
    EXPECT_EQ(Logged("probe.log(new com.Other('a').name(), new Plain('b').name(), new Probe.Inner('c').name());"
                     "probe.log(new Plain() instanceof Probe);")
                  .back(),
              "false");
}

TEST_F(RuntimeTest, MethodsOfBothKinds)
{
    EXPECT_EQ(Logged("var named = new Probe('n', 2);"
                     "probe.log(named.name(), named.staticName(), Probe.staticName() === '', typeof Probe.name);"
                     "Probe.staticLog('on the class'); named.staticLog('on', 'an', 'instance');"
                     "var detached = Probe.staticLog; detached('on nothing');"
                     "probe.log(named instanceof Probe, named.constructor === Probe);"),
              (Lines{"constructed n", "n n true string", "on the class", "on an instance", "on nothing", "true true",
                     "destructed n"}));
    // One instance more than the script made stands behind the static functions of the class.
    EXPECT_EQ(Probe::s_constructed, 3);
}

// Each of these is an error that the script can catch, and that names the method or class.
TEST_F(RuntimeTest, WrongCallsAreScriptErrors)
{
    const std::pair<const char*, const char*> rows[] = {
        {"Probe.prototype.run.call({})", "com.example.Probe.run"},
        {"Probe.prototype.run.call(5)", "com.example.Probe.run"},
        {"Object.create(probe).run()", "com.example.Probe.run"},
        {"var run = probe.run; run()", "com.example.Probe.run"},
        {"Probe()", "com.example.Probe"},
        {"new Probe('refused')", "com.example.Probe"},
        {"setTimeout('text', 1)", "setTimeout"},
    };
    Probe::s_run = [](const Invocation&) { FAIL() << "nothing may be called"; };
    for (const auto& [pCode, pNamed] : rows) {
        const Lines lines =
            Logged(std::string("try { ") + pCode + "; probe.log('no error'); } catch (e) { probe.log(e.message); }");
        EXPECT_NE(lines.at(0).find(pNamed), std::string::npos) << lines[0];
    }
}

TEST_F(RuntimeTest, InstancesEndWithTheirSet)
{
    WriteMovie(
        "var a = new Probe('a'); probe.b = new Probe('b'); a.probe = probe; probe.a = a; a.startUpdates();"
        "setTimeout(function() { new Probe('gone'); quit(); }, 1);"
        "setInterval((function(c) { return function() {}; })(new Probe('c')), 1000);");
    Probe::s_onUpdate = [](const Invocation&) {};
    ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
    ASSERT_EQ(Run().m_nErrorValue, AEError::OK);
    const auto ended = [] {
        return std::count_if(Probe::s_lines.begin(), Probe::s_lines.end(),
                             [](const std::string& line) { return line.rfind("destructed ", 0) == 0; });
    };
    EXPECT_LE(ended(), 1) << "the one that nothing refers to may be gone";
    EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
    EXPECT_EQ(ended(), 4);
}

TEST_F(RuntimeTest, SetsFollowEachOther)
{
    WriteMovie("probe.log(typeof leftover); var leftover = 1;");
    for (int round = 0; round < 2; ++round) {
        ASSERT_EQ(Create().m_nErrorValue, AEError::OK);
        EXPECT_EQ(m_Set.size(), 1u);
        AEArray<StageWindow*> second;
        EXPECT_EQ(m_PRuntime->CreateAndConfigureStageWindowSet(second, 1, std::vector<const char*>{"x"}.data(), 1)
                      .m_nErrorValue,
                  AEError::Usage);
        EXPECT_TRUE(second.empty());
        EXPECT_EQ(Run().m_nErrorValue, AEError::OK);
        EXPECT_EQ(Run().m_nErrorValue, AEError::Usage);
        EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
        EXPECT_EQ(Destroy().m_nErrorValue, AEError::OK);
        EXPECT_EQ(Run().m_nErrorValue, AEError::Usage);
    }
    EXPECT_EQ(Probe::s_lines, (Lines{"undefined", "undefined"}));
}

}  // namespace
