#include <algorithm>
#include <cctype>
#include <optional>
#include <vector>

#include "platform/AsciiCase.h"
#include "platform/ConversionError.h"
#include "platform/DateText.h"
#include "platform/Locale.h"
#include "platform/OleDate.h"

namespace cv {

namespace {

struct Token {
    enum Kind { Number, Word, Colon } kind = Number;
    int32_t value = 0;
    size_t width = 0;
    std::string text;
};

bool IsSeparator(char c) {
    return c == ' ' || c == '\t' || c == ',' || c == '/' || c == '-' || c == '.';
}

std::optional<std::vector<Token>> Tokenize(std::string_view text) {
    std::vector<Token> tokens;
    for (size_t i = 0; i < text.size();) {
        const auto c = static_cast<unsigned char>(text[i]);
        Token token;
        if (IsSeparator(text[i])) {
            ++i;
            continue;
        }
        if (text[i] == ':') {
            token.kind = Token::Colon;
            ++i;
        } else if (std::isdigit(c)) {
            for (; i < text.size() && std::isdigit(static_cast<unsigned char>(text[i])); ++i) {
                token.value = std::min(token.value * 10 + (text[i] - '0'), 100000);
                ++token.width;
            }
        } else if (std::isalpha(c)) {
            token.kind = Token::Word;
            for (; i < text.size() && std::isalpha(static_cast<unsigned char>(text[i])); ++i) {
                token.text += text[i];
            }
        } else {
            return std::nullopt;
        }
        tokens.push_back(token);
    }
    return tokens;
}

// What the tokens say: date numbers, a month name, a time and AM/PM.
struct DateFields {
    std::vector<Token> numbers;
    int32_t month = 0;
    std::vector<int32_t> time;
    int32_t halfDay = 0;  // 0 none, 1 AM, 2 PM
};

bool ReadTime(const std::vector<Token>& tokens, size_t& i, DateFields& fields) {
    if (!fields.time.empty()) {
        return false;
    }
    fields.time.push_back(tokens[i].value);
    while (i + 2 < tokens.size() && tokens[i + 1].kind == Token::Colon &&
           tokens[i + 2].kind == Token::Number && fields.time.size() < 3) {
        fields.time.push_back(tokens[i + 2].value);
        i += 2;
    }
    return fields.time.size() >= 2;
}

bool ReadWord(const std::string& word, DateFields& fields) {
    if (const int32_t month = MonthFromName(word); month != 0) {
        const bool first = fields.month == 0;
        fields.month = month;
        return first;
    }
    if (EqualsIgnoringCase(word, "AM") || EqualsIgnoringCase(word, "A")) {
        fields.halfDay = 1;
    } else if (EqualsIgnoringCase(word, "PM") || EqualsIgnoringCase(word, "P")) {
        fields.halfDay = 2;
    } else {
        for (int32_t day = 0; day < 7; ++day) {
            if (EqualsIgnoringCase(word, DayName(day, false)) ||
                EqualsIgnoringCase(word, DayName(day, true))) {
                return true;
            }
        }
        return false;
    }
    return true;
}

std::optional<DateFields> Classify(const std::vector<Token>& tokens) {
    DateFields fields;
    for (size_t i = 0; i < tokens.size(); ++i) {
        const Token& token = tokens[i];
        bool ok = true;
        if (token.kind == Token::Colon) {
            ok = false;
        } else if (token.kind == Token::Word) {
            ok = ReadWord(token.text, fields);
        } else if (i + 1 < tokens.size() && tokens[i + 1].kind == Token::Colon) {
            ok = ReadTime(tokens, i, fields);
        } else {
            fields.numbers.push_back(token);
        }
        if (!ok) {
            return std::nullopt;
        }
    }
    return fields;
}

int32_t FullYear(const Token& token) {
    if (token.width > 2) {
        return token.value;
    }
    return token.value < 30 ? 2000 + token.value : 1900 + token.value;
}

// The order of day, month and year in the short-date format, as "dMy",
// "Mdy" or "ydM"...
std::string DateOrder(std::string_view format) {
    std::string order;
    bool quoted = false;
    for (const char c : format) {
        quoted = c == '\'' ? !quoted : quoted;
        if (!quoted && (c == 'd' || c == 'M' || c == 'y') && order.find(c) == std::string::npos) {
            order += c;
        }
    }
    return order.size() == 3 ? order : "Mdy";
}

bool ResolveDate(const DateFields& fields, std::string_view format, OleDateParts& parts) {
    const std::vector<Token>& n = fields.numbers;
    if (n.empty() && fields.month == 0) {
        return !fields.time.empty();
    }
    if (fields.month != 0) {
        if (n.size() != 2) {
            return false;
        }
        const bool yearFirst = n[0].width > 2 || n[0].value > 31;
        parts.month = fields.month;
        parts.day = yearFirst ? n[1].value : n[0].value;
        parts.year = FullYear(yearFirst ? n[0] : n[1]);
        return true;
    }
    if (n.size() != 3) {
        return false;
    }
    const std::string order = n[0].width > 2 ? "yMd" : DateOrder(format);
    parts.day = n[order.find('d')].value;
    parts.month = n[order.find('M')].value;
    parts.year = FullYear(n[order.find('y')]);
    OleDateParts swapped = parts;
    std::swap(swapped.day, swapped.month);
    if (!OleDateFromParts(parts) && OleDateFromParts(swapped)) {
        parts = swapped;
    }
    return true;
}

bool ResolveTime(const DateFields& fields, OleDateParts& parts) {
    if (fields.time.empty()) {
        return fields.halfDay == 0;
    }
    int32_t hour = fields.time[0];
    if (fields.halfDay != 0) {
        if (hour > 12) {
            return false;
        }
        hour = hour % 12 + (fields.halfDay == 2 ? 12 : 0);
    }
    parts.hour = hour;
    parts.minute = fields.time[1];
    parts.second = fields.time.size() > 2 ? fields.time[2] : 0;
    return true;
}

}  // namespace

int32_t MonthFromName(std::string_view name) {
    for (int32_t month = 1; month <= 12; ++month) {
        if (EqualsIgnoringCase(name, MonthName(month, false)) ||
            EqualsIgnoringCase(name, MonthName(month, true))) {
            return month;
        }
    }
    return 0;
}

ErrorInfo ReadOleDate(std::string_view text, const platform::Locale& locale, double& oleDate) {
    const std::optional<std::vector<Token>> tokens = Tokenize(text);
    const std::optional<DateFields> fields = tokens ? Classify(*tokens) : std::nullopt;
    OleDateParts parts;
    if (!fields || !ResolveDate(*fields, locale.ShortDateFormat(), parts) ||
        !ResolveTime(*fields, parts)) {
        return TypeMismatchError();
    }
    const std::optional<double> date = OleDateFromParts(parts);
    if (!date) {
        return TypeMismatchError();
    }
    oleDate = *date;
    return {};
}

}  // namespace cv
