// The library's calls by name, each made with fixed arguments.
#pragma once

#include <string>
#include <vector>

#include "ZVWSLib.h"

struct CallResult {
    ZV_WS_Status status = ZV_WS_Status_general_error;
    std::string output;  ///< Everything in it, as text.

    bool operator==(const CallResult& other) const { return status == other.status && output == other.output; }
};

/// All of them, in a table.
std::vector<std::string> CallNames();

/// False when there is no such call ("getTitles" is ZV_WS_getTitles). `after` is called when it has returned, before
/// its output is read.
bool MakeCall(const std::string& name, ZV_WS_Session* session, CallResult& result, void (*after)() = nullptr);
