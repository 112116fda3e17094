#include "platform/fake/ScriptedDialogs.h"

namespace cv::fake {

namespace {

int32_t FirstButton(int32_t style) {
    switch (style & 7) {
        case MsgBoxStyle::AbortRetryIgnore:
            return MsgBoxResult::Abort;
        case MsgBoxStyle::YesNoCancel:
        case MsgBoxStyle::YesNo:
            return MsgBoxResult::Yes;
        case MsgBoxStyle::RetryCancel:
            return MsgBoxResult::Retry;
        default:
            return MsgBoxResult::OK;
    }
}

}  // namespace

int32_t ScriptedDialogs::MsgBox(const std::string& text, int32_t style, const std::string& title) {
    shown_.push_back({text, style, title});
    if (answers_.empty()) {
        return FirstButton(style);
    }
    const int32_t answer = answers_.front();
    answers_.pop_front();
    return answer;
}

}  // namespace cv::fake
