// Standard output for signal handlers: neither allocates nor waits for a lock that the interrupted code may hold.
#pragma once

/// Writes out what others have printed so far. Gives up after half a second in which another thread keeps the stream.
void CrashFlush();

/// Prints as printf does; knows %d, %s, %p and %lx with "-", "0" and a width. Texts are cut at 511 bytes and, that is
/// all, written at once.
void CrashPrint(const char* format, ...) __attribute__((format(printf, 1, 2)));
