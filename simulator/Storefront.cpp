#include "Storefront.h"

#include <arpa/inet.h>
#include <libxml/parser.h>
#include <netinet/tcp.h>
#include <signal.h>
#include <stdlib.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

#include <atomic>
#include <cerrno>
#include <chrono>
#include <condition_variable>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <list>
#include <set>
#include <thread>

#include "Catalogue.h"
#include "Certificates.h"
#include "Channel.h"
#include "ContractPages.h"
#include "Faults.h"
#include "PlainService.h"
#include "RequestLog.h"
#include "SoapService.h"

namespace {

using Clock = std::chrono::steady_clock;

int Listen(int wanted, int& port)
{
    const int listener = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    const int on = 1;
    setsockopt(listener, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<uint16_t>(wanted));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof address;
    if (bind(listener, reinterpret_cast<sockaddr*>(&address), size) != 0 || listen(listener, 64) != 0) {
        const int error = errno;
        close(listener);
        errno = error;
        return -1;
    }
    getsockname(listener, reinterpret_cast<sockaddr*>(&address), &size);
    port = ntohs(address.sin_port);
    return listener;
}

class Simulator final : public Storefront {
public:
    explicit Simulator(const StorefrontOptions& options) : m_Options(options), m_Latency(options.latency) {}
    ~Simulator() override;

    bool Begin(std::string& error);

    int HttpsPort() const override { return m_HttpsPort; }
    int HttpPort() const override { return m_HttpPort; }
    std::string DataFolder() const override { return m_Folder; }
    std::string DeploymentFile() const override { return m_Folder + "/deployment.conf"; }
    bool AddFault(const std::string& text, std::string& error) override { return m_Faults.Add(text, error); }
    void ClearFaults() override { m_Faults.Clear(); }
    std::vector<LoggedRequest> Log() const override { return m_Log.All(); }
    void ClearLog() override { m_Log.Clear(); }
    bool WaitForRequests(size_t count) const override { return m_Log.WaitFor(count); }
    void SetLatency(int milliseconds) override { m_Latency = milliseconds; }
    void SetCertificate(CertificateKind kind) override;
    std::string Query(const std::string& sql) const override { return m_Database->Text(sql); }
    std::vector<std::vector<std::string>> Rows(const std::string& sql) const override;

private:
    // What one connection knows about itself.
    struct Connection {
        Channel channel;
        unsigned long number;
        bool tls;
    };

    struct Worker {
        std::thread thread;
        bool done = false;
    };

    bool OpenFolder(std::string& error);
    bool OpenPorts(std::string& error);
    bool WriteFiles(std::string& error);
    void Accept(int listener, bool tls);
    void Reap();
    void Serve(int descriptor, bool tls, unsigned long number);
    bool Handshake(Connection& connection);
    void NoteMalformed(const Connection& connection);
    void NoteConnection(const Connection& connection, const std::string& fault);
    double Now() const { return std::chrono::duration<double>(Clock::now() - m_Start).count(); }
    void ServeRequests(Connection& connection);
    bool ServeOne(Connection& connection, const HttpRequest& request);
    HttpResponse Answer(const HttpRequest& request, Connection& connection, LoggedRequest& log, Fault& fault);
    bool Send(Connection& connection, const HttpRequest& request, HttpResponse response, const Fault& fault);
    bool SendFaulty(Channel& channel, const std::string& head, const std::string& body, const Fault& fault);
    bool SendEndless(Channel& channel, const std::string& head, const std::string& half);
    bool SendDrip(Channel& channel, const std::string& bytes, int pause);
    // False when the simulator ends meanwhile.
    bool Pause(int milliseconds);

    const StorefrontOptions m_Options;
    std::string m_Folder;
    bool m_FolderIsTemporary = false;
    int m_HttpsPort = 0;
    int m_HttpPort = 0;
    int m_HttpsListener = -1;
    int m_HttpListener = -1;
    std::atomic<int> m_Latency;
    const Clock::time_point m_Start = Clock::now();

    std::unique_ptr<Certificates> m_Certificates;
    std::unique_ptr<Database> m_Database;
    std::unique_ptr<SoapService> m_Soap;
    Faults m_Faults;
    RequestLog m_Log;

    std::mutex m_Mutex;
    std::condition_variable m_Ending;
    bool m_Ended = false;
    SSL_CTX* m_Tls = nullptr;
    std::set<int> m_Open;  // descriptors of the connections being served
    std::list<std::thread> m_Acceptors;
    std::list<Worker> m_Workers;
    unsigned long m_Connections = 0;
};

Simulator::~Simulator()
{
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        m_Ended = true;
        m_Ending.notify_all();
        m_Faults.End();
        for (const int descriptor : m_Open)
            shutdown(descriptor, SHUT_RDWR);
    }
    for (const int listener : {m_HttpsListener, m_HttpListener}) {
        if (listener >= 0) shutdown(listener, SHUT_RDWR);
    }
    for (std::thread& thread : m_Acceptors)
        thread.join();
    // No worker is added from here on.
    for (Worker& worker : m_Workers)
        worker.thread.join();
    for (const int listener : {m_HttpsListener, m_HttpListener}) {
        if (listener >= 0) close(listener);
    }
    m_Log.End();
    SSL_CTX_free(m_Tls);
    m_Soap.reset();
    m_Database.reset();
    std::error_code ignored;
    if (m_FolderIsTemporary) std::filesystem::remove_all(m_Folder, ignored);
}

// ---- Start

bool Simulator::OpenFolder(std::string& error)
{
    m_Folder = m_Options.dataFolder;
    if (m_Folder.empty()) {
        std::string name = std::filesystem::temp_directory_path().string() + "/storefront-XXXXXX";
        if (mkdtemp(&name[0])) m_Folder = name;
        m_FolderIsTemporary = true;
    }
    std::error_code failure;
    std::filesystem::create_directories(m_Folder, failure);
    if (std::filesystem::is_directory(m_Folder)) {
        m_Folder = std::filesystem::absolute(m_Folder).string();
        return true;
    }
    error = m_Folder + ": cannot make the data folder; name another one with --data";
    return false;
}

bool Simulator::OpenPorts(std::string& error)
{
    const struct {
        int wanted;
        int& port;
        int& listener;
        const char* option;
    } rows[] = {{m_Options.httpsPort, m_HttpsPort, m_HttpsListener, "--https-port"},
                {m_Options.httpPort, m_HttpPort, m_HttpListener, "--http-port"}};
    for (const auto& row : rows) {
        row.listener = Listen(row.wanted, row.port);
        if (row.listener >= 0) continue;
        error = "port " + std::to_string(row.wanted) + ": " + strerror(errno) + "; choose another one with " +
                row.option + " (0 takes a free one)";
        return false;
    }
    return true;
}

bool Simulator::WriteFiles(std::string& error)
{
    std::ofstream account(m_Folder + "/account.txt");
    account << "user = " << StorefrontAccount::kUser << "\npassword = " << StorefrontAccount::kPassword
            << "\napi key = " << StorefrontAccount::kApiKey
            << "\nactivation PIN = " << StorefrontAccount::kActivationPin
            << "\nsecond activation PIN = " << StorefrontAccount::kSecondActivationPin << "\n";
    std::ofstream file(DeploymentFile());
    file << "# Written by the storefront simulator when it starts.\n";
    for (const char* key : {"production_host", "api_staging_host", "internal_staging_host", "adult_production_host",
                            "adult_staging_host"}) {
        file << key << " = localhost:" << m_HttpsPort << "\n";
    }
    for (const char* key : {"image_host", "web_host"})
        file << key << " = localhost:" << m_HttpPort << "\n";
    file << "ca_file = " << m_Certificates->AuthorityFile() << "\n";
    file << "device_key_file = " << m_Folder << "/device.key\n";
    file.flush();
    if (file && account) return true;
    error = DeploymentFile() + ": cannot write the deployment file; name a folder that can be written with --data";
    return false;
}

bool Simulator::Begin(std::string& error)
{
    for (const std::string& fault : m_Options.faults) {
        if (!m_Faults.Add(fault, error)) return false;
    }
    if (!OpenFolder(error) || !OpenPorts(error)) return false;
    m_Certificates = Certificates::Open(m_Folder, error);
    if (!m_Certificates) return false;
    m_Database = Database::Open(m_Folder + "/storefront.db", error);
    if (!m_Database || !FillCatalogue(*m_Database, error)) return false;
    xmlInitParser();
    m_Soap =
        std::make_unique<SoapService>(*m_Database, "localhost:" + std::to_string(m_HttpPort), m_Options.largestPage);
    m_Tls = m_Certificates->Context(m_Options.certificate, m_Options.oldTls);
    if (!WriteFiles(error)) return false;
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Acceptors.emplace_back([this] { Accept(m_HttpsListener, true); });
    m_Acceptors.emplace_back([this] { Accept(m_HttpListener, false); });
    return true;
}

void Simulator::SetCertificate(CertificateKind kind)
{
    SSL_CTX* context = m_Certificates->Context(kind, m_Options.oldTls);
    const std::lock_guard<std::mutex> lock(m_Mutex);
    SSL_CTX_free(m_Tls);
    m_Tls = context;
}

std::vector<std::vector<std::string>> Simulator::Rows(const std::string& sql) const
{
    std::vector<std::vector<std::string>> rows;
    m_Database->Each(sql, {}, [&](const Database::Row& row) {
        rows.emplace_back();
        for (int i = 0; i < row.Columns(); ++i)
            rows.back().push_back(row.Text(i));
    });
    return rows;
}

// ---- Connections

void Simulator::Accept(int listener, bool tls)
{
    for (;;) {
        const int descriptor = accept4(listener, nullptr, nullptr, SOCK_CLOEXEC);
        const std::lock_guard<std::mutex> lock(m_Mutex);
        if (m_Ended || (descriptor < 0 && errno != EINTR && errno != ECONNABORTED && errno != EMFILE)) {
            if (descriptor >= 0) close(descriptor);
            return;
        }
        if (descriptor < 0) continue;
        // An answer would wait up to 40 ms for the peer's word that it has the session tickets sent before.
        const int on = 1;
        setsockopt(descriptor, IPPROTO_TCP, TCP_NODELAY, &on, sizeof on);
        const unsigned long number = ++m_Connections;
        m_Open.insert(descriptor);
        Reap();
        Worker& worker = m_Workers.emplace_back();
        worker.thread = std::thread([this, &worker, descriptor, tls, number] {
            Serve(descriptor, tls, number);
            const std::lock_guard<std::mutex> ending(m_Mutex);
            worker.done = true;
        });
    }
}

// Joins the threads whose connections have ended; with the mutex held.
void Simulator::Reap()
{
    for (auto worker = m_Workers.begin(); worker != m_Workers.end();) {
        if (worker->done) worker->thread.join();
        worker = worker->done ? m_Workers.erase(worker) : std::next(worker);
    }
}

void Simulator::Serve(int descriptor, bool tls, unsigned long number)
{
    // A peer that goes away must not end the process.
    sigset_t broken;
    sigemptyset(&broken);
    sigaddset(&broken, SIGPIPE);
    pthread_sigmask(SIG_BLOCK, &broken, nullptr);
    Connection connection{Channel(descriptor), number, tls};
    if (!tls || Handshake(connection)) ServeRequests(connection);
    // Not open any more before the descriptor is closed and its number given out again.
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Open.erase(descriptor);
}

// False when the connection has come to its end.
bool Simulator::Handshake(Connection& connection)
{
    const Fault fault = m_Faults.Take("connect");
    Channel& channel = connection.channel;
    if (!fault.kind.empty() || fault.delay) NoteConnection(connection, fault.Text());
    if (!Pause(fault.delay)) return false;
    if (!fault.kind.empty()) {
        // A handshake record of 74 bytes, of which the first two come.
        if (fault.Is("stall-handshake")) channel.WriteBare(std::string("\x16\x03\x03\x00\x4a\x02\x00", 7));
        if (fault.Is("no-http")) channel.WriteBare("no handshake that anyone speaks\r\n");
        if (fault.Is("stall") || fault.Is("stall-handshake")) channel.Stall();
        if (fault.Is("reset")) channel.Reset();
        return false;
    }
    SSL_CTX* context;
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        context = m_Tls;
        SSL_CTX_up_ref(context);
    }
    const bool done = channel.Handshake(context);
    SSL_CTX_free(context);
    return done;
}

void Simulator::NoteConnection(const Connection& connection, const std::string& fault)
{
    LoggedRequest log;
    log.service = log.operation = "connect";
    log.connection = connection.number;
    log.tls = connection.tls;
    log.time = Now();
    log.fault = fault;
    m_Log.Add(std::move(log));
}

void Simulator::ServeRequests(Connection& connection)
{
    std::string rest;
    HttpRequest request;
    while (ReadRequest(connection.channel, rest, request)) {
        if (!ServeOne(connection, request)) return;
        request = HttpRequest();
    }
    if (!rest.empty()) NoteMalformed(connection);
    connection.channel.Close();
}

// What came is no request, or not all of one.
void Simulator::NoteMalformed(const Connection& connection)
{
    LoggedRequest log;
    log.connection = connection.number;
    log.tls = connection.tls;
    log.time = Now();
    log.violation = "no whole HTTP request";
    m_Log.Add(std::move(log));
}

bool Simulator::ServeOne(Connection& connection, const HttpRequest& request)
{
    if (!connection.tls && request.Path().rfind("/control/", 0) == 0) {
        return Send(connection, request, AnswerControl(request, m_Faults, m_Log), Fault());
    }
    LoggedRequest log;
    log.headers = request.headers;
    log.connection = connection.number;
    log.tls = connection.tls;
    log.resumed = connection.channel.IsResumed();
    log.time = Now();
    Fault fault;
    HttpResponse response = Answer(request, connection, log, fault);
    log.fault = fault.Text();
    m_Log.Add(std::move(log));
    if (!Pause(m_Latency + fault.delay)) return false;
    return Send(connection, request, std::move(response), fault);
}

HttpResponse Simulator::Answer(const HttpRequest& request, Connection& connection, LoggedRequest& log, Fault& fault)
{
    const auto take = [&](const std::string& operation) { return fault = m_Faults.Take(operation); };
    const std::string path = request.Path();
    const std::string endpoint = "https://localhost:" + std::to_string(m_HttpsPort) + path;
    HttpResponse response;
    if (connection.tls && AnswerContract(request, endpoint, response)) {
        log.service = log.operation = "contract";
        return response;
    }
    const ServiceRow* service = connection.tls ? SoapService::Find(path) : nullptr;
    if (service) {
        response = m_Soap->Answer(request, *service, endpoint, log, take);
        if (m_Options.onExchange) m_Options.onExchange({log.service, log.operation, request.body, response.body});
        return response;
    }
    const std::string plain = PlainServiceName(path);
    if (!plain.empty() && (plain == "bandwidth" || connection.tls == (plain == "discovery"))) {
        return AnswerPlain(plain, request, m_Options.environment, take(plain), log);
    }
    log.violation = "nothing is at " + path;
    response.status = 404;
    return response;
}

// ---- Answers

bool Simulator::Send(Connection& connection, const HttpRequest& request, HttpResponse response, const Fault& fault)
{
    Channel& channel = connection.channel;
    if (fault.Is("http")) {
        response.status = fault.Number(503);
        response.body.clear();
        if (fault.retryAfter > 0) response.headers.emplace_back("Retry-After", std::to_string(fault.retryAfter));
        if (response.status == 302) response.headers.emplace_back("Location", "https://localhost/elsewhere");
    } else if (fault.Is("body")) {
        response.body = fault.value;
    } else if (fault.Is("garbage")) {
        response.body = "\x01\x02 this is no answer <<<";
    } else if (fault.Is("empty")) {
        response.body.clear();
    } else if (fault.Is("bomb")) {
        response.headers.emplace_back("Content-Encoding", "gzip");
        response.body = Gzip(response.body + std::string(static_cast<size_t>(fault.Number(256)) << 20, ' '));
    } else if ((m_Options.gzip && request.Header("accept-encoding").find("gzip") != std::string::npos) ||
               fault.Is("damaged-gzip") || fault.Is("wrong-checksum")) {
        response.headers.emplace_back("Content-Encoding", "gzip");
        response.body = Gzip(response.body);
        // The last eight bytes are the checksum and the length.
        if (fault.Is("wrong-checksum")) response.body[response.body.size() - 8] ^= 0x55;
        if (fault.Is("damaged-gzip")) {
            for (size_t i = response.body.size() / 2; i < response.body.size(); i += 3)
                response.body[i] ^= 0x55;
        }
    }
    const bool keepAlive = request.KeepAlive();
    const size_t announced = fault.Is("short")         ? response.body.size() + 100
                             : fault.Is("zero-length") ? 0
                             : response.status == 304  ? 0
                                                       : response.body.size();
    const std::string head = response.Head(announced, keepAlive);
    if (!fault.kind.empty()) return SendFaulty(channel, head, response.body, fault) && keepAlive;
    if (!channel.Write(head + response.body)) return false;
    if (!keepAlive) channel.Close();
    return keepAlive;
}

bool Simulator::SendFaulty(Channel& channel, const std::string& head, const std::string& body, const Fault& fault)
{
    const std::string half = body.substr(0, body.size() / 2);
    if (fault.Is("cut")) return channel.Close(), false;
    if (fault.Is("reset")) return channel.Reset(), false;
    if (fault.Is("no-http")) return channel.Write("no protocol that anyone speaks\r\n\r\n"), channel.Close(), false;
    if (fault.Is("cut-header")) return channel.Write(head.substr(0, head.size() / 2)), channel.Close(), false;
    if (fault.Is("cut-body")) return channel.Write(head + half), channel.Close(), false;
    if (fault.Is("short")) return channel.Write(head + body), channel.Close(), false;
    if (fault.Is("long")) return channel.Write(head + body + "left over");
    if (fault.Is("endless")) return SendEndless(channel, head, half);
    if (fault.Is("hold")) return m_Faults.WaitForClear(fault) && channel.Write(head + body);
    if (fault.Is("drip")) return SendDrip(channel, head + body, fault.Number(100));
    if (fault.Is("split")) return channel.Write(head) && Pause(fault.Number(50)) && channel.Write(body);
    if (fault.Is("stall") || fault.Is("stall-body")) {
        if (fault.Is("stall-body")) channel.Write(head + half);
        channel.Stall();
        return false;
    }
    if (fault.Is("no-length")) {
        const size_t start = head.find("Content-Length");
        channel.Write(head.substr(0, start) + head.substr(head.find("\r\n", start) + 2) + body);
        return channel.Close(), false;
    }
    return channel.Write(head + body);
}

// Half of the right body, and text from there on.
bool Simulator::SendEndless(Channel& channel, const std::string& head, const std::string& half)
{
    const size_t start = head.find("Content-Length");
    if (!channel.Write(head.substr(0, start) + "Connection: close\r\n\r\n" + half)) return false;
    const std::string piece(16384, 'x');
    while (channel.Write(piece) && Pause(0)) {
    }
    return false;
}

bool Simulator::SendDrip(Channel& channel, const std::string& bytes, int pause)
{
    for (const char byte : bytes) {
        if (!channel.Write(std::string(1, byte)) || !Pause(pause)) return false;
    }
    return true;
}

bool Simulator::Pause(int milliseconds)
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    return !m_Ending.wait_for(lock, std::chrono::milliseconds(milliseconds), [this] { return m_Ended; });
}

}  // namespace

std::unique_ptr<Storefront> Storefront::Start(const StorefrontOptions& options, std::string& error)
{
    auto simulator = std::make_unique<Simulator>(options);
    if (!simulator->Begin(error)) return nullptr;
    return simulator;
}

std::string Storefront::HelpOnFaults()
{
    return Faults::Help();
}
