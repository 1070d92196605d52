// The tokens that "authorizeDevice" gives out, and which customer's requests they make. Other threads may use the same
// database meanwhile.
#pragma once

#include "Database.h"

namespace simulator {

/// The account whose requests carry no good token.
constexpr int kFirstAccount = 1;

struct TokenStanding {
    /// "none" without a token; "current": the one that its device was given last; "replaced": given out before that
    /// one, and still good; "withdrawn"; "unknown": never given out.
    const char* name;
    bool isGood;
    int account;  ///< The token's when it is good, else the first.
};
TokenStanding StandingOf(Database& database, const std::string& token);

/// A new token for the account on the device. Those that the device was given before stay good.
std::string GiveToken(Database& database, int account, const std::string& device);

/// None that the device was given is good any more, whoever's it was.
void WithdrawTokens(Database& database, const std::string& device);

}  // namespace simulator
