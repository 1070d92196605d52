#include "Transport.h"

#include <errno.h>
#include <string.h>
#include <sys/socket.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>

#include "Namespaces.h"
#include "ReadLimits.h"
#include "SigpipeGuard.h"
#include "Tls.h"
#include "Url.h"
#include "ZVUtilities.h"

namespace {

// Until a session's settings are there (discovery comes first).
constexpr int kSendSeconds = 30;
constexpr int kReceiveSeconds = 88;

// The toolkit's own text, sent by a session without a user agent.
const char kToolkitAgent[] = "gSOAP/2.7";

// Whether the service has refused a request for what its header says, and so has not acted on it.
bool IsRefused(soap& context, int result)
{
    if (result == 401 || result == 403) return true;
    const char* const code = result == SOAP_FAULT && context.fault ? *soap_faultcode(&context) : nullptr;
    if (!code) return false;
    const auto begins = [&](const char* start) { return strncmp(code, start, strlen(start)) == 0; };
    return begins("SOAP-ENV:Client") || begins("SOAP-ENV:Sender") || begins("wsse:") || begins("wsu:");
}

}  // namespace

Transport::Transport(soap& context) : m_Soap(context), m_Header(context.fposthdr), m_AnswerHeader(context.fparsehdr)
{
    soap_init_zv_log();
    soap_set_namespaces(&context, namespaces);
    context.user = this;
    context.fopen = OpenHook;
    context.fsend = SendHook;
    context.frecv = ReceiveHook;
    context.fpreparerecv = PreparedHook;
    context.fposthdr = HeaderHook;
    context.fparsehdr = AnswerHeaderHook;
    context.fshutdownsocket = ShutdownHook;
    context.cookie_max = 0;
    LimitReading(context);
    context.ssl_flags = SOAP_SSL_DEFAULT | SOAP_TLSv1_2 | SOAP_TLSv1_3 | SOAP_SSL_NO_DEFAULT_CA_PATH;
    SetTimeouts(kSendSeconds, kReceiveSeconds);
}

Transport::~Transport()
{
    Close();
    ForgetTls();
}

bool Transport::LoadAuthorities(const Deployment& deployment)
{
    m_Deployment = &deployment;
    return Tls::LoadAuthorities(deployment.ca_file);
}

bool Transport::UseHost(const char* url)
{
    if (!IsTls(url)) return true;
    ZVString host, path;
    SplitUrl(url, host, path);
    host = host.substr(0, host.find(':'));
    if (m_Soap.ctx && host == m_TlsHost) return true;
    Close();
    ForgetTls();
    m_Soap.ctx = Tls::ContextFor(deployment().ca_file, host);
    m_TlsHost = host;
    return m_Soap.ctx != nullptr;
}

void Transport::ForgetTls()
{
    if (m_Soap.session) SSL_SESSION_free(m_Soap.session);
    m_Soap.session = nullptr;
    if (m_Soap.ctx) SSL_CTX_free(m_Soap.ctx);
    m_Soap.ctx = nullptr;
}

void Transport::SetTimeouts(int sendSeconds, int receiveSeconds)
{
    m_SendTimeout = 1000ull * static_cast<unsigned int>(sendSeconds);
    m_ReceiveTimeout = 1000ull * static_cast<unsigned int>(receiveSeconds);
}

void Transport::BeginExchange()
{
    m_Begun = ZVUtilities::MillisecondTime();
    const bool isUsable = m_Begun - m_Rests < deployment().ConnectionIdleLimit() && OpenConnection().IsQuiet();
    if (soap_valid_socket(m_Soap.socket) && !isUsable) Close();
    m_Connected = false;
    m_HasSent = false;
    m_Received = 0;
    m_ClockOffset = Clock::Offset();
    m_ClockVerdict = Clock::Verdict::Right;
    m_RetryAfter.Begin();
    m_SentSecrets.Restart();
    m_ReceivedSecrets.Restart();
}

// A peer that drips bytes never meets the timeouts of single steps.
Patience Transport::PatienceFor(uint64_t milliseconds) const
{
    const uint64_t end = m_Begun + m_SendTimeout + m_ReceiveTimeout;
    return {std::min(end, ZVUtilities::MillisecondTime() + milliseconds), m_Aborted};
}

bool Transport::KeptConnectionDied() const
{
    const uint64_t shortestTimeout = std::min(m_SendTimeout, m_ReceiveTimeout);
    return !m_Connected && m_Received == 0 && !m_Aborted && ZVUtilities::MillisecondTime() - m_Begun < shortestTimeout;
}

void Transport::EndExchange(int result)
{
    LookAtClock(result);
    m_Rests = ZVUtilities::MillisecondTime();
    const bool leftOver = m_Soap.bufidx < m_Soap.buflen;
    if (result != SOAP_OK || leftOver) Close();
}

// Only what comes over a verified connection, and from the service itself, says something about the time.
void Transport::LookAtClock(int result)
{
    if (m_Date == 0 || m_IsOld || !m_Soap.ssl) return;
    if (result == SOAP_OK) Clock::NoteGood(m_Date, deployment());
    if (IsRefused(m_Soap, result)) {
        m_ClockVerdict = Clock::Compare(m_Date, m_ClockOffset, Tls::ValidityFor(m_Soap.ctx));
    }
}

void Transport::Close()
{
    if (!soap_valid_socket(m_Soap.socket)) return;
    SigpipeGuard guard;
    const int error = m_Soap.error;
    m_Soap.keep_alive = 0;
    m_Soap.error = SOAP_OK;
    soap_closesock(&m_Soap);  // soap_force_closesock leaves `ssl` behind
    m_Soap.error = error;
    m_Soap.keep_alive = 1;
    m_Soap.bufidx = m_Soap.buflen = 0;
}

SOAP_SOCKET Transport::OpenHook(soap* context, const char* endpoint, const char* host, int port)
{
    Transport& self = Of(context);
    self.m_Connected = true;
    context->errnum = 0;
    context->error = SOAP_OK;
    return self.Open(endpoint, host, port);
}

SOAP_SOCKET Transport::Open(const char* endpoint, const char* host, int port)
{
    const Patience patience = PatienceFor(m_SendTimeout);
    m_Soap.imode &= ~SOAP_ENC_SSL;
    m_Soap.omode &= ~SOAP_ENC_SSL;
    const int socket = m_Proxy.IsUsed() ? Connector::OpenTcp(m_Proxy.host, m_Proxy.port, patience)
                                        : Connector::OpenTcp(host, port, patience);
    if (socket < 0) {
        m_Soap.error = SOAP_TCP_ERROR;
        return SOAP_INVALID_SOCKET;
    }
    if (IsTls(endpoint)) {
        if (m_Proxy.IsUsed()) m_Soap.error = OpenTunnel(socket, host, port, patience);
        if (m_Soap.error == SOAP_OK && !OpenTls(socket, host, patience)) m_Soap.error = SOAP_SSL_ERROR;
    }
    m_Peer.length = sizeof m_Peer.socket;
    getpeername(socket, reinterpret_cast<sockaddr*>(&m_Peer.socket), &m_Peer.length);
    if (m_Soap.error == SOAP_OK) return socket;
    close(socket);
    return SOAP_INVALID_SOCKET;
}

// The SOAP runtime's error number: the proxy's status, when it has one.
int Transport::OpenTunnel(int socket, const char* host, int port, const Patience& patience)
{
    const int status = Connector::OpenTunnel(socket, host, port, m_Proxy, patience);
    if (status >= 0) return status;
    return patience.IsOver() ? SOAP_TCP_ERROR : SOAP_HTTP_ERROR;
}

bool Transport::OpenTls(int socket, const char* host, const Patience& patience)
{
    SSL_SESSION* const offered = Tls::SessionFor(m_Soap.ctx);
    const time_t now = Clock::ForCertificates(deployment());
    time_t validFrom = 0;
    m_Soap.ssl = Connector::OpenTls(m_Soap.ctx, socket, host, offered, now, patience, validFrom);
    SSL_SESSION_free(offered);
    if (!m_Soap.ssl) {
        Tls::ForgetSession(m_Soap.ctx);  // perhaps it was what the peer did not like
        if (validFrom != 0) {
            m_ClockVerdict = Clock::Verdict::Wrong;
            Clock::TellBehind(validFrom, now);
        }
        return false;
    }
    Tls::NoteValidity(m_Soap.ssl);
    m_Soap.imode |= SOAP_ENC_SSL;
    m_Soap.omode |= SOAP_ENC_SSL;
    return true;
}

int Transport::SendHook(soap* context, const char* data, size_t length)
{
    Transport& self = Of(context);
    self.m_HasSent = true;
    self.m_Date = 0;
    self.m_IsOld = false;
    TrafficLog::Sent(self.m_SentSecrets, data, length);
    return self.OpenConnection().Send(data, length, self.PatienceFor(self.m_SendTimeout)) ? SOAP_OK : SOAP_EOF;
}

size_t Transport::ReceiveHook(soap* context, char* buffer, size_t size)
{
    Transport& self = Of(context);
    const size_t received = self.OpenConnection().Receive(buffer, size, self.PatienceFor(self.m_ReceiveTimeout));
    self.m_Received += received;
    return received;
}

int Transport::PreparedHook(soap* context, const char* data, size_t length)
{
    TrafficLog::Received(Of(context).m_ReceivedSecrets, data, length);
    return SOAP_OK;
}

int Transport::HeaderHook(soap* context, const char* key, const char* value)
{
    Transport& self = Of(context);
    if (key && strcmp(key, "User-Agent") == 0) {
        value = self.m_UserAgent.empty() ? kToolkitAgent : self.m_UserAgent.c_str();
    }
    // The toolkit would announce deflate, too, of which it reads only one of the two kinds that there are.
    if (key && strcmp(key, "Accept-Encoding") == 0) value = "gzip";
    return self.m_Header(context, key, value);
}

int Transport::AnswerHeaderHook(soap* context, const char* key, const char* value)
{
    Transport& self = Of(context);
    self.m_RetryAfter.ReadHeader(context->status, key, value);
    if (strcasecmp(key, "Date") == 0) self.m_Date = Clock::ParseHttpDate(value);
    if (strcasecmp(key, "Age") == 0) self.m_IsOld = true;
    return self.m_AnswerHeader(context, key, value);
}

// A result other than 0 keeps the runtime from waiting for the peer's side of the close.
int Transport::ShutdownHook(soap*, SOAP_SOCKET socket, int how)
{
    shutdown(socket, how);
    return SOAP_TCP_ERROR;
}
