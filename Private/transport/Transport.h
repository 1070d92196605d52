// What the library adds to a SOAP context: its connections, trust, limits, the user agent, the traffic log, and the
// rules for kept connections.
//
// One Transport belongs to one context and, like it, to one thread at a time.
#pragma once

#include <stdint.h>
#include <stdsoap2.h>
#include <strings.h>

#include <atomic>

#include "Clock.h"
#include "Connector.h"
#include "Deployment.h"
#include "Resolver.h"
#include "RetryAfter.h"
#include "TrafficLog.h"
#include "ZVString.h"

class Transport {
public:
    /// Sets up the context (borrowed; it must outlive this object): flags, limits, timeouts, hooks.
    explicit Transport(soap& context);
    ~Transport();
    Transport(const Transport&) = delete;
    Transport& operator=(const Transport&) = delete;

    static bool IsTls(const char* url) { return strncasecmp(url, "https:", 6) == 0; }
    static Transport& Of(soap* context) { return *static_cast<Transport*>(context->user); }

    /// Loads the certificate authorities of the deployment, which lives as long as the process. False when they cannot
    /// be loaded.
    bool LoadAuthorities(const Deployment& deployment);

    /// Gets the context ready for connections to the URL's host: its TLS context for "https:". False when there is
    /// none.
    bool UseHost(const char* url);

    /// Everything goes through it from the next connection on.
    void SetProxy(const Proxy& proxy) { m_Proxy = proxy; }
    const Proxy& proxy() const { return m_Proxy; }

    /// How long a connection may take and sending may stand still, and how long receiving may: together what a whole
    /// exchange may take.
    void SetTimeouts(int sendSeconds, int receiveSeconds);
    void SetUserAgent(const ZVString& text) { m_UserAgent = text; }

    /// Before an exchange: what is told below is about this one. A kept connection that has rested too long, that the
    /// peer has closed, or on which something waits that nobody has asked for, is closed.
    void BeginExchange();

    /// Whether anything was sent since then: the peer may have acted on it.
    bool HasSent() const { return m_HasSent; }

    /// True when the exchange went over a connection kept from an earlier one and no byte of an answer came: the peer
    /// may have closed it before it saw the request.
    bool KeptConnectionDied() const;

    /// After an exchange with the SOAP runtime's result: keeps the connection only when the answer was whole and
    /// nothing is left over. Looks at the clock when the result is a refusal.
    void EndExchange(int result);

    /// Whether the exchange failed for the clock's sake.
    Clock::Verdict ClockVerdict() const { return m_ClockVerdict; }

    /// The other end of the last connection that was opened, the proxy's where there is one; of no family before any.
    const Address& peer() const { return m_Peer; }

    /// Closes the connection at once, without waiting for the peer.
    void Close();

    /// Any thread: breaks off the exchange that is under way and lets no other begin. For the end of a session whose
    /// call hangs.
    void Abort() { m_Aborted = true; }

    /// The one whose authorities were loaded; the current one before.
    const Deployment& deployment() const { return m_Deployment ? *m_Deployment : Deployment::Current(); }
    soap& context() { return m_Soap; }
    RetryAfter& retryAfter() { return m_RetryAfter; }

private:
    SOAP_SOCKET Open(const char* endpoint, const char* host, int port);
    int OpenTunnel(int socket, const char* host, int port, const Patience& patience);
    bool OpenTls(int socket, const char* host, const Patience& patience);
    Connection OpenConnection() const { return {m_Soap.socket, m_Soap.ssl}; }
    /// For one step of the exchange.
    Patience PatienceFor(uint64_t milliseconds) const;
    void LookAtClock(int result);

    static SOAP_SOCKET OpenHook(soap* context, const char* endpoint, const char* host, int port);
    static int SendHook(soap* context, const char* data, size_t length);
    static size_t ReceiveHook(soap* context, char* buffer, size_t size);
    static int PreparedHook(soap* context, const char* data, size_t length);
    static int HeaderHook(soap* context, const char* key, const char* value);
    static int AnswerHeaderHook(soap* context, const char* key, const char* value);
    static int ShutdownHook(soap* context, SOAP_SOCKET socket, int how);

    void ForgetTls();

    soap& m_Soap;
    RetryAfter m_RetryAfter;
    const Deployment* m_Deployment = nullptr;
    Proxy m_Proxy;
    Address m_Peer;
    ZVString m_TlsHost;
    ZVString m_UserAgent;
    uint64_t m_SendTimeout = 0, m_ReceiveTimeout = 0;  // milliseconds

    // Of the exchange. Times are those of ZVUtilities::MillisecondTime.
    uint64_t m_Begun = 0;
    uint64_t m_Rests = 0;  // since when the kept connection does
    bool m_Connected = false;
    bool m_HasSent = false;
    size_t m_Received = 0;
    int64_t m_ClockOffset = 0;
    time_t m_Date = 0;     // that the answer bears; 0: none
    bool m_IsOld = false;  // it comes from somebody's cache
    Clock::Verdict m_ClockVerdict = Clock::Verdict::Right;
    SecretFilter m_SentSecrets;
    SecretFilter m_ReceivedSecrets;

    std::atomic<bool> m_Aborted{false};

    decltype(soap::fposthdr) m_Header;
    decltype(soap::fparsehdr) m_AnswerHeader;
};
