// A long way to a port of this machine: whatever is sent over it arrives later, in both directions.
#pragma once

#include <stdint.h>

#include <deque>
#include <list>
#include <string>
#include <thread>
#include <vector>

class DelayLine {
public:
    /// Leads from that loopback address to 127.0.0.1, at the same port. `oneWay` in milliseconds. A connection costs a
    /// way there and back before anything else, though connect returns at once here.
    DelayLine(const char* address, int port, int oneWay);
    ~DelayLine();
    DelayLine(const DelayLine&) = delete;
    DelayLine& operator=(const DelayLine&) = delete;

private:
    // What goes from one socket to another. No bytes: the end.
    struct Way {
        int from, to;
        uint64_t notBefore;  // when the first bytes may arrive at the earliest
        std::deque<std::pair<uint64_t, std::string>> under = {};
        bool hasEnded = false;
    };

    void Carry();
    void Accept();
    void Take(Way& way) const;
    static bool Deliver(Way& way, uint64_t now);

    const int m_Port;
    const unsigned int m_OneWay;
    int m_Listener;
    int m_Stop[2];
    std::list<Way> m_Ways;
    std::vector<int> m_Sockets;
    std::thread m_Thread;
};
