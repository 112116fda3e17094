#include "platform/sim/PlantClock.h"

#include <algorithm>
#include <chrono>
#include <ctime>

#include "platform/OleDate.h"

namespace cv::sim {

uint64_t PlantClock::NowMs() {
    const uint32_t now = events_.TimeGetTime();
    elapsed_ += static_cast<uint32_t>(now - last_);
    last_ = now;
    return elapsed_;
}

double PlantClock::LocalNow() {
    const auto now = std::chrono::system_clock::now();
    const std::time_t seconds = std::chrono::system_clock::to_time_t(now);
    std::tm local{};
    localtime_r(&seconds, &local);
    const auto millis =
        std::chrono::duration_cast<std::chrono::milliseconds>(now.time_since_epoch()).count() %
        1000;
    const OleDateParts parts{local.tm_year + 1900,
                             local.tm_mon + 1,
                             local.tm_mday,
                             local.tm_hour,
                             local.tm_min,
                             std::min(local.tm_sec, 59),
                             0};
    return OleDateFromParts(parts).value_or(0.0) + static_cast<double>(millis) / 86400000.0;
}

}  // namespace cv::sim
