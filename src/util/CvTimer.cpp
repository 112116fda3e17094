#include "util/CvTimer.h"

#include <algorithm>
#include <limits>

#include "platform/EventLoop.h"

namespace cv {

namespace {

int32_t Saturated(int64_t value) {
    return static_cast<int32_t>(std::clamp<int64_t>(value, std::numeric_limits<int32_t>::min(),
                                                    std::numeric_limits<int32_t>::max()));
}

}  // namespace

CvTimer::CvTimer(const platform::EventLoop& events)
    : mEvents(events), mlLastReading(events.TimeGetTime()) {}

void CvTimer::InitializeNow(int32_t lWaitTime) {
    mlLastReading = mEvents.TimeGetTime();
    mlWaitTime = lWaitTime;
    mlElapsed = 0;
}

int32_t CvTimer::ElapsedTime() {
    const uint32_t now = mEvents.TimeGetTime();
    // Unsigned subtraction is exact across 2^31 and across the wrap; the
    // clock only moves forward, so the difference is below 2^31.
    const uint32_t difference = now - mlLastReading;
    mlLastReading = now;
    return Saturated(difference);
}

bool CvTimer::TimeUp() {
    mlElapsed = Saturated(int64_t{mlElapsed} + ElapsedTime());
    return mlElapsed >= mlWaitTime;
}

int32_t CvTimer::TimeSinceInitialize() {
    (void)TimeUp();  // brings the count up to date
    return mlElapsed;
}

int32_t CvTimer::PerCentElapsed() {
    (void)TimeUp();  // brings the count up to date
    if (mlWaitTime <= 0) {
        return 100;
    }
    return Saturated(int64_t{mlElapsed} * 100 / mlWaitTime);
}

void CvTimer::ChangeWaitTimeBy(int32_t lChange) {
    mlWaitTime = Saturated(int64_t{mlWaitTime} + lChange);
}

}  // namespace cv
