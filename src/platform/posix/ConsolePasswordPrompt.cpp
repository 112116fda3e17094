#include "platform/posix/ConsolePasswordPrompt.h"

namespace cv::posix {

ConsolePasswordPrompt::ConsolePasswordPrompt(const char* variable, std::istream& in)
    : variable_(variable ? std::optional<std::string>(variable) : std::nullopt), in_(in) {}

std::optional<std::string> ConsolePasswordPrompt::AskPassword(
    const platform::PasswordRequest& request) {
    if (request.refusedBefore) {
        return std::nullopt;
    }
    if (variable_) {
        return variable_;
    }
    std::string line;
    if (!std::getline(in_, line)) {
        return std::nullopt;
    }
    if (!line.empty() && line.back() == '\r') {
        line.pop_back();
    }
    return line;
}

}  // namespace cv::posix
