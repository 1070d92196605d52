#include "Url.h"

#include <arpa/inet.h>
#include <stdlib.h>
#include <string.h>

#include <string>

bool IsHeaderText(const char* text)
{
    for (; *text; ++text) {
        if (static_cast<unsigned char>(*text) < 0x20 || *text == 0x7f) return false;
    }
    return true;
}

bool IsRequestText(const char* text)
{
    return IsHeaderText(text) && !strchr(text, ' ');
}

void SplitUrl(const ZVString& url, ZVString& host, ZVString& path)
{
    const char* start = strstr(url.c_str(), "//");
    if (!start) return;
    start += 2;
    const size_t length = strcspn(start, "/");
    host = ZVString(start, length);
    if (start[length] == '/') path = start + length + 1;
}

bool IsAddress(const char* host)
{
    unsigned char address[sizeof(in6_addr)];
    return inet_pton(AF_INET, host, address) == 1 || inet_pton(AF_INET6, host, address) == 1;
}

bool SplitHostPort(const ZVString& hostPort, int defaultPort, ZVString& host, int& port)
{
    const std::string text(hostPort.c_str(), hostPort.length());
    const size_t colon = text.rfind(':');
    const std::string name = text.substr(0, colon);
    host = name.c_str();
    port = defaultPort;
    if (name.empty() || name.size() > 255) return false;
    for (const char c : name) {
        if (!isalnum(static_cast<unsigned char>(c)) && c != '.' && c != '-' && c != '_') return false;
    }
    if (colon == std::string::npos) return true;
    const std::string digits = text.substr(colon + 1);
    if (digits.empty() || digits.size() > 5 || digits.find_first_not_of("0123456789") != std::string::npos)
        return false;
    port = atoi(digits.c_str());
    return port >= 1 && port <= 65535;
}

ZVString UrlEncode(const ZVString& text)
{
    static const char kHex[] = "0123456789ABCDEF";
    ZVString encoded;
    for (size_t i = 0; i < text.length(); ++i) {
        const unsigned char byte = text[i];
        const bool unreserved = (byte >= 'A' && byte <= 'Z') || (byte >= 'a' && byte <= 'z') ||
                                (byte >= '0' && byte <= '9') || (byte != 0 && strchr("-._~", byte));
        const char out[] = {unreserved ? static_cast<char>(byte) : '%', kHex[byte >> 4], kHex[byte & 15]};
        encoded.append(out, unreserved ? 1 : 3);
    }
    return encoded;
}
