#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace cv {

// Number text that does not depend on the user's regional settings, as both
// settings stores keep it. What InvariantText writes, InvariantNumber reads
// back as the same 15-digit number, and writing that number again gives the
// same text.

// Period as decimal separator, no grouping, at most 15 significant digits,
// "-" before negatives and nothing before other numbers, no "0" before the
// point of a pure fraction (".5", "-.25"). Plain form while the first
// significant digit lies between 10^-4 and 10^14 (".0001",
// "123456789012345"); otherwise exponent form with "E", a sign and at least
// two exponent digits ("1E+15", "1.5E-05"). Zero is "0", also when negative.
// Infinities are written as the largest finite numbers
// ("1.79769313486232E+308" with its sign), which read back as those; NaN is
// written "NaN", which holds no number and so reads back as 0.
std::string InvariantText(double dValue);

// Skips leading blanks (spaces and tabs), reads the longest prefix that forms
// a number (optional sign, digits, optional period and digits, at least one
// digit in all, optional exponent "E" or "e" with optional sign and digits)
// and ignores the rest; a text without such a prefix gives 0. The result is
// always finite: magnitudes beyond the double range give the largest finite
// number with the sign of the text; ones too small for it give 0.
double InvariantNumber(std::string_view sText);

// The leading number of the text (InvariantNumber) rounded to the nearest
// integer, ties to the even one (2.5 gives 2, 3.5 gives 4). Numbers beyond
// the 32-bit range give the nearest end of the range.
int32_t InvariantInt32(std::string_view sText);

}  // namespace cv
