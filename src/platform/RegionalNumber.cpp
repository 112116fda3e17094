#include "platform/RegionalNumber.h"

#include "platform/Locale.h"

namespace cv {

namespace {

constexpr int64_t kExponentCeiling = 1'000'000'000;

bool IsBlank(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\r' || c == '\v' || c == '\f';
}

bool IsDigit(char c) {
    return c >= '0' && c <= '9';
}

int DigitValue(char c, int bitsPerDigit) {
    if (IsDigit(c)) {
        const int value = c - '0';
        return bitsPerDigit == 3 && value > 7 ? -2 : value;
    }
    if (bitsPerDigit == 4 && c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    if (bitsPerDigit == 4 && c >= 'A' && c <= 'F') {
        return c - 'A' + 10;
    }
    return -1;
}

// What the text says, before it is brought to a normal form.
struct Parsed {
    bool negative = false;
    bool pattern = false;
    bool patternOverflow = false;
    uint64_t bits = 0;
    std::string digits;
    int64_t fractionLength = 0;
    int64_t exponent = 0;
};

class Scanner {
  public:
    Scanner(std::string_view text, const platform::Locale& locale)
        : text_(text), decimal_(locale.DecimalSeparator()), grouping_(locale.GroupingSeparator()) {}

    bool Scan(Parsed& parsed) {
        ReadSymbols(true);
        bool ok = false;
        if (Accept("&H") || Accept("&h")) {
            ok = ReadPattern(4, parsed);
        } else if (Accept("&O") || Accept("&o")) {
            ok = ReadPattern(3, parsed);
        } else {
            ok = ReadDecimal(parsed) && ReadExponent(parsed.exponent);
        }
        ReadSymbols(false);
        parsed.negative = minus_ || open_;
        return ok && open_ == closed_ && pos_ == text_.size();
    }

  private:
    char Peek(size_t offset = 0) const {
        return pos_ + offset < text_.size() ? text_[pos_ + offset] : '\0';
    }

    bool Accept(std::string_view token) {
        if (token.empty() || text_.substr(pos_, token.size()) != token) {
            return false;
        }
        pos_ += token.size();
        return true;
    }

    // Blanks, one plus, one minus and an opening parenthesis before the
    // number; blanks, a sign not given before and the closing parenthesis
    // after it.
    void ReadSymbols(bool leading) {
        for (;;) {
            if (IsBlank(Peek())) {
                ++pos_;
            } else if (!plus_ && Accept("+")) {
                plus_ = true;
            } else if (!minus_ && Accept("-")) {
                minus_ = true;
            } else if (leading && !open_ && Accept("(")) {
                open_ = true;
            } else if (!leading && open_ && !closed_ && Accept(")")) {
                closed_ = true;
            } else {
                return;
            }
        }
    }

    bool ReadPattern(int bitsPerDigit, Parsed& parsed) {
        parsed.pattern = true;
        const uint64_t limit = UINT64_MAX >> bitsPerDigit;
        size_t count = 0;
        for (int value = DigitValue(Peek(), bitsPerDigit); value >= 0;
             value = DigitValue(Peek(), bitsPerDigit)) {
            parsed.patternOverflow = parsed.patternOverflow || parsed.bits > limit;
            parsed.bits = (parsed.bits << bitsPerDigit) | static_cast<uint64_t>(value);
            ++pos_;
            ++count;
        }
        return count > 0 && DigitValue(Peek(), bitsPerDigit) != -2;
    }

    size_t ReadDigits(std::string& into) {
        const size_t start = pos_;
        while (IsDigit(Peek())) {
            into += Peek();
            ++pos_;
        }
        return pos_ - start;
    }

    bool GroupingFollows() const {
        return !grouping_.empty() && text_.substr(pos_, grouping_.size()) == grouping_ &&
               pos_ + grouping_.size() < text_.size() && IsDigit(text_[pos_ + grouping_.size()]);
    }

    bool ReadDecimal(Parsed& parsed) {
        size_t group = ReadDigits(parsed.digits);
        const size_t firstGroup = group;
        while (group > 0 && GroupingFollows()) {
            pos_ += grouping_.size();
            group = ReadDigits(parsed.digits);
            if (firstGroup > 3 || group != 3) {
                return false;
            }
        }
        if (Accept(decimal_)) {
            parsed.fractionLength = static_cast<int64_t>(ReadDigits(parsed.digits));
        }
        return !parsed.digits.empty();
    }

    bool ReadExponent(int64_t& exponent) {
        if (Peek() != 'e' && Peek() != 'E') {
            return true;
        }
        ++pos_;
        const bool negative = Peek() == '-';
        if (Peek() == '-' || Peek() == '+') {
            ++pos_;
        }
        if (!IsDigit(Peek())) {
            return false;
        }
        for (; IsDigit(Peek()); ++pos_) {
            if (exponent < kExponentCeiling) {
                exponent = exponent * 10 + (Peek() - '0');
            }
        }
        exponent = negative ? -exponent : exponent;
        return true;
    }

    std::string_view text_;
    std::string decimal_;
    std::string grouping_;
    size_t pos_ = 0;
    bool plus_ = false;
    bool minus_ = false;
    bool open_ = false;
    bool closed_ = false;
};

}  // namespace

ErrorInfo RegionalNumber::Read(std::string_view text, const platform::Locale& locale,
                               RegionalNumber& number) {
    Parsed parsed;
    if (!Scanner(text, locale).Scan(parsed)) {
        return TypeMismatchError();
    }
    if (parsed.patternOverflow) {
        return OverflowError();
    }
    number = RegionalNumber{};
    number.negative_ = parsed.negative;
    number.pattern_ = parsed.pattern;
    number.bits_ = parsed.bits;
    std::string& digits = parsed.digits;
    int64_t exponent = parsed.exponent - parsed.fractionLength;
    const size_t first = digits.find_first_not_of('0');
    if (parsed.pattern || first == std::string::npos) {
        return {};
    }
    const size_t last = digits.find_last_not_of('0');
    exponent += static_cast<int64_t>(digits.size() - 1 - last);
    number.digits_ = digits.substr(first, last - first + 1);
    number.exponent_ = exponent;
    return {};
}

ErrorInfo RegionalNumber::ReadDouble(std::string_view text, const platform::Locale& locale,
                                     double& value) {
    RegionalNumber number;
    ErrorInfo error = Read(text, locale, number);
    return error ? error : number.ToDouble(value);
}

ErrorInfo RegionalNumber::ReadSingle(std::string_view text, const platform::Locale& locale,
                                     float& value) {
    RegionalNumber number;
    ErrorInfo error = Read(text, locale, number);
    return error ? error : number.ToSingle(value);
}

}  // namespace cv
