#include "platform/posix/SteadyEventLoop.h"

#include <algorithm>

namespace cv::posix {

uint32_t SteadyEventLoop::TimeGetTime() const {
    const auto now = Clock::now().time_since_epoch();
    return static_cast<uint32_t>(
        std::chrono::duration_cast<std::chrono::milliseconds>(now).count());
}

platform::EventLoop::TimerId SteadyEventLoop::StartTimer(uint32_t intervalMs, bool repeating,
                                                         std::function<void()> onTimeout) {
    const TimerId id = nextId_++;
    // A repeating timer of 0 ms would never let the loop sleep.
    const std::chrono::milliseconds interval(repeating ? std::max<uint32_t>(intervalMs, 1)
                                                       : intervalMs);
    timers_[id] = Timer{Clock::now() + interval, interval, repeating, std::move(onTimeout)};
    return id;
}

void SteadyEventLoop::StopTimer(TimerId id) {
    timers_.erase(id);
}

void SteadyEventLoop::Post(std::function<void()> event) {
    {
        const std::lock_guard lock(mutex_);
        posted_.push_back(std::move(event));
    }
    postedSignal_.notify_one();
}

void SteadyEventLoop::DoEvents() {
    RunPosted();
    const auto now = Clock::now();
    // Each timer due now fires once; one that falls due again waits its turn.
    for (auto pending = timers_.size(); pending > 0 && FireOneDue(now); --pending) {
        RunPosted();
    }
}

bool SteadyEventLoop::WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) {
    const auto deadline = Clock::now() + std::chrono::milliseconds(timeoutMs);
    RunPosted();
    while (!done()) {
        const auto now = Clock::now();
        if (FireOneDue(now)) {
            RunPosted();
            continue;
        }
        if (now >= deadline) {
            return false;
        }
        auto wake = deadline;
        for (const auto& [id, timer] : timers_) {
            wake = std::min(wake, timer.due);
        }
        SleepUntilEvent(wake);
        RunPosted();
    }
    return true;
}

void SteadyEventLoop::RunPosted() {
    std::deque<std::function<void()>> pending;
    {
        const std::lock_guard lock(mutex_);
        pending.swap(posted_);
    }
    while (!pending.empty()) {
        auto event = std::move(pending.front());
        pending.pop_front();
        event();
    }
}

bool SteadyEventLoop::FireOneDue(Clock::time_point now) {
    auto next = timers_.end();
    for (auto it = timers_.begin(); it != timers_.end(); ++it) {
        if (it->second.due <= now && (next == timers_.end() || it->second.due < next->second.due)) {
            next = it;
        }
    }
    if (next == timers_.end()) {
        return false;
    }
    auto onTimeout = next->second.onTimeout;
    if (next->second.repeating) {
        // A late timer does not fire a burst to catch up.
        next->second.due = std::max(next->second.due + next->second.interval, now);
    } else {
        timers_.erase(next);
    }
    onTimeout();
    return true;
}

void SteadyEventLoop::SleepUntilEvent(Clock::time_point wake) {
    std::unique_lock lock(mutex_);
    postedSignal_.wait_until(lock, wake, [this] { return !posted_.empty(); });
}

}  // namespace cv::posix
