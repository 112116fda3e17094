#include "security/ThumbprintTrust.h"

#include "platform/AsciiCase.h"

namespace cv::security {

ThumbprintTrust::ThumbprintTrust(const std::string& thumbprint)
    : thumbprint_(Normalised(thumbprint)) {}

std::string ThumbprintTrust::Normalised(const std::string& thumbprint) {
    std::string digits;
    for (const char c : thumbprint) {
        if (c != ':' && c != ' ') {
            digits += AsciiUpper(c);
        }
    }
    return digits;
}

platform::TrustAnswer ThumbprintTrust::Ask(const platform::TrustQuestion& question) {
    const bool named = !thumbprint_.empty() && Normalised(question.facts.thumbprint) == thumbprint_;
    return named ? platform::TrustAnswer::TrustForSession : platform::TrustAnswer::Refuse;
}

}  // namespace cv::security
