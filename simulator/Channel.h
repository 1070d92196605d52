// One accepted connection, plain or TLS, as bytes in and out.
#pragma once

#include <openssl/ssl.h>

#include <memory>
#include <string>

namespace simulator {

class Channel {
public:
    /// Owns the descriptor.
    explicit Channel(int descriptor) : m_Descriptor(descriptor) {}
    ~Channel();
    Channel(const Channel&) = delete;
    Channel& operator=(const Channel&) = delete;

    /// The server's side of a TLS handshake; false when it fails.
    bool Handshake(SSL_CTX* context);
    bool IsTls() const { return m_Tls != nullptr; }
    bool IsResumed() const { return m_Tls && SSL_session_reused(m_Tls.get()); }

    /// At most `size` bytes; 0 at the end and on failure.
    size_t Read(char* buffer, size_t size);
    /// False when the peer is gone.
    bool Write(const std::string& bytes);
    /// Waits until something has come, the end included.
    void WaitForBytes();
    /// A further session ticket (TLS 1.3). False when it cannot be sent.
    bool SendTicket();
    /// Past TLS; for a few bytes.
    bool WriteBare(const std::string& bytes);

    /// Ends the connection in order, with TLS's own goodbye.
    void Close();
    /// Makes the end, which comes with the destructor, a reset: the peer sees a broken connection.
    void Reset();
    /// Says nothing until the peer has closed.
    void Stall();

    int Descriptor() const { return m_Descriptor; }

private:
    void WaitFor(short events);

    struct TlsFree {
        void operator()(SSL* tls) const { SSL_free(tls); }
    };
    int m_Descriptor;
    std::unique_ptr<SSL, TlsFree> m_Tls;
};

}  // namespace simulator
