// Script values and script objects as native code sees them.
//
// Threads: main thread only, all of it. A worker passes plain native data to the main thread, never a value or object.
//
// Ownership: ASValue and ASValueArray are plain values; a value that holds an object holds a reference to it. ASObject
// counts references: the runtime must keep a script object alive while native code holds a reference to it, while it is
// registered for updates, and while one of its handlers runs. Native code must have given back every reference before
// the runtime module is unloaded. The same script object must be the same ASObject as long as a reference is held.
//
// Text is UTF-8 in both directions. The runtime must replace ill-formed bytes, and surrogates that have no partner, by
// U+FFFD.
//
// Script errors: an operation that runs script code (a called function, a getter, a toString) can fail. The runtime
// must report the error on the error stream ("script error: ", message, file, line, and the native method that was
// running) and return false; it must not unwind native code. After RunStageWindowSet has returned, Call does nothing
// and returns false. After a stop request had to break off the script, and after the stage-window set was destroyed,
// every operation but AddRef, Release and GetExtensionInstance does: native code must expect false, and no object, at
// any time.
#pragma once

#include <cmath>
#include <cstdint>
#include <utility>

#include "stagecraft/AEArray.h"
#include "stagecraft/AEString.h"

namespace ae {
namespace stagecraft {

class ASExtensionClass;
class ASValue;
typedef AEArray<ASValue> ASValueArray;

// ---- Number to integer as ECMAScript does it (ToUint32, ToInt32): the fraction is cut off, the rest taken modulo
// 2^32; NaN and the infinities are 0.

inline uint32_t ASToUint32(double number)
{
    const double kTwo32 = 4294967296.0;
    if (!std::isfinite(number)) return 0;
    double rest = std::fmod(std::trunc(number), kTwo32);
    if (rest < 0) rest += kTwo32;
    return static_cast<uint32_t>(rest);
}

inline int32_t ASToInt32(double number)
{
    const uint32_t bits = ASToUint32(number);
    return bits <= 0x7FFFFFFFu ? static_cast<int32_t>(bits) : -1 - static_cast<int32_t>(~bits);
}

// A script object: also functions, arrays and dates. Implemented by the runtime.
//
// Names are UTF-8 and must not be null. Output values are set on every path: undefined when the operation failed.
class ASObject {
public:
    virtual void AddRef() = 0;
    // The object must not be used by the caller after its last Release.
    virtual void Release() = 0;

    // The script's "instanceof" with the class of that (dotted) global name: "Array", "Date", "com.example.Player".
    // false when there is no such class.
    virtual bool IsInstanceOf(const char* pClassName) = 0;
    // The native instance behind an object of an extension class; null for every other object, while ConstructInstance
    // has not returned, and after DestructInstance.
    virtual ASExtensionClass* GetExtensionInstance() = 0;

    // A property that does not exist reads as undefined, with true. A symbol, which is no value to native code, is a
    // failure.
    virtual bool GetProperty(const char* pName, ASValue& value) = 0;
    // Properties are enumerated in the order in which they were first set.
    virtual bool SetProperty(const char* pName, const ASValue& value) = 0;
    // The "length" of an array; 0 when the object has none that is a number, also when it cannot be read, which
    // GetUint("length", ...) tells.
    virtual uint32_t GetLength() = 0;
    // An index past the end reads as undefined, with true. A symbol is a failure.
    virtual bool GetElement(uint32_t index, ASValue& value) = 0;

    // Calls the object's own or inherited function of that name with this object as "this". false also when there is no
    // such function. Blocks as long as the script runs; handlers can be entered again before it returns. A function
    // object is called with Call("call", {this value, arguments...}).
    virtual bool Call(const char* pFunctionName, const ASValueArray& arguments, ASValue& result) = 0;
    // "new": an object of the class with that (dotted) global name, in the movie to which this object belongs.
    virtual bool Construct(const char* pClassName, const ASValueArray& arguments, ASValue& result) = 0;

    // From the next tick on the runtime must call OnUpdate of the extension instance behind this object once a tick.
    // Starting twice is like starting once; an object without an instance is never called. The movie goes on as long as
    // one object is registered.
    virtual void StartUpdates() = 0;
    // No OnUpdate follows, not even in the tick that is under way. Harmless when updates were not started.
    virtual void StopUpdates() = 0;

    // The script's own conversions, for a value of any kind: undefined to NaN and "undefined", null to 0 and "null",
    // "0x10" to 16. A failing conversion (an object whose toString throws) gives NaN, and "" with false.
    virtual double ToNumber(const ASValue& value) = 0;
    virtual bool ToText(const ASValue& value, AEString& text) = 0;

    // ---- What follows rests on the operations above: a runtime adds nothing to it.

    // The same number; false, with NaN, when the conversion failed, which NaN alone does not tell. An object is
    // converted once, by the movie's own class Number.
    inline bool ToNumber(const ASValue& value, double& number);

    // ---- A property read and converted at once; the property is read once and its value converted once. A property
    // that does not exist, is undefined or is null reads as 0, false and "", with true. false, and 0, false or "", when
    // the property cannot be read: its getter or the conversion of its value fails.
    inline bool GetNumber(const char* pName, double& number);
    inline bool GetInt(const char* pName, int32_t& number);
    inline bool GetUint(const char* pName, uint32_t& number);
    // Settings arrive as texts as often as not, so this is not the script's own truth: false are false, 0, NaN, and the
    // texts "", "0" and "false"; every other boolean, number and text is true. An object counts as what its valueOf
    // returns (new Boolean(false) is false), and when that is an object as its text ({} is true, [] is false).
    inline bool GetBoolean(const char* pName, bool& flag);
    inline bool GetText(const char* pName, AEString& text);

    // ---- Likewise for callers to whom a property that cannot be read is as good as none.
    double GetNumber(const char* pName) { return Read(&ASObject::GetNumber, pName, 0.0); }
    int32_t GetInt(const char* pName) { return Read(&ASObject::GetInt, pName, 0); }
    uint32_t GetUint(const char* pName) { return Read(&ASObject::GetUint, pName, 0u); }
    bool GetBoolean(const char* pName) { return Read(&ASObject::GetBoolean, pName, false); }
    AEString GetText(const char* pName) { return Read(&ASObject::GetText, pName, AEString()); }

protected:
    virtual ~ASObject() {}

private:
    template <class Value>
    Value Read(bool (ASObject::*get)(const char*, Value&), const char* pName, Value value)
    {
        (this->*get)(pName, value);
        return value;
    }
};

// A script value.
class ASValue {
public:
    enum Type { kUndefined, kNull, kBoolean, kNumber, kString, kObject };

    ASValue() {}  // undefined
    ASValue(const ASValue& other)
        : m_type(other.m_type), m_number(other.m_number), m_text(other.m_text), m_pObject(other.m_pObject)
    {
        if (m_pObject) m_pObject->AddRef();
    }
    ASValue(ASValue&& other) noexcept { Swap(other); }
    ASValue& operator=(ASValue other) noexcept
    {
        Swap(other);
        return *this;
    }
    ~ASValue()
    {
        if (m_pObject) m_pObject->Release();
    }

    static ASValue Null() { return ASValue(kNull); }
    static ASValue Boolean(bool value)
    {
        ASValue result(kBoolean);
        result.m_number = value ? 1 : 0;
        return result;
    }
    static ASValue Number(double value)
    {
        ASValue result(kNumber);
        result.m_number = value;
        return result;
    }
    // The bytes are copied; a null pointer is the script's null.
    static ASValue String(const char* pText) { return pText ? String(AEString(pText)) : Null(); }
    static ASValue String(const AEString& text)
    {
        ASValue result(kString);
        result.m_text = text;
        return result;
    }
    // Takes a reference of its own; a null pointer is the script's null.
    static ASValue Object(ASObject* pObject)
    {
        ASValue result(pObject ? kObject : kNull);
        result.m_pObject = pObject;
        if (pObject) pObject->AddRef();
        return result;
    }

    Type GetType() const { return m_type; }
    bool IsUndefinedOrNull() const { return m_type == kUndefined || m_type == kNull; }
    bool IsObject() const { return m_type == kObject; }

    // What a value of that type holds; for the other types false, 0, "" and null. ASObject converts between types.
    bool GetBoolean() const { return m_type == kBoolean && m_number != 0; }
    double GetNumber() const { return m_type == kNumber ? m_number : 0; }
    const AEString& GetString() const { return m_text; }
    ASObject* GetObject() const { return m_pObject; }  // borrowed: AddRef to keep it beyond this value

    // The script's truth: false for undefined, null, false, 0, NaN and "". ASObject::GetBoolean has a rule of its own.
    bool ToBoolean() const
    {
        switch (m_type) {
            case kBoolean:
            case kNumber:
                return m_number != 0 && !std::isnan(m_number);
            case kString:
                return !m_text.empty();
            case kObject:
                return true;
            default:
                return false;
        }
    }

private:
    explicit ASValue(Type type) : m_type(type) {}

    void Swap(ASValue& other) noexcept
    {
        std::swap(m_type, other.m_type);
        std::swap(m_number, other.m_number);
        std::swap(m_text, other.m_text);
        std::swap(m_pObject, other.m_pObject);
    }

    Type m_type = kUndefined;
    double m_number = 0;
    AEString m_text;
    ASObject* m_pObject = nullptr;
};

inline bool ASObject::ToNumber(const ASValue& value, double& number)
{
    ASValue converted = value;
    if (value.IsObject()) {
        ASValueArray arguments;
        arguments.Append(value);
        Construct("Number", arguments, converted);
    }
    number = ToNumber(converted);
    return !value.IsObject() || converted.IsObject();
}

inline bool ASObject::GetNumber(const char* pName, double& number)
{
    ASValue value;
    number = 0;
    if (!GetProperty(pName, value)) return false;
    if (value.IsUndefinedOrNull() || ToNumber(value, number)) return true;
    number = 0;
    return false;
}

inline bool ASObject::GetInt(const char* pName, int32_t& number)
{
    double wide;
    const bool succeeded = GetNumber(pName, wide);
    number = ASToInt32(wide);
    return succeeded;
}

inline bool ASObject::GetUint(const char* pName, uint32_t& number)
{
    double wide;
    const bool succeeded = GetNumber(pName, wide);
    number = ASToUint32(wide);
    return succeeded;
}

inline bool ASObject::GetBoolean(const char* pName, bool& flag)
{
    ASValue property, value;
    AEString text;
    flag = false;
    if (!GetProperty(pName, property)) return false;
    if (!property.IsObject()) {
        value = property;
    } else if (!property.GetObject()->Call("valueOf", ASValueArray(), value)) {
        return false;
    }
    if (value.IsObject()) {
        if (!ToText(value, text)) return false;
        value = ASValue::String(text);
    }
    flag = value.ToBoolean() && value.GetString() != "0" && value.GetString() != "false";
    return true;
}

inline bool ASObject::GetText(const char* pName, AEString& text)
{
    ASValue value;
    text = AEString();
    return GetProperty(pName, value) && (value.IsUndefinedOrNull() || ToText(value, text));
}

}  // namespace stagecraft
}  // namespace ae
