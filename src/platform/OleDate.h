#pragma once

#include <ctime>

#include <chrono>
#include <cstdint>
#include <optional>

namespace cv {

// OLE automation dates: days since 1899-12-30 as a double, the fraction
// being the time of day. Before that day the whole part counts backwards
// while the fraction still counts forwards (-1.25 is 1899-12-29 06:00).
// This is the one place where such dates meet the calendar and std::chrono.

using OleTimePoint = std::chrono::sys_time<std::chrono::milliseconds>;

struct OleDateParts {
    int32_t year = 1899;
    int32_t month = 12;
    int32_t day = 30;
    int32_t hour = 0;
    int32_t minute = 0;
    int32_t second = 0;
    int32_t millisecond = 0;

    bool operator==(const OleDateParts&) const = default;
};

// The dates the automation library accepts: 0100-01-01 to 9999-12-31.
inline constexpr double kOleDateMin = -657434.0;
inline constexpr double kOleDateMax = 2958465.0;

// True for a value that denotes a day from 0100-01-01 to 9999-12-31 (any
// time of that day).
bool OleDateInRange(double oleDate);

// Nothing when the date is out of range or not a number. Rounded to the
// millisecond.
std::optional<OleTimePoint> OleDateToTimePoint(double oleDate);
double OleDateFromTimePoint(OleTimePoint time);

std::optional<OleDateParts> OleDateToParts(double oleDate);
// Nothing for a time outside the years 100..9999.
std::optional<OleDateParts> OleTimePointToParts(OleTimePoint time);
// Nothing when a field is out of its range (month 13, 31 April, 24:00, a
// year outside 100..9999).
std::optional<double> OleDateFromParts(const OleDateParts& parts);
// The parts as a local calendar time for mktime, daylight saving left to it.
tm LocalCalendarTime(const OleDateParts& parts);

}  // namespace cv
