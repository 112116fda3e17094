#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "ua/secure/SecurityPolicy.h"
#include "ua/transport/TcpMessages.h"

namespace cv::ua {

// What the server said it accepts (its Acknowledge); 0 for no limit.
struct SendLimits {
    uint32_t chunkSize = kMinBufferSize;
    uint32_t maxMessageSize = 0;
    uint32_t maxChunkCount = 0;
};

// Cuts an encoded request into secured OPN, MSG or CLO chunks that fit the
// server's limits, numbering them in sending order.
class ChunkWriter {
  public:
    explicit ChunkWriter(SecurityPolicy& policy) : policy_(policy) {}

    void SetLimits(const SendLimits& limits) { limits_ = limits; }
    // The chunks to send, in order; Bad_RequestTooLarge when the body does
    // not fit the limits (then no sequence number is used up).
    Result<std::vector<std::string>> Write(MessageKind kind, uint32_t channelId, uint32_t tokenId,
                                           uint32_t requestId, std::string_view body);

  private:
    std::string Headers(MessageKind kind, uint32_t channelId, uint32_t tokenId) const;
    uint32_t NextSequenceNumber();

    SecurityPolicy& policy_;
    SendLimits limits_;
    uint32_t lastSequence_ = 0;
};

}  // namespace cv::ua
