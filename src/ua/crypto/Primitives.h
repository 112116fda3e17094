#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "ua/types/Result.h"

namespace cv::ua::crypto {

// The symmetric building blocks of the secure channel, all from OpenSSL.
// Bytes travel in std::string.

inline constexpr size_t kSha256Bytes = 32;
inline constexpr size_t kSha1Bytes = 20;
inline constexpr size_t kAesBlockBytes = 16;

// Bytes from OpenSSL's random generator (nonces, keys).
Result<std::string> RandomBytes(size_t count);
std::string Sha1(std::string_view data);
std::string HmacSha256(std::string_view key, std::string_view data);

// AES-CBC over whole blocks, without padding: the data's length must be a
// multiple of 16 bytes. The key is 16 bytes (AES-128) or 32 (AES-256).
Result<std::string> AesCbcEncrypt(std::string_view key, std::string_view iv, std::string_view data);
Result<std::string> AesCbcDecrypt(std::string_view key, std::string_view iv, std::string_view data);

// Compares without a time that depends on where they differ.
bool SameBytes(std::string_view a, std::string_view b);

}  // namespace cv::ua::crypto
