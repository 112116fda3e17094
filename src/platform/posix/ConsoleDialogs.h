#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "platform/Dialogs.h"

namespace cv::posix {

// Message boxes on a terminal, for programs without a window: each box is
// written to the stream (its title on a line of its own, then its text) and
// answered at once as its escape key would (OK, Cancel, No or Abort), since
// nobody may be there to answer.
class ConsoleDialogs : public platform::Dialogs {
  public:
    explicit ConsoleDialogs(std::ostream& out) : out_(out) {}

    int32_t MsgBox(const std::string& text, int32_t style, const std::string& title) override;

    // The answer a box of that style gives when nobody answers it.
    static int32_t UnattendedAnswer(int32_t style);
    // CR LF (and lone CR) line breaks as "\n".
    static std::string PlainLines(const std::string& text);

  private:
    std::ostream& out_;
};

}  // namespace cv::posix
