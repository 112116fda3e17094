#pragma once

#include <ostream>
#include <string>

#include "platform/Help.h"

namespace cv::posix {

// Help on a terminal: names the topic the window's help would open.
class ConsoleHelp : public platform::Help {
  public:
    explicit ConsoleHelp(std::ostream& out) : out_(out) {}

    void ShowTopic(const std::string& helpFile, int32_t context) override {
        out_ << "Help: topic " << context << " of " << helpFile << '\n';
    }

  private:
    std::ostream& out_;
};

}  // namespace cv::posix
