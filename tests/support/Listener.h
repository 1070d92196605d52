// A port on a loopback address of this machine.
#pragma once

#include <arpa/inet.h>
#include <string.h>
#include <sys/socket.h>
#include <unistd.h>

#include <vector>

/// Somebody answers there, or nobody does, as if what is sent got lost.
class Listener {
public:
    /// `port` 0: a free one.
    Listener(const char* address, int port, bool answers)
    {
        sockaddr_storage own = {};
        const bool isSix = strchr(address, ':') != nullptr;
        auto& four = reinterpret_cast<sockaddr_in&>(own);
        auto& six = reinterpret_cast<sockaddr_in6&>(own);
        own.ss_family = isSix ? AF_INET6 : AF_INET;
        inet_pton(own.ss_family, address, isSix ? static_cast<void*>(&six.sin6_addr) : &four.sin_addr);
        (isSix ? six.sin6_port : four.sin_port) = htons(static_cast<uint16_t>(port));
        socklen_t size = isSix ? sizeof six : sizeof four;
        m_Sockets.push_back(socket(own.ss_family, SOCK_STREAM | SOCK_CLOEXEC, 0));
        if (bind(Get(), reinterpret_cast<sockaddr*>(&own), size) != 0 || listen(Get(), answers ? 9 : 0) != 0) return;
        getsockname(Get(), reinterpret_cast<sockaddr*>(&own), &size);
        m_Port = ntohs(isSix ? six.sin6_port : four.sin_port);
        if (answers) return;
        // A queue that is full, from which nobody takes: the system drops what else comes.
        for (int i = 0; i < 2; ++i) {
            m_Sockets.push_back(socket(own.ss_family, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
            static_cast<void>(connect(m_Sockets.back(), reinterpret_cast<sockaddr*>(&own), size));
        }
    }
    ~Listener()
    {
        for (const int each : m_Sockets)
            close(each);
    }
    Listener(const Listener&) = delete;
    Listener& operator=(const Listener&) = delete;

    int Get() const { return m_Sockets.front(); }
    /// 0: there is no such address here.
    int Port() const { return m_Port; }

private:
    std::vector<int> m_Sockets;
    int m_Port = 0;
};
