// For tests that are not GoogleTest's.
#pragma once

#include <stdio.h>
#include <stdlib.h>

/// Ends the run when a property does not hold.
inline void Require(bool holds, const char* what)
{
    if (holds) return;
    fprintf(stderr, "does not hold: %s\n", what);
    abort();
}
