#include "Certificates.h"

#include <openssl/pem.h>
#include <openssl/rand.h>
#include <openssl/x509v3.h>

#include <cstdio>

#include "Hosts.h"

namespace simulator {

namespace {

constexpr long kDay = 24 * 60 * 60;

using File = std::unique_ptr<FILE, int (*)(FILE*)>;
File OpenFile(const std::string& name, const char* mode)
{
    return File(fopen(name.c_str(), mode), fclose);
}

void AddExtension(X509* certificate, X509* issuer, int kind, const std::string& value)
{
    X509V3_CTX context;
    X509V3_set_ctx_nodb(&context);
    X509V3_set_ctx(&context, issuer, certificate, nullptr, nullptr, 0);
    X509_EXTENSION* extension = X509V3_EXT_conf_nid(nullptr, &context, kind, value.c_str());
    X509_add_ext(certificate, extension, -1);
    X509_EXTENSION_free(extension);
}

// A certificate for the key, not signed yet.
X509* NewCertificate(EVP_PKEY* key, const std::string& commonName, const CertificateDates& dates)
{
    X509* certificate = X509_new();
    X509_set_version(certificate, 2);
    unsigned char serial[8];
    RAND_bytes(serial, sizeof serial);
    serial[0] &= 0x7f;
    BIGNUM* number = BN_bin2bn(serial, sizeof serial, nullptr);
    BN_to_ASN1_INTEGER(number, X509_get_serialNumber(certificate));
    BN_free(number);
    ASN1_TIME_set(X509_getm_notBefore(certificate), dates.from);
    ASN1_TIME_set(X509_getm_notAfter(certificate), dates.until);
    X509_NAME_add_entry_by_txt(X509_get_subject_name(certificate), "CN", MBSTRING_UTF8,
                               reinterpret_cast<const unsigned char*>(commonName.c_str()), -1, -1, 0);
    X509_set_pubkey(certificate, key);
    return certificate;
}

CertificateDates DatesFromNow(long firstDay, long lastDay)
{
    const time_t now = time(nullptr);
    return {now + firstDay * kDay, now + lastDay * kDay};
}

X509* NewAuthority(EVP_PKEY* key)
{
    // Older than its certificates may pretend to be.
    X509* authority = NewCertificate(key, "Storefront simulator CA", DatesFromNow(-20 * 365, 10 * 365));
    X509_set_issuer_name(authority, X509_get_subject_name(authority));
    AddExtension(authority, authority, NID_basic_constraints, "critical,CA:TRUE");
    AddExtension(authority, authority, NID_key_usage, "critical,keyCertSign,cRLSign");
    X509_sign(authority, key, EVP_sha256());
    return authority;
}

// Those of the subject's alternative names.
std::string NamesOf(CertificateKind kind)
{
    std::string names = "DNS:localhost,IP:127.0.0.1";
    for (const HostRow& host : kHosts) {
        if (host.tls) names += std::string(",DNS:") + host.name;
    }
    switch (kind) {
        case CertificateKind::WrongName:
            return "DNS:other.example";
        case CertificateKind::WideWildcard:
            return "DNS:*";  // must not stand for a host
        case CertificateKind::NameOnly:
            return "";
        default:
            return names;
    }
}

}  // namespace

std::unique_ptr<Certificates> Certificates::Open(const std::string& folder, std::string& error)
{
    auto certificates = std::make_unique<Certificates>();
    certificates->m_Folder = folder;
    if (certificates->Load() || certificates->Make()) return certificates;
    error = folder + ": cannot write the certificate authority; name a folder that can be written with --data";
    return nullptr;
}

Certificates::~Certificates()
{
    EVP_PKEY_free(m_Key);
    X509_free(m_Authority);
}

bool Certificates::Load()
{
    const File key = OpenFile(m_Folder + "/ca-key.pem", "r");
    const File authority = OpenFile(AuthorityFile(), "r");
    if (!key || !authority) return false;
    m_Key = PEM_read_PrivateKey(key.get(), nullptr, nullptr, nullptr);
    m_Authority = PEM_read_X509(authority.get(), nullptr, nullptr, nullptr);
    return m_Key && m_Authority;
}

bool Certificates::Make()
{
    EVP_PKEY_free(m_Key);
    X509_free(m_Authority);
    m_Key = EVP_EC_gen("P-256");
    m_Authority = NewAuthority(m_Key);
    const File key = OpenFile(m_Folder + "/ca-key.pem", "w");
    const File authority = OpenFile(AuthorityFile(), "w");
    return key && authority && PEM_write_PrivateKey(key.get(), m_Key, nullptr, nullptr, 0, nullptr, nullptr) == 1 &&
           PEM_write_X509(authority.get(), m_Authority) == 1;
}

SSL_CTX* Certificates::Context(CertificateKind kind, const CertificateDates& dates, bool oldTls) const
{
    EVP_PKEY* key = EVP_EC_gen("P-256");
    EVP_PKEY* signer = m_Key;
    X509* issuer = m_Authority;
    if (kind == CertificateKind::Untrusted) {
        signer = EVP_EC_gen("P-256");
        issuer = NewAuthority(signer);
    }
    CertificateDates valid = kind == CertificateKind::Expired       ? DatesFromNow(-20, -10)
                             : kind == CertificateKind::NotYetValid ? DatesFromNow(10, 20)
                                                                    : DatesFromNow(-1, 365);
    if (dates.from) valid.from = dates.from;
    if (dates.until) valid.until = dates.until;
    X509* certificate = NewCertificate(key, "localhost", valid);
    X509_set_issuer_name(certificate, X509_get_subject_name(issuer));
    const std::string names = NamesOf(kind);
    if (!names.empty()) AddExtension(certificate, issuer, NID_subject_alt_name, names);
    X509_sign(certificate, signer, EVP_sha256());

    SSL_CTX* context = SSL_CTX_new(TLS_server_method());
    SSL_CTX_use_certificate(context, certificate);
    SSL_CTX_use_PrivateKey(context, key);
    if (oldTls) {
        SSL_CTX_set_security_level(context, 0);
        SSL_CTX_set_max_proto_version(context, TLS1_1_VERSION);
    } else {
        SSL_CTX_set_min_proto_version(context, TLS1_2_VERSION);
    }
    const unsigned char id[] = "storefront";
    SSL_CTX_set_session_id_context(context, id, sizeof id - 1);
    X509_free(certificate);
    EVP_PKEY_free(key);
    if (issuer != m_Authority) {
        X509_free(issuer);
        EVP_PKEY_free(signer);
    }
    return context;
}

}  // namespace simulator
