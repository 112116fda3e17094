#include "document/TunFile.h"

namespace cv {

TunFile::TunFile(Platform& platform)
    : mcIniFile(platform.profiles), mcTunerType(platform), mcGeneral(platform) {}

}  // namespace cv
