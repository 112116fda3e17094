#pragma once

#include <chrono>
#include <condition_variable>
#include <deque>
#include <functional>
#include <mutex>
#include <optional>

#include "ua/client/ClientOptions.h"
#include "ua/types/Result.h"

namespace cv::ua::test {

// Stands in for the window thread's event loop: the client's I/O thread
// queues completions here and the test runs them while it waits.
class DispatchQueue {
  public:
    Dispatcher MakeDispatcher() {
        return [this](std::function<void()> work) {
            std::lock_guard lock(mutex_);
            queue_.push_back(std::move(work));
            ready_.notify_one();
        };
    }

    // Runs queued work until done() holds or bound has passed (a generous
    // limit for a broken build, not a measured time). Gives done().
    bool RunUntil(const std::function<bool()>& done,
                  std::chrono::milliseconds bound = std::chrono::seconds(30)) {
        const auto deadline = std::chrono::steady_clock::now() + bound;
        while (!done()) {
            std::unique_lock lock(mutex_);
            if (!ready_.wait_until(lock, deadline, [this] { return !queue_.empty(); })) {
                return done();
            }
            auto work = std::move(queue_.front());
            queue_.pop_front();
            lock.unlock();
            work();
        }
        return true;
    }

    // Runs what is queued now, without waiting for more.
    void RunPending() {
        std::deque<std::function<void()>> now;
        {
            std::lock_guard lock(mutex_);
            now.swap(queue_);
        }
        for (auto& work : now) {
            work();
        }
    }

  private:
    std::mutex mutex_;
    std::condition_variable ready_;
    std::deque<std::function<void()>> queue_;
};

// Starts an operation with a completion that stores its result, and runs
// the queue until it has come.
template <class T, class Start>
Result<T> Await(DispatchQueue& queue, Start start) {
    std::optional<Result<T>> result;
    start([&result](Result<T> value) { result.emplace(std::move(value)); });
    queue.RunUntil([&result] { return result.has_value(); });
    if (!result) {
        return Error{status::BadTimeout, "The test gave up waiting for the completion."};
    }
    return std::move(*result);
}

}  // namespace cv::ua::test
