// Assertions stay in every build: a broken rule of an interface is a programming error that must not go on.
#pragma once

/// Prints the failed expression with its place to the error stream and aborts.
[[noreturn]] void ZV_AssertFailed(const char* expression, const char* file, int line, const char* function);

#define ZV_ASSERT(expression) \
    ((expression) ? static_cast<void>(0) : ZV_AssertFailed(#expression, __FILE__, __LINE__, __func__))
