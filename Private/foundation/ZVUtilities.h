// Small helpers of the library. All may be called from any thread.
#pragma once

#include <stdint.h>
#include <time.h>

#include "ZVString.h"
#include "ZVWSLib.h"

namespace ZVUtilities {

/// Heap copy for a record (new char[]); null stays null.
char* StrDup(const char* text);

/// Fills an empty text record.
void SetText(ZV_WS_String& to, const ZVString& text);

/// True only for the text "true".
bool Str2Bool(const char* text);

/// Whether the text is UTF-8 and holds only characters that XML 1.0 has.
bool IsXmlText(const char* text);

/// The number the service takes for a sort order.
int SortOrder2Int(ZV_WS_SortOrder order);

/// "YYYY/MM/DD HH:MM:SS".
ZVString TM2Str(const struct tm& time);

/// Milliseconds of a clock that never jumps; only differences mean something.
uint64_t MillisecondTime();

/// For each byte: multiply by 16777619 modulo 2^32, then exclusive-or the byte. Names cache files, so it never changes.
uint32_t Hash(const char* text, size_t length, uint32_t seed);

}  // namespace ZVUtilities
