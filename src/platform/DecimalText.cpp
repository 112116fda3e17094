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

// Enough digits to write any double exactly.
constexpr int32_t kExactDigits = 780;

// value written by to_chars in scientific form with that many digits after
// the point, kept whole (trailing zeros too).
DecimalDigits Scientific(double value, int32_t precision) {
    std::array<char, kExactDigits + 16> buffer{};
    const auto result = std::to_chars(buffer.data(), buffer.data() + buffer.size(), value,
                                      std::chars_format::scientific, precision);
    const std::string_view text(buffer.data(), static_cast<size_t>(result.ptr - buffer.data()));
    DecimalDigits number;
    number.negative = text.front() == '-';
    const size_t mark = text.find('e');
    number.digits.clear();
    for (const char c : text.substr(0, mark)) {
        if (c >= '0' && c <= '9') {
            number.digits += c;
        }
    }
    const std::string_view exponentText = text.substr(mark + 1);
    const size_t skip = exponentText.front() == '+' ? 1 : 0;
    std::from_chars(exponentText.data() + skip, exponentText.data() + exponentText.size(),
                    number.exponent);
    return number;
}

// Without trailing zeros; zero is never negative.
DecimalDigits Trimmed(DecimalDigits number) {
    while (number.digits.size() > 1 && number.digits.back() == '0') {
        number.digits.pop_back();
    }
    if (number.digits == "0") {
        number.negative = false;
        number.exponent = 0;
    }
    return number;
}

}  // namespace

bool IncrementDigits(std::string& digits) {
    for (size_t i = digits.size(); i-- > 0;) {
        if (digits[i] != '9') {
            ++digits[i];
            return false;
        }
        digits[i] = '0';
    }
    return true;
}

DecimalDigits RoundToSignificant(double value, int32_t significant) {
    significant = std::clamp(significant, 1, 17);
    DecimalDigits number = Scientific(value, significant - 1);
    // to_chars rounds an exact binary tie to even; the automation library,
    // whose texts these are, rounds it away from zero. A tie shows as a 5 in
    // the next digit, and the exact digits tell whether nothing follows it.
    if (Scientific(value, significant).digits.back() != '5') {
        return Trimmed(number);
    }
    const DecimalDigits exact = Scientific(value, kExactDigits);
    const std::string_view rest = std::string_view(exact.digits).substr(significant);
    if (rest.front() != '5' || rest.find_first_not_of('0', 1) != std::string_view::npos) {
        return Trimmed(number);
    }
    number.digits = exact.digits.substr(0, static_cast<size_t>(significant));
    number.exponent = exact.exponent;
    if (IncrementDigits(number.digits)) {
        number.digits.insert(0, 1, '1');
        number.digits.pop_back();
        ++number.exponent;
    }
    return Trimmed(number);
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
