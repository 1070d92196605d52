// Listens on ports of this machine and gives each connection a thread of its own. Every member may be called from any
// thread, except as said.
#pragma once

#include <condition_variable>
#include <functional>
#include <list>
#include <mutex>
#include <set>
#include <thread>

#include "Channel.h"
#include "Storefront.h"

namespace simulator {

/// One that the server has accepted.
struct Connection {
    Channel channel;
    unsigned long number;     ///< From 1, over all ports.
    int peer;                 ///< The port at the other end.
    unsigned long proxy = 0;  ///< The connection to the proxy that this one continues.

    // The server's, with its mutex held.
    bool waits = false;   // for a request that is not its first
    bool silent = false;  // ordered to answer nothing any more
    bool broken = false;  // ordered to be reset
};

class Server {
public:
    /// Serves a connection to its end, on the connection's thread.
    using Handler = std::function<void(Connection&)>;

    Server() = default;
    ~Server() { End(); }
    Server(const Server&) = delete;
    Server& operator=(const Server&) = delete;

    /// Opens a port of the loopback address, 0: a free one. The port; -1 with errno when it cannot be had. Connections
    /// wait until Begin. Not beside another Open, Begin or End.
    int Open(int port, Handler handler);
    void Begin();
    /// Breaks off whatever connections do, and waits for their threads. The last call.
    void End();

    /// False when the end comes meanwhile.
    bool Pause(int milliseconds);

    /// Waits until a request comes on the connection; `first`: it is the first one. False when none is to be answered.
    bool WaitForRequest(Connection& connection, bool first);
    /// As Storefront's.
    size_t ActOnIdle(IdleAction action, const std::string& bytes);
    bool WaitForIdle(size_t count);
    bool WaitUntilIdle(unsigned long number);

    /// The end breaks off a descriptor of the caller's as well, until it is forgotten.
    void Watch(int descriptor);
    void Forget(int descriptor);

private:
    struct Port {
        int listener;
        Handler handler;
        std::thread acceptor;
    };
    struct Worker {
        unsigned long number;
        std::thread thread = {};
        bool done = false;
        Connection* connection = nullptr;  // as long as it is served

        bool IsIdle() const;
    };

    void Accept(const Port& port);
    void Serve(const Port& port, int descriptor, int peer, Worker& worker);
    void Reap();
    size_t CountIdle() const;
    bool IsServed(unsigned long number) const;
    bool IsIdle(unsigned long number) const;

    std::list<Port> m_Ports;

    std::mutex m_Mutex;
    std::condition_variable m_Ending;
    std::condition_variable m_Changed;  // what connections do
    bool m_Ended = false;
    std::set<int> m_Open;  // descriptors that the end breaks off
    std::list<Worker> m_Workers;
    unsigned long m_Connections = 0;
};

}  // namespace simulator
