// What a strict service refuses: the simulator's own reading of the contract, independent of the client's.
#pragma once

#include <deque>
#include <mutex>
#include <set>
#include <string>

#include "Hosts.h"
#include "Http.h"
#include "Service.h"
#include "SimulatedClock.h"
#include "Storefront.h"

namespace simulator {

/// A request that passed.
struct CheckedRequest {
    const OperationRow* operation = nullptr;
    Arguments arguments;
    int account = 0;     ///< Of the customer who asks.
    std::string device;  ///< That asks: its DestinationUniqueID.
};

class RequestCheck {
public:
    /// The last `remembered` nonces are refused when they come again.
    RequestCheck(Database& database, const Hosts& hosts, const SimulatedClock& clock, size_t remembered)
        : m_Database(database), m_Hosts(hosts), m_Clock(clock), m_Remembered(remembered)
    {}

    /// Checks a request to the service. Empty when it is right, else what is wrong with it. `log` gets the operation,
    /// its children and the token's standing either way, as far as they were found.
    std::string Check(const HttpRequest& request, const ServiceRow& service, CheckedRequest& checked,
                      LoggedRequest& log);

private:
    bool IsEndpoint(const std::string& text, const std::string& path) const;
    bool IsNewNonce(const std::string& digest);

    Database& m_Database;
    const Hosts& m_Hosts;
    const SimulatedClock& m_Clock;
    std::mutex m_Mutex;
    const size_t m_Remembered;
    std::set<std::string> m_Nonces;                         // their digests, as a nonce may be long
    std::deque<std::set<std::string>::iterator> m_InOrder;  // the oldest first
};

}  // namespace simulator
