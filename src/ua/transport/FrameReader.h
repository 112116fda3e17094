#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "ua/transport/TcpMessages.h"

namespace cv::ua {

struct Frame {
    FrameHeader header;
    // The whole frame, header included.
    std::string bytes;
};

// Cuts the byte stream of a connection into frames. A header that cannot
// start a frame makes the stream unusable; the error says why.
class FrameReader {
  public:
    explicit FrameReader(uint32_t maxFrameSize) : maxFrameSize_(maxFrameSize) {}

    void SetMaxFrameSize(uint32_t maxFrameSize) { maxFrameSize_ = maxFrameSize; }
    void Append(std::string_view bytes);
    // The next whole frame, or nothing while its bytes have not all arrived.
    Result<std::optional<Frame>> Next();
    // Bytes of a frame that has begun but not ended.
    size_t PendingBytes() const { return buffer_.size() - start_; }

  private:
    uint32_t maxFrameSize_;
    std::string buffer_;
    size_t start_ = 0;
};

}  // namespace cv::ua
