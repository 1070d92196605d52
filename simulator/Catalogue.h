// The store's data: made once, the same every time, then changed by what clients do.
#pragma once

#include "Database.h"

namespace simulator {

/// Makes the tables of a new database and fills them; within a second. False, with the reason and what to do, when the
/// database has tables of another version, which stay as they are, or cannot be written.
bool FillCatalogue(Database& database, std::string& error);

}  // namespace simulator
