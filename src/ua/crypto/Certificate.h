#pragma once

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "ua/crypto/OpenSsl.h"
#include "ua/crypto/PrivateKey.h"
#include "ua/types/BuiltinTypes.h"

namespace cv::ua::crypto {

// An X.509 certificate as it travels (DER), with what the secure channel
// does with its public key and what a user is shown about it. The bytes may
// hold the certificate's issuers after it (a chain); the rest of this class
// speaks of the first certificate. Copies share the parsed certificate.
class Certificate {
  public:
    Certificate() = default;

    static Result<Certificate> FromDer(std::string_view der);

    bool Empty() const { return !x509_; }
    // The bytes as given, chain included.
    const std::string& Der() const { return der_; }
    // The first certificate's bytes alone.
    std::string_view LeafDer() const { return std::string_view(der_).substr(0, leafSize_); }
    // SHA-1 of LeafDer(): how UA names a certificate.
    std::string Thumbprint() const;
    int KeyBits() const;
    bool Matches(const PrivateKey& key) const;

    // RSA PKCS#1 v1.5 with SHA-256.
    Result<Done> VerifySha256(std::string_view data, std::string_view signature) const;
    // RSA-OAEP (SHA-1) in blocks of KeyBits() / 8 - 42 plain bytes.
    Result<std::string> EncryptOaep(std::string_view data) const;

    // RFC 2253 text, e.g. "CN=UA test peer,O=Test".
    std::string Subject() const;
    std::string Issuer() const;
    std::string CommonName() const;
    // The first URI of subjectAltName: the application URI.
    std::string ApplicationUri() const;
    std::vector<std::string> DnsNames() const;
    // IP addresses of subjectAltName as text ("127.0.0.1", "::1").
    std::vector<std::string> IpAddresses() const;
    DateTime NotBefore() const;
    DateTime NotAfter() const;

    X509* Get() const { return x509_.get(); }

  private:
    std::shared_ptr<X509> x509_;
    std::string der_;
    size_t leafSize_ = 0;
};

}  // namespace cv::ua::crypto
