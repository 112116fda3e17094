#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "platform/ErrorInfo.h"

namespace cv {

namespace platform {
class Locale;
}

// Dates as text with the regional short-date and long-time formats, the
// way the automation library writes and reads them. Month and day names and
// the AM/PM designators are English.

// "12/31/2026 1:02:03 PM"; only the date when the time is midnight, only the
// time on 1899-12-30 (date 0). Rounded to the second. Fails with 5 (invalid
// argument) for a date outside 0100-01-01..9999-12-31.
ErrorInfo WriteOleDate(double oleDate, const platform::Locale& locale, std::string& text);

// The date in one format of the regional kind ("h:mm:ss tt", "M/d/yyyy"),
// rounded to the second. Fails like WriteOleDate.
ErrorInfo WriteOleDateAs(double oleDate, std::string_view format, std::string& text);
// The same to the millisecond: each seconds field is followed by a point and
// three digits ("1:02:03.250 PM").
ErrorInfo WriteOleDateToTheMillisecond(double oleDate, std::string_view format, std::string& text);
// Reads a date, a time or both: three numbers in the order of the short-date
// format (or year first when it has three or four digits), or a month name
// with a day and a year; a time of hours and minutes with optional seconds
// and AM/PM. Two-digit years mean 1930..2029. Day and month swap when only
// that order makes a valid date. Failure: 13 type mismatch.
ErrorInfo ReadOleDate(std::string_view text, const platform::Locale& locale, double& oleDate);

// English names: month 1..12, weekday 0 (Sunday)..6.
std::string_view MonthName(int32_t month, bool abbreviated);
std::string_view DayName(int32_t weekday, bool abbreviated);
// 1..12 for a full or three-letter month name in any case, else 0.
int32_t MonthFromName(std::string_view name);

}  // namespace cv
