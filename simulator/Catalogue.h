// The store's data: made once, the same every time, then changed by what clients do.
#pragma once

#include "Database.h"

/// Makes the tables and fills them unless that is done; within a second.
void FillCatalogue(Database& database);
