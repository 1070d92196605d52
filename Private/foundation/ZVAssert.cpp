#include "ZVAssert.h"

#include <stdio.h>
#include <stdlib.h>

void ZV_AssertFailed(const char* expression, const char* file, int line, const char* function)
{
    fprintf(stderr, "%s:%d: %s: Assertion \"%s\" failed.\n", file, line, function, expression);
    abort();
}
