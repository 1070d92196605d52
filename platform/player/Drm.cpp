// Desktop stand-in: protects nothing. ZV_DRM_INIT_RESULT and ZV_DRM_TERMINATE_RESULT are the results to give.
#include "player/Drm.h"

#include <errno.h>
#include <limits.h>
#include <stdio.h>
#include <stdlib.h>

namespace {

int ResultFrom(const char* variable)
{
    const char* text = getenv(variable);
    if (!text || !*text) return 0;
    char* end = nullptr;
    errno = 0;
    const long result = strtol(text, &end, 0);
    if (*end == '\0' && errno == 0 && result >= INT_MIN && result <= INT_MAX) return static_cast<int>(result);
    fprintf(stderr, "player: %s is not a number: %s\n", variable, text);
    return -1;
}

}  // namespace

int Ipriv_drm_Init(void)
{
    return ResultFrom("ZV_DRM_INIT_RESULT");
}

int Ipriv_drm_Terminate(void)
{
    return ResultFrom("ZV_DRM_TERMINATE_RESULT");
}
