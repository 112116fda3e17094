#pragma once

#include <ostream>
#include <string>

#include "platform/BusyNotice.h"

namespace cv::posix {

// The slow-server notice as one line on a terminal.
class ConsoleBusyNotice : public platform::BusyNotice {
  public:
    explicit ConsoleBusyNotice(std::ostream& out) : out_(out) {}

    void Show(const std::string& text) override { out_ << text << std::endl; }
    void Hide() override {}

  private:
    std::ostream& out_;
};

}  // namespace cv::posix
