// Standard output for signal handlers: neither allocates nor waits for a lock that the interrupted code may hold.
#pragma once

/// Writes out what others have printed so far. Gives up after half a second in which another thread keeps the stream.
void CrashFlush();

/// Prints as printf does, each call at once; knows %d, %s, %p and %lx with "-", "0" and a width. A text of more than
/// 1,023 bytes is cut there and its line ended.
void CrashPrint(const char* format, ...) __attribute__((format(printf, 1, 2)));
