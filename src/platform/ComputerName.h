#pragma once

#include <optional>
#include <string>

namespace cv::platform {

// The local computer's name as other computers of the network know it.
class ComputerName {
  public:
    virtual ~ComputerName() = default;
    // Empty when the name cannot be found.
    virtual std::optional<std::string> Query() const = 0;
};

}  // namespace cv::platform
