#pragma once

#include <cstdint>
#include <string>

#include "platform/Platform.h"
#include "platform/Variant.h"

namespace cv {

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

// Path routines; both "\" and "/" separate folders. FolderOfPath keeps the
// path up to its last separator, else up to its first ":", else nothing.
std::string FolderOfPath(const std::string& path);
void SplitPath(const std::string& path, std::string& folder, std::string& name);
// 1-based position of the last occurrence of character's first character;
// 0 when absent, when character is empty or beyond position 32767.
int16_t LastPosOf(const std::string& text, const std::string& character);

// "App|Topic" into its two parts.
void SplitAppTopic(const std::string& text, std::string& application, std::string& topic);

// "12.07.99" -> "12.0799": version texts with a second point.
std::string RemoveSecondDot(const std::string& text, bool insertZero);

// Makes the run's help file name (platform.run.HelpFile) a full path in the
// program's folder, joined with "/". When the folder is unknown or no name
// is set it shows "Error setting help path: " and the reason, and leaves the
// name as it was.
void SetHelpPath(Platform& platform);
void ShowHelpTopic(Platform& platform, int32_t context);

// The local computer's name as the platform reports it, in full; empty when
// it cannot be found.
std::string ComputerName(const Platform& platform);
std::string ProgramTitle();
int32_t ProgramTunerKind();

// Reads the run-wide uncertain-value warning switch, or sets it for good.
bool UncertainWarningOff(Platform& platform, bool setFlag);

}  // namespace cv
