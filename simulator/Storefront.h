// The storefront of one machine: SOAP services and discovery over HTTPS; box art, clock, bandwidth file and control
// over plain HTTP.
//
// It runs on threads of its own from Start to destruction. Every member may be called from any thread.
#pragma once

#include <ctime>
#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "LoggedRequest.h"

/// What the server certificate is like. All but Good must make a careful client refuse.
enum class CertificateKind { Good, Untrusted, Expired, NotYetValid, WrongName, WideWildcard, NameOnly };

/// What can be done to a kept connection while it waits for its next request.
enum class IdleAction {
    Write,    ///< Bytes that nobody has asked for.
    Close,    ///< In order, with TLS's own goodbye.
    Reset,    ///< The peer sees a broken connection.
    Silence,  ///< Nothing more is read, so that requests are never answered.
    Ticket,   ///< A further TLS session ticket.
};
/// An answer without a request, as servers send it when they have waited long enough.
inline constexpr char kTimeoutAnswer[] =
    "HTTP/1.1 408 Request Timeout\r\nConnection: close\r\nContent-Length: 0\r\n\r\n";

/// When a certificate is valid, by the real clock. 0: as its kind has it.
struct CertificateDates {
    time_t from = 0;
    time_t until = 0;
};

/// What the simulator accepts and knows without being told; also written to "account.txt" beside the deployment file.
struct StorefrontAccount {
    static constexpr char kUser[] = "customer";
    static constexpr char kPassword[] = "secret";
    static constexpr char kApiKey[] = "desktop";
    static constexpr char kAdultPin[] = "0042";
    static constexpr char kActivationPin[] = "123456";        ///< "000000" locks the device out.
    static constexpr char kSecondActivationPin[] = "654321";  ///< Signs in the second customer, on the same player.
};

/// A request to a SOAP service and its answer, both whole: secrets and all.
struct SoapExchange {
    std::string service;    ///< As in the log.
    std::string operation;  ///< Likewise.
    std::string request;    ///< The envelopes, uncompressed.
    std::string answer;
};

struct StorefrontOptions {
    std::string dataFolder;  ///< Database, certificates and deployment file; made when absent. Empty: a temporary one.
    int httpsPort = 0;       ///< 0: a free one.
    int httpPort = 0;
    int proxyPort = -1;         ///< 0: a free one; -1: there is no proxy.
    std::string proxyUser;      ///< Whom the proxy lets through (Basic); empty: everyone.
    std::string proxyPassword;  ///< Of that user.
    int latency = 0;            ///< Milliseconds before every answer.
    long long clock = 0;        ///< Seconds by which the simulator's clock is ahead of the real one.
    CertificateKind certificate = CertificateKind::Good;
    CertificateDates certificateDates;
    bool oldTls = false;     ///< At most TLS 1.1.
    bool gzip = true;        ///< Compress answers for clients that accept it.
    int environment = 2;     ///< What discovery answers.
    int largestPage = 0;     ///< Items that a page holds at most, whatever is asked for; 0: only the catalogue has one.
    int remembered = 50000;  ///< Requests whose log entries, and whose nonces, are kept: the last ones. An entry is cut
                             ///< where it is long.
    std::vector<std::string> faults;
    /// Called with every exchange before its answer is sent, on the thread of its connection: for tests in the same
    /// process.
    std::function<void(const SoapExchange&)> onExchange;
};

class Storefront {
public:
    /// Starts to serve. Null after `error` got one line that names the port, file or folder and what to do.
    static std::unique_ptr<Storefront> Start(const StorefrontOptions& options, std::string& error);
    virtual ~Storefront() = default;

    virtual int HttpsPort() const = 0;
    virtual int HttpPort() const = 0;
    /// -1 when there is no proxy.
    virtual int ProxyPort() const = 0;
    virtual std::string DataFolder() const = 0;
    virtual std::string DeploymentFile() const = 0;
    /// One whose hosts have the client's own names, which only the proxy can find.
    virtual std::string ProxyDeploymentFile() const = 0;

    /// Adds a fault in the form that HelpOnFaults tells. False, with the reason, when it is not one.
    virtual bool AddFault(const std::string& text, std::string& error) = 0;
    virtual void ClearFaults() = 0;

    virtual std::vector<LoggedRequest> Log() const = 0;
    virtual void ClearLog() = 0;
    /// Waits until that many requests have come since the log was cleared; false when the simulator ends first.
    virtual bool WaitForRequests(size_t count) const = 0;

    /// Waits until that many connections have been answered and wait for their next request; false when the simulator
    /// ends first.
    virtual bool WaitForIdle(size_t count) = 0;
    /// The same of one connection, by its number in the log; false also when it ends first.
    virtual bool WaitUntilIdle(unsigned long connection) = 0;
    /// Does it now to each of these, on whatever port, and returns when it is done: how many they were. `bytes` are
    /// what Write writes.
    virtual size_t ActOnIdle(IdleAction action, const std::string& bytes = kTimeoutAnswer) = 0;

    virtual void SetLatency(int milliseconds) = 0;
    /// Seconds by which the clock is ahead of the real one, also negative: that of Date, of the clock service and of
    /// how fresh a token is. Certificates stay as they are.
    virtual void SetClock(long long seconds) = 0;
    /// Changes what the next connections see.
    virtual void SetCertificate(CertificateKind kind, const CertificateDates& dates = {}) = 0;

    /// The one value of a query on the database, as text: what tests compare results with.
    virtual std::string Query(const std::string& sql) const = 0;
    /// All rows of a query.
    virtual std::vector<std::vector<std::string>> Rows(const std::string& sql) const = 0;

    static std::string HelpOnFaults();
};
