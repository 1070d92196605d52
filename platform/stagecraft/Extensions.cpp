#include "Extensions.h"

#include <algorithm>

using namespace ae::stagecraft;

namespace {

void* HeapObjectOf(const ASValue& value)
{
    return value.IsObject() ? static_cast<ScriptObject*>(value.GetObject())->HeapObject() : nullptr;
}

// Names the native method that runs, for error reports.
class CurrentMethod {
public:
    CurrentMethod(ScriptEngine& engine, std::string name)
        : m_Engine(engine), m_Outer(engine.SetCurrentMethod(std::move(name)))
    {}
    ~CurrentMethod() { m_Engine.SetCurrentMethod(std::move(m_Outer)); }
    CurrentMethod(const CurrentMethod&) = delete;
    CurrentMethod& operator=(const CurrentMethod&) = delete;

private:
    ScriptEngine& m_Engine;
    std::string m_Outer;
};

}  // namespace

Extensions::Extensions(ScriptEngine& engine, StageWindow& window, const std::vector<ExtensionClass>& classes)
    : m_Engine(engine),
      m_Window(window),
      m_Classes(classes),
      m_Constructors(classes.size()),
      m_StaticInstances(classes.size())
{
    m_Engine.SetExtensions(this);
    for (size_t i = 0; i < m_Classes.size(); ++i) {
        Define(i);
    }
}

Extensions::~Extensions()
{
    DestructAll();
    m_Constructors.clear();
    m_Engine.SetExtensions(nullptr);
}

// ---- Script classes

void Extensions::Define(size_t classIndex)
{
    const ExtensionClass& extension = m_Classes[classIndex];
    const int construct = m_Engine.AddNative([this, &extension](NativeCall& call) { Construct(extension, call); });
    const int finalize = m_Engine.AddNative([this](NativeCall& call) {
        if (!call.arguments.empty() && call.arguments[0].IsObject()) Destruct(HeapObjectOf(call.arguments[0]));
    });
    m_Engine.Evaluate(
        [&](duk_context* pContext) {
            ScriptEngine::PushNative(pContext, construct);
            duk_push_object(pContext);
            duk_dup(pContext, -2);
            duk_put_prop_string(pContext, -2, "constructor");
            ScriptEngine::PushNative(pContext, finalize);
            duk_set_finalizer(pContext, -2);  // inherited by the instances
            duk_put_prop_string(pContext, -2, "prototype");
            duk_dup(pContext, -1);
            ScriptEngine::PutGlobal(pContext, extension.name.c_str());
        },
        m_Constructors[classIndex]);
    DefineMethods(classIndex);
}

void Extensions::DefineMethods(size_t classIndex)
{
    for (const ASExtensionClass::Method& method : m_Classes[classIndex].methods) {
        const int native =
            m_Engine.AddNative([this, classIndex, &method](NativeCall& call) { Invoke(classIndex, method, call); });
        m_Engine.Execute([&](duk_context* pContext) {
            ScriptEngine::PushValue(pContext, m_Constructors[classIndex]);
            duk_get_prop_string(pContext, -1, "prototype");
            ScriptEngine::PushNative(pContext, native);
            duk_dup(pContext, -1);
            duk_put_prop_string(pContext, -3, method.m_pName);
            if (method.m_type == ASExtensionClass::Method::kStaticFunction) {
                duk_put_prop_string(pContext, -3, method.m_pName);
            }
        });
    }
}

void Extensions::Invoke(size_t classIndex, const ASExtensionClass::Method& method, NativeCall& call)
{
    const ExtensionClass& extension = m_Classes[classIndex];
    const std::string name = extension.name + "." + method.m_pName;
    ASValue self = call.self;
    if (method.m_type == ASExtensionClass::Method::kStaticFunction && !Find(self, extension)) {
        self = StaticInstance(classIndex);
    }
    const Instance* pInstance = Find(self, extension);
    if (!pInstance) {
        call.error = name + ": called on something that is no live instance of the class";
        return;
    }
    const CurrentMethod running(m_Engine, name);
    (pInstance->pNative->*method.m_function)(&m_Window, *self.GetObject(), call.arguments, call.result);
}

// The instance on which static functions run that are called on the class; undefined when it cannot be constructed.
ASValue Extensions::StaticInstance(size_t classIndex)
{
    ASValue& instance = m_StaticInstances[classIndex];
    if (!instance.IsObject()) {
        ASValue made;
        m_Engine.Evaluate(
            [&](duk_context* pContext) {
                ScriptEngine::PushValue(pContext, m_Constructors[classIndex]);
                duk_new(pContext, 0);
            },
            made);
        instance = made;
    }
    return instance;
}

// ---- Instances

const Extensions::Instance* Extensions::Find(const ASValue& value, const ExtensionClass& extension) const
{
    const auto found = m_Instances.find(HeapObjectOf(value));
    const bool usable = found != m_Instances.end() && found->second.pClass == &extension && found->second.pNative;
    return usable ? &found->second : nullptr;
}

ASExtensionClass* Extensions::InstanceOf(void* pHeapObject)
{
    const auto found = m_Instances.find(pHeapObject);
    return found != m_Instances.end() ? found->second.pNative : nullptr;
}

void Extensions::Construct(const ExtensionClass& extension, NativeCall& call)
{
    if (!call.isConstruct || !call.self.IsObject()) {
        call.error = extension.name + ": a class is called with \"new\"";
        return;
    }
    void* const pHeapObject = HeapObjectOf(call.self);
    m_Instances[pHeapObject] = Instance{&extension, nullptr, ++m_Counter, false};
    ASExtensionClass* pNative;
    {
        const CurrentMethod running(m_Engine, extension.name);
        pNative = extension.construct(&m_Window, *call.self.GetObject(), call.arguments);
    }
    if (pNative) {
        m_Instances[pHeapObject].pNative = pNative;
        return;
    }
    m_Instances.erase(pHeapObject);
    StopUpdates(*static_cast<ScriptObject*>(call.self.GetObject()));
    call.error = extension.name + ": no instance could be constructed";
}

void Extensions::Destruct(void* pHeapObject)
{
    const auto found = m_Instances.find(pHeapObject);
    if (found == m_Instances.end() || !found->second.pNative || found->second.destructing) return;
    found->second.destructing = true;
    ScriptObject* pObject = m_Engine.Wrap(pHeapObject);
    StopUpdates(*pObject);
    found->second.pClass->destruct(&m_Window, *pObject);
    m_Instances.erase(found);
    pObject->Release();
}

void Extensions::DestructAll()
{
    m_StaticInstances.assign(m_Classes.size(), ASValue());
    for (;;) {
        void* pYoungest = nullptr;
        uint64_t number = 0;
        for (const auto& entry : m_Instances) {
            const bool candidate = entry.second.pNative && !entry.second.destructing;
            if (candidate && entry.second.number > number) {
                pYoungest = entry.first;
                number = entry.second.number;
            }
        }
        if (!pYoungest) break;
        Destruct(pYoungest);
    }
}

// ---- Update calls

void Extensions::StartUpdates(ScriptObject& object)
{
    const bool registered = std::any_of(m_Updates.begin(), m_Updates.end(),
                                        [&](const Registration& update) { return update.pObject == &object; });
    const auto instance = m_Instances.find(object.HeapObject());
    if (registered || instance == m_Instances.end() || instance->second.destructing) return;
    object.AddRef();
    m_Updates.push_back(Registration{&object, ++m_Counter});
}

void Extensions::StopUpdates(ScriptObject& object)
{
    const auto found = std::find_if(m_Updates.begin(), m_Updates.end(),
                                    [&](const Registration& update) { return update.pObject == &object; });
    if (found == m_Updates.end()) return;
    m_Updates.erase(found);
    object.Release();
}

void Extensions::Update(const std::function<bool()>& ended)
{
    // Registrations made meanwhile have higher numbers and wait for the next tick.
    const uint64_t last = m_Counter;
    for (uint64_t done = 0; !ended();) {
        const auto next = std::find_if(m_Updates.begin(), m_Updates.end(),
                                       [&](const Registration& update) { return update.number > done; });
        if (next == m_Updates.end() || next->number > last) break;
        done = next->number;
        const ASValue held = ASValue::Object(next->pObject);
        const auto instance = m_Instances.find(next->pObject->HeapObject());
        if (instance == m_Instances.end() || !instance->second.pNative) continue;
        const CurrentMethod running(m_Engine, instance->second.pClass->name + ".OnUpdate");
        instance->second.pNative->OnUpdate(&m_Window, *held.GetObject());
    }
}
