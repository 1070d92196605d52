#include "ScriptObject.h"

#include <cmath>

#include "ScriptEngine.h"

using namespace ae::stagecraft;

namespace {

// For bodies: raises when what was read is nothing that native code can hold.
void RefuseSymbol(duk_context* pContext)
{
    if (duk_is_symbol(pContext, -1)) duk_type_error(pContext, "a symbol cannot be read by native code");
}

}  // namespace

void ScriptObject::Release()
{
    if (--m_References > 0) return;
    if (m_PEngine) m_PEngine->Forget(*this);
    delete this;
}

template <class Body>
bool ScriptObject::Evaluate(Body&& body, ASValue& result)
{
    if (!m_PEngine) {
        result = ASValue();
        return false;
    }
    void* const pSelf = m_PHeapObject;
    return m_PEngine->Evaluate(
        [&](duk_context* pContext) {
            duk_push_heapptr(pContext, pSelf);
            body(pContext);
        },
        result);
}

bool ScriptObject::IsInstanceOf(const char* pClassName)
{
    ASValue result;
    Evaluate(
        [&](duk_context* pContext) {
            ScriptEngine::PushGlobal(pContext, pClassName);
            duk_push_boolean(pContext, duk_is_function(pContext, -1) && duk_instanceof(pContext, -2, -1));
        },
        result);
    return result.GetBoolean();
}

ASExtensionClass* ScriptObject::GetExtensionInstance()
{
    return m_PEngine && m_PEngine->Extensions() ? m_PEngine->Extensions()->InstanceOf(m_PHeapObject) : nullptr;
}

bool ScriptObject::GetProperty(const char* pName, ASValue& value)
{
    return Evaluate(
        [&](duk_context* pContext) {
            ScriptEngine::PushText(pContext, pName);
            duk_get_prop(pContext, -2);
            RefuseSymbol(pContext);
        },
        value);
}

bool ScriptObject::SetProperty(const char* pName, const ASValue& value)
{
    ASValue unused;
    return Evaluate(
        [&](duk_context* pContext) {
            ScriptEngine::PushText(pContext, pName);
            ScriptEngine::PushValue(pContext, value);
            duk_put_prop(pContext, -3);
            duk_push_undefined(pContext);
        },
        unused);
}

uint32_t ScriptObject::GetLength()
{
    ASValue length;
    GetProperty("length", length);
    return ASToUint32(length.GetNumber());
}

bool ScriptObject::GetElement(uint32_t index, ASValue& value)
{
    return Evaluate(
        [&](duk_context* pContext) {
            duk_get_prop_index(pContext, -1, index);
            RefuseSymbol(pContext);
        },
        value);
}

bool ScriptObject::Call(const char* pFunctionName, const ASValueArray& arguments, ASValue& result)
{
    if (m_PEngine && !m_PEngine->Running()) {
        result = ASValue();
        return false;
    }
    return Evaluate(
        [&](duk_context* pContext) {
            const duk_idx_t self = duk_get_top_index(pContext);
            ScriptEngine::PushText(pContext, pFunctionName);
            ScriptEngine::PushArguments(pContext, arguments);
            duk_call_prop(pContext, self, static_cast<duk_idx_t>(arguments.size()));
        },
        result);
}

bool ScriptObject::Construct(const char* pClassName, const ASValueArray& arguments, ASValue& result)
{
    return Evaluate(
        [&](duk_context* pContext) {
            ScriptEngine::PushGlobal(pContext, pClassName);
            if (!duk_is_function(pContext, -1)) duk_type_error(pContext, "there is no class %s", pClassName);
            ScriptEngine::PushArguments(pContext, arguments);
            duk_new(pContext, static_cast<duk_idx_t>(arguments.size()));
        },
        result);
}

void ScriptObject::StartUpdates()
{
    if (m_PEngine && m_PEngine->Extensions()) m_PEngine->Extensions()->StartUpdates(*this);
}

void ScriptObject::StopUpdates()
{
    if (m_PEngine && m_PEngine->Extensions()) m_PEngine->Extensions()->StopUpdates(*this);
}

double ScriptObject::ToNumber(const ASValue& value)
{
    return m_PEngine ? m_PEngine->ToNumber(value) : NAN;
}

bool ScriptObject::ToText(const ASValue& value, AEString& text)
{
    if (m_PEngine) return m_PEngine->ToText(value, text);
    text = AEString();
    return false;
}
