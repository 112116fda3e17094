#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "platform/Dialogs.h"

namespace cv::posix {

// Message boxes on a terminal, for programs without a window: each box is
// written to the stream (its title on a line of its own, then its text) and
// answered at once as its escape key would (OK, Cancel, No or Abort), since
// nobody may be there to answer. So a box that asks is written without its
// question (the last paragraph of its text), and not at all when the
// question is all it says.
class ConsoleDialogs : public platform::Dialogs {
  public:
    explicit ConsoleDialogs(std::ostream& out) : out_(out) {}

    int32_t MsgBox(const std::string& text, int32_t style, const std::string& title) override;

    // The answer a box of that style gives when nobody answers it.
    static int32_t UnattendedAnswer(int32_t style);
    // CR LF (and lone CR) line breaks as "\n".
    static std::string PlainLines(const std::string& text);
    // What a box of that style tells: its text, less the question of a box
    // with more than an OK button.
    static std::string ToldText(const std::string& text, int32_t style);

  private:
    std::ostream& out_;
};

}  // namespace cv::posix
