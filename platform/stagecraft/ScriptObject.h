// A script object as native code holds it. Main thread only.
#pragma once

#include <duktape.h>

#include "stagecraft/ASValue.h"

class ScriptEngine;

class ScriptObject final : public ae::stagecraft::ASObject {
public:
    // The maker owns the first reference.
    ScriptObject(ScriptEngine& engine, void* pHeapObject) : m_PEngine(&engine), m_PHeapObject(pHeapObject) {}

    void AddRef() override { ++m_References; }
    void Release() override;
    bool IsInstanceOf(const char* pClassName) override;
    ae::stagecraft::ASExtensionClass* GetExtensionInstance() override;
    bool GetProperty(const char* pName, ae::stagecraft::ASValue& value) override;
    bool SetProperty(const char* pName, const ae::stagecraft::ASValue& value) override;
    uint32_t GetLength() override;
    bool GetElement(uint32_t index, ae::stagecraft::ASValue& value) override;
    bool Call(const char* pFunctionName, const ae::stagecraft::ASValueArray& arguments,
              ae::stagecraft::ASValue& result) override;
    bool Construct(const char* pClassName, const ae::stagecraft::ASValueArray& arguments,
                   ae::stagecraft::ASValue& result) override;
    void StartUpdates() override;
    void StopUpdates() override;
    double ToNumber(const ae::stagecraft::ASValue& value) override;
    bool ToText(const ae::stagecraft::ASValue& value, AEString& text) override;

    // The object's address in the engine: its identity, valid as long as this object has references. Null once the
    // engine is gone.
    void* HeapObject() const { return m_PHeapObject; }

    // ---- For the engine.
    duk_uarridx_t m_Slot = 0;  // in its table of references
    void Detach()              // it goes
    {
        m_PEngine = nullptr;
        m_PHeapObject = nullptr;
    }

private:
    // Runs `body`, which leaves one value on the stack above this object. Nothing of this object is used once `result`
    // is written: that may give back the last reference to it.
    template <class Body>
    bool Evaluate(Body&& body, ae::stagecraft::ASValue& result);

    ScriptEngine* m_PEngine;
    void* m_PHeapObject;
    unsigned m_References = 1;
};
