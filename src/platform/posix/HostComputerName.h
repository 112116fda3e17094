#pragma once

#include "platform/ComputerName.h"

namespace cv::posix {

// The host name's first label, upper-cased and cut to 15 characters, the
// form Windows networks give a computer's name.
class HostComputerName : public platform::ComputerName {
  public:
    std::optional<std::string> Query() const override;
};

}  // namespace cv::posix
