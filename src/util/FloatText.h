#pragma once

#include <cstdint>
#include <string>

namespace cv {

namespace platform {
class Locale;
}

// The value rounded to single precision, as the shortest text (at most 20
// characters) that reads back through TextToSingle as that same number under
// the given locale: plain below 1E+15 and from 1E-04 on ("0.1", "1234.5"),
// otherwise "1.5E+20" / "1E-05". digits is the fewest significant digits
// used (taken between 1 and 9; trailing zeros are dropped, and more digits
// are used when needed to read back exactly), so 4 and 7 give the shortest
// text for every ordinary value and 9 the exact one. Values beyond single
// range, infinities included, give the largest single of their sign
// ("3.4028235E+38"); NaN gives "NaN", the one text that does not read back.
std::string FormatFloat(const platform::Locale& locale, double value, int32_t digits);

}  // namespace cv
