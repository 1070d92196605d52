// What the public headers say, read from their comments.
#pragma once

#include <set>
#include <string>
#include <vector>

struct PublicCall {
    std::string name;     ///< "ZV_WS_getTitles".
    std::string comment;  ///< Its own lines as one.
    std::string section;  ///< The lines that head its section, likewise.
};

/// Every function of Public/ with that in its name, in the order of the headers.
std::vector<PublicCall> PublicCalls(const std::string& prefix);

struct PublicStatus {
    std::string name;  ///< "net_error".
    int value = 0;
    std::string who;              ///< "Network".
    std::string cause;            ///< Without the stop at its end, like the remedy.
    std::string remedy;           ///< Empty when there is none; without the calls.
    std::set<std::string> calls;  ///< The only ones to give it; empty when that is not said.
};

/// Every status, as Public/ZV_WS_Status.h has them.
const std::vector<PublicStatus>& PublicStatuses();

/// "general_error (-1004)"; the number alone where only its family has a name.
std::string Named(int status);

/// The names in `text` that begin with the prefix ("ZV_WS_Status_"), without it.
std::set<std::string> NamesIn(const std::string& text, const std::string& prefix);
