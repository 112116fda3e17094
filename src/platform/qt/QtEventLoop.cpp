#include "platform/qt/QtEventLoop.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <algorithm>
#include <chrono>
#include <climits>

namespace cv::qtui {

uint32_t QtEventLoop::TimeGetTime() const {
    // Milliseconds of the monotonic clock (time since boot), cut to 32 bits.
    const auto now = std::chrono::steady_clock::now().time_since_epoch();
    return static_cast<uint32_t>(
        std::chrono::duration_cast<std::chrono::milliseconds>(now).count());
}

platform::EventLoop::TimerId QtEventLoop::StartTimer(uint32_t intervalMs, bool repeating,
                                                     std::function<void()> onTimeout) {
    const TimerId id = nextId_++;
    auto* timer = new QTimer(&context_);
    timer->setTimerType(Qt::PreciseTimer);
    timer->setSingleShot(!repeating);
    timer->setInterval(static_cast<int>(std::min<uint32_t>(intervalMs, INT_MAX)));
    QObject::connect(timer, &QTimer::timeout, &context_,
                     [this, id, callback = std::move(onTimeout)] {
                         Fire(id);
                         callback();
                     });
    timers_[id] = timer;
    timer->start();
    return id;
}

void QtEventLoop::Fire(TimerId id) {
    // A one-shot timer is finished before its callback runs, so that the
    // callback may start new timers or stop this one freely.
    const auto it = timers_.find(id);
    if (it != timers_.end() && it->second->isSingleShot()) {
        it->second->deleteLater();
        timers_.erase(it);
    }
}

void QtEventLoop::StopTimer(TimerId id) {
    const auto it = timers_.find(id);
    if (it == timers_.end()) {
        return;
    }
    it->second->stop();
    // Later, since the timer may be the one whose callback is running now.
    it->second->deleteLater();
    timers_.erase(it);
}

void QtEventLoop::Post(std::function<void()> event) {
    QMetaObject::invokeMethod(&context_, std::move(event), Qt::QueuedConnection);
}

void QtEventLoop::DoEvents() {
    QCoreApplication::processEvents();
}

bool QtEventLoop::WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) {
    // Every completion arrives as an event, so done() can only change after
    // one; the single-shot timer wakes the wait at its deadline.
    QElapsedTimer elapsed;
    elapsed.start();
    QTimer deadline;
    deadline.setSingleShot(true);
    deadline.setTimerType(Qt::PreciseTimer);
    deadline.start(static_cast<int>(std::min<uint32_t>(timeoutMs, INT_MAX)));
    while (!done()) {
        if (static_cast<uint64_t>(elapsed.elapsed()) >= timeoutMs) {
            return false;
        }
        QCoreApplication::processEvents(QEventLoop::AllEvents | QEventLoop::WaitForMoreEvents);
    }
    return true;
}

}  // namespace cv::qtui
