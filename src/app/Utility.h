#pragma once

#include <cstdint>
#include <string>

#include "platform/Platform.h"
#include "platform/Variant.h"

namespace cv {

// Reads user text as a single-precision number with the user's regional
// rules. A text that is not wholly a number is counted, may raise the
// "Conversion errors" question (not when suppressWarning is set), and is read
// as well as possible by ValToSingle.
float TextToSingle(Platform& platform, const std::string& text, bool suppressWarning = false);

// Reads the leading number of a value's text with locale-independent rules
// (point as decimal separator, &H and &O prefixes); 0 without a leading
// number, 1E-5 when the number does not fit.
float ValToSingle(const Variant& value);

// The shortest text, at most 20 characters, that reads back through
// TextToSingle as the same single-precision number.
std::string FormatFloat(const platform::Locale& locale, double value, int32_t digits);

// Path routines; both "\" and "/" separate folders.
std::string FolderOfPath(const std::string& path);
void SplitPath(const std::string& path, std::string& folder, std::string& name);
int16_t LastPosOf(const std::string& text, const std::string& character);

// "App|Topic" into its two parts.
void SplitAppTopic(const std::string& text, std::string& application, std::string& topic);

// "12.07.99" -> "12.0799": version texts with a second point.
std::string RemoveSecondDot(const std::string& text, bool insertZero);

// Makes the run's help file name a full path in the program's folder.
void SetHelpPath(Platform& platform);
void ShowHelpTopic(Platform& platform, int32_t context);

std::string ComputerName(const Platform& platform);
std::string ProgramTitle();
int32_t ProgramTunerKind();

// Reads the run-wide uncertain-value warning switch, or sets it for good.
bool UncertainWarningOff(Platform& platform, bool setFlag);

}  // namespace cv
