// The hosts that the simulator plays, and where they are.
#pragma once

#include <string>

#include "Http.h"

namespace simulator {

struct HostRow {
    const char* key;   ///< In the deployment file.
    const char* name;  ///< The client's own, for the key.
    bool tls;
};
inline constexpr HostRow kHosts[] = {
    {"production_host", "api.zorvane.example", true},
    {"api_staging_host", "apistg.zorvane.example", true},
    {"internal_staging_host", "stg.zorvane.example", true},
    {"adult_production_host", "kac.zorvane.example", true},
    {"adult_staging_host", "kacstg.zorvane.example", true},
    {"image_host", "images.zorvane.example", false},
    {"web_host", "www.zorvane.example", false},
};

/// A host and a port.
struct Address {
    std::string host;  ///< In lower case, without the brackets of an IPv6 address.
    int port = 0;
    bool operator==(const Address& other) const { return host == other.host && port == other.port; }
};
/// Reads "host", "host:port" or "[v6]:port"; without a port it is `port`. A host of no characters is none: ports
/// from 1.
Address ReadAddress(const std::string& text, int port);

class Hosts {
public:
    Hosts(int httpsPort, int httpPort) : m_HttpsPort(httpsPort), m_HttpPort(httpPort) {}

    /// Where the bytes for an address go: one of the simulator's is on this machine, its standard port is the
    /// simulator's own. Every other one stays as it is.
    Address Resolve(const Address& address) const;
    /// Whether what stands between "https://" or, without `tls`, "http://" and the path of an address is one of the
    /// simulator's.
    bool IsOurs(const std::string& authority, bool tls) const;
    /// Empty when the request says once which host it is for, and that is one of the simulator's; else what is wrong.
    std::string Check(const HttpRequest& request, bool tls) const;

    std::string Https() const { return "localhost:" + std::to_string(m_HttpsPort); }
    std::string Http() const { return "localhost:" + std::to_string(m_HttpPort); }

private:
    int m_HttpsPort;
    int m_HttpPort;
};

}  // namespace simulator
