// Plays scripts in the desktop runtime, which is started once for the process. Main thread.
#pragma once

#include <string>

#include "stagecraft/IStagecraft.h"

/// `prepare` registers extension classes, at the first run. Aborts when the script fails, which it may not.
void RunScript(const std::string& script, const std::string& flashVars,
               void (*prepare)(ae::stagecraft::IStagecraft& runtime) = nullptr);
