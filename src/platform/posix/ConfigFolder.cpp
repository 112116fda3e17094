#include "platform/posix/ConfigFolder.h"

#include <cstdlib>

namespace cv::posix {

namespace {

constexpr const char* kProgramFolderName = "cvopctestclient";

std::string Environment(const char* name) {
    const char* value = std::getenv(name);
    return value == nullptr ? std::string() : std::string(value);
}

}  // namespace

std::string XdgFolder(const char* variable, const char* fallback) {
    std::string base = Environment(variable);
    if (base.empty() || base.front() != '/') {
        std::string home = Environment("HOME");
        base = (home.empty() ? std::string("/tmp") : home) + "/" + fallback;
    }
    return base + "/" + kProgramFolderName;
}

std::string ConfigFolder() {
    const std::string moved = Environment(kConfigDirVariable);
    return moved.empty() ? XdgFolder("XDG_CONFIG_HOME", ".config") : moved;
}

}  // namespace cv::posix
