#include "Tls.h"

#include <openssl/err.h>
#include <openssl/x509v3.h>
#include <stdio.h>
#include <stdsoap2.h>

#include <algorithm>
#include <map>
#include <string>
#include <utility>

#include "Deployment.h"
#include "Url.h"
#include "ZVMutex.h"

namespace {

// Sets up the TLS library for the process; made on the first session's thread.
struct Library {
    Library() { soap_ssl_init(); }
};

class Contexts {
public:
    X509_STORE* Authorities(const std::string& caFile) ZV_EXCLUDES(m_Mutex)
    {
        ZVMutexLock lock(m_Mutex);
        return AuthoritiesLocked(caFile);
    }

    SSL_CTX* Context(const std::string& caFile, const std::string& host) ZV_EXCLUDES(m_Mutex)
    {
        ZVMutexLock lock(m_Mutex);
        SSL_CTX*& context = m_Contexts[{caFile, host}];
        if (!context) context = Make(AuthoritiesLocked(caFile), host);
        if (!context) return nullptr;
        m_Hosts[context];  // here, since Keep must not throw
        SSL_CTX_up_ref(context);
        return context;
    }

    // Takes the session, which nobody else uses.
    void Keep(SSL_CTX* context, SSL_SESSION* session) ZV_EXCLUDES(m_Mutex)
    {
        ZVMutexLock lock(m_Mutex);
        std::swap(m_Hosts.find(context)->second.newest, session);
        SSL_SESSION_free(session);
    }

    SSL_SESSION* Session(SSL_CTX* context) ZV_EXCLUDES(m_Mutex)
    {
        ZVMutexLock lock(m_Mutex);
        SSL_SESSION* newest = m_Hosts.find(context)->second.newest;
        return newest ? SSL_SESSION_dup(newest) : nullptr;
    }

    void NoteValidity(SSL_CTX* context, const Clock::Validity& validity) ZV_EXCLUDES(m_Mutex)
    {
        ZVMutexLock lock(m_Mutex);
        m_Hosts.find(context)->second.validity = validity;
    }

    Clock::Validity Validity(SSL_CTX* context) ZV_EXCLUDES(m_Mutex)
    {
        ZVMutexLock lock(m_Mutex);
        return m_Hosts.find(context)->second.validity;
    }

private:
    // What its connections have left behind.
    struct Host {
        SSL_SESSION* newest = nullptr;
        Clock::Validity validity;
    };

    static int KeepSession(SSL* connection, SSL_SESSION* session);

    X509_STORE* AuthoritiesLocked(const std::string& caFile) ZV_REQUIRES(m_Mutex)
    {
        const auto known = m_Authorities.find(caFile);
        if (known != m_Authorities.end()) return known->second;
        X509_STORE* store = X509_STORE_new();
        const int loaded = !store           ? 0
                           : caFile.empty() ? X509_STORE_set_default_paths(store)
                                            : X509_STORE_load_file(store, caFile.c_str());
        ERR_clear_error();
        if (loaded != 1) {
            X509_STORE_free(store);
            fprintf(stderr, "%s: cannot read the certificate authorities; name a PEM file with ca_file\n",
                    caFile.empty() ? "system" : caFile.c_str());
            return nullptr;
        }
        return m_Authorities[caFile] = store;
    }

    static SSL_CTX* Make(X509_STORE* authorities, const std::string& host)
    {
        if (!authorities) return nullptr;
        SSL_CTX* context = SSL_CTX_new(TLS_client_method());
        if (!context) return nullptr;
        SSL_CTX_set_min_proto_version(context, TLS1_2_VERSION);
        SSL_CTX_set_mode(context, SSL_MODE_AUTO_RETRY);
        // A peer that cuts the connection without a TLS goodbye is told from a whole answer by the answer's length.
        SSL_CTX_set_options(context, SSL_OP_NO_RENEGOTIATION | SSL_OP_IGNORE_UNEXPECTED_EOF);
        // Kept here: the context's own list would grow with every connection.
        SSL_CTX_set_session_cache_mode(context, SSL_SESS_CACHE_CLIENT | SSL_SESS_CACHE_NO_INTERNAL);
        SSL_CTX_sess_set_new_cb(context, KeepSession);
        SSL_CTX_set1_cert_store(context, authorities);
        SSL_CTX_set_verify(context, SSL_VERIFY_PEER, nullptr);
        X509_VERIFY_PARAM* verify = SSL_CTX_get0_param(context);
        X509_VERIFY_PARAM_set_hostflags(verify,
                                        X509_CHECK_FLAG_NO_PARTIAL_WILDCARDS | X509_CHECK_FLAG_NEVER_CHECK_SUBJECT);
        const int named = IsAddress(host.c_str()) ? X509_VERIFY_PARAM_set1_ip_asc(verify, host.c_str())
                                                  : X509_VERIFY_PARAM_set1_host(verify, host.c_str(), host.size());
        if (named == 1) return context;
        SSL_CTX_free(context);
        return nullptr;
    }

    ZVMutex m_Mutex;
    std::map<std::string, X509_STORE*> m_Authorities ZV_GUARDED_BY(m_Mutex);
    std::map<std::pair<std::string, std::string>, SSL_CTX*> m_Contexts ZV_GUARDED_BY(m_Mutex);
    std::map<SSL_CTX*, Host> m_Hosts ZV_GUARDED_BY(m_Mutex);  // of every context
};

Contexts& TheContexts()
{
    static Library library;
    static auto* contexts = new Contexts;  // outlives threads that still end a session at exit
    return *contexts;
}

// On the thread that reads from the connection. The connection goes on with its own session, so a copy is kept.
int Contexts::KeepSession(SSL* connection, SSL_SESSION* session)
{
    if (SSL_SESSION* copy = SSL_SESSION_dup(session)) TheContexts().Keep(SSL_get_SSL_CTX(connection), copy);
    return 0;
}

std::string Text(const ZVString& text)
{
    return std::string(text.c_str(), text.length());
}

time_t TimeOf(const ASN1_TIME* time)
{
    tm parts = {};
    return ASN1_TIME_to_tm(time, &parts) == 1 ? timegm(&parts) : 0;
}

}  // namespace

namespace Tls {

bool LoadAuthorities(const ZVString& caFile)
{
    return TheContexts().Authorities(Text(caFile)) != nullptr;
}

SSL_CTX* ContextFor(const ZVString& caFile, const ZVString& host)
{
    return TheContexts().Context(Text(caFile), Text(host));
}

SSL_SESSION* SessionFor(SSL_CTX* context)
{
    return TheContexts().Session(context);
}

void ForgetSession(SSL_CTX* context)
{
    TheContexts().Keep(context, nullptr);
}

// A resumed connection shows no certificates: what is known of them stays.
void NoteValidity(const SSL* connection)
{
    const STACK_OF(X509)* chain = SSL_get0_verified_chain(connection);
    if (!chain || sk_X509_num(chain) == 0) return;
    Clock::Validity together = {0, TimeOf(X509_get0_notAfter(sk_X509_value(chain, 0)))};
    for (int i = 0; i < sk_X509_num(chain); ++i) {
        const X509* certificate = sk_X509_value(chain, i);
        together.from = std::max(together.from, TimeOf(X509_get0_notBefore(certificate)));
        together.to = std::min(together.to, TimeOf(X509_get0_notAfter(certificate)));
    }
    TheContexts().NoteValidity(SSL_get_SSL_CTX(connection), together);
}

Clock::Validity ValidityFor(SSL_CTX* context)
{
    return TheContexts().Validity(context);
}

}  // namespace Tls
