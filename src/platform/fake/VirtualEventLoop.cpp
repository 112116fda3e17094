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
    posted_.push_back(std::move(event));
}

void VirtualEventLoop::DoEvents() {
    ++doEventsCalls_;
    RunPosted();
}

void VirtualEventLoop::RunPosted() {
    // Only what is pending now: events posted by these events wait their turn.
    for (auto pending = posted_.size(); pending > 0 && !posted_.empty(); --pending) {
        auto event = std::move(posted_.front());
        posted_.pop_front();
        event();
    }
}

void VirtualEventLoop::Advance(uint32_t ms) {
    const uint64_t until = now_ + ms;
    RunPosted();
    while (FireNextDue(until)) {
        RunPosted();
    }
    now_ = until;
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
    now_ = next->second.due;
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
