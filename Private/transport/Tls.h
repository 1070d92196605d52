// TLS of the service connections: which authorities are trusted, and one SSL_CTX and TLS session for each host.
//
// The authorities are read once per process and file, and contexts share them: reading them costs more than fifty
// calls. A host has a context of its own because the name that its certificate must carry is part of it. Any thread.
#pragma once

#include <openssl/ssl.h>

#include "Clock.h"
#include "ZVString.h"

namespace Tls {

/// Reads the bundle (the system's when the name is empty) unless that is done. False when it cannot be read or holds no
/// certificate.
bool LoadAuthorities(const ZVString& caFile);

/// A context that accepts only a certificate of the authorities that carries the host's name (or address) as a subject
/// alternative name; at least TLS 1.2. The caller owns one reference. Null when the authorities cannot be loaded.
SSL_CTX* ContextFor(const ZVString& caFile, const ZVString& host);

/// A copy of the newest session that the context's host gave to a connection of this process, for the next one to
/// resume: a full handshake costs as much as five calls. The caller owns it. Null before the first.
SSL_SESSION* SessionFor(SSL_CTX* context);

/// Makes the next connection's handshake a full one.
void ForgetSession(SSL_CTX* context);

/// After a handshake: notes from when to when all certificates are valid by which the peer has proved itself.
void NoteValidity(const SSL* connection);
/// As of the host's last full handshake.
Clock::Validity ValidityFor(SSL_CTX* context);

}  // namespace Tls
