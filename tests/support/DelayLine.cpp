#include "DelayLine.h"

#include <arpa/inet.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>

#include "Require.h"

namespace {

uint64_t Now()
{
    const auto time = std::chrono::steady_clock::now().time_since_epoch();
    return static_cast<uint64_t>(std::chrono::duration_cast<std::chrono::milliseconds>(time).count());
}

sockaddr_in Address(const char* address, int port)
{
    sockaddr_in result = {};
    result.sin_family = AF_INET;
    result.sin_port = htons(static_cast<uint16_t>(port));
    inet_pton(AF_INET, address, &result.sin_addr);
    return result;
}

}  // namespace

DelayLine::DelayLine(const char* address, int port, int oneWay)
    : m_Port(port),
      m_OneWay(static_cast<unsigned int>(oneWay)),
      m_Listener(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0))
{
    const sockaddr_in own = Address(address, port);
    const int on = 1;
    setsockopt(m_Listener, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    Require(bind(m_Listener, reinterpret_cast<const sockaddr*>(&own), sizeof own) == 0 && listen(m_Listener, 9) == 0,
            "a socket of the delay line");
    Require(pipe(m_Stop) == 0, "a pipe");
    m_Thread = std::thread([this] { Carry(); });
}

DelayLine::~DelayLine()
{
    close(m_Stop[1]);
    m_Thread.join();
    close(m_Stop[0]);
    close(m_Listener);
    for (const int each : m_Sockets)
        close(each);
}

void DelayLine::Carry()
{
    for (;;) {
        const uint64_t now = Now();
        std::vector<pollfd> waits = {{m_Stop[0], 0, 0}, {m_Listener, POLLIN, 0}};
        uint64_t next = now + 1000;
        for (const Way& way : m_Ways) {
            if (!way.under.empty()) next = std::min(next, way.under.front().first);
            waits.push_back({way.hasEnded ? -1 : way.from, POLLIN, 0});
        }
        poll(waits.data(), waits.size(), static_cast<int>(next - std::min(now, next)));
        if (waits[0].revents != 0) return;
        size_t at = 2;
        for (Way& way : m_Ways) {
            if (waits[at++].revents != 0) Take(way);
        }
        if (waits[1].revents != 0) Accept();
        m_Ways.remove_if([time = Now()](Way& way) { return !Deliver(way, time); });
    }
}

void DelayLine::Accept()
{
    const int client = accept4(m_Listener, nullptr, nullptr, SOCK_CLOEXEC);
    const int service = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const sockaddr_in other = Address("127.0.0.1", m_Port);
    m_Sockets.insert(m_Sockets.end(), {client, service});
    if (connect(service, reinterpret_cast<const sockaddr*>(&other), sizeof other) != 0) return;
    m_Ways.push_back({client, service, Now() + 3 * m_OneWay});
    m_Ways.push_back({service, client, 0});
}

void DelayLine::Take(Way& way) const
{
    char piece[16384];
    const ssize_t count = recv(way.from, piece, sizeof piece, 0);
    way.hasEnded = count <= 0;
    way.under.emplace_back(std::max(Now() + m_OneWay, way.notBefore), std::string(piece, count > 0 ? count : 0));
}

// False when the way has come to its end.
bool DelayLine::Deliver(Way& way, uint64_t now)
{
    for (; !way.under.empty() && way.under.front().first <= now; way.under.pop_front()) {
        const std::string& bytes = way.under.front().second;
        const bool arrives = !bytes.empty() && send(way.to, bytes.data(), bytes.size(), MSG_NOSIGNAL) > 0;
        if (arrives) continue;
        shutdown(way.to, SHUT_WR);
        return false;
    }
    return true;
}
