#include "Proxy.h"

#include <fcntl.h>
#include <netdb.h>
#include <netinet/in.h>
#include <poll.h>
#include <strings.h>
#include <sys/socket.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

#include "Base64.h"

namespace simulator {

namespace {

constexpr size_t kPiece = 16384;

// The goal of a request; empty when it is right, else what is wrong with it.
std::string ReadGoal(const HttpRequest& request, Proxy::Goal& goal)
{
    const std::string scheme = "http://";
    goal.isTunnel = request.method == "CONNECT";
    if (goal.isTunnel) {
        goal.authority = request.target;
        goal.address = ReadAddress(request.target, 0);
        return goal.address.port ? "" : "the target of CONNECT is no host and port";
    }
    if (request.target.compare(0, scheme.size(), scheme) != 0) return "the target is no http address";
    goal.path = request.Local();
    goal.authority = request.target.substr(scheme.size(), request.target.find('/', scheme.size()) - scheme.size());
    goal.address = ReadAddress(goal.authority, 80);
    return goal.address.port ? "" : "the target is no http address";
}

// The request as the host itself gets it.
std::string OwnRequest(const HttpRequest& request, const Proxy::Goal& goal, bool keepAlive)
{
    std::string text = request.method + " " + goal.path + " HTTP/1.1\r\nHost: " + goal.authority + "\r\n";
    for (const auto& [name, value] : request.headers) {
        static const char* const kOfConnection[] = {
            "host", "connection", "keep-alive", "proxy-connection", "proxy-authorization", "transfer-encoding",
            "te",   "upgrade",    "expect",     "content-length"};
        bool passes = true;
        for (const char* own : kOfConnection)
            passes = passes && name != own;
        if (passes) text.append(name).append(": ").append(value).append("\r\n");
    }
    if (!request.body.empty()) text += "Content-Length: " + std::to_string(request.body.size()) + "\r\n";
    text += std::string("Via: 1.1 storefront-proxy\r\nConnection: ") + (keepAlive ? "keep-alive" : "close");
    return text + "\r\n\r\n" + request.body;
}

// At most `size` bytes into `bytes`; 0 at the end, negative when the connection is broken.
ssize_t ReadPiece(int descriptor, std::string& bytes, size_t size)
{
    bytes.resize(size);
    ssize_t count;
    do {
        count = recv(descriptor, &bytes[0], size, 0);
    } while (count < 0 && errno == EINTR);
    bytes.resize(count > 0 ? static_cast<size_t>(count) : 0);
    return count;
}

// Counts what comes back to the client, for the faults that end a tunnel.
class Budget {
public:
    explicit Budget(const Fault& fault) : m_Counts(fault.As<TunnelEnd>() != nullptr), m_Left(fault.Number(0)) {}
    bool Counts() const { return m_Counts; }
    bool IsSpent() const { return m_Counts && m_Left <= 0; }
    size_t Next() const { return m_Counts ? std::min<size_t>(kPiece, static_cast<size_t>(m_Left)) : kPiece; }
    void Spend(size_t count) { m_Left -= static_cast<long>(count); }

private:
    bool m_Counts;
    long m_Left;
};

void EndAsOrdered(Channel& client, const Fault& fault)
{
    switch (*fault.As<TunnelEnd>()) {
        case TunnelEnd::Stall:
            client.Stall();
            break;
        case TunnelEnd::Cut:
            break;
    }
    client.Close();
}

HttpResponse Unreachable(const Proxy::Goal& goal)
{
    HttpResponse response;
    response.status = 502;
    response.body = "no way to " + goal.authority;
    return response;
}

}  // namespace

// A connection to where a client wants to go. The simulator recognises it by its port, which is known before it
// accepts.
class Proxy::FarSide {
public:
    FarSide(Proxy& proxy, const Address& address, unsigned long client) : m_Proxy(proxy), m_Address(address)
    {
        const Address where = proxy.m_Hosts.Resolve(address);
        addrinfo hints = {};
        hints.ai_socktype = SOCK_STREAM;
        hints.ai_flags = AI_NUMERICSERV;
        addrinfo* found = nullptr;
        if (getaddrinfo(where.host.c_str(), std::to_string(where.port).c_str(), &hints, &found) != 0) return;
        for (const addrinfo* one = found; one && !m_Channel; one = one->ai_next)
            Connect(*one, client);
        freeaddrinfo(found);
    }
    ~FarSide() { Leave(); }
    FarSide(const FarSide&) = delete;
    FarSide& operator=(const FarSide&) = delete;

    explicit operator bool() const { return m_Channel != nullptr; }
    Channel& operator*() { return *m_Channel; }
    const Address& Where() const { return m_Address; }
    /// Nothing has come since the last answer, not even the end.
    bool IsQuiet() const
    {
        pollfd entry = {m_Channel->Descriptor(), POLLIN | POLLRDHUP, 0};
        return poll(&entry, 1, 0) == 0;
    }

private:
    void Connect(const addrinfo& one, unsigned long client)
    {
        const int descriptor = socket(one.ai_family, SOCK_STREAM | SOCK_CLOEXEC | SOCK_NONBLOCK, 0);
        if (descriptor < 0) return;
        m_Channel = std::make_unique<Channel>(descriptor);
        sockaddr_storage own = {};
        own.ss_family = static_cast<sa_family_t>(one.ai_family);
        socklen_t size = one.ai_addrlen;
        if (bind(descriptor, reinterpret_cast<sockaddr*>(&own), size) == 0 &&
            getsockname(descriptor, reinterpret_cast<sockaddr*>(&own), &size) == 0) {
            // The port stands in the same place in both families.
            m_Port = ntohs(reinterpret_cast<sockaddr_in*>(&own)->sin_port);
            const std::lock_guard<std::mutex> lock(m_Proxy.m_Mutex);
            m_Proxy.m_Ports[m_Port] = client;
        }
        if (!IsConnected(descriptor, one)) Leave();
    }
    // What the server's end breaks off must have begun.
    bool IsConnected(int descriptor, const addrinfo& one)
    {
        const bool begun = connect(descriptor, one.ai_addr, one.ai_addrlen) == 0 || errno == EINPROGRESS;
        m_Proxy.m_Server.Watch(descriptor);
        pollfd entry = {descriptor, POLLOUT, 0};
        while (begun && poll(&entry, 1, -1) < 0 && errno == EINTR) {
        }
        int error = 0;
        socklen_t size = sizeof error;
        getsockopt(descriptor, SOL_SOCKET, SO_ERROR, &error, &size);
        fcntl(descriptor, F_SETFL, 0);
        return begun && error == 0 && (entry.revents & POLLHUP) == 0;
    }
    void Leave()
    {
        if (!m_Channel) return;
        m_Proxy.m_Server.Forget(m_Channel->Descriptor());
        {
            const std::lock_guard<std::mutex> lock(m_Proxy.m_Mutex);
            m_Proxy.m_Ports.erase(m_Port);
        }
        m_Channel.reset();
    }

    Proxy& m_Proxy;
    const Address m_Address;
    int m_Port = 0;
    std::unique_ptr<Channel> m_Channel;
};

Proxy::Proxy(Server& server, AnswerWriter& writer, Faults& faults, RequestLog& log, const Hosts& hosts,
             const std::string& user, const std::string& password)
    : m_Server(server),
      m_Writer(writer),
      m_Faults(faults),
      m_Log(log),
      m_Hosts(hosts),
      m_Credentials(user.empty() ? "" : Base64(user + ":" + password))
{}

unsigned long Proxy::Behind(int port) const
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    const auto found = m_Ports.find(port);
    return found == m_Ports.end() ? 0 : found->second;
}

void Proxy::Serve(Connection& client)
{
    std::unique_ptr<FarSide> kept;
    ServeRequests(m_Server, client, m_Log, [&](const HttpRequest& request, const std::string& early) {
        return ServeOne(client, request, early, kept);
    });
}

std::string Proxy::Standing(const HttpRequest& request) const
{
    if (m_Credentials.empty()) return "";
    const std::string given = request.Header("proxy-authorization");
    if (given.empty()) return "none";
    const size_t start = given.find_first_not_of(' ', std::min(given.find(' '), given.size()));
    const bool right =
        strncasecmp(given.c_str(), "basic ", 6) == 0 && given.compare(start, given.npos, m_Credentials) == 0;
    return right ? "right" : "wrong";
}

// Notes the request. The answer that refuses it, or one of 200.
HttpResponse Proxy::Check(const Connection& client, const HttpRequest& request, const Fault& fault, Goal& goal)
{
    HttpResponse response;
    LoggedRequest log = BeginEntry(client, m_Log, request);
    log.service = log.operation = "proxy";
    log.fault = fault.Spelling();
    log.credentials = Standing(request);
    log.violation = ReadGoal(request, goal);
    if (!log.violation.empty()) response.status = 400;
    if (log.credentials == "none" || log.credentials == "wrong") {
        log.violation = log.credentials == "none" ? "no credentials" : "wrong credentials";
        response.status = 407;
    }
    if (response.status == 407 || (fault.Is(Content::Status) && fault.Number(0) == 407)) {
        response.headers.emplace_back("Proxy-Authenticate", "Basic realm=\"storefront\"");
    }
    response.body = log.violation;
    response.opensTunnel = goal.isTunnel && response.status == 200;
    m_Log.Add(std::move(log));
    return response;
}

bool Proxy::ServeOne(Connection& client, const HttpRequest& request, const std::string& early,
                     std::unique_ptr<FarSide>& kept)
{
    const Fault fault = m_Faults.Take("proxy");
    Goal goal;
    const HttpResponse response = Check(client, request, fault, goal);
    if (!m_Server.Pause(fault.delay)) return false;
    if (response.status != 200) return m_Writer.Send(client.channel, request, response, fault);
    // A length in the answer that opens a tunnel means nothing.
    const bool claimsFailure = fault.ClaimsFailure() && !(goal.isTunnel && fault.Is(Bounding::ZeroLength));
    if (claimsFailure) return m_Writer.Send(client.channel, request, response, fault) && fault.Is(Content::Status);
    if (!goal.isTunnel) return Forward(client, request, goal, kept, fault);
    FarSide far(*this, goal.address, client.number);
    if (!far) return m_Writer.Send(client.channel, request, Unreachable(goal), fault);
    if (m_Writer.Send(client.channel, request, response, fault)) Tunnel(client.channel, *far, early, fault);
    return false;
}

// Passes bytes both ways until both have ended.
void Proxy::Tunnel(Channel& client, Channel& far, const std::string& early, const Fault& fault)
{
    struct {
        Channel& from;
        Channel& to;
        bool open;
    } ways[] = {{client, far, true}, {far, client, true}};
    Budget budget(fault);
    std::string piece = early;
    if (!far.Write(piece)) return;
    while (ways[0].open || ways[1].open) {
        if (budget.IsSpent()) return EndAsOrdered(client, fault);
        pollfd entries[2];
        for (size_t i = 0; i < 2; ++i)
            entries[i] = {ways[i].open ? ways[i].from.Descriptor() : -1, POLLIN, 0};
        if (poll(entries, 2, -1) < 0) continue;
        for (size_t i = 0; i < 2; ++i) {
            if (entries[i].revents == 0) continue;
            const ssize_t count = ReadPiece(ways[i].from.Descriptor(), piece, i == 0 ? kPiece : budget.Next());
            if (count < 0) return ways[i].to.Reset();
            if (count == 0) {
                ways[i].open = false;
                shutdown(ways[i].to.Descriptor(), SHUT_WR);
            }
            if (i == 1) budget.Spend(piece.size());
            if (!ways[i].to.Write(piece)) return;
        }
    }
}

// A plain request and its answer.
bool Proxy::Forward(Connection& client, const HttpRequest& request, const Goal& goal, std::unique_ptr<FarSide>& kept,
                    const Fault& fault)
{
    std::unique_ptr<FarSide> far = std::move(kept);
    if (!far || !(far->Where() == goal.address) || !far->IsQuiet()) {
        far = std::make_unique<FarSide>(*this, goal.address, client.number);
    }
    if (!*far) return m_Writer.Send(client.channel, request, Unreachable(goal), fault);
    // An answer that a fault spoils is the proxy's own, made of what has come whole.
    const bool passes = !fault.row || Budget(fault).Counts();
    AnswerReader answer(request.method == "HEAD");
    (**far).Write(OwnRequest(request, goal, request.KeepAlive() && passes));
    if (!Fetch(client.channel, **far, answer, passes, fault)) return false;
    if (!passes) return m_Writer.Send(client.channel, request, answer.Response(), fault);
    if (answer.KeepAlive()) kept = std::move(far);
    return answer.KeepAlive() && request.KeepAlive();
}

// Reads an answer to its end, and passes on each piece when `passes`. False when one side has ended before that.
bool Proxy::Fetch(Channel& client, Channel& far, AnswerReader& answer, bool passes, const Fault& fault)
{
    Budget budget(fault);
    std::string piece;
    while (!answer.Done()) {
        if (budget.IsSpent()) return EndAsOrdered(client, fault), false;
        pollfd entries[] = {{far.Descriptor(), POLLIN, 0}, {client.Descriptor(), POLLRDHUP, 0}};
        if (poll(entries, 2, -1) < 0) continue;
        if (entries[1].revents) return false;
        const ssize_t count = ReadPiece(far.Descriptor(), piece, budget.Next());
        if (count < 0) return client.Reset(), false;
        if (count == 0) {
            answer.End();
            if (passes || !answer.Done()) return client.Close(), false;
        }
        budget.Spend(piece.size());
        answer.Take(piece);
        if (!passes) continue;
        if (!client.Write(piece)) return false;
        answer.DropBody();
    }
    return true;
}

}  // namespace simulator
