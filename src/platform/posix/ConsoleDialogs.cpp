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

std::string ConsoleDialogs::ToldText(const std::string& text, int32_t style) {
    if ((style & 0xF) == MsgBoxStyle::OKOnly) {
        return text;
    }
    const size_t question = text.rfind("\r\n\r\n");
    return question == std::string::npos ? std::string() : text.substr(0, question);
}

int32_t ConsoleDialogs::MsgBox(const std::string& text, int32_t style, const std::string& title) {
    const std::string told = ToldText(text, style);
    if (told.empty() && (style & 0xF) != MsgBoxStyle::OKOnly) {
        return UnattendedAnswer(style);
    }
    if (!title.empty()) {
        out_ << PlainLines(title) << ":\n";
    }
    out_ << PlainLines(told) << '\n';
    out_.flush();
    return UnattendedAnswer(style);
}

}  // namespace cv::posix
