#pragma once

#include <cstdint>
#include <functional>

namespace cv::platform {

// The window thread's event loop: a millisecond clock, timers and a way to
// let pending events run while a long operation is under way.
class EventLoop {
  public:
    using TimerId = int32_t;

    virtual ~EventLoop() = default;
    // Milliseconds since an arbitrary start; wraps at 2^32 like the
    // multimedia timer, so callers subtract with unsigned arithmetic.
    virtual uint32_t TimeGetTime() const = 0;
    // Calls onTimeout after intervalMs, once or every intervalMs until
    // stopped. Returns an id greater than 0.
    virtual TimerId StartTimer(uint32_t intervalMs, bool repeating,
                               std::function<void()> onTimeout) = 0;
    // Stopping an unknown or already stopped timer does nothing.
    virtual void StopTimer(TimerId id) = 0;
    // Queues a callback to run on the window thread between other events.
    // Safe to call from any thread.
    virtual void Post(std::function<void()> event) = 0;
    // Runs the events that are pending now, then returns.
    virtual void DoEvents() = 0;
    // Lets events run (timers, posted events, input) until done() answers
    // true or timeoutMs has passed; answers done(). done() is asked after
    // every event. Calls may nest.
    virtual bool WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) = 0;
};

}  // namespace cv::platform
