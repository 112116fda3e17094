#include "ua/transport/FrameReader.h"

namespace cv::ua {

void FrameReader::Append(std::string_view bytes) {
    if (start_ > 0 && start_ >= buffer_.size() / 2) {
        buffer_.erase(0, start_);
        start_ = 0;
    }
    buffer_.append(bytes);
}

Result<std::optional<Frame>> FrameReader::Next() {
    if (PendingBytes() < kFrameHeaderSize) {
        return std::optional<Frame>();
    }
    const std::string_view available = std::string_view(buffer_).substr(start_);
    auto header = ParseFrameHeader(available.substr(0, kFrameHeaderSize), maxFrameSize_);
    if (!header) {
        return header.Failure();
    }
    if (available.size() < header.Value().size) {
        return std::optional<Frame>();
    }
    Frame frame{header.Value(), std::string(available.substr(0, header.Value().size))};
    start_ += header.Value().size;
    return std::optional<Frame>(std::move(frame));
}

}  // namespace cv::ua
