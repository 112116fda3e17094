#include "ua/types/Base64.h"

#include <algorithm>
#include <cstdint>

namespace cv::ua {
namespace {

constexpr std::string_view kAlphabet =
    "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

int SextetOf(char c) {
    const size_t pos = kAlphabet.find(c);
    return pos == std::string_view::npos ? -1 : static_cast<int>(pos);
}

}  // namespace

std::string Base64Encode(std::string_view bytes) {
    std::string text;
    text.reserve((bytes.size() + 2) / 3 * 4);
    for (size_t i = 0; i < bytes.size(); i += 3) {
        const size_t n = std::min<size_t>(3, bytes.size() - i);
        uint32_t group = 0;
        for (size_t k = 0; k < 3; ++k) {
            group = (group << 8) | (k < n ? static_cast<uint8_t>(bytes[i + k]) : 0u);
        }
        for (size_t k = 0; k < 4; ++k) {
            text += k <= n ? kAlphabet[(group >> (18 - 6 * k)) & 0x3F] : '=';
        }
    }
    return text;
}

std::optional<std::string> Base64Decode(std::string_view sText) {
    if (sText.size() % 4 != 0) {
        return std::nullopt;
    }
    std::string bytes;
    bytes.reserve(sText.size() / 4 * 3);
    for (size_t i = 0; i < sText.size(); i += 4) {
        size_t padding = 0;
        if (i + 4 == sText.size() && sText[i + 3] == '=') {
            padding = sText[i + 2] == '=' ? 2 : 1;
        }
        uint32_t group = 0;
        for (size_t k = 0; k < 4; ++k) {
            const int sextet = k < 4 - padding ? SextetOf(sText[i + k]) : 0;
            if (sextet < 0) {
                return std::nullopt;
            }
            group = (group << 6) | static_cast<uint32_t>(sextet);
        }
        for (size_t k = 0; k < 3 - padding; ++k) {
            bytes += static_cast<char>((group >> (16 - 8 * k)) & 0xFF);
        }
    }
    return bytes;
}

}  // namespace cv::ua
