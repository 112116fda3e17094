#include "platform/ua/UaOptions.h"

#include <charconv>
#include <cstring>

namespace cv::uaopc {

std::optional<uint16_t> PortFromText(const char* text) {
    if (text == nullptr) {
        return std::nullopt;
    }
    const char* end = text + std::strlen(text);
    uint16_t port = 0;
    const auto [stop, error] = std::from_chars(text, end, port);
    if (error != std::errc() || stop != end || port == 0) {
        return std::nullopt;
    }
    return port;
}

}  // namespace cv::uaopc
