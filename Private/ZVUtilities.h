// Small helpers of the library, by subject in the files named beside them. All may be called from any thread.
#pragma once

#include <stdint.h>
#include <time.h>

#include "ZVString.h"
#include "ZVWSLib.h"

struct soap;

namespace ZVUtilities {

// ---- ZVUtilities.cpp

/// Heap copy for a record (new char[]); null stays null.
char* StrDup(const char* text);

/// Fills an empty text record.
void SetText(ZV_WS_String& to, const ZVString& text);

/// True only for the text "true".
bool Str2Bool(const char* text);

/// The number the service takes for a sort order.
int SortOrder2Int(ZV_WS_SortOrder order);

/// "YYYY/MM/DD HH:MM:SS".
ZVString TM2Str(const struct tm& time);

/// Milliseconds of a clock that never jumps; only differences mean something.
uint64_t MillisecondTime();

/// For each byte: multiply by 16777619 modulo 2^32, then exclusive-or the byte. Names cache files, so it never changes.
uint32_t Hash(const char* text, size_t length, uint32_t seed);

/// RFC 3986: unreserved characters stay, every other byte becomes "%XX" in upper case.
ZVString UrlEncode(const ZVString& text);

// ---- Status.cpp

/// The status of a transport result (the SOAP runtime's error number, or an HTTP status).
ZV_WS_Status To_ZV_WS_Status(int soapError);

/// The status of a call: of its transport result when that is not 0, else of the service's response code as the
/// function's row reads it. `functionName` is the ZV_WS_ function; null, empty or without a row: every code but 0 is a
/// general error.
ZV_WS_Status To_ZV_WS_Status(int soapError, int responseCode, const char* functionName);

/// Does nothing: a place to look at a context's error while debugging.
void print_soap_error(struct soap* context);

// ---- Discovery.cpp

/// The base URL of all three services: from the table for an environment named by `envNum`, else the environment is
/// asked from the production host over `context`, whose kept connection is closed before and after. "" when the service
/// cannot be reached; every unusable answer is production. `envID` gets the environment, the service's raw digit
/// included. The text lives as long as the process. `context` may be null when `envNum` names the environment.
const char* QueryServiceBaseURL(ContentType type, struct soap* context, const char* destinationUniqueID,
                                int destinationTypeID, ZV_WS_EnvNum envNum, ZV_WS_EnvID& envID);

// ---- HttpCalls.cpp

/// Breaks off every ZV_WS_getServerTime that is under way.
void AbortClockQueries();

}  // namespace ZVUtilities
