#include "CrashConsole.h"

#include <errno.h>
#include <limits.h>
#include <stdarg.h>
#include <stddef.h>
#include <stdint.h>
#include <stdio.h>
#include <string.h>
#include <time.h>
#include <unistd.h>

namespace {

// How a value is laid out: "-", "0" and the width.
struct Field {
    bool isLeft = false;
    bool hasZeros = false;
    size_t width = 0;
};

class Text {
public:
    void Add(char character)
    {
        if (m_length < sizeof m_text) m_text[m_length++] = character;
    }
    void Add(const char* text, const Field& field)
    {
        const size_t length = strlen(text);
        const size_t padding = field.width > length ? field.width - length : 0;
        if (!field.isLeft) Pad(padding, field.hasZeros ? '0' : ' ');
        for (size_t i = 0; i < length; ++i)
            Add(text[i]);
        if (field.isLeft) Pad(padding, ' ');
    }
    void Write()
    {
        if (m_length == sizeof m_text) m_text[m_length - 1] = '\n';
        for (size_t at = 0; at < m_length;) {
            const ssize_t written = write(STDOUT_FILENO, m_text + at, m_length - at);
            if (written < 0 && errno != EINTR) return;
            if (written > 0) at += static_cast<size_t>(written);
        }
    }

private:
    void Pad(size_t count, char character)
    {
        for (; count > 0; --count)
            Add(character);
    }

    char m_text[1024];
    size_t m_length = 0;
};

// A number's digits.
class Digits {
public:
    Digits(unsigned long value, unsigned base, const char* prefix = "")
    {
        do {
            *--m_at = "0123456789abcdef"[value % base];
            value /= base;
        } while (value != 0);
        for (size_t i = strlen(prefix); i > 0; --i)
            *--m_at = prefix[i - 1];
    }
    const char* Get() const { return m_at; }

private:
    char m_text[sizeof(unsigned long) * CHAR_BIT / 3 + 4] = {};
    char* m_at = m_text + sizeof m_text - 1;
};

// Reads what follows a "%", up to the letter of the conversion.
Field ReadField(const char*& at)
{
    Field field;
    for (; *at == '-' || *at == '0'; ++at)
        (*at == '-' ? field.isLeft : field.hasZeros) = true;
    for (; *at >= '0' && *at <= '9'; ++at)
        field.width = field.width * 10 + static_cast<size_t>(*at - '0');
    if (*at == 'l') ++at;
    return field;
}

}  // namespace

void CrashFlush()
{
    const timespec aMillisecond = {0, 1000000};
    for (int i = 0; ftrylockfile(stdout) != 0; ++i) {
        if (i == 500) return;
        nanosleep(&aMillisecond, nullptr);
    }
    fflush_unlocked(stdout);
    funlockfile(stdout);
}

void CrashPrint(const char* format, ...)
{
    Text text;
    va_list arguments;
    va_start(arguments, format);
    for (const char* at = format; *at; ++at) {
        if (*at != '%') {
            text.Add(*at);
            continue;
        }
        ++at;
        const Field field = ReadField(at);
        if (*at == 's') {
            text.Add(va_arg(arguments, const char*), field);
        } else if (*at == 'p') {
            const auto address = reinterpret_cast<uintptr_t>(va_arg(arguments, void*));
            text.Add(address ? Digits(address, 16, "0x").Get() : "(nil)", field);
        } else if (*at == 'd') {
            const long value = va_arg(arguments, int);
            text.Add(Digits(static_cast<unsigned long>(value < 0 ? -value : value), 10, value < 0 ? "-" : "").Get(),
                     field);
        } else {  // x
            text.Add(Digits(va_arg(arguments, unsigned long), 16).Get(), field);
        }
    }
    va_end(arguments);
    text.Write();
}
