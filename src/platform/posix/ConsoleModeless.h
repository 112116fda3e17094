#pragma once

#include <ostream>
#include <string>

#include "platform/ModelessMessages.h"
#include "platform/posix/ConsoleDialogs.h"

namespace cv::posix {

// Message windows that do not wait, on a terminal: each message is written
// at once; closing it has nothing to do.
class ConsoleModeless : public platform::ModelessMessages {
  public:
    explicit ConsoleModeless(std::ostream& out) : out_(out) {}

    WindowId Launch(const std::string& sTitle, const std::string& sText,
                    const std::string& /*sButton*/) override {
        out_ << ConsoleDialogs::PlainLines(sTitle) << ":\n"
             << ConsoleDialogs::PlainLines(sText) << std::endl;
        return ++lastId_;
    }
    void Close(WindowId /*id*/) override {}

  private:
    std::ostream& out_;
    WindowId lastId_ = 0;
};

}  // namespace cv::posix
