#include "Hosts.h"

#include <algorithm>
#include <cstdlib>

namespace simulator {

Address ReadAddress(const std::string& text, int port)
{
    const size_t close = text.rfind('[', 0) == 0 ? text.find(']') : 0;
    if (close == std::string::npos) return {};
    const size_t colon = std::min(text.find(':', close), text.size());
    if (close > 0 && close + 1 != colon) return {};
    std::string host = close > 0 ? text.substr(1, close - 1) : text.substr(0, colon);
    std::transform(host.begin(), host.end(), host.begin(), [](unsigned char c) { return tolower(c); });
    if (colon < text.size()) {
        const std::string digits = text.substr(colon + 1);
        const bool number = digits.size() < 6 && digits.find_first_not_of("0123456789") == std::string::npos;
        port = number ? atoi(digits.c_str()) : 0;
    }
    return host.empty() || port < 1 || port > 65535 ? Address() : Address{host, port};
}

Address Hosts::Resolve(const Address& address) const
{
    if (address.host == "localhost") return {"127.0.0.1", address.port};
    for (const HostRow& row : kHosts) {
        if (address.host != row.name) continue;
        const bool standard = address.port == (row.tls ? 443 : 80);
        return {"127.0.0.1", !standard ? address.port : row.tls ? m_HttpsPort : m_HttpPort};
    }
    return address;
}

bool Hosts::IsOurs(const std::string& authority, bool tls) const
{
    const Address own = {"127.0.0.1", tls ? m_HttpsPort : m_HttpPort};
    return Resolve(ReadAddress(authority, tls ? 443 : 80)) == own;
}

std::string Hosts::Check(const HttpRequest& request, bool tls) const
{
    const auto isHost = [](const auto& header) { return header.first == "host"; };
    const auto count = std::count_if(request.headers.begin(), request.headers.end(), isHost);
    const std::string own = tls ? Https() : Http();
    if (count > 1) return "more than one Host";
    if (count == 0 && request.version != "HTTP/1.0") return "no Host: " + own + " expected";
    // A target that is a whole address goes before what the header says.
    std::string host = request.Header("host");
    const std::string scheme = tls ? "https://" : "http://";
    const bool isWhole = request.target.find("://") < request.target.find('/');
    if (isWhole && request.target.rfind(scheme, 0) != 0) return request.target + " is not at " + own;
    if (isWhole)
        host = request.target.substr(scheme.size(), request.target.find_first_of("/?", scheme.size()) - scheme.size());
    return (count == 0 && !isWhole) || IsOurs(host, tls) ? "" : "Host " + host + " is not " + own;
}

}  // namespace simulator
