// AEString: the runtime's string: bytes with an explicit length, always NUL-terminated. Text is UTF-8. A plain value
// without locking.
#pragma once

#include <cstddef>
#include <string>

class AEString {
public:
    AEString() {}
    AEString(const char* pText) : m_text(pText ? pText : "") {}  // null is the empty string
    AEString(const char* pText, size_t length) : m_text(pText ? pText : "", pText ? length : 0) {}

    // Never null. The text can hold NUL bytes of its own: c_str() then reads shorter than length().
    const char* c_str() const { return m_text.c_str(); }
    size_t length() const { return m_text.size(); }
    bool empty() const { return m_text.empty(); }

    bool operator==(const AEString& other) const { return m_text == other.m_text; }
    bool operator!=(const AEString& other) const { return m_text != other.m_text; }

private:
    std::string m_text;
};
