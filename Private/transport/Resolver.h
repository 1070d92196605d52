// Looks up the addresses of a host's name without blocking anybody: the caller waits, in a poll loop of its own, for
// the lookup's sockets beside whatever else it waits for.
//
// Addresses given as such and names of the hosts file are known at once, as are names that this process has just looked
// up, for as long as their records allow and at most a minute. Other names are asked from the system's name servers, as
// its configuration says at that moment, one question for each address family: a name server that never answers one of
// them does not hold up the other. One thread at a time.
#pragma once

#include <netinet/in.h>
#include <poll.h>
#include <sys/socket.h>

#include <memory>
#include <vector>

#include "ZVString.h"

struct Address {
    sockaddr_storage socket = {};
    socklen_t length = 0;

    int Family() const { return socket.ss_family; }
};

class NameLookup {
public:
    NameLookup(const ZVString& host, int port);
    /// Gives up what is not answered yet.
    ~NameLookup();
    NameLookup(const NameLookup&) = delete;
    NameLookup& operator=(const NameLookup&) = delete;

    /// What is known without asking anybody; nothing for a name that would have to be asked for.
    static std::vector<Address> Known(const ZVString& host, int port);

    /// Whether nothing more will come for that family (AF_INET, AF_INET6).
    bool IsDone(int family) const;
    bool IsDone() const { return IsDone(AF_INET) && IsDone(AF_INET6); }

    /// The addresses that have come since the last time, in the order to try them within a family.
    std::vector<Address> Take();

    /// Appends what it waits for, and shortens `timeout` (milliseconds).
    void AddTo(std::vector<pollfd>& waits, int& timeout) const;
    /// After a poll: takes what has come.
    void Process(const std::vector<pollfd>& waited);

    /// None of the addresses was good: the next lookup asks anew.
    static void Forget(const ZVString& host);

    /// Tests: a configuration (as /etc/resolv.conf) and a port of name servers in place of the system's. Null: those.
    static void UseConfiguration(const char* path, unsigned short port);

private:
    struct Question;
    struct WithoutAsking {};

    NameLookup(const ZVString& host, int port, WithoutAsking);
    void AddLocal();
    void AddKnown();
    void Ask();
    void Keep();

    const ZVString m_Host;
    const int m_Port;
    std::vector<std::unique_ptr<Question>> m_Questions;
    std::vector<Address> m_Found, m_All;
    int m_Seconds = 0;  // the shortest time that an answer may be kept
};
