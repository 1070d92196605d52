#include "Server.h"

#include <netinet/in.h>
#include <netinet/tcp.h>
#include <signal.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>

namespace simulator {

int Server::Open(int port, Handler handler)
{
    const int listener = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const int on = 1;
    setsockopt(listener, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<uint16_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof address;
    if (bind(listener, reinterpret_cast<sockaddr*>(&address), size) != 0 || listen(listener, 64) != 0) {
        const int error = errno;
        close(listener);
        errno = error;
        return -1;
    }
    getsockname(listener, reinterpret_cast<sockaddr*>(&address), &size);
    m_Ports.push_back({listener, std::move(handler), std::thread()});
    return ntohs(address.sin_port);
}

void Server::Begin()
{
    for (Port& port : m_Ports)
        port.acceptor = std::thread([this, &port] { Accept(port); });
}

void Server::End()
{
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        m_Ended = true;
        m_Ending.notify_all();
        m_Changed.notify_all();
        for (const int descriptor : m_Open)
            shutdown(descriptor, SHUT_RDWR);
    }
    for (Port& port : m_Ports) {
        shutdown(port.listener, SHUT_RDWR);
        if (port.acceptor.joinable()) port.acceptor.join();
        close(port.listener);
    }
    // No worker is added from here on.
    for (Worker& worker : m_Workers)
        worker.thread.join();
    m_Workers.clear();
    m_Ports.clear();
}

bool Server::Pause(int milliseconds)
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    return !m_Ending.wait_for(lock, std::chrono::milliseconds(milliseconds), [this] { return m_Ended; });
}

void Server::Watch(int descriptor)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Open.insert(descriptor);
    if (m_Ended) shutdown(descriptor, SHUT_RDWR);
}

void Server::Forget(int descriptor)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Open.erase(descriptor);
}

void Server::Accept(const Port& port)
{
    for (;;) {
        sockaddr_in peer = {};
        socklen_t size = sizeof peer;
        const int descriptor = accept4(port.listener, reinterpret_cast<sockaddr*>(&peer), &size, SOCK_CLOEXEC);
        const std::lock_guard<std::mutex> lock(m_Mutex);
        if (m_Ended || (descriptor < 0 && errno != EINTR && errno != ECONNABORTED && errno != EMFILE)) {
            if (descriptor >= 0) close(descriptor);
            return;
        }
        if (descriptor < 0) continue;
        // An answer would wait up to 40 ms for the peer's word that it has the session tickets sent before.
        const int on = 1;
        setsockopt(descriptor, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
        m_Open.insert(descriptor);
        Reap();
        Worker& worker = m_Workers.emplace_back(Worker{++m_Connections});
        worker.thread = std::thread([this, &port, &worker, descriptor, peer] {
            Serve(port, descriptor, ntohs(peer.sin_port), worker);
            const std::lock_guard<std::mutex> ending(m_Mutex);
            worker.done = true;
            m_Changed.notify_all();
        });
    }
}

void Server::Serve(const Port& port, int descriptor, int peer, Worker& worker)
{
    // A peer that goes away must not end the process.
    sigset_t broken;
    sigemptyset(&broken);
    sigaddset(&broken, SIGPIPE);
    pthread_sigmask(SIG_BLOCK, &broken, nullptr);
    Connection connection{Channel(descriptor), worker.number, peer};
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        worker.connection = &connection;
    }
    port.handler(connection);
    // Before the descriptor is closed and its number given out again.
    const std::lock_guard<std::mutex> lock(m_Mutex);
    worker.connection = nullptr;
    m_Open.erase(descriptor);
}

// Joins the threads whose connections have ended; with the mutex held.
void Server::Reap()
{
    for (auto worker = m_Workers.begin(); worker != m_Workers.end();) {
        if (worker->done) worker->thread.join();
        worker = worker->done ? m_Workers.erase(worker) : std::next(worker);
    }
}

// ---- Kept connections

bool Server::WaitForRequest(Connection& connection, bool first)
{
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        connection.waits = !first;
        m_Changed.notify_all();
    }
    connection.channel.WaitForBytes();
    std::unique_lock<std::mutex> lock(m_Mutex);
    connection.waits = false;
    if (!connection.silent && !connection.broken) return true;
    lock.unlock();
    if (connection.broken) {
        connection.channel.Reset();
    } else {
        connection.channel.Stall();
    }
    return false;
}

bool Server::Worker::IsIdle() const
{
    return connection && connection->waits && !connection->silent;
}

// With the mutex held, as the next ones.
size_t Server::CountIdle() const
{
    return static_cast<size_t>(
        std::count_if(m_Workers.begin(), m_Workers.end(), [](const Worker& worker) { return worker.IsIdle(); }));
}

bool Server::IsIdle(unsigned long number) const
{
    return std::any_of(m_Workers.begin(), m_Workers.end(),
                       [&](const Worker& worker) { return worker.number == number && worker.IsIdle(); });
}

bool Server::IsServed(unsigned long number) const
{
    return std::any_of(m_Workers.begin(), m_Workers.end(),
                       [&](const Worker& worker) { return worker.number == number && !worker.done; });
}

bool Server::WaitForIdle(size_t count)
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    m_Changed.wait(lock, [&] { return m_Ended || CountIdle() >= count; });
    return CountIdle() >= count;
}

bool Server::WaitUntilIdle(unsigned long number)
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    m_Changed.wait(lock, [&] { return m_Ended || IsIdle(number) || !IsServed(number); });
    return IsIdle(number);
}

size_t Server::ActOnIdle(IdleAction action, const std::string& bytes)
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    std::vector<unsigned long> reached;
    for (const Worker& worker : m_Workers) {
        if (!worker.IsIdle()) continue;
        Connection* const connection = worker.connection;  // its thread waits, so that the channel is free
        bool done = true;
        switch (action) {
            case IdleAction::Write:
                done = connection->channel.Write(bytes);
                break;
            case IdleAction::Ticket:
                done = connection->channel.SendTicket();
                break;
            case IdleAction::Silence:
                connection->silent = true;
                break;
            case IdleAction::Reset:
                connection->broken = true;
                shutdown(connection->channel.Descriptor(), SHUT_RD);
                break;
            case IdleAction::Close:
                connection->channel.Close();
                break;
        }
        if (done) reached.push_back(worker.number);
    }
    if (action == IdleAction::Reset || action == IdleAction::Close) {
        m_Changed.wait(lock, [&] {
            return std::none_of(reached.begin(), reached.end(),
                                [this](unsigned long number) { return IsServed(number); });
        });
    }
    return reached.size();
}

}  // namespace simulator
