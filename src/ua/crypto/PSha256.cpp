#include "ua/crypto/PSha256.h"

#include "ua/crypto/Primitives.h"

namespace cv::ua::crypto {

std::string PSha256(std::string_view secret, std::string_view seed, size_t length) {
    std::string out;
    out.reserve(length + kSha256Bytes);
    std::string a(seed);
    while (out.size() < length) {
        a = HmacSha256(secret, a);
        out += HmacSha256(secret, a + std::string(seed));
    }
    out.resize(length);
    return out;
}

}  // namespace cv::ua::crypto
