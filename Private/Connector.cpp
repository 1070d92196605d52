#include "Connector.h"

#include <errno.h>
#include <netdb.h>
#include <netinet/tcp.h>
#include <openssl/err.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <memory>
#include <string>

#include "Deployment.h"
#include "ZVUtilities.h"

namespace {

constexpr uint64_t kSlice = 100;  // milliseconds

int Connect(const addrinfo& to, const Patience& patience)
{
    const int made = socket(to.ai_family, to.ai_socktype | SOCK_NONBLOCK | SOCK_CLOEXEC, to.ai_protocol);
    if (made < 0) return -1;
    const int on = 1;
    setsockopt(made, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
    int error = connect(made, to.ai_addr, to.ai_addrlen) == 0 ? 0 : errno;
    if (error == EINPROGRESS) {
        socklen_t size = sizeof error;
        const bool answered = patience.WaitFor(made, POLLOUT);
        if (!answered || getsockopt(made, SOL_SOCKET, SO_ERROR, &error, &size) != 0) error = ETIMEDOUT;
    }
    if (error == 0) return made;
    close(made);
    return -1;
}

}  // namespace

bool Patience::IsOver() const
{
    return aborted || ZVUtilities::MillisecondTime() >= deadline;
}

bool Patience::WaitFor(int socket, short events) const
{
    while (!IsOver()) {
        const uint64_t left = deadline - std::min(deadline, ZVUtilities::MillisecondTime());
        pollfd ready = {socket, events, 0};
        const int count = poll(&ready, 1, static_cast<int>(std::min(left, kSlice)));
        if (count > 0) return true;
        if (count < 0 && errno != EINTR) return false;
    }
    return false;
}

namespace Connector {

int OpenTcp(const char* host, int port, const Patience& patience)
{
    addrinfo wanted = {};
    wanted.ai_socktype = SOCK_STREAM;
    wanted.ai_flags = AI_ADDRCONFIG;
    addrinfo* found = nullptr;
    if (getaddrinfo(host, std::to_string(port).c_str(), &wanted, &found) != 0) return -1;
    const std::unique_ptr<addrinfo, void (*)(addrinfo*)> addresses(found, freeaddrinfo);
    for (const addrinfo* address = found; address && !patience.IsOver(); address = address->ai_next) {
        const int connected = Connect(*address, patience);
        if (connected >= 0) return connected;
    }
    return -1;
}

SSL* OpenTls(SSL_CTX* context, int socket, const char* host, SSL_SESSION* resumed, const Patience& patience)
{
    struct Free {
        void operator()(SSL* tls) const { SSL_free(tls); }
    };
    std::unique_ptr<SSL, Free> tls(SSL_new(context));
    if (!tls || SSL_set_fd(tls.get(), socket) != 1) return nullptr;
    if (!IsAddress(host)) SSL_set_tlsext_host_name(tls.get(), host);
    if (resumed) SSL_set_session(tls.get(), resumed);
    for (;;) {
        ERR_clear_error();
        const int result = SSL_connect(tls.get());
        if (result == 1) return tls.release();
        const int reason = SSL_get_error(tls.get(), result);
        const bool waits = reason == SSL_ERROR_WANT_READ || reason == SSL_ERROR_WANT_WRITE;
        if (!waits || !patience.WaitFor(socket, reason == SSL_ERROR_WANT_READ ? POLLIN : POLLOUT)) break;
    }
    ERR_clear_error();
    return nullptr;
}

}  // namespace Connector
