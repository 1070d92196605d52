#include "ScriptEngine.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "LastLine.h"
#include "ScriptBreak.h"
#include "Text.h"

using namespace ae::stagecraft;

namespace {

constexpr const char* kReferences = "references";  // the table in the heap's stash that keeps objects alive
constexpr duk_idx_t kStackRoom = 32;               // what the bodies of native operations need at most, arguments aside

[[noreturn]] void OnFatal(void*, const char* pMessage)
{
    fprintf(stderr, "stagecraft: the script engine failed: %s\n", pMessage ? pMessage : "unknown fault");
    abort();
}

ScriptEngine& EngineOf(duk_context* pContext)
{
    duk_memory_functions functions;
    duk_get_memory_functions(pContext, &functions);
    return *static_cast<ScriptEngine*>(functions.udata);
}

}  // namespace

// ---- The heap

ScriptEngine::ScriptEngine()
{
    m_PContext = duk_create_heap(Allocate, Reallocate, Free, this, OnFatal);
    if (!m_PContext) OnFatal(nullptr, "out of memory");
    Execute([](duk_context* pContext) {
        duk_push_heap_stash(pContext);
        duk_push_array(pContext);
        duk_put_prop_string(pContext, -2, kReferences);
        duk_get_global_string(pContext, "Duktape");
        duk_push_c_function(pContext, OnThrow, 1);
        duk_put_prop_string(pContext, -2, "errThrow");
    });
}

ScriptEngine::~ScriptEngine()
{
    for (const auto& entry : m_Objects) {
        entry.second->Detach();
    }
    m_Objects.clear();
    m_Natives.clear();  // finalizers still run
    if (m_Alive) duk_destroy_heap(m_PContext);
    for (Block* pBlock = m_Blocks.pNext; pBlock != &m_Blocks;) {
        free(std::exchange(pBlock, pBlock->pNext));
    }
}

void* ScriptEngine::Allocate(void* pEngine, duk_size_t size)
{
    return Reallocate(pEngine, nullptr, size);
}

void* ScriptEngine::Reallocate(void* pEngine, void* pOld, duk_size_t size)
{
    if (size == 0) {
        Free(pEngine, pOld);
        return nullptr;
    }
    Block* pOldBlock = pOld ? static_cast<Block*>(pOld) - 1 : nullptr;
    auto* pBlock = static_cast<Block*>(realloc(pOldBlock, sizeof(Block) + size));
    if (!pBlock) return nullptr;
    if (!pOldBlock) {
        Block& anchor = static_cast<ScriptEngine*>(pEngine)->m_Blocks;
        pBlock->pPrevious = &anchor;
        pBlock->pNext = anchor.pNext;
    }
    pBlock->pPrevious->pNext = pBlock;
    pBlock->pNext->pPrevious = pBlock;
    return pBlock + 1;
}

void ScriptEngine::Free(void*, void* pOld)
{
    if (!pOld) return;
    Block* pBlock = static_cast<Block*>(pOld) - 1;
    pBlock->pPrevious->pNext = pBlock->pNext;
    pBlock->pNext->pPrevious = pBlock->pPrevious;
    free(pBlock);
}

// ---- Calls into the engine

bool ScriptEngine::TryRaw(duk_safe_call_function function, void* pData)
{
    struct Call {
        duk_context* pContext;
        duk_safe_call_function function;
        void* pData;
        duk_int_t result;
    } call{m_PContext, function, pData, DUK_EXEC_ERROR};
    if (!m_Alive) return false;

    m_Alive = EnterScript(
        [](void* pCall) {
            Call& call = *static_cast<Call*>(pCall);
            if (!duk_check_stack(call.pContext, kStackRoom)) OnFatal(nullptr, "out of memory");
            call.result = duk_safe_call(call.pContext, call.function, call.pData, 0, 1);
        },
        &call);
    return m_Alive && call.result == DUK_EXEC_SUCCESS;
}

void ScriptEngine::Pop()
{
    if (m_Alive)
        m_Alive = EnterScript([](void* pContext) { duk_pop(static_cast<duk_context*>(pContext)); }, m_PContext);
}

bool ScriptEngine::Take(bool succeeded, ASValue& result)
{
    ASValue value;
    if (m_Alive && succeeded) {
        ReadValue(-1, value);
        Pop();
    } else if (m_Alive) {
        ReportError();
    }
    result = std::move(value);
    return m_Alive && succeeded;
}

void ScriptEngine::ReadValue(duk_idx_t index, ASValue& value)
{
    switch (duk_get_type(m_PContext, index)) {
        case DUK_TYPE_NULL:
            value = ASValue::Null();
            break;
        case DUK_TYPE_BOOLEAN:
            value = ASValue::Boolean(duk_get_boolean(m_PContext, index));
            break;
        case DUK_TYPE_NUMBER:
            value = ASValue::Number(duk_get_number(m_PContext, index));
            break;
        case DUK_TYPE_STRING: {
            if (duk_is_symbol(m_PContext, index)) break;
            duk_size_t length;
            const char* pText = duk_get_lstring(m_PContext, index, &length);
            const std::string text = Utf8FromScriptText(pText, length);
            value = ASValue::String(AEString(text.data(), text.size()));
            break;
        }
        default:
            if (void* pHeapObject = duk_get_heapptr(m_PContext, index)) {
                ScriptObject* pObject = Wrap(pHeapObject);
                value = ASValue::Object(pObject);
                pObject->Release();
            }
    }
}

void ScriptEngine::ReportError()
{
    // Reading an error can run script code, which can raise again.
    const auto describe = [this](duk_context* pContext) {
        const duk_idx_t error = duk_get_top_index(pContext);
        const char* pFile = m_ThrowFile;
        int line = m_ThrowLine;
        if (duk_is_error(pContext, error)) {
            duk_get_prop_string(pContext, error, "fileName");
            duk_get_prop_string(pContext, error, "lineNumber");
            const int ownLine = duk_get_int(pContext, -1);
            if (duk_is_string(pContext, -2) && ownLine > 0) {
                pFile = duk_get_string(pContext, -2);
                line = ownLine;
            }
        }
        duk_dup(pContext, error);
        const char* pMessage = duk_safe_to_string(pContext, -1);
        duk_push_sprintf(pContext, line > 0 ? "%s (%s:%d)" : "%s", pMessage, pFile, line);
    };
    ASValue text;
    const bool described = Try(describe);
    if (m_Alive && described) ReadValue(-1, text);
    Pop();
    Pop();
    LastLine::ScriptError();
    fprintf(stderr, "script error: %s%s%s\n", described ? text.GetString().c_str() : "an error without description",
            m_CurrentMethod.empty() ? "" : ", called by ", m_CurrentMethod.c_str());
}

// Duktape.errThrow: remembers which line of a script throws, and leaves the thrown value as it is.
duk_ret_t ScriptEngine::OnThrow(duk_context* pContext)
{
    ScriptEngine& engine = EngineOf(pContext);
    engine.m_ThrowLine = 0;
    for (duk_int_t level = -2; engine.m_ThrowLine <= 0; --level) {
        duk_inspect_callstack_entry(pContext, level);
        if (!duk_is_object(pContext, -1)) break;
        duk_get_prop_string(pContext, -1, "lineNumber");
        duk_get_prop_string(pContext, -2, "function");
        duk_get_prop_string(pContext, -1, "fileName");
        const char* pFile = duk_get_string_default(pContext, -1, "");
        snprintf(engine.m_ThrowFile, sizeof(engine.m_ThrowFile), "%s", pFile);
        engine.m_ThrowLine = duk_get_int(pContext, -3);
        duk_set_top(pContext, 1);
    }
    duk_set_top(pContext, 1);
    return 1;
}

// ---- Bodies

void ScriptEngine::PushText(duk_context* pContext, const char* pText, size_t length)
{
    auto* pBuffer = static_cast<char*>(duk_push_fixed_buffer(pContext, ScriptTextBound(length)));
    const size_t written = WriteScriptText(pText, length, pBuffer);
    duk_push_lstring(pContext, pBuffer, written);
    duk_remove(pContext, -2);
}

void ScriptEngine::PushText(duk_context* pContext, const char* pText)
{
    PushText(pContext, pText, strlen(pText));
}

void ScriptEngine::PushValue(duk_context* pContext, const ASValue& value)
{
    switch (value.GetType()) {
        case ASValue::kUndefined:
            duk_push_undefined(pContext);
            break;
        case ASValue::kNull:
            duk_push_null(pContext);
            break;
        case ASValue::kBoolean:
            duk_push_boolean(pContext, value.GetBoolean());
            break;
        case ASValue::kNumber:
            duk_push_number(pContext, value.GetNumber());
            break;
        case ASValue::kString:
            PushText(pContext, value.GetString().c_str(), value.GetString().length());
            break;
        case ASValue::kObject:
            duk_push_heapptr(pContext, static_cast<ScriptObject*>(value.GetObject())->HeapObject());
            break;
    }
}

void ScriptEngine::PushArguments(duk_context* pContext, const ASValueArray& arguments)
{
    duk_require_stack(pContext, static_cast<duk_idx_t>(arguments.size()) + kStackRoom);
    for (const ASValue& argument : arguments) {
        PushValue(pContext, argument);
    }
}

void ScriptEngine::PushGlobal(duk_context* pContext, const char* pDottedName)
{
    duk_push_global_object(pContext);
    for (const char* pPart = pDottedName; pPart;) {
        if (duk_is_null_or_undefined(pContext, -1)) return;
        const char* pDot = strchr(pPart, '.');
        PushText(pContext, pPart, pDot ? static_cast<size_t>(pDot - pPart) : strlen(pPart));
        duk_get_prop(pContext, -2);
        duk_remove(pContext, -2);
        pPart = pDot ? pDot + 1 : nullptr;
    }
}

void ScriptEngine::PutGlobal(duk_context* pContext, const char* pDottedName)
{
    duk_push_global_object(pContext);
    const char* pPart = pDottedName;
    for (const char* pDot = strchr(pPart, '.'); pDot; pPart = pDot + 1, pDot = strchr(pPart, '.')) {
        PushText(pContext, pPart, static_cast<size_t>(pDot - pPart));
        duk_dup(pContext, -1);
        duk_get_prop(pContext, -3);
        if (!duk_is_object(pContext, -1)) {
            duk_pop(pContext);
            duk_push_object(pContext);
            duk_dup(pContext, -2);
            duk_dup(pContext, -2);
            duk_put_prop(pContext, -5);
        }
        duk_remove(pContext, -2);
        duk_remove(pContext, -2);
    }
    PushText(pContext, pPart);
    duk_dup(pContext, -3);
    duk_put_prop(pContext, -3);
    duk_pop_2(pContext);
}

void ScriptEngine::PushNative(duk_context* pContext, int native)
{
    duk_push_c_function(pContext, NativeEntry, DUK_VARARGS);
    duk_set_magic(pContext, -1, native);
}

// ---- Operations

int ScriptEngine::AddNative(NativeFunction function)
{
    m_Natives.push_back(std::move(function));
    return static_cast<int>(m_Natives.size()) - 1;
}

bool ScriptEngine::DefineGlobal(const char* pName, NativeFunction function)
{
    const int native = AddNative(std::move(function));
    return Execute([&](duk_context* pContext) {
        PushNative(pContext, native);
        duk_put_global_string(pContext, pName);
    });
}

bool ScriptEngine::RunProgram(const std::string& text, const std::string& fileName)
{
    return Execute([&](duk_context* pContext) {
        PushText(pContext, text.data(), text.size());
        PushText(pContext, fileName.data(), fileName.size());
        duk_compile(pContext, DUK_COMPILE_SHEBANG);
        duk_call(pContext, 0);
    });
}

bool ScriptEngine::CallFunction(const ASValue& function, const ASValueArray& arguments)
{
    return Execute([&](duk_context* pContext) {
        PushValue(pContext, function);
        PushArguments(pContext, arguments);
        duk_call(pContext, static_cast<duk_idx_t>(arguments.size()));
    });
}

bool ScriptEngine::IsFunction(const ASValue& value)
{
    ASValue result;
    Evaluate(
        [&](duk_context* pContext) {
            PushValue(pContext, value);
            duk_push_boolean(pContext, duk_is_function(pContext, -1));
        },
        result);
    return result.GetBoolean();
}

double ScriptEngine::ToNumber(const ASValue& value)
{
    ASValue number;
    const bool converted = Evaluate(
        [&](duk_context* pContext) {
            PushValue(pContext, value);
            duk_to_number(pContext, -1);
        },
        number);
    return converted ? number.GetNumber() : NAN;
}

bool ScriptEngine::ToText(const ASValue& value, AEString& text)
{
    ASValue converted;
    const bool succeeded = Evaluate(
        [&](duk_context* pContext) {
            PushValue(pContext, value);
            duk_to_string(pContext, -1);
        },
        converted);
    text = converted.GetString();
    return succeeded;
}

// ---- References

ScriptObject* ScriptEngine::Wrap(void* pHeapObject)
{
    const auto known = m_Objects.find(pHeapObject);
    if (known != m_Objects.end()) {
        known->second->AddRef();
        return known->second;
    }
    auto* pObject = new ScriptObject(*this, pHeapObject);
    m_Objects[pHeapObject] = pObject;
    if (m_FreeReferences.empty()) m_FreeReferences.push_back(m_ReferenceCount++);
    pObject->m_Slot = m_FreeReferences.back();
    m_FreeReferences.pop_back();
    Execute([&](duk_context* pContext) {
        duk_push_heap_stash(pContext);
        duk_get_prop_string(pContext, -1, kReferences);
        duk_push_heapptr(pContext, pHeapObject);
        duk_put_prop_index(pContext, -2, pObject->m_Slot);
    });
    return pObject;
}

void ScriptEngine::Forget(ScriptObject& object)
{
    // First off the list: giving the reference back can finalize the object, which takes a new one.
    m_Objects.erase(object.HeapObject());
    Execute([&](duk_context* pContext) {
        duk_push_heap_stash(pContext);
        duk_get_prop_string(pContext, -1, kReferences);
        duk_push_undefined(pContext);
        duk_put_prop_index(pContext, -2, object.m_Slot);
    });
    m_FreeReferences.push_back(object.m_Slot);
}

// ---- Calls out of the engine

duk_ret_t ScriptEngine::NativeEntry(duk_context* pContext)
{
    if (!EngineOf(pContext).RunNative(pContext)) return duk_throw(pContext);
    return 1;
}

bool ScriptEngine::RunNative(duk_context* pContext)
{
    ScriptEntry* pEntry = EnterNative();
    duk_context* pOuterContext = std::exchange(m_PContext, pContext);
    const bool succeeded = CallNative(pContext);
    m_PContext = pOuterContext;
    LeaveNative(pEntry, !m_Alive);
    return succeeded;
}

// Leaves the result, or the error, on the stack.
bool ScriptEngine::CallNative(duk_context* pContext)
{
    const auto native = static_cast<size_t>(duk_get_current_magic(pContext));
    NativeCall call;
    call.isConstruct = duk_is_constructor_call(pContext);
    const duk_idx_t count = duk_get_top(pContext);
    duk_push_this(pContext);
    ReadValue(count, call.self);
    for (duk_idx_t i = 0; i < count && m_Alive; ++i) {
        ASValue argument;
        ReadValue(i, argument);
        call.arguments.Append(std::move(argument));
    }
    Pop();
    if (!m_Alive) return false;

    if (native < m_Natives.size()) m_Natives[native](call);

    if (call.error.empty()) {
        const auto pushResult = [&](duk_context* pTarget) { PushValue(pTarget, call.result); };
        return Try(pushResult);
    }
    const auto pushError = [&](duk_context* pTarget) {
        PushText(pTarget, call.error.data(), call.error.size());
        duk_push_error_object_raw(pTarget, DUK_ERR_TYPE_ERROR, nullptr, 0, "%s", duk_get_string(pTarget, -1));
    };
    Try(pushError);
    return false;
}
