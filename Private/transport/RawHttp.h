// One hand-built HTTP/1.1 GET over a SOAP context's socket, for the few answers that are not SOAP.
//
// The exchange takes the context's connection: a kept one is closed before, its own afterwards, so that the context's
// next SOAP call starts from a defined state. What is read is bounded by the caller's pieces and, in time, by the
// transport's deadline for an exchange.
#pragma once

#include "SigpipeGuard.h"
#include "Transport.h"

class RawHttp {
public:
    /// How the two header lines of a request follow each other; services have their own ideas.
    enum class Order { AgentFirst, HostFirst };

    /// The most bytes that one receive takes.
    static constexpr size_t kPiece = 2048;

    explicit RawHttp(Transport& transport);
    ~RawHttp() { m_Transport.Close(); }
    RawHttp(const RawHttp&) = delete;
    RawHttp& operator=(const RawHttp&) = delete;

    /// Opens a connection to the URL's host and port (443 for "https:", else 80, when it names none), with TLS for
    /// "https:".
    bool Connect(const ZVString& url);

    /// Sends "GET path" with the two header lines, and before them that of the condition (the value of
    /// "If-Modified-Since"; none when it is empty). False when it cannot be sent, or holds what a request cannot.
    bool SendGet(const ZVString& path, const ZVString& host, Order order, const ZVString& condition = ZVString());

    /// Receives once, at most 2047 bytes: the answer's head, perhaps with the start of its body. False when nothing
    /// came.
    bool ReceiveHead();

    /// True when the head holds the status line, given without its line end ("HTTP/1.1 200 OK").
    bool StatusIs(const char* line) const;

    /// True when the head holds the text anywhere.
    bool Holds(const char* text) const;

    /// The header's text up to its line end. False when the head has no such header.
    bool Header(const char* name, ZVString& value) const;

    /// The header "Content-Length" as a decimal number; 0 when it is missing or no number above 0.
    unsigned int ContentLength() const;

    /// The part of the body that came with the head. False when the head has no end.
    bool BodyStart(const char*& bytes, size_t& length) const;

    /// Receives once, at most `size` bytes. 0 at the end and on failure.
    size_t Receive(char* buffer, size_t size);

private:
    Transport& m_Transport;
    SigpipeGuard m_Guard;
    bool m_IsTls = false;
    size_t m_HeadLength = 0;
    char m_Head[kPiece];
};
