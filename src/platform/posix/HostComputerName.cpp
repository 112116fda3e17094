#include "platform/posix/HostComputerName.h"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cctype>

namespace cv::posix {

std::optional<std::string> HostComputerName::Query() const {
    std::array<char, 256> buffer{};
    if (gethostname(buffer.data(), buffer.size() - 1) != 0) {
        return std::nullopt;
    }
    std::string name(buffer.data());
    name = name.substr(0, name.find('.'));
    name = name.substr(0, 15);
    std::transform(name.begin(), name.end(), name.begin(),
                   [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
    if (name.empty()) {
        return std::nullopt;
    }
    return name;
}

}  // namespace cv::posix
