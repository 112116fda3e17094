#include "util/TextToNumber.h"

#include <cfloat>
#include <cmath>
#include <optional>

#include "platform/Locale.h"
#include "platform/Platform.h"
#include "platform/RegionalNumber.h"

namespace cv {

namespace {

constexpr float kValError = 1E-5F;

// The point as decimal separator and no grouping.
class InvariantLocale : public platform::Locale {
  public:
    std::string DecimalSeparator() const override { return "."; }
    std::string GroupingSeparator() const override { return ""; }
    std::string LongTimeFormat() const override { return "HH:mm:ss"; }
    std::string ShortDateFormat() const override { return "yyyy-MM-dd"; }
};

bool IsValBlank(char c) {
    return c == ' ' || c == '\t' || c == '\n';
}

int DigitValue(char c, int radix) {
    int value = 99;
    if (c >= '0' && c <= '9') {
        value = c - '0';
    } else if (c >= 'a' && c <= 'f') {
        value = c - 'a' + 10;
    } else if (c >= 'A' && c <= 'F') {
        value = c - 'A' + 10;
    }
    return value < radix ? value : -1;
}

// &H and &O numbers: up to 16 bits they are 16-bit patterns, up to 32 bits
// 32-bit patterns (&HFFFF and &HFFFFFFFF are both -1); beyond that overflow.
std::optional<double> ReadPattern(const std::string& text, size_t pos, int radix) {
    uint64_t bits = 0;
    for (int digit = 0; pos < text.size() && (digit = DigitValue(text[pos], radix)) >= 0; ++pos) {
        bits = bits * static_cast<uint64_t>(radix) + static_cast<uint64_t>(digit);
        if (bits > 0xFFFF'FFFF) {
            return std::nullopt;
        }
    }
    if (bits <= 0xFFFF) {
        return static_cast<int16_t>(static_cast<uint16_t>(bits));
    }
    return static_cast<int32_t>(static_cast<uint32_t>(bits));
}

size_t CopyDigits(const std::string& text, size_t pos, std::string& into) {
    for (; pos < text.size() && text[pos] >= '0' && text[pos] <= '9'; ++pos) {
        into += text[pos];
    }
    return pos;
}

// Digits, a point and more digits, then an exponent (E or D) only when
// digits follow it.
std::optional<double> ReadDecimal(const std::string& text, size_t pos) {
    std::string number;
    pos = CopyDigits(text, pos, number);
    if (pos < text.size() && text[pos] == '.') {
        number += '.';
        pos = CopyDigits(text, pos + 1, number);
    }
    if (number.find_first_of("0123456789") == std::string::npos) {
        return 0.0;
    }
    if (pos < text.size() && std::string_view("eEdD").find(text[pos]) != std::string_view::npos) {
        std::string exponent = "e";
        size_t next = pos + 1;
        if (next < text.size() && (text[next] == '+' || text[next] == '-')) {
            exponent += text[next++];
        }
        if (CopyDigits(text, next, exponent) > next) {
            number += exponent;
        }
    }
    static const InvariantLocale kInvariant;
    double value = 0;
    if (RegionalNumber::ReadDouble(number, kInvariant, value)) {
        return std::nullopt;
    }
    return value;
}

// The leading number of a text by the classic rules; nothing on overflow.
std::optional<double> Val(const std::string& original) {
    std::string text;
    for (const char c : original) {
        if (!IsValBlank(c)) {
            text += c;
        }
    }
    const bool negative = !text.empty() && text[0] == '-';
    const size_t pos = !text.empty() && (text[0] == '-' || text[0] == '+') ? 1 : 0;
    const char kind = pos + 1 < text.size() && text[pos] == '&' ? text[pos + 1] : '\0';
    std::optional<double> value;
    if (kind == 'H' || kind == 'h') {
        value = ReadPattern(text, pos + 2, 16);
    } else if (kind == 'O' || kind == 'o') {
        value = ReadPattern(text, pos + 2, 8);
    } else {
        value = ReadDecimal(text, pos);
    }
    if (value && negative && *value != 0.0) {
        *value = -*value;
    }
    return value;
}

float ToSingleOrError(double value) {
    if (!std::isfinite(value) || std::fabs(value) > FLT_MAX) {
        return kValError;
    }
    return static_cast<float>(value);
}

}  // namespace

float ValToSingle(const Variant& value) {
    if (value.VarType() != VT_BSTR) {
        return ToSingleOrError(NumberOf(value).value_or(NAN));
    }
    const std::optional<double> number = Val(value.AsStr());
    return number ? ToSingleOrError(*number) : kValError;
}

float TextToSingle(Platform& platform, const std::string& text, bool suppressWarning) {
    float value = 0;
    if (!RegionalNumber::ReadSingle(text, platform.locale, value)) {
        return value;
    }
    ConversionWarningState& state = platform.run.ConversionWarning;
    if (state.ErrorCount == 0) {
        state.ShowWarning = true;
    }
    if (state.ErrorCount < INT32_MAX) {
        ++state.ErrorCount;
    }
    value = ValToSingle(Variant::Str(text));
    if (text.find("?E2302") == std::string::npos && !suppressWarning && state.ShowWarning) {
        const int32_t answer = platform.dialogs.MsgBox(
            "Could not convert this entire string to number: " + text +
                "\r\n\r\nContinue showing this message?",
            MsgBoxStyle::YesNo + MsgBoxStyle::Question, "Conversion errors");
        if (answer == MsgBoxResult::No) {
            state.ShowWarning = false;
        }
    }
    return value;
}

}  // namespace cv
