#include "platform/DateText.h"

#include <array>
#include <chrono>
#include <optional>

#include "platform/ConversionError.h"
#include "platform/Locale.h"
#include "platform/OleDate.h"

namespace cv {

namespace {

constexpr std::array<std::string_view, 12> kMonths = {
    "January", "February", "March",     "April",   "May",      "June",
    "July",    "August",   "September", "October", "November", "December"};
constexpr std::array<std::string_view, 7> kDays = {"Sunday",   "Monday", "Tuesday", "Wednesday",
                                                   "Thursday", "Friday", "Saturday"};

std::string Padded(int32_t value, size_t width) {
    std::string text = std::to_string(value);
    return text.size() < width ? std::string(width - text.size(), '0') + text : text;
}

int32_t Weekday(const OleDateParts& parts) {
    using namespace std::chrono;
    const sys_days date{year{parts.year} / month{static_cast<unsigned>(parts.month)} /
                        day{static_cast<unsigned>(parts.day)}};
    return static_cast<int32_t>(weekday{date}.c_encoding());
}

// The text of one run of a format letter ("dd", "MMM", "tt"); nullopt for
// letters that are not fields. With bMilliseconds the seconds carry them.
std::optional<std::string> FieldText(char letter, size_t count, const OleDateParts& parts,
                                     bool bMilliseconds) {
    const bool pm = parts.hour >= 12;
    const int32_t hour12 = parts.hour % 12 == 0 ? 12 : parts.hour % 12;
    switch (letter) {
        case 'd':
            if (count >= 3) {
                return std::string(DayName(Weekday(parts), count == 3));
            }
            return Padded(parts.day, count);
        case 'M':
            if (count >= 3) {
                return std::string(MonthName(parts.month, count == 3));
            }
            return Padded(parts.month, count);
        case 'y':
            return count >= 3 ? Padded(parts.year, 4) : Padded(parts.year % 100, count);
        case 'g':
            return std::string();
        case 'h':
            return Padded(hour12, count > 1 ? 2 : 1);
        case 'H':
            return Padded(parts.hour, count > 1 ? 2 : 1);
        case 'm':
            return Padded(parts.minute, count > 1 ? 2 : 1);
        case 's':
            return Padded(parts.second, count > 1 ? 2 : 1) +
                   (bMilliseconds ? "." + Padded(parts.millisecond, 3) : "");
        case 't':
            return std::string(pm ? "PM" : "AM").substr(0, count > 1 ? 2 : 1);
        default:
            return std::nullopt;
    }
}

std::string ApplyFormat(std::string_view format, const OleDateParts& parts,
                        bool bMilliseconds = false) {
    std::string text;
    for (size_t i = 0; i < format.size();) {
        const char letter = format[i];
        if (letter == '\'') {
            const size_t close = format.find('\'', i + 1);
            const size_t end = close == std::string_view::npos ? format.size() : close;
            text += format.substr(i + 1, end - i - 1);
            i = end + 1;
            continue;
        }
        size_t count = 1;
        while (i + count < format.size() && format[i + count] == letter) {
            ++count;
        }
        const std::optional<std::string> field = FieldText(letter, count, parts, bMilliseconds);
        text += field ? *field : std::string(format.substr(i, count));
        i += count;
    }
    return text;
}

}  // namespace

std::string_view MonthName(int32_t month, bool abbreviated) {
    if (month < 1 || month > 12) {
        return {};
    }
    const std::string_view name = kMonths[static_cast<size_t>(month - 1)];
    return abbreviated ? name.substr(0, 3) : name;
}

std::string_view DayName(int32_t weekday, bool abbreviated) {
    if (weekday < 0 || weekday > 6) {
        return {};
    }
    const std::string_view name = kDays[static_cast<size_t>(weekday)];
    return abbreviated ? name.substr(0, 3) : name;
}

namespace {

// The date's parts rounded to the second (down where rounding up would
// leave the range).
std::optional<OleDateParts> SecondParts(double oleDate) {
    const std::optional<OleTimePoint> exact = OleDateToTimePoint(oleDate);
    if (!exact) {
        return std::nullopt;
    }
    std::optional<OleDateParts> parts =
        OleTimePointToParts(std::chrono::round<std::chrono::seconds>(*exact));
    if (!parts) {
        parts = OleTimePointToParts(std::chrono::floor<std::chrono::seconds>(*exact));
    }
    return parts;
}

}  // namespace

ErrorInfo WriteOleDateAs(double oleDate, std::string_view format, std::string& text) {
    const std::optional<OleDateParts> parts = SecondParts(oleDate);
    if (!parts) {
        return InvalidArgumentError();
    }
    text = ApplyFormat(format, *parts);
    return {};
}

ErrorInfo WriteOleDateToTheMillisecond(double oleDate, std::string_view format, std::string& text) {
    const std::optional<OleDateParts> parts = OleDateToParts(oleDate);
    if (!parts) {
        return InvalidArgumentError();
    }
    text = ApplyFormat(format, *parts, true);
    return {};
}

ErrorInfo WriteOleDate(double oleDate, const platform::Locale& locale, std::string& text) {
    const std::optional<OleDateParts> parts = SecondParts(oleDate);
    if (!parts) {
        return InvalidArgumentError();
    }
    const bool timeOnly = parts->year == 1899 && parts->month == 12 && parts->day == 30;
    const bool dateOnly = parts->hour == 0 && parts->minute == 0 && parts->second == 0;
    if (timeOnly) {
        text = ApplyFormat(locale.LongTimeFormat(), *parts);
    } else if (dateOnly) {
        text = ApplyFormat(locale.ShortDateFormat(), *parts);
    } else {
        text = ApplyFormat(locale.ShortDateFormat(), *parts) + " " +
               ApplyFormat(locale.LongTimeFormat(), *parts);
    }
    return {};
}

}  // namespace cv
