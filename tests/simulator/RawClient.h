// A client for the storefront's tests: sends bytes written by hand over OpenSSL and reads what comes back.
#pragma once

#include <gtest/gtest.h>
#include <openssl/bio.h>
#include <openssl/evp.h>
#include <openssl/sha.h>
#include <openssl/ssl.h>
#include <poll.h>

#include <csignal>
#include <cstring>
#include <ctime>
#include <string>

#include "Storefront.h"

struct Reply {
    int status = 0;  ///< 0 when no whole header came
    std::string head = {}, body = {};

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
    RawClient(int port, bool tls)
    {
        sigset_t pipe;
        sigemptyset(&pipe);
        sigaddset(&pipe, SIGPIPE);
        pthread_sigmask(SIG_BLOCK, &pipe, nullptr);
        const std::string address = "127.0.0.1:" + std::to_string(port);
        m_Bio = tls ? BIO_new_ssl_connect(m_Context) : BIO_new(BIO_s_connect());
        BIO_set_conn_hostname(m_Bio, address.c_str());
        EXPECT_EQ(1, BIO_do_connect(m_Bio)) << address;
    }
    ~RawClient()
    {
        BIO_free_all(m_Bio);
        SSL_CTX_free(m_Context);
    }
    RawClient(const RawClient&) = delete;
    RawClient& operator=(const RawClient&) = delete;

    /// A TLS handshake on the connection as it is, whose certificate must be the authority's, for the name, and valid
    /// at that time (0: now).
    bool StartTls(const std::string& name, const std::string& authorityFile, time_t when = 0)
    {
        SSL_CTX_load_verify_locations(m_Context, authorityFile.c_str(), nullptr);
        SSL_CTX_set_verify(m_Context, SSL_VERIFY_PEER, nullptr);
        BIO* tls = BIO_new_ssl(m_Context, 1);
        SSL* ssl = nullptr;
        BIO_get_ssl(tls, &ssl);
        SSL_set1_host(ssl, name.c_str());
        if (when) X509_VERIFY_PARAM_set_time(SSL_get0_param(ssl), when);
        m_Bio = BIO_push(tls, m_Bio);
        return BIO_do_handshake(m_Bio) == 1;
    }
    bool Send(const std::string& bytes)
    {
        return BIO_write(m_Bio, bytes.data(), static_cast<int>(bytes.size())) == static_cast<int>(bytes.size());
    }
    /// One answer with a length, or without a body (`head`); what comes behind it stays. Status 0 when it is not whole.
    Reply ReceiveOne(bool head = false)
    {
        Reply reply;
        while (reply.head.size() < 4 || reply.head.compare(reply.head.size() - 4, 4, "\r\n\r\n") != 0) {
            if (!Append(reply.head, 1)) return {0, reply.head};
        }
        reply.head.resize(reply.head.size() - 2);
        const size_t length = head ? 0 : strtoul(reply.Header("Content-Length").c_str(), nullptr, 10);
        if (!Append(reply.body, length)) return {0, reply.head, reply.body};
        reply.status = atoi(reply.head.c_str() + strlen("HTTP/1.1 "));
        return reply;
    }
    /// Waits for the end, before which nothing may come: false when it is a broken connection.
    bool EndsInOrder()
    {
        char byte;
        const bool ended = BIO_read(m_Bio, &byte, 1) <= 0;
        SSL* const ssl = Tls();
        return ended && (ssl ? (SSL_get_shutdown(ssl) & SSL_RECEIVED_SHUTDOWN) != 0 : BIO_eof(m_Bio) != 0);
    }
    /// Whether anything has come and waits, the end included.
    bool HasBytes()
    {
        pollfd entry = {static_cast<int>(BIO_get_fd(m_Bio, nullptr)), POLLIN, 0};
        return BIO_pending(m_Bio) > 0 || poll(&entry, 1, 0) > 0;
    }
    /// The TLS session ticket that came last.
    std::string Ticket()
    {
        const unsigned char* ticket = nullptr;
        size_t size = 0;
        SSL_SESSION_get0_ticket(SSL_get0_session(Tls()), &ticket, &size);
        return std::string(ticket, ticket + size);
    }
    /// All that comes; requests ask for the connection's end.
    Reply Receive()
    {
        std::string got;
        char piece[64 * 1024];
        for (int size; (size = BIO_read(m_Bio, piece, sizeof piece)) > 0;)
            got.append(piece, static_cast<size_t>(size));
        const size_t end = got.find("\r\n\r\n");
        if (end == std::string::npos) return {};
        return {atoi(got.c_str() + strlen("HTTP/1.1 ")), got.substr(0, end + 2), got.substr(end + 4)};
    }

private:
    SSL* Tls()
    {
        SSL* ssl = nullptr;
        BIO_get_ssl(m_Bio, &ssl);
        return ssl;
    }
    // False when the connection ends before `count` bytes have come.
    bool Append(std::string& text, size_t count)
    {
        const size_t before = text.size();
        text.resize(before + count);
        for (size_t at = before; at < text.size();) {
            const int size = BIO_read(m_Bio, &text[at], static_cast<int>(text.size() - at));
            if (size <= 0) return text.resize(at), false;
            at += static_cast<size_t>(size);
        }
        return true;
    }

    SSL_CTX* m_Context = SSL_CTX_new(TLS_client_method());
    BIO* m_Bio = nullptr;
};

inline std::string Base64(const std::string& bytes)
{
    std::string text(bytes.size() / 3 * 4 + 8, '\0');
    text.resize(static_cast<size_t>(EVP_EncodeBlock(reinterpret_cast<unsigned char*>(text.data()),
                                                    reinterpret_cast<const unsigned char*>(bytes.data()),
                                                    static_cast<int>(bytes.size()))));
    return text;
}

/// A request whose parts a test may change before it is put together.
struct SoapRequest {
    std::string service = {};  ///< "RealTimeBrowse", "DownloadAPI" or "StreamAPI"
    std::string operation = {};
    std::string children = {};   ///< of the request element; the prefix "z" is the service's namespace
    std::string base = "/api/";  ///< what the path begins with
    std::string password = "secret";
    long long created_offset = 0;  ///< seconds from now
    long long created_zone = 0;    ///< seconds by which the time is ahead of UTC, which `created_end` then says
    std::string created_end = "Z";
    std::string nonce = {};  ///< of one's own; else a fresh one
    std::string token = {};  ///< from "authorizeDevice"
    std::string device = "desktop-player";
    std::string host = {};  ///< of the address, and its port; else that of this machine

    std::string Authority(int port) const { return host.empty() ? "localhost:" + std::to_string(port) : host; }
    std::string Envelope(int port) const
    {
        static int s_Count;
        const std::string bytes = nonce.empty() ? "number " + std::to_string(++s_Count) : nonce;
        const time_t when = time(nullptr) + created_offset + created_zone;
        tm parts{};
        char seconds[32];
        strftime(seconds, sizeof seconds, "%Y-%m-%dT%H:%M:%S", gmtime_r(&when, &parts));
        const std::string created = seconds + created_end;
        const std::string digested = bytes + created + password;
        std::string digest(SHA_DIGEST_LENGTH, '\0');
        SHA1(reinterpret_cast<const unsigned char*>(digested.data()), digested.size(),
             reinterpret_cast<unsigned char*>(digest.data()));
        const std::string block = service == "RealTimeBrowse" ? "DeviceSettings"
                                  : service == "DownloadAPI"  ? "DownloadDeviceRequestSettings"
                                                              : "StreamDeviceRequestSettings";
        const std::string oasis = "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-";
        const std::string addressing = "http://schemas.xmlsoap.org/ws/2004/08/addressing";
        return R"(<?xml version="1.0" encoding="UTF-8"?>
<e:Envelope xmlns:e="http://schemas.xmlsoap.org/soap/envelope/" xmlns:z="http://api.zorvane.example/api/" xmlns:u=")" +
               oasis + R"(wssecurity-utility-1.0.xsd" xmlns:s=")" + oasis + R"(wssecurity-secext-1.0.xsd" xmlns:a=")" +
               addressing +
               R"("><e:Header><s:Security e:mustUnderstand="1"><s:UsernameToken u:Id="User">)"
               R"(<s:Username>customer</s:Username><s:Password Type=")" +
               oasis + "username-token-profile-1.0#PasswordDigest\">" + Base64(digest) +
               "</s:Password><s:Nonce EncodingType=\"" + oasis + "soap-message-security-1.0#Base64Binary\">" +
               Base64(bytes) + "</s:Nonce><u:Created>" + created +
               "</u:Created></s:UsernameToken></s:Security><a:MessageID>uuid:" + operation +
               R"(</a:MessageID><a:ReplyTo e:mustUnderstand="1"><a:Address>)" + addressing +
               R"(/role/anonymous</a:Address></a:ReplyTo><a:To e:mustUnderstand="true">https://)" + Authority(port) +
               base + service + R"(.asmx</a:To><a:Action e:mustUnderstand="1">http://api.zorvane.example/api/)" +
               operation + "</a:Action><z:" + block +
               R"( e:mustUnderstand="1"><z:APIKey>desktop</z:APIKey><z:DestinationUniqueID>)" + device +
               "</z:DestinationUniqueID><z:DestinationTypeID>48</z:DestinationTypeID>" +
               (token.empty() ? "" : "<z:AuthToken>" + token + "</z:AuthToken>") + "</z:" + block +
               "></e:Header><e:Body><z:" + operation + ">" + children + "</z:" + operation + "></e:Body></e:Envelope>";
    }
    std::string Head(int port, size_t length) const
    {
        return "POST " + base + service + ".asmx HTTP/1.1\r\nHost: " + Authority(port) +
               "\r\nConnection: close\r\nUser-Agent: raw\r\nContent-Type: text/xml; charset=utf-8\r\nContent-Length: " +
               std::to_string(length) + "\r\nSOAPAction: \"http://api.zorvane.example/api/" + operation + "\"\r\n\r\n";
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
    void Order(const std::string& fault)
    {
        std::string error;
        ASSERT_TRUE(store->AddFault(fault, error)) << error;
    }

    /// One request on a connection of its own.
    static Reply SendBytes(int port, bool tls, const std::string& bytes)
    {
        RawClient client(port, tls);
        EXPECT_TRUE(client.Send(bytes));
        return client.Receive();
    }
    Reply Send(const SoapRequest& request)
    {
        return SendBytes(store->HttpsPort(), true, request.Text(store->HttpsPort()));
    }
    Reply Ask(const std::string& service, const std::string& operation, const std::string& children = "")
    {
        return Send({service, operation, children});
    }
    /// The header line that the plain port wants.
    std::string PlainHost() const { return "Host: localhost:" + std::to_string(store->HttpPort()) + "\r\n"; }
    /// A request for the time that keeps its connection.
    std::string TimeRequest() const { return "GET /device/time/ HTTP/1.1\r\n" + PlainHost() + "\r\n"; }
    Reply Plain(const std::string& path, const std::string& headers = "", const std::string& method = "GET",
                const std::string& body = "")
    {
        return SendBytes(store->HttpPort(), false,
                         method + " " + path + " HTTP/1.1\r\n" + headers + PlainHost() +
                             "Connection: close\r\nContent-Length: " + std::to_string(body.size()) + "\r\n\r\n" + body);
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
