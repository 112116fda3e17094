#pragma once

#include <string_view>

#include "ua/crypto/Certificate.h"
#include "ua/services/SessionServices.h"

namespace cv::ua {

// The proofs of possession of a session: each side signs the other side's
// certificate followed by the nonce that side sent (RSA-SHA256).
Result<SignatureData> SignSession(const crypto::PrivateKey& key, std::string_view certificate,
                                  std::string_view nonce);
// Checks that signer signed certificate ‖ nonce.
Result<Done> CheckSessionSignature(const crypto::Certificate& signer, std::string_view certificate,
                                   std::string_view nonce, const SignatureData& signature);

}  // namespace cv::ua
