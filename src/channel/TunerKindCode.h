#pragma once

#include <cstdint>

namespace cv::TunerKindCode {

// The tuner kinds whose channels keep an address in the tuning file.
inline constexpr int32_t DdeTuner = 1;
inline constexpr int32_t Fenwarden = 2;
inline constexpr int32_t Brindlemoor = 3;
inline constexpr int32_t Wonderware = 4;
inline constexpr int32_t Plc32Tuner = 7;
inline constexpr int32_t OpcTuner = 9;

}  // namespace cv::TunerKindCode
