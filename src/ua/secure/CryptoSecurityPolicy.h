#pragma once

#include <memory>
#include <string>
#include <vector>

#include "ua/crypto/Credentials.h"
#include "ua/secure/PolicyProfile.h"
#include "ua/secure/SecurityPolicy.h"

namespace cv::ua {

// Basic256Sha256 or Aes128_Sha256_RsaOaep in mode Sign or SignAndEncrypt.
//
// Open chunks are signed with our private key and encrypted with the
// server's public key in both modes; the server's come back signed with its
// key and encrypted with ours. The other chunks are signed with HMAC-SHA256
// and, in SignAndEncrypt, encrypted with AES-CBC, using the keys derived
// from the two nonces of the token their header names: ours to send, the
// server's to receive. The keys of the token before the newest stay until
// the channel retires it.
class CryptoSecurityPolicy : public SecurityPolicy {
  public:
    // Checks that both keys suit the policy.
    static Result<std::unique_ptr<CryptoSecurityPolicy>> Make(const PolicyProfile& profile,
                                                              MessageSecurityMode mode,
                                                              crypto::Credentials own,
                                                              crypto::Certificate server);

    std::string_view Uri() const override { return profile_.uri; }
    MessageSecurityMode Mode() const override { return mode_; }
    Result<ByteString> NewClientNonce() override;
    Result<Done> AcceptToken(uint32_t tokenId, const ByteString& serverNonce) override;
    void RetireToken(uint32_t tokenId) override;
    void WriteAsymmetricHeader(Encoder& encoder) const override;
    Result<Done> ReadAsymmetricHeader(Decoder& decoder) const override;
    size_t BodyRoom(size_t chunkSize, size_t headerSize, bool asymmetric) const override;
    Result<Done> Protect(std::string& chunk, size_t sequenceAt, bool asymmetric) override;
    Result<size_t> Unprotect(std::string& chunk, size_t sequenceAt, bool asymmetric) override;

  private:
    struct TokenKeys {
        uint32_t tokenId = 0;
        SymmetricKeys client;
        SymmetricKeys server;
    };

    CryptoSecurityPolicy(const PolicyProfile& profile, MessageSecurityMode mode,
                         crypto::Credentials own, crypto::Certificate server);

    bool Encrypts() const { return mode_ == MessageSecurityMode::SignAndEncrypt; }
    const TokenKeys* KeysOf(const std::string& chunk) const;
    Result<Done> ProtectAsymmetric(std::string& chunk, size_t sequenceAt);
    Result<Done> ProtectSymmetric(std::string& chunk, size_t sequenceAt);
    Result<size_t> UnprotectAsymmetric(std::string& chunk, size_t sequenceAt);
    Result<size_t> UnprotectSymmetric(std::string& chunk, size_t sequenceAt);

    const PolicyProfile& profile_;
    MessageSecurityMode mode_;
    crypto::Credentials own_;
    crypto::Certificate server_;
    std::string serverThumbprint_;
    std::string ownThumbprint_;
    std::string clientNonce_;
    std::vector<TokenKeys> tokens_;
};

}  // namespace cv::ua
