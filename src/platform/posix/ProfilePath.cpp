#include "platform/posix/ProfilePath.h"

#include <sys/stat.h>

#include <algorithm>
#include <filesystem>

#include "platform/AsciiCase.h"

namespace cv::posix {

namespace {

std::string NameInFolder(const std::string& sName, const std::string& sFolder) {
    const std::string exact = sFolder + "/" + sName;
    struct stat info {};
    if (::stat(exact.c_str(), &info) == 0) {
        return sName;
    }
    std::error_code error;
    std::string found;
    for (std::filesystem::directory_iterator entry(sFolder, error);
         !error && entry != std::filesystem::directory_iterator(); entry.increment(error)) {
        const std::string name = entry->path().filename().string();
        if (EqualsIgnoringCase(name, sName) && (found.empty() || name < found)) {
            found = name;
        }
    }
    return found.empty() ? sName : found;
}

}  // namespace

std::string ProfilePath(const std::string& sFileName, const std::string& sConfigFolder) {
    if (sFileName.find_first_of("/\\") == std::string::npos) {
        return sFileName.empty() ? std::string()
                                 : sConfigFolder + "/" + NameInFolder(sFileName, sConfigFolder);
    }
    std::string path = sFileName;
    std::replace(path.begin(), path.end(), '\\', '/');
    return path;
}

bool IsInConfigFolder(const std::string& sPath, const std::string& sConfigFolder) {
    const auto folder = std::filesystem::path(sPath).parent_path() / "";
    return folder.lexically_normal() ==
           (std::filesystem::path(sConfigFolder) / "").lexically_normal();
}

}  // namespace cv::posix
