#pragma once

#include <QObject>
#include <QTimer>
#include <map>

#include "platform/EventLoop.h"

namespace cv::qtui {

// The window thread's event loop as Qt's: a steady millisecond clock, precise
// QTimers, queued calls and processEvents.
class QtEventLoop : public platform::EventLoop {
  public:
    QtEventLoop() = default;
    QtEventLoop(const QtEventLoop&) = delete;
    QtEventLoop& operator=(const QtEventLoop&) = delete;

    uint32_t TimeGetTime() const override;
    TimerId StartTimer(uint32_t intervalMs, bool repeating,
                       std::function<void()> onTimeout) override;
    void StopTimer(TimerId id) override;
    void Post(std::function<void()> event) override;
    void DoEvents() override;
    bool WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) override;

    int ActiveTimers() const { return static_cast<int>(timers_.size()); }

  private:
    void Fire(TimerId id);

    // Parent of the timers and target of posted calls: when the loop goes,
    // its pending calls and timers go with it.
    QObject context_;
    std::map<TimerId, QTimer*> timers_;
    TimerId nextId_ = 1;
};

}  // namespace cv::qtui
