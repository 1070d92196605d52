// Ordered lists of faults, one for each operation, consumed one a request.
#pragma once

#include <condition_variable>
#include <deque>
#include <map>
#include <mutex>
#include <string>

#include "FaultKinds.h"

namespace simulator {

struct Fault {
    const KindRow* row = nullptr;  ///< Null: none.
    std::string value;
    int delay = 0;        ///< Milliseconds before the answer.
    int retryAfter = -1;  ///< Seconds after which the client may try again; -1: it is not told.
    int count = 1;
    bool afterEffect = false;  ///< What the request asks for is done although the answer claims otherwise.
    unsigned long clears = 0;  ///< How often the lists had been cleared when it was taken.

    FaultKind Kind() const { return row ? row->kind : FaultKind(); }
    /// The kind when it is one of these, else null.
    template <class Kinds>
    const Kinds* As() const
    {
        return row ? std::get_if<Kinds>(&row->kind) : nullptr;
    }
    template <class Kinds>
    bool Is(Kinds kind) const
    {
        const Kinds* own = As<Kinds>();
        return own && *own == kind;
    }
    int Number(int standard) const;
    long long Seconds(long long standard) const;
    /// As it was ordered; empty for none.
    std::string Spelling() const;
    /// Whether what the client gets says that the request was not carried out, and it was not.
    bool ClaimsFailure() const { return row && row->effect == kUndone && !afterEffect; }
};

class Faults {
public:
    /// Reads "OPERATION=KIND[:VALUE][,delay=MS][,count=N][,retry=SECONDS][,after]" and appends it to the operation's
    /// list.
    bool Add(const std::string& text, std::string& error);
    /// The next fault for the operation, taken off its list; the list "any" counts for every request without an own
    /// one.
    Fault Take(const std::string& operation);
    /// Also lets go of the answers that are held.
    void Clear();
    /// Waits until the lists are cleared once more than when the fault was taken. False when the simulator ends first.
    bool WaitForClear(const Fault& fault);
    void End();
    /// What still waits, a list entry a line.
    std::string Pending() const;

    static std::string Help();

private:
    mutable std::mutex m_Mutex;
    std::condition_variable m_Changed;
    unsigned long m_Clears = 0;
    bool m_Ended = false;
    std::map<std::string, std::deque<Fault>> m_Lists;
};

}  // namespace simulator
