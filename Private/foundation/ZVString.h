// The library's byte string: bytes with an explicit length, NUL bytes allowed, always NUL-terminated. A plain value
// without locking. Null pointers and indexes outside of the length are assertion failures; memory exhaustion throws
// std::bad_alloc.
#pragma once

#include <stddef.h>

#include <string>

#include "ZVAssert.h"

class ZVString {
public:
    static constexpr size_t npos = std::string::npos;

    ZVString() = default;
    ZVString(const char* buf) : m_Text(Checked(buf)) {}
    ZVString(const char* buf, size_t length) : m_Text(Checked(buf), length) {}

    const char* c_str() const { return m_Text.c_str(); }
    size_t length() const { return m_Text.size(); }
    size_t size() const { return m_Text.size(); }
    bool empty() const { return m_Text.empty(); }

    char operator[](size_t idx) const
    {
        ZV_ASSERT(idx < length());
        return m_Text[idx];
    }
    char& operator[](size_t idx)
    {
        ZV_ASSERT(idx < length());
        return m_Text[idx];
    }

    /// The first place of the byte at or after `from`; npos when there is none.
    size_t find(char c, size_t from = 0) const { return m_Text.find(c, from); }

    /// At most `count` bytes from `from` on; empty when `from` is past the end.
    ZVString substr(size_t from, size_t count = npos) const;

    ZVString& assign(const char* buf, size_t length)
    {
        m_Text.assign(Checked(buf), length);
        return *this;
    }
    ZVString& append(const char* buf, size_t length)
    {
        m_Text.append(Checked(buf), length);
        return *this;
    }

    /// Takes blanks, tabs and line ends off both ends.
    ZVString& trim();

    ZVString& operator+=(const ZVString& other)
    {
        m_Text += other.m_Text;
        return *this;
    }
    ZVString& operator+=(const char* buf)
    {
        m_Text += Checked(buf);
        return *this;
    }

    /// Byte by byte, as unsigned numbers; below 0, 0 or above 0.
    int compare(const ZVString& other) const { return m_Text.compare(other.m_Text); }
    int compare(const char* buf) const { return m_Text.compare(Checked(buf)); }

private:
    static const char* Checked(const char* buf)
    {
        ZV_ASSERT(buf != 0);
        return buf;
    }

    std::string m_Text;
};

template <class Right>
ZVString operator+(ZVString left, const Right& right)
{
    left += right;
    return left;
}

#define ZV_STRING_COMPARISON(op)                                  \
    inline bool operator op(const ZVString& a, const ZVString& b) \
    {                                                             \
        return a.compare(b) op 0;                                 \
    }                                                             \
    inline bool operator op(const ZVString& a, const char* b)     \
    {                                                             \
        return a.compare(b) op 0;                                 \
    }                                                             \
    inline bool operator op(const char* a, const ZVString& b)     \
    {                                                             \
        return 0 op b.compare(a);                                 \
    }
ZV_STRING_COMPARISON(==)
ZV_STRING_COMPARISON(!=)
ZV_STRING_COMPARISON(<)
ZV_STRING_COMPARISON(<=)
ZV_STRING_COMPARISON(>)
ZV_STRING_COMPARISON(>=)
#undef ZV_STRING_COMPARISON
