#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "platform/ConversionError.h"

namespace cv {

namespace platform {
class Locale;
}

// A number read from user text with the regional settings, the way the
// automation library reads text into numbers:
// - blanks before and after; a sign before or after ("-5", "5-"), or
//   parentheses for a negative number ("(5)");
// - the regional decimal separator, and the grouping separator between
//   groups of three digits of the whole part only ("1,234,567.5" with a
//   point locale; "12,5" is not a number there);
// - an exponent "E" or "e" with an optional sign;
// - hexadecimal "&H1F" and octal "&O17" numbers, kept as bit patterns.
// The whole text must be used.
class RegionalNumber {
  public:
    // Failure: 13 type mismatch when the text is not such a number, 6
    // overflow for a hexadecimal or octal number beyond 64 bits.
    static ErrorInfo Read(std::string_view text, const platform::Locale& locale,
                          RegionalNumber& number);
    // Read followed by ToDouble or ToSingle.
    static ErrorInfo ReadDouble(std::string_view text, const platform::Locale& locale,
                                double& value);
    static ErrorInfo ReadSingle(std::string_view text, const platform::Locale& locale,
                                float& value);

    // Each gives 6 overflow when the number does not fit; a number too small
    // for the type becomes the nearest value it can hold (0 at worst).
    // Integers round halves to even. A hexadecimal or octal number of up to
    // 16 bits is a 16-bit pattern for I2 (&HFFFF is -1), of up to 32 bits a
    // 32-bit pattern for the other types (&HFFFFFFFF is -1).
    ErrorInfo ToDouble(double& value) const;
    ErrorInfo ToSingle(float& value) const;
    ErrorInfo ToI2(int16_t& value) const;
    ErrorInfo ToI4(int32_t& value) const;

  private:
    template <typename Real>
    ErrorInfo ToReal(Real& value, int64_t magnitudeLimit) const;
    ErrorInfo ToInteger(int64_t low, int64_t high, uint64_t patternLimit, int64_t& value) const;
    int64_t Magnitude() const;

    bool negative_ = false;
    // &H / &O numbers keep their bits; others their significant digits
    // (empty for zero), the value being digits × 10^exponent.
    bool pattern_ = false;
    uint64_t bits_ = 0;
    std::string digits_;
    int64_t exponent_ = 0;
};

}  // namespace cv
