#include "Channel.h"

#include <openssl/err.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

namespace simulator {

Channel::~Channel()
{
    m_Tls.reset();
    if (m_Descriptor >= 0) close(m_Descriptor);
}

bool Channel::Handshake(SSL_CTX* context)
{
    m_Tls.reset(SSL_new(context));
    SSL_set_fd(m_Tls.get(), m_Descriptor);
    const bool done = SSL_accept(m_Tls.get()) == 1;
    ERR_clear_error();
    return done;
}

size_t Channel::Read(char* buffer, size_t size)
{
    if (m_Tls) {
        const int count = SSL_read(m_Tls.get(), buffer, static_cast<int>(size));
        ERR_clear_error();
        return std::max(count, 0);
    }
    ssize_t count;
    do {
        count = recv(m_Descriptor, buffer, size, 0);
    } while (count < 0 && errno == EINTR);
    return count < 0 ? 0 : static_cast<size_t>(count);
}

bool Channel::Write(const std::string& bytes)
{
    for (size_t done = 0; done < bytes.size();) {
        ssize_t count;
        if (m_Tls) {
            count = SSL_write(m_Tls.get(), bytes.data() + done, static_cast<int>(bytes.size() - done));
            ERR_clear_error();
        } else {
            count = send(m_Descriptor, bytes.data() + done, bytes.size() - done, MSG_NOSIGNAL);
            if (count < 0 && errno == EINTR) continue;
        }
        if (count <= 0) return false;
        done += static_cast<size_t>(count);
    }
    return true;
}

void Channel::WaitFor(short events)
{
    pollfd entry = {m_Descriptor, events, 0};
    while (poll(&entry, 1, -1) < 0 && errno == EINTR) {
    }
}

void Channel::WaitForBytes()
{
    if (!m_Tls || SSL_pending(m_Tls.get()) == 0) WaitFor(POLLIN);
}

void Channel::Stall()
{
    // Ends with the peer's close, and with the shutdown that the simulator's end brings.
    WaitFor(POLLRDHUP);
}

bool Channel::SendTicket()
{
    const bool sent = m_Tls && SSL_new_session_ticket(m_Tls.get()) == 1 && SSL_do_handshake(m_Tls.get()) == 1;
    ERR_clear_error();
    return sent;
}

bool Channel::WriteBare(const std::string& bytes)
{
    return send(m_Descriptor, bytes.data(), bytes.size(), MSG_NOSIGNAL) == static_cast<ssize_t>(bytes.size());
}

void Channel::Close()
{
    if (m_Tls) SSL_shutdown(m_Tls.get());
    ERR_clear_error();
    shutdown(m_Descriptor, SHUT_RDWR);
}

void Channel::Reset()
{
    const linger now = {1, 0};
    setsockopt(m_Descriptor, SOL_SOCKET, SO_LINGER, &now, sizeof now);
    m_Tls.reset();
}

}  // namespace simulator
