#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <mutex>

#include "platform/EventLoop.h"

namespace cv::posix {

// An event loop without a window system, for programs that run on a
// terminal: the steady clock, timers, and events posted from any thread.
// Timers belong to the thread that runs the loop.
class SteadyEventLoop : public platform::EventLoop {
  public:
    SteadyEventLoop() = default;
    SteadyEventLoop(const SteadyEventLoop&) = delete;
    SteadyEventLoop& operator=(const SteadyEventLoop&) = delete;

    uint32_t TimeGetTime() const override;
    TimerId StartTimer(uint32_t intervalMs, bool repeating,
                       std::function<void()> onTimeout) override;
    void StopTimer(TimerId id) override;
    void Post(std::function<void()> event) override;
    void DoEvents() override;
    bool WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) override;

  private:
    using Clock = std::chrono::steady_clock;
    struct Timer {
        Clock::time_point due;
        std::chrono::milliseconds interval{0};
        bool repeating = false;
        std::function<void()> onTimeout;
    };

    void RunPosted();
    bool FireOneDue(Clock::time_point now);
    void SleepUntilEvent(Clock::time_point wake);

    std::map<TimerId, Timer> timers_;
    TimerId nextId_ = 1;
    std::mutex mutex_;
    std::condition_variable postedSignal_;
    std::deque<std::function<void()>> posted_;
};

}  // namespace cv::posix
