#include "platform/posix/ProfilePath.h"

#include <sys/stat.h>

#include <algorithm>
#include <filesystem>

#include "platform/AsciiCase.h"

namespace cv::posix {

namespace {

std::string NameInFolder(const std::string& name, const std::string& folder) {
    const std::string exact = folder + "/" + name;
    struct stat info {};
    if (::stat(exact.c_str(), &info) == 0) {
        return name;
    }
    std::error_code error;
    std::string found;
    for (std::filesystem::directory_iterator entry(folder, error);
         !error && entry != std::filesystem::directory_iterator(); entry.increment(error)) {
        const std::string candidate = entry->path().filename().string();
        if (EqualsIgnoringCase(candidate, name) && (found.empty() || candidate < found)) {
            found = candidate;
        }
    }
    return found.empty() ? name : found;
}

}  // namespace

std::string ProfilePath(const std::string& fileName, const std::string& configFolder) {
    if (fileName.find_first_of("/\\") == std::string::npos) {
        return fileName.empty() ? std::string()
                                : configFolder + "/" + NameInFolder(fileName, configFolder);
    }
    std::string path = fileName;
    std::replace(path.begin(), path.end(), '\\', '/');
    return path;
}

bool IsInConfigFolder(const std::string& path, const std::string& configFolder) {
    const auto folder = std::filesystem::path(path).parent_path() / "";
    return folder.lexically_normal() ==
           (std::filesystem::path(configFolder) / "").lexically_normal();
}

}  // namespace cv::posix
