#include "Storefront.h"

#include <libxml/parser.h>
#include <stdlib.h>

#include <atomic>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>

#include "AnswerWriter.h"
#include "Catalogue.h"
#include "Certificates.h"
#include "ContractPages.h"
#include "Control.h"
#include "Hosts.h"
#include "PlainService.h"
#include "Proxy.h"
#include "RequestLoop.h"
#include "Server.h"
#include "SoapService.h"

using namespace simulator;

namespace {

class Simulator final : public Storefront {
public:
    explicit Simulator(const StorefrontOptions& options)
        : m_Options(options),
          m_Latency(options.latency),
          m_Clock(options.clock),
          m_Log(static_cast<size_t>(options.remembered)),
          m_Writer(m_Server, m_Faults, m_Clock, options.gzip)
    {}
    ~Simulator() override;

    bool Begin(std::string& error);

    int HttpsPort() const override { return m_HttpsPort; }
    int HttpPort() const override { return m_HttpPort; }
    int ProxyPort() const override { return m_ProxyPort; }
    std::string DataFolder() const override { return m_Folder; }
    std::string DeploymentFile() const override { return m_Folder + "/deployment.conf"; }
    std::string ProxyDeploymentFile() const override { return m_Folder + "/behind-proxy.conf"; }
    bool AddFault(const std::string& text, std::string& error) override { return m_Faults.Add(text, error); }
    void ClearFaults() override { m_Faults.Clear(); }
    std::vector<LoggedRequest> Log() const override { return m_Log.All(); }
    void ClearLog() override { m_Log.Clear(); }
    bool WaitForRequests(size_t count) const override { return m_Log.WaitFor(count); }
    bool WaitForIdle(size_t count) override { return m_Server.WaitForIdle(count); }
    bool WaitUntilIdle(unsigned long connection) override { return m_Server.WaitUntilIdle(connection); }
    size_t ActOnIdle(IdleAction action, const std::string& bytes) override { return m_Server.ActOnIdle(action, bytes); }
    void SetLatency(int milliseconds) override { m_Latency = milliseconds; }
    void SetClock(long long seconds) override { m_Clock.SetOffset(seconds); }
    void SetCertificate(CertificateKind kind, const CertificateDates& dates) override;
    std::string Query(const std::string& sql) const override { return m_Database->Text(sql); }
    std::vector<std::vector<std::string>> Rows(const std::string& sql) const override;

private:
    bool OpenFolder(std::string& error);
    bool OpenPorts(std::string& error);
    bool WriteFiles(std::string& error);
    bool WriteDeployment(const std::string& name, bool behindProxy) const;
    bool Handshake(Connection& connection);
    void Serve(Connection& connection, bool tls);
    bool ServeOne(Connection& connection, const HttpRequest& request);
    HttpResponse Answer(const HttpRequest& request, const Connection& connection, LoggedRequest& log, Fault& fault);

    const StorefrontOptions m_Options;
    std::string m_Folder;
    bool m_FolderIsTemporary = false;
    int m_HttpsPort = 0;
    int m_HttpPort = 0;
    int m_ProxyPort = -1;
    std::atomic<int> m_Latency;
    SimulatedClock m_Clock;

    std::unique_ptr<Hosts> m_Hosts;
    std::unique_ptr<Certificates> m_Certificates;
    std::unique_ptr<Database> m_Database;
    std::unique_ptr<SoapService> m_Soap;
    Faults m_Faults;
    RequestLog m_Log;

    Server m_Server;
    AnswerWriter m_Writer;
    std::unique_ptr<Proxy> m_Proxy;  // null when there is none

    std::mutex m_Mutex;
    SSL_CTX* m_Tls = nullptr;  // with the mutex held
};

Simulator::~Simulator()
{
    m_Faults.End();
    m_Server.End();
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
        const char* option;
        Server::Handler handler;
    } rows[] = {
        {m_Options.httpsPort, m_HttpsPort, "--https-port", [this](Connection& c) { Serve(c, true); }},
        {m_Options.httpPort, m_HttpPort, "--http-port", [this](Connection& c) { Serve(c, false); }},
        {m_Options.proxyPort, m_ProxyPort, "--proxy-port", [this](Connection& c) { m_Proxy->Serve(c); }},
    };
    for (const auto& row : rows) {
        if (row.wanted < 0) continue;
        row.port = m_Server.Open(row.wanted, row.handler);
        if (row.port >= 0) continue;
        error = "port " + std::to_string(row.wanted) + ": " + strerror(errno) + "; choose another one with " +
                row.option + " (0 takes a free one)";
        return false;
    }
    m_Hosts = std::make_unique<Hosts>(m_HttpsPort, m_HttpPort);
    if (m_ProxyPort >= 0) {
        m_Proxy = std::make_unique<Proxy>(m_Server, m_Writer, m_Faults, m_Log, *m_Hosts, m_Options.proxyUser,
                                          m_Options.proxyPassword);
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
    if (account && WriteDeployment(DeploymentFile(), false) && WriteDeployment(ProxyDeploymentFile(), true))
        return true;
    error = DeploymentFile() + ": cannot write the deployment file; name a folder that can be written with --data";
    return false;
}

bool Simulator::WriteDeployment(const std::string& name, bool behindProxy) const
{
    std::ofstream file(name);
    file << "# Written by the storefront simulator when it starts"
         << (behindProxy ? ", for clients of its proxy, which knows these hosts.\n" : ".\n");
    for (const HostRow& row : kHosts) {
        file << row.key << " = " << (behindProxy ? row.name : row.tls ? m_Hosts->Https() : m_Hosts->Http()) << "\n";
    }
    file << "ca_file = " << m_Certificates->AuthorityFile() << "\n";
    file << "device_key_file = " << m_Folder << "/device.key\n";
    file.flush();
    return bool(file);
}

bool Simulator::Begin(std::string& error)
{
    for (const std::string& fault : m_Options.faults) {
        if (!m_Faults.Add(fault, error)) return false;
    }
    if (!OpenFolder(error) || !OpenPorts(error)) return false;
    // First of all that writes: a folder that is refused stays as it is.
    m_Database = Database::Open(m_Folder + "/storefront.db", error);
    if (!m_Database || !FillCatalogue(*m_Database, error)) return false;
    m_Certificates = Certificates::Open(m_Folder, error);
    if (!m_Certificates) return false;
    xmlInitParser();
    m_Soap = std::make_unique<SoapService>(*m_Database, *m_Hosts, m_Clock, m_Options);
    m_Tls = m_Certificates->Context(m_Options.certificate, m_Options.certificateDates, m_Options.oldTls);
    if (!WriteFiles(error)) return false;
    m_Server.Begin();
    return true;
}

void Simulator::SetCertificate(CertificateKind kind, const CertificateDates& dates)
{
    SSL_CTX* context = m_Certificates->Context(kind, dates, m_Options.oldTls);
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

void Simulator::Serve(Connection& connection, bool tls)
{
    if (m_Proxy) connection.proxy = m_Proxy->Behind(connection.peer);
    if (tls && !Handshake(connection)) return;
    ServeRequests(m_Server, connection, m_Log,
                  [&](const HttpRequest& request, const std::string&) { return ServeOne(connection, request); });
}

// What comes in the place of a handshake.
void Spoil(Channel& channel, const Fault& fault)
{
    if (const Opening* kind = fault.As<Opening>()) {
        switch (*kind) {
            case Opening::Close:
                return;
            case Opening::StallHandshake:
                // A handshake record of 74 bytes, of which the first two come.
                channel.WriteBare(std::string("\x16\x03\x03\x00\x4a\x02\x00", 7));
                return channel.Stall();
        }
    }
    if (const Breaking* kind = fault.As<Breaking>()) {
        switch (*kind) {
            case Breaking::Reset:
                return channel.Reset();
            case Breaking::Stall:
                return channel.Stall();
            case Breaking::NoHttp:
                channel.WriteBare("no handshake that anyone speaks\r\n");
                return;
        }
    }
}

// False when the connection has come to its end.
bool Simulator::Handshake(Connection& connection)
{
    const Fault fault = m_Faults.Take("connect");
    Channel& channel = connection.channel;
    if (fault.row || fault.delay) {
        LoggedRequest log = BeginEntry(connection, m_Log);
        log.service = log.operation = "connect";
        log.tls = true;
        log.fault = fault.Spelling();
        m_Log.Add(std::move(log));
    }
    if (!m_Server.Pause(fault.delay)) return false;
    if (fault.row) return Spoil(channel, fault), false;
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

bool Simulator::ServeOne(Connection& connection, const HttpRequest& request)
{
    if (!connection.channel.IsTls() && request.Path().rfind("/control/", 0) == 0) {
        return m_Writer.Send(connection.channel, request, AnswerControl(request, {m_Faults, m_Log, m_Clock, m_Server}),
                             Fault());
    }
    LoggedRequest log = BeginEntry(connection, m_Log, request);
    Fault fault;
    HttpResponse response = Answer(request, connection, log, fault);
    log.fault = fault.Spelling();
    m_Log.Add(std::move(log));
    return m_Server.Pause(m_Latency + fault.delay) &&
           m_Writer.Send(connection.channel, request, std::move(response), fault);
}

HttpResponse Simulator::Answer(const HttpRequest& request, const Connection& connection, LoggedRequest& log,
                               Fault& fault)
{
    const auto take = [&](const std::string& operation) { return fault = m_Faults.Take(operation); };
    const std::string path = request.Path();
    HttpResponse response;
    log.violation = m_Hosts->Check(request, connection.channel.IsTls());
    if (!log.violation.empty()) {
        response.status = 400;
        response.body = log.violation;
        return response;
    }
    if (connection.channel.IsTls() && AnswerContract(request, "https://" + m_Hosts->Https() + path, response)) {
        log.service = log.operation = "contract";
        return response;
    }
    const ServiceRow* service = connection.channel.IsTls() ? SoapService::Find(path) : nullptr;
    if (service) {
        response = m_Soap->Answer(request, *service, log, take);
        if (m_Options.onExchange) m_Options.onExchange({log.service, log.operation, request.body, response.body});
        return response;
    }
    const std::string plain = PlainServiceName(path);
    if (!plain.empty() && (plain == "bandwidth" || connection.channel.IsTls() == (plain == "discovery"))) {
        return AnswerPlain(plain, request, *m_Database, m_Options.environment, m_Clock.Now(), take(plain), log);
    }
    log.violation = "nothing is at " + path;
    response.status = 404;
    return response;
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
