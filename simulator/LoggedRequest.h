// One request as the simulator's log has it: secrets are told from each other, and not shown.
#pragma once

#include <string>
#include <utility>
#include <vector>

struct LoggedRequest {
    unsigned long number = 0;
    std::string service;    ///< "browse", "account", "stream", "discovery", "clock", "bandwidth", "boxart", "contract",
                            ///< "connect" or "proxy".
    std::string operation;  ///< SOAP operation; the service's name for the others; the prefix for box art.
    std::string method;     ///< HTTP's.
    std::string target;     ///< What stands behind it: a path and a query, a whole address, or host and port.
    std::vector<std::pair<std::string, std::string>>
        headers;  ///< HTTP headers, names in lower case; of Proxy-Authorization only the scheme.
    std::vector<std::pair<std::string, std::string>>
        soap;  ///< The SOAP header's: user, messageID, to, settings (the block's name), the settings' children,
               ///< AuthToken as "***", and token: "none", "current" (the one that its device was given last),
               ///< "replaced" (given out before that one), "withdrawn" or "unknown", as it was when the request came.
    std::vector<std::pair<std::string, std::string>>
        children;  ///< The request's, in order; passwords and PINs as "***".
    unsigned long connection = 0;
    unsigned long proxy = 0;  ///< The connection to the proxy through which it came; 0: none, it came directly.
    std::string credentials;  ///< Those for the proxy: "right", "wrong" or "none"; empty when it asks for none.
    bool tls = false;
    bool resumed = false;   ///< TLS session resumed.
    double time = 0;        ///< Seconds since the start.
    std::string fault;      ///< The fault that was applied.
    std::string violation;  ///< Why the request was refused.
};
