// The namespace table of every message. All contexts use this one table, in this order.
#pragma once

#include <stdsoap2.h>

/// 14 rows and the closing empty one; also the table that the SOAP runtime falls back to.
extern struct Namespace namespaces[];
