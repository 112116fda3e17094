#pragma once

#include <string>
#include <vector>

#include "platform/BusyNotice.h"

namespace cv::fake {

// Records each time the busy notice is shown and hidden.
class RecordingBusyNotice : public platform::BusyNotice {
  public:
    void Show(const std::string& text) override {
        shown_.push_back(text);
        visible_ = true;
    }
    void Hide() override { visible_ = false; }

    bool Visible() const { return visible_; }
    const std::vector<std::string>& Shown() const { return shown_; }

  private:
    std::vector<std::string> shown_;
    bool visible_ = false;
};

}  // namespace cv::fake
