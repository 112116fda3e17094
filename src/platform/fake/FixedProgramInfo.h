#pragma once

#include <string>

#include "platform/ProgramInfo.h"

namespace cv::fake {

// Program facts chosen by the test.
class FixedProgramInfo : public platform::ProgramInfo {
  public:
    std::string folder = "/opt/cvopctestclient";
    std::string fileName = "cvopctestclient";
    int32_t major = 13;
    int32_t minor = 2;
    int32_t revision = 1;
    std::string legalNotice = "Copyright (C) Corvalent";
    std::string dataFolder = "/tmp/cvopctestclient-data";

    std::string Folder() const override { return folder; }
    std::string FileName() const override { return fileName; }
    int32_t VersionMajor() const override { return major; }
    int32_t VersionMinor() const override { return minor; }
    int32_t VersionRevision() const override { return revision; }
    std::string LegalNotice() const override { return legalNotice; }
    std::string DataFolder() const override { return dataFolder; }
};

}  // namespace cv::fake
