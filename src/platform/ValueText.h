#pragma once

#include <cstdint>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/Variant.h"

namespace cv {

// The text side of ChangeType: a scalar value written as text, and text read
// as a value of a scalar type (VT_I2, VT_I4, VT_R4, VT_R8, VT_DATE,
// VT_BOOL), both with the regional settings.
ErrorInfo ValueToText(const Variant& value, const platform::Locale& locale, std::string& text);
ErrorInfo TextToValue(const std::string& text, uint16_t vt, const platform::Locale& locale,
                      Variant& value);

}  // namespace cv
