// What a strict service refuses: the simulator's own reading of the contract, independent of the client's.
#pragma once

#include <mutex>
#include <set>
#include <string>

#include "Http.h"
#include "Service.h"
#include "Storefront.h"

/// A request that passed.
struct CheckedRequest {
    const OperationRow* operation = nullptr;
    Arguments arguments;
    int account = 0;     ///< Of the customer who asks.
    std::string device;  ///< That asks: its DestinationUniqueID.
};

class RequestCheck {
public:
    explicit RequestCheck(Database& database) : m_Database(database) {}

    /// Checks a request to the service whose endpoint is `endpoint`. Empty when it is right, else what is wrong with
    /// it. `log` gets the operation, its children and the token's standing either way, as far as they were found.
    std::string Check(const HttpRequest& request, const ServiceRow& service, const std::string& endpoint,
                      CheckedRequest& checked, LoggedRequest& log);

private:
    bool IsNewNonce(const std::string& nonce);

    Database& m_Database;
    std::mutex m_Mutex;
    std::set<std::string> m_Nonces;
};
