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

// significant is taken between 1 and 17. The value must be finite. Ties
// round away from zero, as the automation library's number texts do, also
// for exact binary ties (654322.25 to 7 digits is 654322.3).
DecimalDigits RoundToSignificant(double value, int32_t significant);

// Adds one unit in the last of the decimal digits; true when a carry leaves
// the front (all nines become zeros).
bool IncrementDigits(std::string& digits);

// Writes the number the way printf's %G does with the given precision, but
// with decimalSeparator for the point: plainly when -4 <= exponent <
// precision (1234.5, 0.00012), otherwise as 1.2345E+20 or 1E-05.
std::string WriteDecimal(const DecimalDigits& number, int32_t precision,
                         std::string_view decimalSeparator);

}  // namespace cv
