#include <gtest/gtest.h>

#include <sstream>

#include "platform/posix/ConsoleDialogs.h"

namespace cv::posix {
namespace {

// Nobody answers on a terminal: a box that asks is told without its
// question, its last paragraph, and answered as its escape key would.
TEST(ConsoleDialogs, WritesTheBoxWithoutItsQuestionAndAnswersAsItsEscapeKey) {
    struct Case {
        int32_t style;
        int32_t answer;
        const char* out;
    };
    const Case cases[] = {
        {MsgBoxStyle::OKOnly + MsgBoxStyle::Critical, MsgBoxResult::OK,
         "Error reading X:\na\n\nb\nc\n"},
        {MsgBoxStyle::OKCancel, MsgBoxResult::Cancel, "Error reading X:\na\n"},
        {MsgBoxStyle::AbortRetryIgnore, MsgBoxResult::Abort, "Error reading X:\na\n"},
        {MsgBoxStyle::YesNoCancel, MsgBoxResult::Cancel, "Error reading X:\na\n"},
        {MsgBoxStyle::YesNo + MsgBoxStyle::Question, MsgBoxResult::No, "Error reading X:\na\n"},
        {MsgBoxStyle::RetryCancel, MsgBoxResult::Cancel, "Error reading X:\na\n"}};
    for (const Case& c : cases) {
        std::ostringstream out;
        ConsoleDialogs dialogs(out);
        EXPECT_EQ(dialogs.MsgBox("a\r\n\r\nb\rc", c.style, "Error reading X"), c.answer);
        EXPECT_EQ(out.str(), c.out);
    }
    std::ostringstream out;
    ConsoleDialogs dialogs(out);
    (void)dialogs.MsgBox("alone", MsgBoxStyle::OKOnly, "");
    EXPECT_EQ(dialogs.MsgBox("Continue?", MsgBoxStyle::YesNo, "Conversion errors"),
              MsgBoxResult::No);
    EXPECT_EQ(out.str(), "alone\n");
}

}  // namespace
}  // namespace cv::posix
