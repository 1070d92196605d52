// The host's lines on standard output, which people and scripts read.
#pragma once

/// Prints as printf does, and a line end when the format does not bring its own; then flushes. Texts are written whole:
/// lines of several threads never mix. Any thread.
void HostPrint(const char* format, ...) __attribute__((format(printf, 1, 2)));
