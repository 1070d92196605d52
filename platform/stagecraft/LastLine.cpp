#include "LastLine.h"

#include <cstdio>
#include <cstdlib>

namespace {

const char* s_pEnd = nullptr;  // null: no movie has ended
bool s_hasScriptError = false;

void Write()
{
    if (!s_pEnd) return;
    fflush(stdout);  // which may be the same file
    fprintf(stderr, "movie ended: %s\n", s_hasScriptError ? "script error" : s_pEnd);
}

}  // namespace

void LastLine::MovieBegins()
{
    static const bool s_registered = atexit(Write) == 0;
    static_cast<void>(s_registered);
    s_pEnd = nullptr;
    s_hasScriptError = false;
}

void LastLine::MovieEnds(bool wasStopped)
{
    s_pEnd = wasStopped ? "stopped" : "ok";
}

void LastLine::ScriptError()
{
    s_hasScriptError = true;
}
