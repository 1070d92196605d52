// What a service may change about its answers, and what becomes of each change in players that do not know it.
#pragma once

#include <vector>

#include "ZVWSLib.h"

struct Addition {
    const char* change;
    const char* effect;    ///< What a player does with it; empty when the call fails, with that status.
    ZV_WS_Status status;   ///< Of "getTitleListing".
    const char* from;      ///< Replaced in a good answer ...
    const char* to;        ///< ... by this.
    const char* was = "";  ///< What that replaces of what is read, when it changes.
    const char* is = "";
    bool everywhere = false;  ///< All that is like `from` is replaced.
};

const std::vector<Addition>& Additions();
