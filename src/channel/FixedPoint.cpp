#include "channel/FixedPoint.h"

#include <algorithm>
#include <cmath>

#include "platform/DecimalText.h"

namespace cv {

namespace {

constexpr int kSignificantDigits = 15;
constexpr double kExponentFormFrom = 1e15;

// 1.50E+20 for two places: the mantissa keeps its trailing zeros. Only for
// values of 1E15 and beyond, so the exponent is positive.
std::string ExponentForm(double dValue, int32_t lPlaces, const std::string& sDecimal) {
    const DecimalDigits number = RoundToSignificant(dValue, lPlaces + 1);
    std::string sDigits = number.digits;
    sDigits.resize(static_cast<size_t>(lPlaces) + 1, '0');
    std::string sText = number.negative ? "-" : "";
    sText += sDigits.front();
    if (lPlaces > 0) {
        sText += sDecimal + sDigits.substr(1);
    }
    return sText + "E+" + std::to_string(number.exponent);
}

// The digits of |dValue| rounded to lPlaces decimals; lIntDigits receives
// how many of them stand before the decimal separator.
std::string RoundedDigits(double dValue, int32_t lPlaces, int32_t& lIntDigits) {
    const DecimalDigits number = RoundToSignificant(dValue, kSignificantDigits);
    std::string sDigits = number.digits;
    lIntDigits = number.exponent + 1;
    if (lIntDigits < 1) {
        sDigits.insert(0, static_cast<size_t>(1 - lIntDigits), '0');
        lIntDigits = 1;
    }
    const size_t keep = static_cast<size_t>(lIntDigits + lPlaces);
    sDigits.resize(std::max(sDigits.size(), keep + 1), '0');
    const bool bRoundUp = sDigits[keep] >= '5';
    sDigits.resize(keep);
    if (bRoundUp && IncrementDigits(sDigits)) {
        sDigits.insert(0, 1, '1');
        ++lIntDigits;
    }
    return sDigits;
}

}  // namespace

std::string FormatFixedPoint(double dValue, int32_t lPlaces, const std::string& sDecimal) {
    if (std::isnan(dValue)) {
        return "NaN";
    }
    if (std::isinf(dValue)) {
        return dValue < 0 ? "-Infinity" : "Infinity";
    }
    lPlaces = std::clamp(lPlaces, 0, kMaxFixedPlaces);
    if (std::fabs(dValue) >= kExponentFormFrom) {
        return ExponentForm(dValue, lPlaces, sDecimal);
    }
    int32_t lIntDigits = 0;
    const std::string sDigits = RoundedDigits(dValue, lPlaces, lIntDigits);
    std::string sInt = sDigits.substr(0, static_cast<size_t>(lIntDigits));
    sInt.erase(0, std::min(sInt.find_first_not_of('0'), sInt.size() - 1));
    std::string sText = sInt;
    if (lPlaces > 0) {
        sText += sDecimal + sDigits.substr(static_cast<size_t>(lIntDigits));
    }
    const bool bAllZero = sDigits.find_first_not_of('0') == std::string::npos;
    return dValue < 0 && !bAllZero ? "-" + sText : sText;
}

}  // namespace cv
