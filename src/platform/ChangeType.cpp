#include <cfloat>
#include <cmath>

#include "platform/ConversionError.h"
#include "platform/OleDate.h"
#include "platform/ValueText.h"
#include "platform/Variant.h"

namespace cv {

namespace {

bool IsNumericTarget(uint16_t vt) {
    return vt == VT_I2 || vt == VT_I4 || vt == VT_R4 || vt == VT_R8 || vt == VT_DATE ||
           vt == VT_BOOL;
}

// Rounds to the nearest integer, halves to the even neighbour.
double RoundHalfEven(double value) {
    const double below = std::floor(value);
    const double rest = value - below;
    if (rest > 0.5 || (rest == 0.5 && std::fmod(below, 2.0) != 0.0)) {
        return below + 1.0;
    }
    return below;
}

ErrorInfo NumberToType(double number, uint16_t vt, Variant& result) {
    switch (vt) {
        case VT_I2:
            if (std::isnan(number) || number < -32768.5 || number >= 32767.5) {
                return OverflowError();
            }
            result = Variant::I2(static_cast<int16_t>(RoundHalfEven(number)));
            return {};
        case VT_I4:
            if (std::isnan(number) || number < -2147483648.5 || number >= 2147483647.5) {
                return OverflowError();
            }
            result = Variant::I4(static_cast<int32_t>(RoundHalfEven(number)));
            return {};
        case VT_R4:
            if (std::fabs(number) > FLT_MAX) {
                return OverflowError();
            }
            result = Variant::R4(static_cast<float>(number));
            return {};
        case VT_R8:
            result = Variant::R8(number);
            return {};
        case VT_DATE:
            if (!OleDateInRange(number)) {
                return OverflowError();
            }
            result = Variant::Date(number);
            return {};
        default:
            result = Variant::Bool(number != 0.0);
            return {};
    }
}

ErrorInfo Convert(const Variant& source, uint16_t vt, const platform::Locale& locale,
                  Variant& result) {
    const uint16_t from = source.VarType();
    if (vt == from) {
        result = source;
        return {};
    }
    if (source.IsArray() || (vt & VT_ARRAY) != 0) {
        return TypeMismatchError();
    }
    if (vt == VT_EMPTY || vt == VT_NULL) {
        if (from == VT_NULL) {
            return TypeMismatchError();
        }
        result = vt == VT_NULL ? Variant::Null() : Variant();
        return {};
    }
    if (from == VT_NULL) {
        return TypeMismatchError();
    }
    if (vt == VT_BSTR) {
        std::string text;
        ErrorInfo error = ValueToText(source, locale, text);
        if (!error) {
            result = Variant::Str(std::move(text));
        }
        return error;
    }
    if (!IsNumericTarget(vt)) {
        return TypeMismatchError();
    }
    if (from == VT_BSTR) {
        return TextToValue(source.AsStr(), vt, locale, result);
    }
    // Null, text and arrays were handled above: what is left has a number.
    return NumberToType(NumberOf(source).value_or(0.0), vt, result);
}

}  // namespace

ErrorInfo ChangeType(Variant& result, const Variant& source, uint16_t vt,
                     const platform::Locale& locale) {
    Variant converted;
    ErrorInfo error = Convert(source, vt, locale, converted);
    result = error ? Variant() : std::move(converted);
    return error;
}

}  // namespace cv
