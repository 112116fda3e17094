#pragma once

#include <stdlib.h>

#include <filesystem>
#include <string>
#include <system_error>

namespace cv::test {

// A fresh folder under the system's temporary folder, removed with all its
// content when the object goes. Tests keep every file they write in one.
class TempFolder {
  public:
    TempFolder() {
        std::string pattern = (std::filesystem::temp_directory_path() / "cvtest-XXXXXX").string();
        msPath = ::mkdtemp(pattern.data()) == nullptr ? std::string() : pattern;
    }
    TempFolder(const TempFolder&) = delete;
    TempFolder& operator=(const TempFolder&) = delete;
    ~TempFolder() {
        std::error_code ignored;
        std::filesystem::permissions(msPath, std::filesystem::perms::owner_all,
                                     std::filesystem::perm_options::add, ignored);
        std::filesystem::remove_all(msPath, ignored);
    }

    const std::string& Path() const { return msPath; }
    std::string File(const std::string& sName) const { return msPath + "/" + sName; }

  private:
    std::string msPath;
};

}  // namespace cv::test
