// The script engine's heap: calls into it and out of it, values across the border, references, error reports.
//
// Everything that can raise a script error runs inside Try, since an error unwinds to the innermost Try with longjmp:
// what runs there must own nothing that has to be destroyed. Native functions are plain C++ on the other side of
// NativeEntry, which alone turns their errors into script errors.
//
// Invariant: a ScriptObject with references is listed in m_Objects, and the engine's object behind it is held in the
// table of references, so that its address stays valid and stands for its identity.
//
// Threads: main thread only.
#pragma once

#include <duktape.h>

#include <functional>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "ScriptObject.h"
#include "stagecraft/ASValue.h"

// One call of a native function by the script.
struct NativeCall {
    ae::stagecraft::ASValue self;  // "this"
    ae::stagecraft::ASValueArray arguments;
    bool isConstruct = false;  // called with "new": self is the new object
    ae::stagecraft::ASValue result;
    std::string error;  // when set, the script gets a TypeError with this text instead of the result
};
using NativeFunction = std::function<void(NativeCall&)>;

// What script objects ask about the extension classes of their movie.
class ExtensionRegistry {
public:
    virtual ae::stagecraft::ASExtensionClass* InstanceOf(void* pHeapObject) = 0;
    virtual void StartUpdates(ScriptObject& object) = 0;
    virtual void StopUpdates(ScriptObject& object) = 0;

protected:
    ~ExtensionRegistry() = default;
};

class ScriptEngine {
public:
    ScriptEngine();
    // ScriptObjects that native code still holds lose their engine.
    ~ScriptEngine();
    ScriptEngine(const ScriptEngine&) = delete;
    ScriptEngine& operator=(const ScriptEngine&) = delete;

    // false once script code was broken off: every operation then fails.
    bool Alive() const { return m_Alive; }

    // Whether native code may call script functions.
    bool Running() const { return m_Running; }
    void SetRunning(bool running) { m_Running = running; }

    // Null until set, and null again while the registry goes.
    ExtensionRegistry* Extensions() const { return m_PExtensions; }
    void SetExtensions(ExtensionRegistry* pExtensions) { m_PExtensions = pExtensions; }

    // Runs `body`, a function of the engine's context that leaves one value on the stack, and takes that value. false,
    // and undefined, after a script error, which is reported.
    template <class Body>
    bool Evaluate(Body&& body, ae::stagecraft::ASValue& result)
    {
        return Take(Try(body), result);
    }
    // Likewise with a body that leaves nothing.
    template <class Body>
    bool Execute(Body&& body)
    {
        ae::stagecraft::ASValue unused;
        return Evaluate(
            [&](duk_context* pContext) {
                body(pContext);
                duk_push_undefined(pContext);
            },
            unused);
    }

    // ---- For bodies: may raise.
    static void PushText(duk_context* pContext, const char* pText, size_t length);
    static void PushText(duk_context* pContext, const char* pText);
    static void PushValue(duk_context* pContext, const ae::stagecraft::ASValue& value);
    static void PushArguments(duk_context* pContext, const ae::stagecraft::ASValueArray& arguments);
    // What the dotted name stands for, from the global object on; undefined when a part is missing.
    static void PushGlobal(duk_context* pContext, const char* pDottedName);
    // Takes the value from the stack and puts it under the dotted name; parts that are missing become objects.
    static void PutGlobal(duk_context* pContext, const char* pDottedName);
    static void PushNative(duk_context* pContext, int native);

    // ---- For native code.
    // The number under which bodies push the function. Native functions live as long as the engine.
    int AddNative(NativeFunction function);
    bool DefineGlobal(const char* pName, NativeFunction function);
    // Compiles and runs a script file's text.
    bool RunProgram(const std::string& text, const std::string& fileName);
    bool CallFunction(const ae::stagecraft::ASValue& function, const ae::stagecraft::ASValueArray& arguments);
    bool IsFunction(const ae::stagecraft::ASValue& value);
    double ToNumber(const ae::stagecraft::ASValue& value);
    bool ToText(const ae::stagecraft::ASValue& value, AEString& text);

    // The native method that runs, for error reports. Returns the one before.
    std::string SetCurrentMethod(std::string name) { return std::exchange(m_CurrentMethod, std::move(name)); }

    // ---- For ScriptObject.
    // The object at that address; the caller owns a reference.
    ScriptObject* Wrap(void* pHeapObject);
    void Forget(ScriptObject& object);

private:
    template <class Body>
    bool Try(Body& body)
    {
        return TryRaw(
            [](duk_context* pContext, void* pData) -> duk_ret_t {
                (*static_cast<Body*>(pData))(pContext);
                return 1;
            },
            const_cast<void*>(static_cast<const void*>(&body)));
    }
    bool TryRaw(duk_safe_call_function function, void* pData);
    bool Take(bool succeeded, ae::stagecraft::ASValue& result);
    void ReadValue(duk_idx_t index, ae::stagecraft::ASValue& value);
    void Pop();
    void ReportError();

    bool RunNative(duk_context* pContext);
    bool CallNative(duk_context* pContext);
    static duk_ret_t NativeEntry(duk_context* pContext);
    static duk_ret_t OnThrow(duk_context* pContext);

    // Every block is listed, so that the heap of an engine that was broken off can be freed.
    struct Block {
        Block* pPrevious;
        Block* pNext;
    };
    static void* Allocate(void* pEngine, duk_size_t size);
    static void* Reallocate(void* pEngine, void* pOld, duk_size_t size);
    static void Free(void* pEngine, void* pOld);

    Block m_Blocks{&m_Blocks, &m_Blocks};
    duk_context* m_PContext = nullptr;  // the one that runs: a coroutine has its own
    bool m_Alive = true;
    bool m_Running = false;
    ExtensionRegistry* m_PExtensions = nullptr;
    std::vector<NativeFunction> m_Natives;
    std::map<void*, ScriptObject*> m_Objects;
    std::vector<duk_uarridx_t> m_FreeReferences;
    duk_uarridx_t m_ReferenceCount = 0;
    std::string m_CurrentMethod;
    // Where the last throw happened: thrown values that are no Error do not know.
    char m_ThrowFile[256] = "";
    int m_ThrowLine = 0;
};
