#include "Transport.h"

#include <errno.h>
#include <string.h>
#include <sys/socket.h>
#include <time.h>
#include <unistd.h>

#include <algorithm>

#include "Connector.h"
#include "Namespaces.h"
#include "RawHttp.h"
#include "ReadLimits.h"
#include "Tls.h"
#include "ZVUtilities.h"

namespace {

// Until a session's settings are there (discovery comes first).
constexpr int kSendSeconds = 30;
constexpr int kReceiveSeconds = 88;

// The toolkit's own text, sent by a session without a user agent.
const char kToolkitAgent[] = "gSOAP/2.7";

}  // namespace

SigpipeGuard::SigpipeGuard()
{
    sigset_t pipe, pending;
    sigemptyset(&pipe);
    sigaddset(&pipe, SIGPIPE);
    sigpending(&pending);
    m_WasPending = sigismember(&pending, SIGPIPE) == 1;
    pthread_sigmask(SIG_BLOCK, &pipe, &m_Before);
}

SigpipeGuard::~SigpipeGuard()
{
    if (!m_WasPending) {
        sigset_t pipe;
        sigemptyset(&pipe);
        sigaddset(&pipe, SIGPIPE);
        const timespec now = {0, 0};
        while (sigtimedwait(&pipe, nullptr, &now) == -1 && errno == EINTR) {
        }
    }
    pthread_sigmask(SIG_SETMASK, &m_Before, nullptr);
}

Transport::Transport(soap& context)
    : m_Soap(context),
      m_Open(context.fopen),
      m_CloseSocket(context.fclosesocket),
      m_Send(context.fsend),
      m_Receive(context.frecv),
      m_Header(context.fposthdr)
{
    soap_init_zv_log();
    soap_set_namespaces(&context, namespaces);
    context.user = this;
    context.fopen = OpenHook;
    context.fsend = SendHook;
    context.frecv = ReceiveHook;
    context.fpreparerecv = PreparedHook;
    context.fposthdr = HeaderHook;
    context.fshutdownsocket = ShutdownHook;
    context.fclosesocket = CloseHook;
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
    m_Soap.connect_timeout = sendSeconds;
    m_Soap.send_timeout = sendSeconds;
    m_Soap.recv_timeout = receiveSeconds;
    m_Soap.transfer_timeout = sendSeconds + receiveSeconds;  // a peer that drips bytes never meets the others
}

void Transport::BeginExchange()
{
    m_Begun = ZVUtilities::MillisecondTime();
    m_Connected = false;
    m_HasSent = false;
    m_Received = 0;
    m_Soap.start = static_cast<ULONG64>(time(nullptr));  // of transfer_timeout; the runtime sets it for SOAP alone
    m_RetryAfter.Begin();
    m_SentSecrets.Restart();
    m_ReceivedSecrets.Restart();
}

bool Transport::KeptConnectionDied() const
{
    const uint64_t shortestTimeout =
        1000ull * static_cast<unsigned int>(std::min(m_Soap.send_timeout, m_Soap.recv_timeout));
    return !m_Connected && m_Received == 0 && ZVUtilities::MillisecondTime() - m_Begun < shortestTimeout;
}

void Transport::EndExchange(int result)
{
    const bool leftOver = m_Soap.bufidx < m_Soap.buflen;
    if (result != SOAP_OK || leftOver) Close();
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
    // The way through a proxy is the toolkit's.
    const SOAP_SOCKET socket =
        context->proxy_host ? self.m_Open(context, endpoint, host, port) : self.Open(endpoint, host, port);
    self.Watch(socket);
    return socket;
}

SOAP_SOCKET Transport::Open(const char* endpoint, const char* host, int port)
{
    const Patience patience = {ZVUtilities::MillisecondTime() + 1000ull * m_Soap.connect_timeout, m_Aborted};
    m_Soap.imode &= ~SOAP_ENC_SSL;
    m_Soap.omode &= ~SOAP_ENC_SSL;
    m_Soap.errnum = 0;
    const int socket = Connector::OpenTcp(host, port, patience);
    if (socket < 0) {
        m_Soap.error = SOAP_TCP_ERROR;
        return SOAP_INVALID_SOCKET;
    }
    if (!IsTls(endpoint) || OpenTls(socket, host, patience)) return socket;
    close(socket);
    m_Soap.error = SOAP_SSL_ERROR;
    return SOAP_INVALID_SOCKET;
}

bool Transport::OpenTls(int socket, const char* host, const Patience& patience)
{
    SSL_SESSION* const offered = Tls::SessionFor(m_Soap.ctx);
    m_Soap.ssl = Connector::OpenTls(m_Soap.ctx, socket, host, offered, patience);
    SSL_SESSION_free(offered);
    if (!m_Soap.ssl) {
        Tls::ForgetSession(m_Soap.ctx);  // perhaps it was what the peer did not like
        return false;
    }
    m_Soap.imode |= SOAP_ENC_SSL;
    m_Soap.omode |= SOAP_ENC_SSL;
    return true;
}

void Transport::Watch(SOAP_SOCKET socket)
{
    ZVMutexLock lock(m_AbortMutex);
    m_Watched = socket;
    if (m_Aborted && soap_valid_socket(socket)) shutdown(socket, SHUT_RDWR);
}

void Transport::Abort()
{
    ZVMutexLock lock(m_AbortMutex);
    m_Aborted = true;
    if (soap_valid_socket(m_Watched)) shutdown(m_Watched, SHUT_RDWR);
}

int Transport::CloseHook(soap* context, SOAP_SOCKET socket)
{
    Transport& self = Of(context);
    self.Watch(SOAP_INVALID_SOCKET);
    return self.m_CloseSocket(context, socket);
}

int Transport::SendHook(soap* context, const char* data, size_t length)
{
    Transport& self = Of(context);
    self.m_HasSent = true;
    TrafficLog::Sent(self.m_SentSecrets, data, length);
    return self.m_Send(context, data, length);
}

size_t Transport::ReceiveHook(soap* context, char* buffer, size_t size)
{
    Transport& self = Of(context);
    const size_t received = self.m_Receive(context, buffer, size);
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
    return self.m_Header(context, key, value);
}

// A result other than 0 keeps the runtime from waiting for the peer's side of the close.
int Transport::ShutdownHook(soap*, SOAP_SOCKET socket, int how)
{
    shutdown(socket, how);
    return SOAP_TCP_ERROR;
}
