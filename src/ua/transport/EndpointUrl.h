#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "ua/types/Result.h"

namespace cv::ua {

// The parts of "opc.tcp://host:port/path" ("[::1]" for IPv6 hosts; the port
// defaults to 4840).
struct EndpointUrl {
    std::string host;
    uint16_t port = 4840;
    std::string path;

    static Result<EndpointUrl> Parse(std::string_view sUrl);
};

}  // namespace cv::ua
