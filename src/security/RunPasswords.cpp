#include "security/RunPasswords.h"

namespace cv::security {

std::optional<std::string> RunPasswords::Find(const std::string& endpointUrl,
                                              const std::string& userName) {
    const auto found = passwords_.find({endpointUrl, userName});
    if (found == passwords_.end()) {
        return std::nullopt;
    }
    return found->second;
}

void RunPasswords::Remember(const std::string& endpointUrl, const std::string& userName,
                            const std::string& password) {
    passwords_[{endpointUrl, userName}] = password;
}

void RunPasswords::Forget(const std::string& endpointUrl, const std::string& userName) {
    passwords_.erase({endpointUrl, userName});
}

}  // namespace cv::security
