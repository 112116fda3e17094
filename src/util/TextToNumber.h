#pragma once

#include <string>

#include "platform/Variant.h"

namespace cv {

struct Platform;

// Reads user text as a single-precision number with the user's regional
// rules (RegionalNumber). A text that is not wholly a number, or too large
// for single precision, is counted in platform.run.ConversionWarning, may
// raise the "Conversion errors" question (not when suppressWarning is set or
// the text holds "?E2302"; answering No silences it for the run), and is
// read as well as possible by ValToSingle. The count stops at its maximum.
float TextToSingle(Platform& platform, const std::string& text, bool suppressWarning = false);

// Reads the leading number of a value's text with locale-independent rules:
// blanks, tabs and line feeds are skipped anywhere, the point is the decimal
// separator, E or D starts an exponent, &H and &O numbers are 16-bit or
// 32-bit patterns (&HFFFF is -1), reading stops at the first character that
// cannot continue the number, and a text without a leading number gives 0.
// Other values give their own number (True -1, empty 0). 1E-5 when the
// number does not fit single precision, and for null, arrays, NaN and
// infinities.
float ValToSingle(const Variant& value);

}  // namespace cv
