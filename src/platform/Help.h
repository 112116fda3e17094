#pragma once

#include <cstdint>
#include <string>

namespace cv::platform {

// Shows one topic of a help file, chosen by its context number. The file name
// may carry a window name after ">".
class Help {
  public:
    virtual ~Help() = default;
    virtual void ShowTopic(const std::string& helpFile, int32_t context) = 0;
};

}  // namespace cv::platform
