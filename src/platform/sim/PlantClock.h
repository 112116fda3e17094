#pragma once

#include <cstdint>

#include "platform/EventLoop.h"

namespace cv::sim {

// The plant's time: milliseconds since the plant started, summed from the
// event loop's 32-bit clock (so its wrap every 49.7 days does not matter as
// long as it is read more often than that), and time stamps as OLE dates in
// local time counted from the start date.
class PlantClock {
  public:
    PlantClock(const platform::EventLoop& events, double startDate)
        : events_(events), last_(events.TimeGetTime()), startDate_(startDate) {}

    uint64_t NowMs();
    double OleDate(uint64_t elapsedMs) const { return startDate_ + elapsedMs / 86400000.0; }

    // This moment of the system clock as an OLE date in local time.
    static double LocalNow();

  private:
    const platform::EventLoop& events_;
    uint32_t last_;
    uint64_t elapsed_ = 0;
    double startDate_;
};

}  // namespace cv::sim
