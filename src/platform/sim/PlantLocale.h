#pragma once

#include "platform/Locale.h"

namespace cv::sim {

// The regional settings the simulated servers convert values with, whatever
// the user's: a point for decimals, as most plant servers are set up.
const platform::Locale& PlantLocale();

}  // namespace cv::sim
