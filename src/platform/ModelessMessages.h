#pragma once

#include <cstdint>
#include <string>

namespace cv::platform {

// Message windows that stay open while the program goes on: one per failing
// channel, closed by their owner when the channels go offline.
class ModelessMessages {
  public:
    using WindowId = int32_t;
    virtual ~ModelessMessages() = default;
    // Opens a window with one button; 0 when it could not be opened.
    virtual WindowId Launch(const std::string& sTitle, const std::string& sText,
                            const std::string& sButton) = 0;
    // Closing a window the user closed already does nothing.
    virtual void Close(WindowId id) = 0;
};

}  // namespace cv::platform
