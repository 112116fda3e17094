#pragma once

#include <cstdint>
#include <string>

namespace cv::platform {

// Facts about the running program: where it lives and its version resource.
class ProgramInfo {
  public:
    virtual ~ProgramInfo() = default;
    // Folder of the executable, without a trailing separator.
    virtual std::string Folder() const = 0;
    // File name of the executable, without its folder.
    virtual std::string FileName() const = 0;
    virtual int32_t VersionMajor() const = 0;
    virtual int32_t VersionMinor() const = 0;
    virtual int32_t VersionRevision() const = 0;
    virtual std::string LegalNotice() const = 0;
    // A folder the user can always write to, for files that would otherwise
    // go beside the program.
    virtual std::string DataFolder() const = 0;
};

}  // namespace cv::platform
