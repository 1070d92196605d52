// Opens connections to services: names, TCP, the way through a proxy, TLS where the service wants it. All of it has one
// deadline and can be broken off from another thread at any moment.
#pragma once

#include <openssl/ssl.h>
#include <stdint.h>

#include <atomic>

#include "ZVString.h"

/// What bounds an attempt: a time, and a flag that another thread may set. It is looked at every tenth of a second.
struct Patience {
    uint64_t deadline;  ///< By ZVUtilities::MillisecondTime.
    const std::atomic<bool>& aborted;

    bool IsOver() const;
    /// Milliseconds until the deadline, or until the flag is to be looked at.
    int Slice() const;
    /// Waits until the socket is ready for `events` (of poll). False when the patience is over.
    bool WaitFor(int socket, short events) const;
};

/// The proxy that carries a session's connections; none when the host is empty.
struct Proxy {
    ZVString host;
    int port = 0;
    ZVString userName, password;

    bool IsUsed() const { return !host.empty(); }
    /// The header line with the credentials, with its line end; empty without credentials.
    ZVString AuthorizationLine() const;

    /// The one of the session that was last set up, for what belongs to no session. Any thread.
    static Proxy Current();
    void MakeCurrent() const;
};

namespace Connector {

/// A connected socket that does not block, the caller's to close; -1 when none of the host's addresses answers. All
/// addresses of both families are tried, each 250 ms after the one before while that has not answered, and the first
/// that answers wins. A peer that goes away silently is noticed within 10 s of whatever was sent to it.
int OpenTcp(const ZVString& host, int port, const Patience& patience);

/// Asks the proxy at the other end of the socket to connect it with that host. 0, or the HTTP status with which it
/// refuses, or -1 when it gives no answer that makes sense.
int OpenTunnel(int socket, const ZVString& host, int port, const Proxy& proxy, const Patience& patience);

/// The client's side of a handshake on the socket, which stays the caller's; null when it fails. `resumed` (null is
/// allowed) is offered to the peer. Certificates are looked at as of `now`; when one is valid only from later on,
/// `validFrom` says when that is. The caller owns the result.
SSL* OpenTls(SSL_CTX* context, int socket, const ZVString& host, SSL_SESSION* resumed, time_t now,
             const Patience& patience, time_t& validFrom);

}  // namespace Connector

/// An open connection, which stays its owner's; `tls` is null for a plain one.
struct Connection {
    int socket = -1;
    SSL* tls = nullptr;

    /// All of it. False when it cannot be sent within the patience.
    bool Send(const char* data, size_t length, const Patience& patience) const;
    /// At least one byte and at most `size`. 0 at the end, on failure, and when the patience is over.
    size_t Receive(char* buffer, size_t size, const Patience& patience) const;
    /// Whether the peer has neither closed it nor sent anything that nobody has asked for. Does not wait. What TLS has
    /// to say to itself is taken on the way.
    bool IsQuiet() const;
};
