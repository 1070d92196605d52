// Text between native code (UTF-8) and the script engine, which keeps characters beyond U+FFFF as two surrogates of
// three bytes each (CESU-8). Both directions replace what is ill-formed by U+FFFD, byte for byte, so that no text can
// be mistaken for one of the engine's internal keys.
#pragma once

#include <cstddef>
#include <string>

// The engine's form of a text; never longer than ScriptTextBound(length). Writes to `out` and returns the bytes
// written. Allocates nothing.
size_t WriteScriptText(const char* pText, size_t length, char* out);
inline size_t ScriptTextBound(size_t length)
{
    return 3 * length;
}

// UTF-8 of a text in the engine's form.
std::string Utf8FromScriptText(const char* pText, size_t length);

// "%41" becomes "A"; a "%" that two hexadecimal digits do not follow stays as it is.
std::string PercentDecode(const std::string& text);
