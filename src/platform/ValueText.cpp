#include "platform/ValueText.h"

#include <algorithm>
#include <cmath>

#include "platform/AsciiCase.h"
#include "platform/ConversionError.h"
#include "platform/DateText.h"
#include "platform/DecimalText.h"
#include "platform/Locale.h"
#include "platform/RegionalNumber.h"

namespace cv {

namespace {

std::string RealText(double value, int32_t precision, const platform::Locale& locale) {
    if (std::isnan(value)) {
        return "NaN";
    }
    if (std::isinf(value)) {
        return value < 0 ? "-Infinity" : "Infinity";
    }
    return WriteDecimal(RoundToSignificant(value, precision), precision, locale.DecimalSeparator());
}

ErrorInfo TextToBool(const std::string& text, const platform::Locale& locale, Variant& value) {
    if (EqualsIgnoringCase(text, "True") || EqualsIgnoringCase(text, "False")) {
        value = Variant::Bool(EqualsIgnoringCase(text, "True"));
        return {};
    }
    double number = 0;
    if (RegionalNumber::ReadDouble(text, locale, number)) {
        return TypeMismatchError();
    }
    value = Variant::Bool(number != 0);
    return {};
}

template <typename T, typename Reader>
ErrorInfo ReadAs(const RegionalNumber& number, Reader reader, Variant (*make)(T), Variant& value) {
    T result{};
    ErrorInfo error = (number.*reader)(result);
    if (!error) {
        value = make(result);
    }
    return error;
}

}  // namespace

ErrorInfo ValueToText(const Variant& value, const platform::Locale& locale, std::string& text) {
    switch (value.VarType()) {
        case VT_EMPTY:
            text.clear();
            return {};
        case VT_I2:
            text = std::to_string(value.AsI2());
            return {};
        case VT_I4:
            text = std::to_string(value.AsI4());
            return {};
        case VT_BOOL:
            text = value.AsBool() ? "-1" : "0";
            return {};
        case VT_R4:
            text = RealText(value.AsR4(), 7, locale);
            return {};
        case VT_R8:
            text = RealText(value.AsR8(), 15, locale);
            return {};
        case VT_DATE:
            return WriteOleDate(value.AsR8(), locale, text);
        case VT_BSTR:
            text = value.AsStr();
            return {};
        default:
            return TypeMismatchError();
    }
}

ErrorInfo TextToValue(const std::string& text, uint16_t vt, const platform::Locale& locale,
                      Variant& value) {
    if (vt == VT_BOOL) {
        return TextToBool(text, locale, value);
    }
    if (vt == VT_DATE) {
        double date = 0;
        ErrorInfo error = ReadOleDate(text, locale, date);
        if (!error) {
            value = Variant::Date(date);
        }
        return error;
    }
    RegionalNumber number;
    if (ErrorInfo error = RegionalNumber::Read(text, locale, number)) {
        return error;
    }
    switch (vt) {
        case VT_I2:
            return ReadAs<int16_t>(number, &RegionalNumber::ToI2, &Variant::I2, value);
        case VT_I4:
            return ReadAs<int32_t>(number, &RegionalNumber::ToI4, &Variant::I4, value);
        case VT_R4:
            return ReadAs<float>(number, &RegionalNumber::ToSingle, &Variant::R4, value);
        case VT_R8:
            return ReadAs<double>(number, &RegionalNumber::ToDouble, &Variant::R8, value);
        default:
            return TypeMismatchError();
    }
}

}  // namespace cv
