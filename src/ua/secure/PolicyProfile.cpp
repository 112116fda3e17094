#include "ua/secure/PolicyProfile.h"

#include <array>

#include "ua/crypto/PSha256.h"

namespace cv::ua {
namespace {

constexpr std::array kPolicies = {
    PolicyProfile{"http://opcfoundation.org/UA/SecurityPolicy#Basic256Sha256", "Basic256Sha256",
                  32},
    PolicyProfile{"http://opcfoundation.org/UA/SecurityPolicy#Aes128_Sha256_RsaOaep",
                  "Aes128_Sha256_RsaOaep", 16},
};

}  // namespace

std::span<const PolicyProfile> SupportedPolicies() {
    return kPolicies;
}

const PolicyProfile* FindPolicy(std::string_view uri) {
    for (const PolicyProfile& profile : kPolicies) {
        if (profile.uri == uri) {
            return &profile;
        }
    }
    return nullptr;
}

SymmetricKeys DeriveKeys(const PolicyProfile& profile, std::string_view secret,
                         std::string_view seed) {
    const size_t signing = profile.signingKeyBytes;
    const size_t encrypting = profile.encryptingKeyBytes;
    const std::string bytes =
        crypto::PSha256(secret, seed, signing + encrypting + kSymmetricBlockBytes);
    return {bytes.substr(0, signing), bytes.substr(signing, encrypting),
            bytes.substr(signing + encrypting)};
}

}  // namespace cv::ua
