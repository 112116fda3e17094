#include "platform/fake/VirtualEventLoop.h"

#include <algorithm>

namespace cv::fake {

platform::EventLoop::TimerId VirtualEventLoop::StartTimer(uint32_t intervalMs, bool repeating,
                                                          std::function<void()> onTimeout) {
    // A zero interval fires on the next millisecond, so that a repeating
    // timer cannot hold the clock still.
    const uint32_t interval = std::max<uint32_t>(intervalMs, 1);
    const TimerId id = nextId_++;
    timers_[id] = Timer{now_ + interval, interval, repeating, std::move(onTimeout)};
    return id;
}

void VirtualEventLoop::StopTimer(TimerId id) {
    timers_.erase(id);
}

void VirtualEventLoop::Post(std::function<void()> event) {
    const std::lock_guard lock(postedMutex_);
    posted_.push_back(std::move(event));
}

void VirtualEventLoop::DoEvents() {
    ++doEventsCalls_;
    RunPosted();
}

bool VirtualEventLoop::WaitUntil(const std::function<bool()>& done, uint32_t timeoutMs) {
    const uint64_t deadline = now_ + timeoutMs;
    RunPosted();
    while (!done()) {
        if (!FireNextDue(deadline)) {
            now_ = std::max(now_, deadline);
            return done();
        }
        RunPosted();
    }
    return true;
}

void VirtualEventLoop::RunPosted() {
    // Only what is pending now: events posted by these events wait their turn.
    std::deque<std::function<void()>> pending;
    {
        const std::lock_guard lock(postedMutex_);
        pending.swap(posted_);
    }
    while (!pending.empty()) {
        auto event = std::move(pending.front());
        pending.pop_front();
        event();
    }
}

void VirtualEventLoop::Advance(uint32_t ms) {
    const uint64_t until = now_ + ms;
    RunPosted();
    while (FireNextDue(until)) {
        RunPosted();
    }
    // A wait inside a timer may have carried the clock past the end already.
    now_ = std::max(now_, until);
}

bool VirtualEventLoop::FireNextDue(uint64_t until) {
    auto next = timers_.end();
    for (auto it = timers_.begin(); it != timers_.end(); ++it) {
        if (it->second.due <= until &&
            (next == timers_.end() || it->second.due < next->second.due)) {
            next = it;
        }
    }
    if (next == timers_.end()) {
        return false;
    }
    now_ = std::max(now_, next->second.due);
    auto onTimeout = next->second.onTimeout;
    if (next->second.repeating) {
        next->second.due += next->second.interval;
    } else {
        timers_.erase(next);
    }
    onTimeout();
    return true;
}

}  // namespace cv::fake
