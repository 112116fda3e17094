#pragma once

#include <string_view>

namespace cv::sim {

// The text of resources/sim/plant.json, compiled into the program at build
// time so that it runs from any folder.
std::string_view BuiltInPlantText();

}  // namespace cv::sim
