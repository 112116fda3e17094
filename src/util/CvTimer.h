#pragma once

#include <cstdint>

namespace cv {

namespace platform {
class EventLoop;
}

// Elapsed time against a time-out, on the event loop's millisecond clock.
// The clock wraps at 2^32; differences are taken modulo 2^32, so a reading
// across 2^31 or across the wrap to 0 gives the true small difference.
// Counts saturate instead of overflowing, and a time-out of 0 or below is
// up at once (PerCentElapsed then answers 100).
class CvTimer {
  public:
    explicit CvTimer(const platform::EventLoop& events);

    void InitializeNow(int32_t lWaitTime);
    bool TimeUp();
    int32_t TimeSinceInitialize();
    // Passes 100 once the time is up (120 at 12 s of a 10 s wait).
    int32_t PerCentElapsed();
    void ChangeWaitTimeBy(int32_t lChange);
    int32_t WaitTime() const { return mlWaitTime; }

  private:
    // Milliseconds since the previous reading.
    int32_t ElapsedTime();

    const platform::EventLoop& mEvents;
    uint32_t mlLastReading;
    int32_t mlWaitTime = 0;
    int32_t mlElapsed = 0;
};

}  // namespace cv
