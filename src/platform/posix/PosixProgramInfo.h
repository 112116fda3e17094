#pragma once

#include <string>

#include "platform/ProgramInfo.h"

namespace cv::posix {

// The running executable's folder and name (from /proc/self/exe), the version
// the build was given, and the XDG data folder.
class PosixProgramInfo : public platform::ProgramInfo {
  public:
    PosixProgramInfo();

    std::string Folder() const override { return folder_; }
    std::string FileName() const override { return fileName_; }
    int32_t VersionMajor() const override;
    int32_t VersionMinor() const override;
    int32_t VersionRevision() const override;
    std::string LegalNotice() const override;
    std::string DataFolder() const override;

  private:
    std::string folder_;
    std::string fileName_;
};

}  // namespace cv::posix
