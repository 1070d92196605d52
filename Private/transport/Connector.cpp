#include "Connector.h"

#include <errno.h>
#include <netinet/tcp.h>
#include <openssl/err.h>
#include <openssl/evp.h>
#include <poll.h>
#include <stdlib.h>
#include <string.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <deque>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "Resolver.h"
#include "Url.h"
#include "ZVMutex.h"
#include "ZVUtilities.h"

namespace {

constexpr uint64_t kSlice = 100;             // milliseconds
constexpr uint64_t kNextAttempt = 250;       // milliseconds after the one before
constexpr uint64_t kOtherFamily = 50;        // milliseconds that the answer for IPv6 is waited for
constexpr unsigned int kSilentPeer = 10000;  // milliseconds
constexpr size_t kMostHead = 16 * 1024;      // bytes of a proxy's answer

class Socket {
public:
    explicit Socket(int descriptor) : m_Descriptor(descriptor) {}
    ~Socket()
    {
        if (m_Descriptor >= 0) close(m_Descriptor);
    }
    Socket(Socket&& other) noexcept : m_Descriptor(other.Release()) {}
    Socket& operator=(Socket&& other) noexcept
    {
        std::swap(m_Descriptor, other.m_Descriptor);
        return *this;
    }

    int Get() const { return m_Descriptor; }
    int Release() { return std::exchange(m_Descriptor, -1); }

private:
    int m_Descriptor;
};

void Set(int socket, int level, int option, int value)
{
    setsockopt(socket, level, option, &value, sizeof value);
}

// Starts to connect; -1 when that fails at once.
Socket Start(const Address& to)
{
    Socket made(socket(to.Family(), SOCK_STREAM | SOCK_NONBLOCK | SOCK_CLOEXEC, IPPROTO_TCP));
    if (made.Get() < 0) return made;
    Set(made.Get(), IPPROTO_TCP, TCP_NODELAY, 1);
    // Something between here and the peer may forget the connection without telling anybody.
    Set(made.Get(), SOL_SOCKET, SO_KEEPALIVE, 1);
    Set(made.Get(), IPPROTO_TCP, TCP_KEEPIDLE, 5);
    Set(made.Get(), IPPROTO_TCP, TCP_KEEPINTVL, 2);
    Set(made.Get(), IPPROTO_TCP, TCP_KEEPCNT, 2);
    const auto* address = reinterpret_cast<const sockaddr*>(&to.socket);
    if (connect(made.Get(), address, to.length) == 0 || errno == EINPROGRESS) return made;
    return Socket(-1);
}

int ErrorOf(int socket)
{
    int error = 0;
    socklen_t size = sizeof error;
    return getsockopt(socket, SOL_SOCKET, SO_ERROR, &error, &size) == 0 ? error : errno;
}

// Connects with the first of a host's addresses that answers (RFC 8305).
class Race {
public:
    Race(const ZVString& host, int port, const Patience& patience)
        : m_Host(host), m_Names(host, port), m_Patience(patience)
    {}

    Socket Run()
    {
        while (!m_Patience.IsOver()) {
            for (const Address& address : m_Names.Take())
                (address.Family() == AF_INET6 ? m_Six : m_Four).push_back(address);
            StartNext();
            if (m_Attempts.empty() && m_Six.empty() && m_Four.empty() && m_Names.IsDone()) break;
            Socket winner = Wait();
            if (winner.Get() >= 0) return winner;
        }
        NameLookup::Forget(m_Host);
        return Socket(-1);
    }

private:
    // Milliseconds until another attempt may begin; 0: now.
    int UntilNext() const
    {
        const uint64_t now = ZVUtilities::MillisecondTime();
        // IPv6 goes first when its addresses come at nearly the same time.
        const bool waitsForSix = m_Next == 0 && m_Six.empty() && !m_Names.IsDone(AF_INET6);
        const uint64_t start = waitsForSix ? m_FourCame + kOtherFamily : m_Next;
        return static_cast<int>(start - std::min(start, now));
    }

    void StartNext()
    {
        if (!m_Four.empty() && m_FourCame == 0) m_FourCame = ZVUtilities::MillisecondTime();
        while ((!m_Six.empty() || !m_Four.empty()) && UntilNext() == 0) {
            // The families take turns.
            const bool takesSix = m_Four.empty() || (!m_Six.empty() && !m_LastWasSix);
            std::deque<Address>& family = takesSix ? m_Six : m_Four;
            Socket attempt = Start(family.front());
            family.pop_front();
            m_LastWasSix = takesSix;
            if (attempt.Get() < 0) continue;
            m_Attempts.push_back(std::move(attempt));
            m_Next = ZVUtilities::MillisecondTime() + kNextAttempt;
        }
    }

    // Until something happens; the socket that is connected, or none yet.
    Socket Wait()
    {
        std::vector<pollfd> waits;
        for (const Socket& attempt : m_Attempts)
            waits.push_back({attempt.Get(), POLLOUT, 0});
        int timeout = m_Patience.Slice();
        if (!m_Six.empty() || !m_Four.empty()) timeout = std::min(timeout, UntilNext());
        m_Names.AddTo(waits, timeout);
        if (poll(waits.data(), waits.size(), timeout) < 0 && errno != EINTR) return Socket(-1);
        m_Names.Process(waits);
        for (size_t i = m_Attempts.size(); i-- > 0;) {
            if (waits[i].revents == 0) continue;
            const bool connected = ErrorOf(m_Attempts[i].Get()) == 0;
            Socket attempt = std::move(m_Attempts[i]);
            m_Attempts.erase(m_Attempts.begin() + static_cast<long>(i));
            if (connected) return attempt;
            m_Next = ZVUtilities::MillisecondTime();  // nothing to wait for any more
        }
        return Socket(-1);
    }

    const ZVString m_Host;
    NameLookup m_Names;
    const Patience& m_Patience;
    std::deque<Address> m_Six, m_Four;  // not tried yet
    uint64_t m_FourCame = 0;            // by ZVUtilities::MillisecondTime, 0: not yet
    uint64_t m_Next = 0;                // when another attempt may begin; 0: none has yet
    bool m_LastWasSix = false;
    std::vector<Socket> m_Attempts;  // under way
};

// Repeats a step of the TLS library, which waits for nothing, until it is done (a positive result) or fails.
template <class Step>
int Finish(const SSL* tls, int socket, const Patience& patience, Step step)
{
    for (;;) {
        ERR_clear_error();
        const int result = step();
        if (result > 0) return result;
        const int error = SSL_get_error(tls, result);
        const bool waits = error == SSL_ERROR_WANT_READ || error == SSL_ERROR_WANT_WRITE;
        if (!waits || !patience.WaitFor(socket, error == SSL_ERROR_WANT_READ ? POLLIN : POLLOUT)) return -1;
    }
}

// The same for a step of a plain socket.
template <class Step>
ssize_t Finish(int socket, short events, const Patience& patience, Step step)
{
    for (;;) {
        const ssize_t result = step();
        if (result >= 0) return result;
        if (errno != EINTR && (errno != EAGAIN || !patience.WaitFor(socket, events))) return -1;
    }
}

// Up to and with the empty line, and nothing behind it: the peer has not been asked for anything yet. False when there
// is no such head.
bool ReceiveHead(int socket, std::string& head, const Patience& patience)
{
    static const char kEnd[] = "\r\n\r\n";
    while (head.find(kEnd) == std::string::npos) {
        char piece[1024];
        const size_t count = Connection{socket}.Receive(piece, sizeof piece, patience);
        if (count == 0 || head.size() > kMostHead) return false;
        head.append(piece, count);
    }
    return true;
}

// The TLS library's question, at each certificate, whether its verdict stands. It does.
int NoteNotYetValid(int isValid, X509_STORE_CTX* chain)
{
    const auto* tls = static_cast<SSL*>(X509_STORE_CTX_get_ex_data(chain, SSL_get_ex_data_X509_STORE_CTX_idx()));
    auto* validFrom = static_cast<time_t*>(SSL_get_app_data(tls));
    if (validFrom && !isValid && X509_STORE_CTX_get_error(chain) == X509_V_ERR_CERT_NOT_YET_VALID) {
        tm parts = {};
        ASN1_TIME_to_tm(X509_get0_notBefore(X509_STORE_CTX_get_current_cert(chain)), &parts);
        *validFrom = timegm(&parts);
    }
    return isValid;
}

// The status in "HTTP/1.x NNN ..."; -1 for anything else.
int StatusOf(const std::string& head)
{
    if (head.compare(0, 7, "HTTP/1.") != 0 || head.size() < 12 || !isdigit(head[7]) || head[8] != ' ') return -1;
    const int status = atoi(head.substr(9, 3).c_str());
    return status >= 100 && status <= 599 ? status : -1;
}

}  // namespace

bool Patience::IsOver() const
{
    return aborted || ZVUtilities::MillisecondTime() >= deadline;
}

int Patience::Slice() const
{
    const uint64_t now = ZVUtilities::MillisecondTime();
    return static_cast<int>(std::min(deadline - std::min(deadline, now), kSlice));
}

bool Patience::WaitFor(int socket, short events) const
{
    while (!IsOver()) {
        pollfd ready = {socket, events, 0};
        const int count = poll(&ready, 1, Slice());
        if (count > 0) return true;
        if (count < 0 && errno != EINTR) return false;
    }
    return false;
}

ZVString Proxy::AuthorizationLine() const
{
    if (userName.empty()) return ZVString();
    const ZVString pair = userName + ":" + password;
    std::string coded(4 * ((pair.length() + 2) / 3) + 1, '\0');
    const auto* bytes = reinterpret_cast<const unsigned char*>(pair.c_str());
    EVP_EncodeBlock(reinterpret_cast<unsigned char*>(&coded[0]), bytes, static_cast<int>(pair.length()));
    return ZVString("Proxy-Authorization: Basic ") + coded.c_str() + "\r\n";
}

struct CurrentProxy {
    ZVMutex mutex;
    Proxy proxy ZV_GUARDED_BY(mutex);

    static CurrentProxy& Get()
    {
        static auto* current = new CurrentProxy;  // outlives threads that still ask at exit
        return *current;
    }
};

Proxy Proxy::Current()
{
    CurrentProxy& current = CurrentProxy::Get();
    ZVMutexLock lock(current.mutex);
    return current.proxy;
}

void Proxy::MakeCurrent() const
{
    CurrentProxy& current = CurrentProxy::Get();
    ZVMutexLock lock(current.mutex);
    current.proxy = *this;
}

namespace Connector {

int OpenTcp(const ZVString& host, int port, const Patience& patience)
{
    Socket connected = Race(host, port, patience).Run();
    if (connected.Get() >= 0) Set(connected.Get(), IPPROTO_TCP, TCP_USER_TIMEOUT, kSilentPeer);
    return connected.Release();
}

int OpenTunnel(int socket, const ZVString& host, int port, const Proxy& proxy, const Patience& patience)
{
    const bool isSix = host.find(':') != ZVString::npos;
    const ZVString target = (isSix ? ZVString("[") + host + "]" : host) + ":" + std::to_string(port).c_str();
    const ZVString request =
        ZVString("CONNECT ") + target + " HTTP/1.1\r\nHost: " + target + "\r\n" + proxy.AuthorizationLine() + "\r\n";
    std::string head;
    const bool asked = Connection{socket}.Send(request.c_str(), request.length(), patience);
    if (!asked || !ReceiveHead(socket, head, patience)) return -1;
    const int status = StatusOf(head);
    if (status < 200 || status > 299) return status;
    char behind;
    const bool isAll =
        head.find("\r\n\r\n") + 4 == head.size() && recv(socket, &behind, 1, MSG_PEEK | MSG_DONTWAIT) <= 0;
    return isAll ? 0 : -1;
}

SSL* OpenTls(SSL_CTX* context, int socket, const ZVString& host, SSL_SESSION* resumed, time_t now,
             const Patience& patience, time_t& validFrom)
{
    struct Free {
        void operator()(SSL* tls) const { SSL_free(tls); }
    };
    std::unique_ptr<SSL, Free> tls(SSL_new(context));
    if (!tls || SSL_set_fd(tls.get(), socket) != 1) return nullptr;
    X509_VERIFY_PARAM_set_time(SSL_get0_param(tls.get()), now);
    if (!IsAddress(host.c_str())) SSL_set_tlsext_host_name(tls.get(), host.c_str());
    if (resumed) SSL_set_session(tls.get(), resumed);
    SSL_set_app_data(tls.get(), &validFrom);
    SSL_set_verify(tls.get(), SSL_VERIFY_PEER, NoteNotYetValid);
    const bool isOpen = Finish(tls.get(), socket, patience, [&] { return SSL_connect(tls.get()); }) == 1;
    SSL_set_app_data(tls.get(), nullptr);
    if (isOpen) return tls.release();
    ERR_clear_error();
    return nullptr;
}

}  // namespace Connector

bool Connection::Send(const char* data, size_t length, const Patience& patience) const
{
    for (const char* const end = data + length; data < end;) {
        if (patience.IsOver()) return false;
        const auto rest = static_cast<size_t>(end - data);
        const ssize_t count =
            tls ? Finish(tls, socket, patience, [&] { return SSL_write(tls, data, static_cast<int>(rest)); })
                : Finish(socket, POLLOUT, patience, [&] { return send(socket, data, rest, MSG_NOSIGNAL); });
        if (count <= 0) return false;
        data += count;
    }
    return true;
}

size_t Connection::Receive(char* buffer, size_t size, const Patience& patience) const
{
    if (patience.IsOver()) return 0;
    const ssize_t count =
        tls ? Finish(tls, socket, patience, [&] { return SSL_read(tls, buffer, static_cast<int>(size)); })
            : Finish(socket, POLLIN, patience, [&] { return recv(socket, buffer, size, 0); });
    return count > 0 ? static_cast<size_t>(count) : 0;
}

bool Connection::IsQuiet() const
{
    char byte;
    if (!tls) return recv(socket, &byte, 1, MSG_PEEK | MSG_DONTWAIT) < 0 && errno == EAGAIN;
    ERR_clear_error();
    const int result = SSL_peek(tls, &byte, 1);
    return result <= 0 && SSL_get_error(tls, result) == SSL_ERROR_WANT_READ;
}
