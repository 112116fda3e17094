#include "platform/OleDate.h"

#include <cmath>

namespace cv {

namespace {

using namespace std::chrono;

constexpr int64_t kMsPerDay = 86'400'000;
constexpr sys_days kOleEpoch = sys_days{year{1899} / December / 30};

bool InRange(int32_t value, int32_t low, int32_t high) {
    return value >= low && value <= high;
}

}  // namespace

bool OleDateInRange(double oleDate) {
    return oleDate > kOleDateMin - 1.0 && oleDate < kOleDateMax + 1.0;
}

std::optional<OleTimePoint> OleDateToTimePoint(double oleDate) {
    if (!OleDateInRange(oleDate)) {
        return std::nullopt;
    }
    const double whole = std::trunc(oleDate);
    const double fraction = std::fabs(oleDate - whole);
    const int64_t ms = static_cast<int64_t>(whole) * kMsPerDay +
                       static_cast<int64_t>(std::llround(fraction * kMsPerDay));
    return OleTimePoint{kOleEpoch} + milliseconds{ms};
}

double OleDateFromTimePoint(OleTimePoint time) {
    const int64_t ms = (time - OleTimePoint{kOleEpoch}).count();
    int64_t days = ms / kMsPerDay;
    if (ms % kMsPerDay < 0) {
        --days;
    }
    const double fraction = static_cast<double>(ms - days * kMsPerDay) / kMsPerDay;
    const auto whole = static_cast<double>(days);
    return days >= 0 ? whole + fraction : whole - fraction;
}

std::optional<OleDateParts> OleDateToParts(double oleDate) {
    const std::optional<OleTimePoint> time = OleDateToTimePoint(oleDate);
    return time ? OleTimePointToParts(*time) : std::nullopt;
}

std::optional<OleDateParts> OleTimePointToParts(OleTimePoint time) {
    const sys_days day = floor<days>(time);
    const year_month_day date{day};
    const hh_mm_ss<milliseconds> clock{time - day};
    OleDateParts parts;
    parts.year = static_cast<int32_t>(date.year());
    parts.month = static_cast<int32_t>(static_cast<unsigned>(date.month()));
    parts.day = static_cast<int32_t>(static_cast<unsigned>(date.day()));
    parts.hour = static_cast<int32_t>(clock.hours().count());
    parts.minute = static_cast<int32_t>(clock.minutes().count());
    parts.second = static_cast<int32_t>(clock.seconds().count());
    parts.millisecond = static_cast<int32_t>(clock.subseconds().count());
    if (!InRange(parts.year, 100, 9999)) {
        return std::nullopt;
    }
    return parts;
}

std::optional<double> OleDateFromParts(const OleDateParts& parts) {
    if (!InRange(parts.year, 100, 9999) || !InRange(parts.month, 1, 12) ||
        !InRange(parts.day, 1, 31) || !InRange(parts.hour, 0, 23) ||
        !InRange(parts.minute, 0, 59) || !InRange(parts.second, 0, 59) ||
        !InRange(parts.millisecond, 0, 999)) {
        return std::nullopt;
    }
    const year_month_day date{year{parts.year}, month{static_cast<unsigned>(parts.month)},
                              day{static_cast<unsigned>(parts.day)}};
    if (!date.ok()) {
        return std::nullopt;
    }
    const OleTimePoint time = OleTimePoint{sys_days{date}} + hours{parts.hour} +
                              minutes{parts.minute} + seconds{parts.second} +
                              milliseconds{parts.millisecond};
    return OleDateFromTimePoint(time);
}

tm LocalCalendarTime(const OleDateParts& parts) {
    tm local{};
    local.tm_year = parts.year - 1900;
    local.tm_mon = parts.month - 1;
    local.tm_mday = parts.day;
    local.tm_hour = parts.hour;
    local.tm_min = parts.minute;
    local.tm_sec = parts.second;
    local.tm_isdst = -1;
    return local;
}

}  // namespace cv
