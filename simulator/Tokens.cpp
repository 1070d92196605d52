#include "Tokens.h"

namespace simulator {

TokenStanding StandingOf(Database& database, const std::string& token)
{
    if (token.empty()) return {"none", false, kFirstAccount};
    TokenStanding standing = {"unknown", false, kFirstAccount};
    database.Each(
        "SELECT account, withdrawn, number = (SELECT MAX(number) FROM token AS other WHERE other.device = "
        "token.device) FROM token WHERE text = ?",
        {token}, [&](const Database::Row& row) {
            if (row.Int(1)) {
                standing.name = "withdrawn";
            } else {
                standing = {row.Int(2) ? "current" : "replaced", true, row.Int(0)};
            }
        });
    return standing;
}

std::string GiveToken(Database& database, int account, const std::string& device)
{
    database.Run(
        "INSERT INTO token SELECT next, 'token-' || next, ?, ?, 0 FROM (SELECT COALESCE(MAX(number), 0) + 1 AS next "
        "FROM token)",
        {account, device});
    return "token-" + std::to_string(database.LastId());
}

void WithdrawTokens(Database& database, const std::string& device)
{
    database.Run("UPDATE token SET withdrawn = 1 WHERE device = ?", {device});
}

}  // namespace simulator
