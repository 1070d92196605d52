// The simulator's own certificate authority and the server certificates it signs.
#pragma once

#include <openssl/ssl.h>

#include <memory>
#include <string>

#include "Storefront.h"

namespace simulator {

class Certificates {
public:
    /// Loads the authority of the folder, or makes one and writes "ca.pem" and "ca-key.pem" there.
    static std::unique_ptr<Certificates> Open(const std::string& folder, std::string& error);
    ~Certificates();

    std::string AuthorityFile() const { return m_Folder + "/ca.pem"; }

    /// A server context with a fresh key and a certificate of that kind. The caller frees it.
    SSL_CTX* Context(CertificateKind kind, const CertificateDates& dates, bool oldTls) const;

private:
    bool Load();
    bool Make();

    std::string m_Folder;
    EVP_PKEY* m_Key = nullptr;
    X509* m_Authority = nullptr;
};

}  // namespace simulator
