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

bool Hosts::IsService(const std::string& authority) const
{
    return Resolve(ReadAddress(authority, 443)) == Address{"127.0.0.1", m_HttpsPort};
}

}  // namespace simulator
