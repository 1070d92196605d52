// Opens connections to services: TCP, then TLS where the service wants it. Both can be broken off from another thread.
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
    /// Waits until the socket is ready for `events` (of poll). False when the patience is over.
    bool WaitFor(int socket, short events) const;
};

namespace Connector {

/// A connected socket that does not block, the caller's to close; -1 when none of the host's addresses answers. Looking
/// the name up blocks as long as the system's resolver does.
int OpenTcp(const char* host, int port, const Patience& patience);

/// The client's side of a handshake on the socket, which stays the caller's; null when it fails. `resumed` (null is
/// allowed) is offered to the peer. The caller owns the result.
SSL* OpenTls(SSL_CTX* context, int socket, const char* host, SSL_SESSION* resumed, const Patience& patience);

}  // namespace Connector
