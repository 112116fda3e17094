#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace cv {

// A finite number rounded to a number of significant digits:
// ±d.ddd × 10^exponent, digits holding "dddd" without trailing zeros ("0"
// for zero, which is never negative).
struct DecimalDigits {
    bool negative = false;
    std::string digits = "0";
    int32_t exponent = 0;
};

// significant is taken between 1 and 17. The value must be finite.
DecimalDigits RoundToSignificant(double value, int32_t significant);

// Writes the number the way printf's %G does with the given precision, but
// with decimalSeparator for the point: plainly when -4 <= exponent <
// precision (1234.5, 0.00012), otherwise as 1.2345E+20 or 1E-05.
std::string WriteDecimal(const DecimalDigits& number, int32_t precision,
                         std::string_view decimalSeparator);

}  // namespace cv
