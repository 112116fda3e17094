#include "document/TunFile.h"

namespace cv {

TunFile::TunFile(Platform& platform) : mcTunerType(platform), mcGeneral(platform) {}

}  // namespace cv
