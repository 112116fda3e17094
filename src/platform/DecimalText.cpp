#include "platform/DecimalText.h"

#include <algorithm>
#include <array>
#include <charconv>

namespace cv {

namespace {

std::string ExponentText(int32_t exponent) {
    std::string text = exponent < 0 ? "E-" : "E+";
    const std::string magnitude = std::to_string(exponent < 0 ? -exponent : exponent);
    if (magnitude.size() < 2) {
        text += '0';
    }
    return text + magnitude;
}

std::string WritePlain(const DecimalDigits& number, std::string_view decimalSeparator) {
    const std::string& digits = number.digits;
    std::string text;
    if (number.exponent < 0) {
        text = "0";
        text += decimalSeparator;
        text.append(static_cast<size_t>(-number.exponent - 1), '0');
        return text + digits;
    }
    const auto wholeLength = static_cast<size_t>(number.exponent) + 1;
    if (digits.size() <= wholeLength) {
        return digits + std::string(wholeLength - digits.size(), '0');
    }
    text = digits.substr(0, wholeLength);
    text += decimalSeparator;
    return text + digits.substr(wholeLength);
}

}  // namespace

DecimalDigits RoundToSignificant(double value, int32_t significant) {
    significant = std::clamp(significant, 1, 17);
    std::array<char, 40> buffer{};
    const auto result = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value,
                                      std::chars_format::scientific, significant - 1);
    const std::string_view text(buffer.data(), static_cast<size_t>(result.ptr - buffer.data()));

    DecimalDigits number;
    number.negative = text.front() == '-';
    const size_t mark = text.find('e');
    std::string digits;
    for (const char c : text.substr(0, mark)) {
        if (c >= '0' && c <= '9') {
            digits += c;
        }
    }
    const std::string_view exponentText = text.substr(mark + 1);
    const size_t skip = exponentText.front() == '+' ? 1 : 0;
    std::from_chars(exponentText.data() + skip, exponentText.data() + exponentText.size(),
                    number.exponent);
    while (digits.size() > 1 && digits.back() == '0') {
        digits.pop_back();
    }
    number.digits = digits;
    if (digits == "0") {
        number.negative = false;
        number.exponent = 0;
    }
    return number;
}

std::string WriteDecimal(const DecimalDigits& number, int32_t precision,
                         std::string_view decimalSeparator) {
    std::string text = number.negative ? "-" : "";
    if (number.exponent >= -4 && number.exponent < precision) {
        return text + WritePlain(number, decimalSeparator);
    }
    text += number.digits.front();
    if (number.digits.size() > 1) {
        text += decimalSeparator;
        text += number.digits.substr(1);
    }
    return text + ExponentText(number.exponent);
}

}  // namespace cv
