#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace cv::ua::crypto {

// The key derivation of the secure channel (TLS's P_hash with HMAC-SHA256):
// A(0) = seed, A(i) = HMAC(secret, A(i-1)), and the output is
// HMAC(secret, A(1) + seed) + HMAC(secret, A(2) + seed) + ..., cut to length.
std::string PSha256(std::string_view secret, std::string_view seed, size_t length);

}  // namespace cv::ua::crypto
