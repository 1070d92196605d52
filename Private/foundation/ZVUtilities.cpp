#include "ZVUtilities.h"

#include <string.h>

#include <chrono>

namespace ZVUtilities {

char* StrDup(const char* text)
{
    if (!text) return nullptr;
    const size_t size = strlen(text) + 1;
    char* copy = new char[size];
    memcpy(copy, text, size);
    return copy;
}

void SetText(ZV_WS_String& to, const ZVString& text)
{
    to.data = new char[text.length() + 1];
    memcpy(to.data, text.c_str(), text.length() + 1);
    to.size = static_cast<unsigned int>(text.length());
}

bool Str2Bool(const char* text)
{
    return text && strcmp(text, "true") == 0;
}

bool IsXmlText(const char* text)
{
    const auto* at = reinterpret_cast<const unsigned char*>(text);
    while (*at) {
        // The shortest form is the only one.
        static const unsigned int kLeast[] = {0, 0x80, 0x800, 0x10000};
        const int more = *at < 0x80 ? 0 : *at < 0xc0 ? -1 : *at < 0xe0 ? 1 : *at < 0xf0 ? 2 : *at < 0xf8 ? 3 : -1;
        if (more < 0) return false;
        unsigned int character = more == 0 ? *at : *at & (0x3fu >> more);
        ++at;
        for (int i = 0; i < more; ++i, ++at) {
            if ((*at & 0xc0) != 0x80) return false;
            character = character << 6 | (*at & 0x3fu);
        }
        const bool isIn = character >= 0x20 ? character < 0xd800 || (character > 0xdfff && character < 0xfffe) ||
                                                  (character > 0xffff && character < 0x110000)
                                            : character == '\t' || character == '\n' || character == '\r';
        if (character < kLeast[more] || !isIn) return false;
    }
    return true;
}

int SortOrder2Int(ZV_WS_SortOrder order)
{
    return order;
}

ZVString TM2Str(const struct tm& time)
{
    char text[64];
    const size_t length = strftime(text, sizeof text, "%Y/%m/%d %H:%M:%S", &time);
    return ZVString(text, length);
}

uint64_t MillisecondTime()
{
    using namespace std::chrono;
    return duration_cast<milliseconds>(steady_clock::now().time_since_epoch()).count();
}

uint32_t Hash(const char* text, size_t length, uint32_t seed)
{
    uint32_t hash = seed;
    for (size_t i = 0; i < length; ++i)
        hash = (hash * 16777619u) ^ static_cast<unsigned char>(text[i]);
    return hash;
}

}  // namespace ZVUtilities
