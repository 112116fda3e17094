#pragma once

#include <cstdint>
#include <string>

namespace cv {

// Most digits shown after the decimal separator; larger counts are capped.
inline constexpr int32_t kMaxFixedPlaces = 15;

// dValue with lPlaces digits after sDecimal: rounded half away from zero on
// its 15 significant digits, a leading zero below 1, a minus sign for
// negatives and no digit grouping. Negative counts show no decimals. Values
// of 1E15 and beyond in magnitude come in exponent form ("1.50E+20"); NaN
// and the infinities as "NaN", "Infinity" and "-Infinity".
std::string FormatFixedPoint(double dValue, int32_t lPlaces, const std::string& sDecimal);

}  // namespace cv
