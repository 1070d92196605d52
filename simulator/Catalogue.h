// The store's data: made once, the same every time, then changed by what clients do.
#pragma once

#include "Database.h"

namespace simulator {

/// Makes the tables of a new database and fills them, within a second; brings those of an older version up to date with
/// all that is in them. False, with the reason and what to do, when the database is of a version that is too old for
/// that or newer than this, and then nothing of it changes, or cannot be written.
bool FillCatalogue(Database& database, std::string& error);

}  // namespace simulator
