// The registered extension classes inside one movie: their script classes, instances and update calls.
//
// Invariants: an instance is in m_Instances from before its ConstructInstance until after its DestructInstance, which
// is called once. An object with an update registration holds a reference, so it is not collected.
//
// Threads: main thread only.
#pragma once

#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "ScriptEngine.h"
#include "stagecraft/IStagecraft.h"

// A class as it was registered.
struct ExtensionClass {
    std::string name;
    AEArray<ae::stagecraft::ASExtensionClass::Method> methods;
    ae::stagecraft::IStagecraft::ConstructInstanceFunction construct;
    ae::stagecraft::IStagecraft::DestructInstanceFunction destruct;
};

class Extensions final : public ExtensionRegistry {
public:
    // The classes must outlive this object, the engine too. Values that the movie holds must go before this object:
    // when they do, instances can be finalized.
    Extensions(ScriptEngine& engine, ae::stagecraft::StageWindow& window, const std::vector<ExtensionClass>& classes);
    ~Extensions();
    Extensions(const Extensions&) = delete;
    Extensions& operator=(const Extensions&) = delete;

    bool HasUpdates() const { return !m_Updates.empty(); }
    // Calls OnUpdate of every object that is registered now, in the order of registration, until `ended` says so.
    void Update(const std::function<bool()>& ended);

    // Destructs the instances that are left, the youngest first.
    void DestructAll();

    ae::stagecraft::ASExtensionClass* InstanceOf(void* pHeapObject) override;
    void StartUpdates(ScriptObject& object) override;
    void StopUpdates(ScriptObject& object) override;

private:
    struct Instance {
        const ExtensionClass* pClass;
        ae::stagecraft::ASExtensionClass* pNative;
        uint64_t number;  // counts up over the movie
        bool destructing;
    };
    struct Registration {
        ScriptObject* pObject;
        uint64_t number;
    };

    void Define(size_t classIndex);
    void DefineMethods(size_t classIndex);
    void Construct(const ExtensionClass& extension, NativeCall& call);
    void Destruct(void* pHeapObject);
    void Invoke(size_t classIndex, const ae::stagecraft::ASExtensionClass::Method& method, NativeCall& call);
    ae::stagecraft::ASValue StaticInstance(size_t classIndex);
    const Instance* Find(const ae::stagecraft::ASValue& value, const ExtensionClass& extension) const;

    ScriptEngine& m_Engine;
    ae::stagecraft::StageWindow& m_Window;
    const std::vector<ExtensionClass>& m_Classes;
    std::vector<ae::stagecraft::ASValue> m_Constructors;     // of each class
    std::vector<ae::stagecraft::ASValue> m_StaticInstances;  // of each class; undefined until one is needed
    std::map<void*, Instance> m_Instances;                   // by the engine's address of the script object
    std::vector<Registration> m_Updates;
    uint64_t m_Counter = 0;
};
