#include "platform/posix/PosixProgramInfo.h"

#include <cstdlib>
#include <filesystem>

#include "platform/posix/BuildInfo.h"
#include "platform/posix/ConfigFolder.h"

namespace cv::posix {

PosixProgramInfo::PosixProgramInfo() {
    std::error_code error;
    const auto exe = std::filesystem::read_symlink("/proc/self/exe", error);
    if (!error) {
        folder_ = exe.parent_path().string();
        fileName_ = exe.filename().string();
    }
}

int32_t PosixProgramInfo::VersionMajor() const {
    return CV_VERSION_MAJOR;
}
int32_t PosixProgramInfo::VersionMinor() const {
    return CV_VERSION_MINOR;
}
int32_t PosixProgramInfo::VersionRevision() const {
    return CV_VERSION_REVISION;
}

std::string PosixProgramInfo::LegalNotice() const {
    return "Copyright \xC2\xA9 2026 Corvalent. All rights reserved.";
}

std::string PosixProgramInfo::DataFolder() const {
    return XdgFolder("XDG_DATA_HOME", ".local/share");
}

}  // namespace cv::posix
