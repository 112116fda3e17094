#pragma once

#include <cstdint>
#include <deque>
#include <functional>
#include <map>
#include <mutex>

#include "platform/EventLoop.h"

namespace cv::fake {

// An event loop whose clock moves only when the test says so. Timers fire in
// order of their due time while the clock is advanced; posted events run on
// DoEvents and whenever the clock is advanced. WaitUntil moves the clock
// from timer to timer until it is done, so a wait of many virtual seconds
// takes no real time; it does not wait for events other threads may post.
class VirtualEventLoop : public platform::EventLoop {
  public:
    explicit VirtualEventLoop(uint32_t startMs = 0) : now_(startMs) {}

    uint32_t TimeGetTime() const override { return static_cast<uint32_t>(now_); }
    TimerId StartTimer(uint32_t intervalMs, bool repeating,
                       std::function<void()> onTimeout) override;
    void StopTimer(TimerId id) override;
    void Post(std::function<void()> event) override;
    void DoEvents() override;
    bool WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) override;

    // Moves the clock forward by ms, firing every timer that falls due.
    void Advance(uint32_t ms);
    int ActiveTimers() const { return static_cast<int>(timers_.size()); }
    int DoEventsCalls() const { return doEventsCalls_; }

  private:
    struct Timer {
        uint64_t due = 0;
        uint32_t interval = 0;
        bool repeating = false;
        std::function<void()> onTimeout;
    };

    bool FireNextDue(uint64_t until);
    void RunPosted();

    uint64_t now_;
    std::mutex postedMutex_;
    TimerId nextId_ = 1;
    std::map<TimerId, Timer> timers_;
    std::deque<std::function<void()>> posted_;
    int doEventsCalls_ = 0;
};

}  // namespace cv::fake
