#include "Text.h"

#include <cstdint>

namespace {

constexpr uint32_t kReplacement = 0xFFFD;

bool IsHighSurrogate(uint32_t code)
{
    return code >= 0xD800 && code <= 0xDBFF;
}
bool IsLowSurrogate(uint32_t code)
{
    return code >= 0xDC00 && code <= 0xDFFF;
}

// One character of UTF-8, or a surrogate in three bytes. Returns the bytes taken, 0 when they form no character.
size_t Decode(const unsigned char* p, size_t length, uint32_t& code)
{
    static const uint32_t kLeast[] = {0, 0, 0x80, 0x800, 0x10000};
    if (p[0] < 0x80) {
        code = p[0];
        return 1;
    }
    const size_t count = p[0] >= 0xF0 ? 4 : p[0] >= 0xE0 ? 3 : 2;
    if (p[0] < 0xC2 || p[0] > 0xF4 || length < count) return 0;
    code = p[0] & (0x7Fu >> count);
    for (size_t i = 1; i < count; ++i) {
        if ((p[i] & 0xC0) != 0x80) return 0;
        code = code << 6 | (p[i] & 0x3F);
    }
    return code >= kLeast[count] && code <= 0x10FFFF ? count : 0;
}

size_t Encode(uint32_t code, char* out)
{
    static const unsigned char kLead[] = {0, 0, 0xC0, 0xE0, 0xF0};
    if (code < 0x80) {
        out[0] = static_cast<char>(code);
        return 1;
    }
    const size_t count = code >= 0x10000 ? 4 : code >= 0x800 ? 3 : 2;
    for (size_t i = count - 1; i > 0; --i, code >>= 6) {
        out[i] = static_cast<char>(0x80 | (code & 0x3F));
    }
    out[0] = static_cast<char>(kLead[count] | code);
    return count;
}

int HexDigit(char c)
{
    if (c >= '0' && c <= '9') return c - '0';
    const char lower = static_cast<char>(c | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

}  // namespace

size_t WriteScriptText(const char* pText, size_t length, char* out)
{
    const auto* bytes = reinterpret_cast<const unsigned char*>(pText);
    size_t written = 0;
    for (size_t at = 0; at < length;) {
        uint32_t code;
        const size_t taken = Decode(bytes + at, length - at, code);
        at += taken ? taken : 1;
        if (!taken || IsHighSurrogate(code) || IsLowSurrogate(code)) code = kReplacement;
        if (code >= 0x10000) {
            written += Encode(0xD800 + ((code - 0x10000) >> 10), out + written);
            code = 0xDC00 + ((code - 0x10000) & 0x3FF);
        }
        written += Encode(code, out + written);
    }
    return written;
}

std::string Utf8FromScriptText(const char* pText, size_t length)
{
    const auto* bytes = reinterpret_cast<const unsigned char*>(pText);
    std::string text;
    text.reserve(length);
    for (size_t at = 0; at < length;) {
        uint32_t code;
        const size_t taken = Decode(bytes + at, length - at, code);
        at += taken ? taken : 1;
        uint32_t low;
        if (taken && IsHighSurrogate(code) && at < length && Decode(bytes + at, length - at, low) == 3 &&
            IsLowSurrogate(low)) {
            code = 0x10000 + ((code - 0xD800) << 10) + (low - 0xDC00);
            at += 3;
        }
        if (!taken || IsHighSurrogate(code) || IsLowSurrogate(code)) code = kReplacement;
        char encoded[4];
        text.append(encoded, Encode(code, encoded));
    }
    return text;
}

std::string PercentDecode(const std::string& text)
{
    std::string decoded;
    decoded.reserve(text.size());
    for (size_t at = 0; at < text.size(); ++at) {
        const bool digits =
            text[at] == '%' && at + 2 < text.size() && HexDigit(text[at + 1]) >= 0 && HexDigit(text[at + 2]) >= 0;
        if (digits) {
            decoded += static_cast<char>(HexDigit(text[at + 1]) * 16 + HexDigit(text[at + 2]));
            at += 2;
        } else {
            decoded += text[at];
        }
    }
    return decoded;
}
