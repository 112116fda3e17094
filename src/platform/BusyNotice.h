#pragma once

#include <string>

namespace cv::platform {

// The notice shown while a call into a server is still pending after the
// busy time-out. It has no buttons: it goes away when the call returns.
class BusyNotice {
  public:
    virtual ~BusyNotice() = default;
    virtual void Show(const std::string& text) = 0;
    virtual void Hide() = 0;
};

}  // namespace cv::platform
