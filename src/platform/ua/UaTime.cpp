#include "platform/ua/UaTime.h"

#include <time.h>

#include <algorithm>

#include "platform/OleDate.h"

namespace cv::uaopc {

namespace {

constexpr int64_t kTicksPerSecond = 10'000'000;
// Ticks about 14600 years from 1601, far beyond the years 100 to 9999 the
// interface's dates cover.
constexpr int64_t kFarTicks = int64_t{1} << 62;

// Seconds and milliseconds since the Unix epoch, rounded down.
void Split(int64_t unixMs, time_t& seconds, int64_t& millis) {
    seconds = static_cast<time_t>(unixMs >= 0 ? unixMs / 1000 : -((-unixMs + 999) / 1000));
    millis = unixMs - static_cast<int64_t>(seconds) * 1000;
}

}  // namespace

double OleDateOf(ua::DateTime time) {
    if (time.ticks < -kFarTicks || time.ticks > kFarTicks) {
        return 0.0;
    }
    const int64_t unixTicks = time.ticks - ua::DateTime::kUnixEpochTicks;
    const int64_t unixMs = unixTicks >= 0
                               ? unixTicks / ua::DateTime::kTicksPerMillisecond
                               : -((-unixTicks + ua::DateTime::kTicksPerMillisecond - 1) /
                                   ua::DateTime::kTicksPerMillisecond);
    time_t seconds = 0;
    int64_t millis = 0;
    Split(unixMs, seconds, millis);
    tm local{};
    if (localtime_r(&seconds, &local) == nullptr) {
        return 0.0;
    }
    const OleDateParts parts{local.tm_year + 1900,
                             local.tm_mon + 1,
                             local.tm_mday,
                             local.tm_hour,
                             local.tm_min,
                             std::min(local.tm_sec, 59),
                             static_cast<int32_t>(millis)};
    return OleDateFromParts(parts).value_or(0.0);
}

std::optional<ua::DateTime> UaDateTimeOf(double oleDate) {
    const auto parts = OleDateToParts(oleDate);
    if (!parts) {
        return std::nullopt;
    }
    tm local = LocalCalendarTime(*parts);
    const time_t seconds = mktime(&local);
    const int64_t ticks = static_cast<int64_t>(seconds) * kTicksPerSecond +
                          parts->millisecond * ua::DateTime::kTicksPerMillisecond;
    return ua::DateTime{ua::DateTime::kUnixEpochTicks + ticks};
}

double TimeStampOf(const ua::DataValue& value) {
    if (value.serverTimestamp.ticks != 0) {
        return OleDateOf(value.serverTimestamp);
    }
    if (value.sourceTimestamp.ticks != 0) {
        return OleDateOf(value.sourceTimestamp);
    }
    return OleDateOf(ua::DateTime::Now());
}

platform::ValueDetail DetailOf(const ua::DataValue& value) {
    platform::ValueDetail detail;
    if (value.sourceTimestamp.ticks != 0) {
        detail.sourceTimeStamp = OleDateOf(value.sourceTimestamp);
    }
    detail.status = value.status.WithoutInfoBits().code;
    return detail;
}

}  // namespace cv::uaopc
