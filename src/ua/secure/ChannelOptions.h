#pragma once

#include <cstdint>

#include "ua/encoding/DecodeLimits.h"

namespace cv::ua {

// What the client offers in its Hello; the server may lower each.
struct TransportLimits {
    uint32_t receiveBufferSize = 65535;
    uint32_t sendBufferSize = 65535;
    // The largest message body the client takes; 0 for no limit.
    uint32_t maxMessageSize = 16u << 20;
    // 0 for no limit.
    uint32_t maxChunkCount = 0;
    // What the messages still waiting for chunks may hold together, however
    // many the server interleaves; 0 for no limit.
    uint32_t maxUnfinishedSize = 16u << 20;
};

struct ChannelOptions {
    TransportLimits limits;
    DecodeLimits decodeLimits;
    // Connecting, Hello and the first OpenSecureChannel together.
    uint32_t connectTimeoutMs = 10'000;
    uint32_t requestedLifetimeMs = 3'600'000;
};

}  // namespace cv::ua
