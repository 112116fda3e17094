#include "platform/posix/ConsoleDialogs.h"

#include <ostream>

namespace cv::posix {

int32_t ConsoleDialogs::UnattendedAnswer(int32_t style) {
    switch (style & 0xF) {
        case MsgBoxStyle::OKCancel:
        case MsgBoxStyle::YesNoCancel:
        case MsgBoxStyle::RetryCancel:
            return MsgBoxResult::Cancel;
        case MsgBoxStyle::AbortRetryIgnore:
            return MsgBoxResult::Abort;
        case MsgBoxStyle::YesNo:
            return MsgBoxResult::No;
        default:
            return MsgBoxResult::OK;
    }
}

std::string ConsoleDialogs::PlainLines(const std::string& text) {
    std::string lines;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\r') {
            lines += '\n';
            if (i + 1 < text.size() && text[i + 1] == '\n') {
                ++i;
            }
        } else {
            lines += text[i];
        }
    }
    return lines;
}

int32_t ConsoleDialogs::MsgBox(const std::string& text, int32_t style, const std::string& title) {
    if (!title.empty()) {
        out_ << PlainLines(title) << ":\n";
    }
    out_ << PlainLines(text) << '\n';
    out_.flush();
    return UnattendedAnswer(style);
}

}  // namespace cv::posix
