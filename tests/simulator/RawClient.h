// A client for the storefront's tests: sends bytes written by hand over OpenSSL and reads what comes back.
#pragma once

#include <gtest/gtest.h>
#include <netinet/in.h>
#include <openssl/evp.h>
#include <openssl/rand.h>
#include <openssl/ssl.h>
#include <openssl/x509v3.h>
#include <sys/socket.h>
#include <unistd.h>

#include <csignal>
#include <cstring>
#include <ctime>
#include <string>

#include "Storefront.h"

struct Reply {
    int status = 0;  ///< 0 when no whole header came
    std::string head, body;
    bool whole = false;  ///< the body came to its announced or natural end

    std::string Header(const std::string& name) const
    {
        const size_t start = head.find("\r\n" + name + ": ");
        if (start == std::string::npos) return "";
        const size_t value = start + name.size() + 4;
        return head.substr(value, head.find("\r\n", value) - value);
    }
    /// The text of the first element of the name.
    std::string Element(const std::string& name) const
    {
        const std::string open = "<" + name + ">";
        const size_t start = body.find(open);
        if (start == std::string::npos) return "";
        return body.substr(start + open.size(), body.find('<', start + open.size()) - start - open.size());
    }
};

class RawClient {
public:
    /// With a CA file over TLS, else plain.
    explicit RawClient(int port, const std::string& caFile = "")
    {
        sigset_t pipe;
        sigemptyset(&pipe);
        sigaddset(&pipe, SIGPIPE);
        pthread_sigmask(SIG_BLOCK, &pipe, nullptr);
        m_Port = port;
        if (caFile.empty()) return;
        m_Context = SSL_CTX_new(TLS_client_method());
        EXPECT_EQ(1, SSL_CTX_load_verify_locations(m_Context, caFile.c_str(), nullptr));
        SSL_CTX_set_verify(m_Context, SSL_VERIFY_PEER, nullptr);
        SSL_CTX_set_min_proto_version(m_Context, TLS1_2_VERSION);
        SSL_CTX_set_max_proto_version(m_Context, TLS1_2_VERSION);  // sessions are there as soon as the handshake is
    }
    ~RawClient()
    {
        Close();
        SSL_SESSION_free(m_Session);
        SSL_CTX_free(m_Context);
    }
    RawClient(const RawClient&) = delete;
    RawClient& operator=(const RawClient&) = delete;

    /// Connects and shakes hands as a strict client would; the session of an earlier connection is offered again.
    bool Connect(const char* name = "localhost")
    {
        Close();
        m_Socket = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
        const timeval limit{10, 0};
        setsockopt(m_Socket, SOL_SOCKET, SO_RCVTIMEO, &limit, sizeof limit);
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_port = htons(static_cast<uint16_t>(m_Port));
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        if (connect(m_Socket, reinterpret_cast<sockaddr*>(&address), sizeof address)) return false;
        if (!m_Context) return true;
        m_Ssl = SSL_new(m_Context);
        SSL_set_fd(m_Ssl, m_Socket);
        SSL_set1_host(m_Ssl, name);
        SSL_set_hostflags(m_Ssl, X509_CHECK_FLAG_NO_PARTIAL_WILDCARDS | X509_CHECK_FLAG_NEVER_CHECK_SUBJECT);
        if (m_Session) SSL_set_session(m_Ssl, m_Session);
        const bool connected = SSL_connect(m_Ssl) == 1;
        verify_result = SSL_get_verify_result(m_Ssl);
        if (connected) {
            SSL_SESSION_free(m_Session);
            m_Session = SSL_get1_session(m_Ssl);
        }
        return connected;
    }
    void Close()
    {
        if (m_Ssl && SSL_is_init_finished(m_Ssl)) SSL_shutdown(m_Ssl);
        SSL_free(m_Ssl);
        m_Ssl = nullptr;
        if (m_Socket >= 0) close(m_Socket);
        m_Socket = -1;
        m_Buffer.clear();
    }
    bool Send(const std::string& bytes)
    {
        if (m_Ssl) return SSL_write(m_Ssl, bytes.data(), static_cast<int>(bytes.size())) > 0;
        return send(m_Socket, bytes.data(), bytes.size(), MSG_NOSIGNAL) == static_cast<ssize_t>(bytes.size());
    }
    /// What one receive gives; empty at the end.
    std::string ReceiveSome()
    {
        char piece[64 * 1024];
        const ssize_t size = m_Ssl ? SSL_read(m_Ssl, piece, sizeof piece) : recv(m_Socket, piece, sizeof piece, 0);
        return size > 0 ? std::string(piece, static_cast<size_t>(size)) : "";
    }
    /// One answer: to its Content-Length, to the end without one, or until the connection fails.
    Reply Receive()
    {
        Reply reply;
        size_t end;
        while ((end = m_Buffer.find("\r\n\r\n")) == std::string::npos) {
            const std::string more = ReceiveSome();
            if (more.empty()) return reply;
            m_Buffer += more;
        }
        reply.head = m_Buffer.substr(0, end + 2);
        reply.status = reply.head.compare(0, 9, "HTTP/1.1 ") == 0 ? atoi(reply.head.c_str() + 9) : 0;
        const std::string length = reply.Header("Content-Length");
        const size_t wanted = length.empty() ? std::string::npos : strtoul(length.c_str(), nullptr, 10);
        m_Buffer.erase(0, end + 4);
        std::string more = "-";
        while (m_Buffer.size() < wanted && !more.empty())
            m_Buffer += more = ReceiveSome();
        reply.whole = length.empty() || m_Buffer.size() >= wanted;
        reply.body = m_Buffer.substr(0, wanted);
        m_Buffer.erase(0, reply.body.size());
        return reply;
    }
    /// What came after the last answer.
    const std::string& Rest() const { return m_Buffer; }

    long verify_result = 0;

private:
    int m_Port;
    int m_Socket = -1;
    SSL_CTX* m_Context = nullptr;
    SSL* m_Ssl = nullptr;
    SSL_SESSION* m_Session = nullptr;
    std::string m_Buffer;
};

inline std::string Base64(const std::string& bytes)
{
    std::string text(bytes.size() / 3 * 4 + 8, '\0');
    const int size =
        EVP_EncodeBlock(reinterpret_cast<unsigned char*>(text.data()),
                        reinterpret_cast<const unsigned char*>(bytes.data()), static_cast<int>(bytes.size()));
    text.resize(static_cast<size_t>(size));
    return text;
}

inline std::string Sha1(const std::string& bytes)
{
    std::string digest(20, '\0');
    EVP_Digest(bytes.data(), bytes.size(), reinterpret_cast<unsigned char*>(digest.data()), nullptr, EVP_sha1(),
               nullptr);
    return digest;
}

/// A request whose parts a test may change before it is put together.
struct SoapRequest {
    std::string service = {};  ///< "RealTimeBrowse", "DownloadAPI" or "StreamAPI"
    std::string operation = {};
    std::string children = {};  ///< of the request element; the prefix "z" is the service's namespace
    std::string user = "customer";
    std::string password = "secret";
    std::string device = "desktop-player";
    int device_type = 48;
    long long created_offset = 0;   ///< seconds from now
    std::string nonce = {};         ///< of one's own; else a fresh one
    std::string http_headers = {};  ///< further lines, each with its end

    std::string Block() const
    {
        return service == "RealTimeBrowse" ? "DeviceSettings"
               : service == "DownloadAPI"  ? "DownloadDeviceRequestSettings"
                                           : "StreamDeviceRequestSettings";
    }

    std::string Envelope(int port) const
    {
        std::string bytes = nonce;
        if (bytes.empty()) {
            bytes.resize(20);
            RAND_bytes(reinterpret_cast<unsigned char*>(bytes.data()), 20);
        }
        const time_t when = time(nullptr) + created_offset;
        tm parts{};
        gmtime_r(&when, &parts);
        char created[32];
        strftime(created, sizeof created, "%Y-%m-%dT%H:%M:%SZ", &parts);
        const std::string oasis = "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-";
        return "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
               "<e:Envelope xmlns:e=\"http://schemas.xmlsoap.org/soap/envelope/\" "
               "xmlns:z=\"http://api.zorvane.example/api/\" "
               "xmlns:u=\"" +
               oasis + "wssecurity-utility-1.0.xsd\" xmlns:s=\"" + oasis +
               "wssecurity-secext-1.0.xsd\" "
               "xmlns:a=\"http://schemas.xmlsoap.org/ws/2004/08/addressing\"><e:Header>"
               "<s:Security e:mustUnderstand=\"1\"><s:UsernameToken u:Id=\"User\"><s:Username>" +
               user +
               "</s:Username>"
               "<s:Password Type=\"" +
               oasis + "username-token-profile-1.0#PasswordDigest\">" + Base64(Sha1(bytes + created + password)) +
               "</s:Password><s:Nonce EncodingType=\"" + oasis + "soap-message-security-1.0#Base64Binary\">" +
               Base64(bytes) + "</s:Nonce><u:Created>" + created +
               "</u:Created></s:UsernameToken></s:Security><a:MessageID>uuid:" + operation +
               "</a:MessageID>"
               "<a:ReplyTo "
               "e:mustUnderstand=\"1\"><a:Address>http://schemas.xmlsoap.org/ws/2004/08/addressing/role/anonymous"
               "</a:Address></a:ReplyTo><a:To e:mustUnderstand=\"true\">https://localhost:" +
               std::to_string(port) + "/api/" + service +
               ".asmx</a:To><a:Action e:mustUnderstand=\"1\">http://api.zorvane.example/api/" + operation +
               "</a:Action><z:" + Block() +
               " e:mustUnderstand=\"1\"><z:APIKey>desktop</z:APIKey><z:DestinationUniqueID>" + device +
               "</z:DestinationUniqueID><z:DestinationTypeID>" + std::to_string(device_type) +
               "</z:DestinationTypeID></z:" + Block() + "></e:Header><e:Body><z:" + operation + ">" + children +
               "</z:" + operation + "></e:Body></e:Envelope>";
    }
    std::string Head(int port, size_t length) const
    {
        return "POST /api/" + service + ".asmx HTTP/1.1\r\nHost: localhost:" + std::to_string(port) +
               "\r\nUser-Agent: raw\r\nContent-Type: text/xml; charset=utf-8\r\nContent-Length: " +
               std::to_string(length) + "\r\nSOAPAction: \"http://api.zorvane.example/api/" + operation + "\"\r\n" +
               http_headers + "\r\n";
    }
    std::string Text(int port) const
    {
        const std::string envelope = Envelope(port);
        return Head(port, envelope.size()) + envelope;
    }
};

/// A running storefront in a temporary folder.
class StorefrontTest : public testing::Test {
protected:
    void Begin(const StorefrontOptions& options = {})
    {
        std::string error;
        store = Storefront::Start(options, error);
        ASSERT_TRUE(store) << error;
    }
    std::string CaFile() const { return store->DataFolder() + "/ca.pem"; }

    void Order(const std::string& fault)
    {
        std::string error;
        ASSERT_TRUE(store->AddFault(fault, error)) << error;
    }

    /// One request on a connection of its own.
    Reply Send(const SoapRequest& request)
    {
        RawClient client(store->HttpsPort(), CaFile());
        EXPECT_TRUE(client.Connect());
        EXPECT_TRUE(client.Send(request.Text(store->HttpsPort())));
        return client.Receive();
    }
    Reply Ask(const std::string& service, const std::string& operation, const std::string& children = "",
              const std::string& user = "customer")
    {
        SoapRequest request{service, operation, children};
        request.user = user;
        return Send(request);
    }
    Reply Plain(const std::string& path, const std::string& headers = "User-Agent: ZVWSLib\r\n",
                const std::string& method = "GET", const std::string& body = "")
    {
        RawClient client(store->HttpPort());
        EXPECT_TRUE(client.Connect());
        EXPECT_TRUE(client.Send(method + " " + path + " HTTP/1.1\r\n" + headers +
                                "Host: localhost\r\nContent-Length: " + std::to_string(body.size()) + "\r\n\r\n" +
                                body));
        return client.Receive();
    }
    LoggedRequest LastLogged() { return store->Log().back(); }

    std::unique_ptr<Storefront> store;
};

/// The value of the first pair of the name; empty when there is none.
inline std::string Value(const std::vector<std::pair<std::string, std::string>>& pairs, const std::string& name)
{
    for (const auto& pair : pairs) {
        if (pair.first == name) return pair.second;
    }
    return "";
}

/// "<z:NAME>VALUE</z:NAME>" for each pair.
inline std::string Children(std::initializer_list<std::pair<const char*, std::string>> list)
{
    std::string text;
    for (const auto& [name, value] : list)
        text += std::string("<z:") + name + ">" + value + "</z:" + name + ">";
    return text;
}
