#include "HostConsole.h"

#include <stdarg.h>
#include <stdio.h>
#include <string.h>

void HostPrint(const char* format, ...)
{
    const size_t length = strlen(format);
    va_list arguments;
    va_start(arguments, format);
    flockfile(stdout);
    vfprintf(stdout, format, arguments);
    if (length == 0 || format[length - 1] != '\n') putc_unlocked('\n', stdout);
    fflush(stdout);
    funlockfile(stdout);
    va_end(arguments);
}
