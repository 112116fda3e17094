#pragma once

#include <algorithm>
#include <chrono>
#include <cstdint>

namespace cv::ua {

// The one wait a connection has from its first step to its last, counted
// from when it was made: each step waits only for what is left of it, so a
// server that paces its answers cannot stretch the whole.
class ConnectDeadline {
  public:
    ConnectDeadline() = default;
    explicit ConnectDeadline(uint32_t waitMs)
        : end_(std::chrono::steady_clock::now() + std::chrono::milliseconds(waitMs)) {}

    // At least 1 ms, so that a step's time-out still fires.
    uint32_t LeftMs() const {
        const auto left =
            std::chrono::ceil<std::chrono::milliseconds>(end_ - std::chrono::steady_clock::now());
        return static_cast<uint32_t>(std::max<int64_t>(1, left.count()));
    }

  private:
    std::chrono::steady_clock::time_point end_;
};

}  // namespace cv::ua
