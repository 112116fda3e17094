#include "ua/transport/EndpointUrl.h"

#include <charconv>

namespace cv::ua {
namespace {

constexpr std::string_view kScheme = "opc.tcp://";

Error Invalid(std::string_view sUrl, const char* why) {
    return Error{status::BadTcpEndpointUrlInvalid,
                 "The endpoint URL \"" + std::string(sUrl) + "\" " + why + "."};
}

bool StartsWithScheme(std::string_view sUrl) {
    if (sUrl.size() < kScheme.size()) {
        return false;
    }
    for (size_t i = 0; i < kScheme.size(); ++i) {
        const char c = sUrl[i];
        if ((c >= 'A' && c <= 'Z' ? static_cast<char>(c + 32) : c) != kScheme[i]) {
            return false;
        }
    }
    return true;
}

}  // namespace

Result<EndpointUrl> EndpointUrl::Parse(std::string_view sUrl) {
    if (!StartsWithScheme(sUrl)) {
        return Invalid(sUrl, "does not start with opc.tcp://");
    }
    const std::string_view rest = sUrl.substr(kScheme.size());
    const size_t slash = rest.find('/');
    const std::string_view authority = rest.substr(0, slash);
    EndpointUrl url;
    url.path = slash == std::string_view::npos ? "" : std::string(rest.substr(slash));
    std::string_view port;
    if (!authority.empty() && authority.front() == '[') {
        const size_t close = authority.find(']');
        if (close == std::string_view::npos) {
            return Invalid(sUrl, "has an IPv6 address without its closing bracket");
        }
        url.host = std::string(authority.substr(1, close - 1));
        const std::string_view after = authority.substr(close + 1);
        if (!after.empty() && after.front() != ':') {
            return Invalid(sUrl, "has text after its IPv6 address");
        }
        port = after.empty() ? after : after.substr(1);
    } else {
        const size_t colon = authority.find(':');
        url.host = std::string(authority.substr(0, colon));
        port = colon == std::string_view::npos ? std::string_view() : authority.substr(colon + 1);
    }
    if (url.host.empty()) {
        return Invalid(sUrl, "names no host");
    }
    if (!port.empty() || authority.ends_with(':')) {
        const auto [end, ec] = std::from_chars(port.data(), port.data() + port.size(), url.port);
        if (ec != std::errc() || end != port.data() + port.size() || url.port == 0) {
            return Invalid(sUrl, "has no valid port number");
        }
    }
    return url;
}

}  // namespace cv::ua
