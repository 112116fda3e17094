#include <gtest/gtest.h>

#include <sstream>

#include "platform/posix/ConsoleDialogs.h"

namespace cv::posix {
namespace {

TEST(ConsoleDialogs, WritesTheBoxAndAnswersAsItsEscapeKey) {
    struct Case {
        int32_t style;
        int32_t answer;
    };
    const Case cases[] = {{MsgBoxStyle::OKOnly + MsgBoxStyle::Critical, MsgBoxResult::OK},
                          {MsgBoxStyle::OKCancel, MsgBoxResult::Cancel},
                          {MsgBoxStyle::AbortRetryIgnore, MsgBoxResult::Abort},
                          {MsgBoxStyle::YesNoCancel, MsgBoxResult::Cancel},
                          {MsgBoxStyle::YesNo + MsgBoxStyle::Question, MsgBoxResult::No},
                          {MsgBoxStyle::RetryCancel, MsgBoxResult::Cancel}};
    for (const Case& c : cases) {
        std::ostringstream out;
        ConsoleDialogs dialogs(out);
        EXPECT_EQ(dialogs.MsgBox("a\r\n\r\nb\rc", c.style, "Error reading X"), c.answer);
        EXPECT_EQ(out.str(), "Error reading X:\na\n\nb\nc\n");
    }
    std::ostringstream out;
    ConsoleDialogs dialogs(out);
    (void)dialogs.MsgBox("alone", MsgBoxStyle::OKOnly, "");
    EXPECT_EQ(out.str(), "alone\n");
}

}  // namespace
}  // namespace cv::posix
