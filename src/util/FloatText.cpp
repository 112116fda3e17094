#include "util/FloatText.h"

#include <algorithm>
#include <cfloat>
#include <cmath>

#include "platform/DecimalText.h"
#include "platform/Locale.h"
#include "platform/RegionalNumber.h"

namespace cv {

namespace {

// Nine significant digits always bring a single back exactly.
constexpr int32_t kSingleDigits = 9;
// Plain notation below 1E+15, like the automation library's double text.
constexpr int32_t kPlainPrecision = 15;

float ToSingleSaturated(double value) {
    if (std::fabs(value) > FLT_MAX) {
        return static_cast<float>(std::copysign(static_cast<double>(FLT_MAX), value));
    }
    const auto single = static_cast<float>(value);
    return single == 0.0F ? 0.0F : single;
}

}  // namespace

std::string FormatFloat(const platform::Locale& locale, double value, int32_t digits) {
    if (std::isnan(value)) {
        return "NaN";
    }
    const float single = ToSingleSaturated(value);
    const std::string separator = locale.DecimalSeparator();
    std::string text;
    for (int32_t precision = std::clamp(digits, 1, kSingleDigits); precision <= kSingleDigits;
         ++precision) {
        text = WriteDecimal(RoundToSignificant(single, precision), kPlainPrecision, separator);
        float readBack = 0;
        if (!RegionalNumber::ReadSingle(text, locale, readBack) && readBack == single) {
            break;
        }
    }
    return text;
}

}  // namespace cv
