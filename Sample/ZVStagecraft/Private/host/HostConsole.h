// The host's lines on standard output, which people and scripts read.
#pragma once

/// Opens /dev/null in the place of each of the descriptors 0 to 2 that the process was started without, so that no
/// socket or database gets its number, and with it the host's lines. Main thread, before anything else opens a file.
void FillStandardStreams();

/// Prints as printf does, and a line end when the format does not bring its own; then flushes. Texts are written whole:
/// lines of several threads never mix. Any thread.
void HostPrint(const char* format, ...) __attribute__((format(printf, 1, 2)));
