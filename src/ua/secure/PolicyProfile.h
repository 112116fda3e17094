#pragma once

#include <cstddef>
#include <span>
#include <string>
#include <string_view>

namespace cv::ua {

// The algorithms and sizes of a security policy this library speaks. Both
// sign asymmetrically with RSA PKCS#1 v1.5 and SHA-256, encrypt
// asymmetrically with RSA-OAEP (SHA-1), sign chunks with HMAC-SHA256,
// encrypt them with AES-CBC and derive keys with P_SHA256.
struct PolicyProfile {
    std::string_view uri;
    // The last part of the URI, for texts.
    std::string_view name;
    size_t encryptingKeyBytes = 32;
    size_t signingKeyBytes = 32;
    size_t nonceBytes = 32;
    int minKeyBits = 2048;
    int maxKeyBits = 4096;
};

inline constexpr size_t kSymmetricSignatureBytes = 32;
inline constexpr size_t kSymmetricBlockBytes = 16;
// What OAEP with SHA-1 takes from each RSA block.
inline constexpr size_t kOaepOverhead = 42;
inline constexpr std::string_view kRsaSha256Uri =
    "http://www.w3.org/2001/04/xmldsig-more#rsa-sha256";
inline constexpr std::string_view kRsaOaepUri = "http://www.w3.org/2001/04/xmlenc#rsa-oaep";

// Basic256Sha256 and Aes128_Sha256_RsaOaep, in the order the client prefers
// them when a server rates them alike.
std::span<const PolicyProfile> SupportedPolicies();
// Null for a policy this library does not speak (None included).
const PolicyProfile* FindPolicy(std::string_view uri);

// The keys one side of a secure channel signs and encrypts with.
struct SymmetricKeys {
    std::string signing;
    std::string encrypting;
    std::string iv;
};

// Cuts P_SHA256(secret, seed) into signing key, encrypting key and IV. The
// client's keys come from (server nonce, client nonce), the server's from
// (client nonce, server nonce).
SymmetricKeys DeriveKeys(const PolicyProfile& profile, std::string_view secret,
                         std::string_view seed);

}  // namespace cv::ua
