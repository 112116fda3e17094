#pragma once

#include <optional>
#include <string>

#include "platform/ComputerName.h"

namespace cv::fake {

class FixedComputerName : public platform::ComputerName {
  public:
    std::optional<std::string> name = "TESTPC";

    std::optional<std::string> Query() const override { return name; }
};

}  // namespace cv::fake
