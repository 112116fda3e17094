#include "ua/secure/SessionSignature.h"

#include "ua/secure/PolicyProfile.h"
#include "ua/types/PlainText.h"

namespace cv::ua {

Result<SignatureData> SignSession(const crypto::PrivateKey& key, std::string_view certificate,
                                  std::string_view nonce) {
    auto signature = key.SignSha256(std::string(certificate) + std::string(nonce));
    if (!signature) {
        return signature.Failure();
    }
    return SignatureData{std::string(kRsaSha256Uri), ByteString{std::move(signature.Value())}};
}

Result<Done> CheckSessionSignature(const crypto::Certificate& signer, std::string_view certificate,
                                   std::string_view nonce, const SignatureData& signature) {
    if (signature.algorithm != kRsaSha256Uri) {
        return Error{status::BadApplicationSignatureInvalid,
                     "The server signed the session with \"" + PlainText(signature.algorithm) +
                         "\" instead of RSA-SHA256."};
    }
    if (!signer.VerifySha256(std::string(certificate) + std::string(nonce),
                             signature.signature.bytes)) {
        return Error{status::BadApplicationSignatureInvalid,
                     "The server's signature of the session does not match its certificate."};
    }
    return Done{};
}

}  // namespace cv::ua
