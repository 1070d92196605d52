// What a transport result or a service's response code means to the caller. Any thread.
#pragma once

#include "ZV_WS_Status.h"

struct soap;

namespace ZVUtilities {

/// The status of a transport result (the SOAP runtime's error number, or an HTTP status).
ZV_WS_Status To_ZV_WS_Status(int soapError);

/// The status of a call: of its transport result when that is not 0, else of the service's response code as the
/// function's row reads it. `functionName` is the ZV_WS_ function; null, empty or without a row: every code but 0 is a
/// general error.
ZV_WS_Status To_ZV_WS_Status(int soapError, int responseCode, const char* functionName);

/// Does nothing: a place to look at a context's error while debugging.
void print_soap_error(struct soap* context);

}  // namespace ZVUtilities
