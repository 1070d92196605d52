// The parts of addresses, and what may stand in a request. Any thread.
#pragma once

#include "ZVString.h"

/// Whether the text, or the address, can stand in a request line (no blanks) or in a header line: it holds no control
/// character, with which one value would write others.
bool IsHeaderText(const char* text);
bool IsRequestText(const char* text);

/// The host (with its port, when it has one) and the path without its first "/" of "scheme://host/path"; empty where
/// missing.
void SplitUrl(const ZVString& url, ZVString& host, ZVString& path);

/// Splits "host:port"; `defaultPort` when there is no port. False for a host that is empty or holds characters that no
/// host name has, and for a port outside of 1 to 65535.
bool SplitHostPort(const ZVString& hostPort, int defaultPort, ZVString& host, int& port);

/// Whether the host is given as an IPv4 or IPv6 address instead of a name.
bool IsAddress(const char* host);

/// RFC 3986: unreserved characters stay, every other byte becomes "%XX" in upper case.
ZVString UrlEncode(const ZVString& text);
