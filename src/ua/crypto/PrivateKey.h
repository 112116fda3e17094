#pragma once

#include <memory>
#include <string>
#include <string_view>

#include "ua/crypto/OpenSsl.h"

namespace cv::ua::crypto {

// An RSA private key. Copies share the key.
class PrivateKey {
  public:
    PrivateKey() = default;

    static Result<PrivateKey> Generate(int bits);
    // An unencrypted PEM private key (PKCS#8 or the older RSA form).
    static Result<PrivateKey> FromPem(std::string_view pem);
    // PKCS#8, unencrypted.
    std::string ToPem() const;

    bool Empty() const { return !key_; }
    int Bits() const;
    // RSA PKCS#1 v1.5 with SHA-256; the signature has Bits() / 8 bytes.
    Result<std::string> SignSha256(std::string_view data) const;
    // Decrypts RSA-OAEP (SHA-1) blocks of Bits() / 8 bytes each.
    Result<std::string> DecryptOaep(std::string_view data) const;

    EVP_PKEY* Get() const { return key_.get(); }

  private:
    explicit PrivateKey(EVP_PKEY* key) : key_(key, EVP_PKEY_free) {}

    std::shared_ptr<EVP_PKEY> key_;
};

}  // namespace cv::ua::crypto
