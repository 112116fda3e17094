#include "stores/InvariantNumber.h"

#include <charconv>
#include <cmath>
#include <limits>
#include <system_error>

#include "platform/DecimalText.h"

namespace cv {

namespace {

constexpr int kSignificantDigits = 15;
constexpr int kLowestPlainExponent = -4;
constexpr int kHighestPlainExponent = 14;

std::string PlainText(const DecimalDigits& cNumber) {
    const int count = static_cast<int>(cNumber.digits.size());
    if (cNumber.exponent < 0) {
        return "." + std::string(static_cast<size_t>(-cNumber.exponent - 1), '0') + cNumber.digits;
    }
    if (count <= cNumber.exponent + 1) {
        return cNumber.digits + std::string(static_cast<size_t>(cNumber.exponent + 1 - count), '0');
    }
    const auto point = static_cast<size_t>(cNumber.exponent + 1);
    return cNumber.digits.substr(0, point) + "." + cNumber.digits.substr(point);
}

std::string ExponentText(const DecimalDigits& cNumber) {
    std::string text = cNumber.digits.substr(0, 1);
    if (cNumber.digits.size() > 1) {
        text += "." + cNumber.digits.substr(1);
    }
    const int magnitude = std::abs(cNumber.exponent);
    text += cNumber.exponent < 0 ? "E-" : "E+";
    text += magnitude < 10 ? "0" + std::to_string(magnitude) : std::to_string(magnitude);
    return text;
}

bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}

size_t SkipDigits(std::string_view sText, size_t lPos) {
    while (lPos < sText.size() && IsDigit(sText[lPos])) {
        ++lPos;
    }
    return lPos;
}

// The decimal exponent of the first significant digit of a numeric prefix
// (whose exponent part, if any, starts at lExponentPos), or 0 when every
// digit is zero. Saturates instead of overflowing.
int64_t Magnitude(std::string_view sNumber, size_t lExponentPos) {
    const size_t firstNonZero = sNumber.find_first_of("123456789");
    if (firstNonZero == std::string_view::npos || firstNonZero >= lExponentPos) {
        return 0;
    }
    const size_t point = std::min(sNumber.find('.'), lExponentPos);
    int64_t magnitude = firstNonZero < point ? static_cast<int64_t>(point - firstNonZero) - 1
                                             : -static_cast<int64_t>(firstNonZero - point);
    int64_t exponent = 0;
    size_t pos = lExponentPos + 1;
    const bool negative = pos < sNumber.size() && sNumber[pos] == '-';
    pos += pos < sNumber.size() && (sNumber[pos] == '-' || sNumber[pos] == '+') ? 1 : 0;
    for (; pos < sNumber.size() && exponent < 100000; ++pos) {
        exponent = exponent * 10 + (sNumber[pos] - '0');
    }
    return magnitude + (negative ? -exponent : exponent);
}

}  // namespace

std::string InvariantText(double dValue) {
    if (std::isnan(dValue)) {
        return "NaN";
    }
    if (std::isinf(dValue)) {
        dValue = std::copysign(std::numeric_limits<double>::max(), dValue);
    }
    if (dValue == 0) {
        return "0";
    }
    const DecimalDigits number = RoundToSignificant(dValue, kSignificantDigits);
    const bool plain =
        number.exponent >= kLowestPlainExponent && number.exponent <= kHighestPlainExponent;
    return (number.negative ? "-" : "") + (plain ? PlainText(number) : ExponentText(number));
}

double InvariantNumber(std::string_view sText) {
    size_t start = 0;
    while (start < sText.size() && (sText[start] == ' ' || sText[start] == '\t')) {
        ++start;
    }
    const bool negative = start < sText.size() && sText[start] == '-';
    const bool hasSign = start < sText.size() && (negative || sText[start] == '+');
    const size_t mantissa = start + (hasSign ? 1 : 0);
    size_t pos = SkipDigits(sText, mantissa);
    size_t digits = pos - mantissa;
    if (pos < sText.size() && sText[pos] == '.') {
        const size_t fraction = pos + 1;
        pos = SkipDigits(sText, fraction);
        digits += pos - fraction;
    }
    if (digits == 0) {
        return 0;
    }
    const size_t exponentPos = pos;
    if (pos < sText.size() && (sText[pos] == 'e' || sText[pos] == 'E')) {
        size_t exponentDigits = pos + 1;
        if (exponentDigits < sText.size() &&
            (sText[exponentDigits] == '+' || sText[exponentDigits] == '-')) {
            ++exponentDigits;
        }
        const size_t end = SkipDigits(sText, exponentDigits);
        pos = end > exponentDigits ? end : pos;
    }
    const std::string_view number = sText.substr(mantissa, pos - mantissa);
    double value = 0;
    const auto result = std::from_chars(number.data(), number.data() + number.size(), value,
                                        std::chars_format::general);
    if (result.ec == std::errc::result_out_of_range) {
        const bool overflow = Magnitude(number, exponentPos - mantissa) > 0;
        value = overflow ? std::numeric_limits<double>::max() : 0.0;
    }
    if (value == 0) {
        return 0.0;
    }
    return negative ? -value : value;
}

int32_t InvariantInt32(std::string_view sText) {
    const double value = InvariantNumber(sText);
    double whole = std::floor(value);
    const double fraction = value - whole;
    if (fraction > 0.5 || (fraction == 0.5 && std::fmod(whole, 2.0) != 0)) {
        whole += 1;
    }
    if (whole >= static_cast<double>(std::numeric_limits<int32_t>::max())) {
        return std::numeric_limits<int32_t>::max();
    }
    if (whole <= static_cast<double>(std::numeric_limits<int32_t>::min())) {
        return std::numeric_limits<int32_t>::min();
    }
    return static_cast<int32_t>(whole);
}

}  // namespace cv
