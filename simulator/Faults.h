// Ordered lists of faults, one for each operation, consumed one a request.
#pragma once

#include <deque>
#include <map>
#include <mutex>
#include <string>

struct Fault {
    std::string kind;  ///< Empty: none.
    std::string value;
    int delay = 0;  ///< Milliseconds before the answer.
    int count = 1;
    bool afterEffect = false;  ///< What the request asks for is done although the answer claims otherwise.

    bool Is(const char* name) const { return kind == name; }
    int Number(int standard) const;
    std::string Text() const { return value.empty() ? kind : kind + ":" + value; }
};

class Faults {
public:
    /// Reads "OPERATION=KIND[:VALUE][,delay=MS][,count=N][,after]" and appends it to the operation's list.
    bool Add(const std::string& text, std::string& error);
    /// The next fault for the operation, taken off its list; the list "any" counts for every request without an own
    /// one.
    Fault Take(const std::string& operation);
    void Clear();
    /// What still waits, a list entry a line.
    std::string Pending() const;

    static std::string Help();

private:
    mutable std::mutex m_Mutex;
    std::map<std::string, std::deque<Fault>> m_Lists;
};
