#pragma once

#include <asio/executor_work_guard.hpp>
#include <asio/io_context.hpp>
#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <thread>

#include "ua/client/ClientOptions.h"

namespace cv::ua {

// The thread that runs a client's network work, and the way results travel
// from it to the owner's thread. A delivered function runs through the
// dispatcher only while the owner is alive; Stop ends that at once, even
// for functions queued in the dispatcher already.
class IoThread {
  public:
    explicit IoThread(Dispatcher dispatcher);
    ~IoThread();

    asio::io_context& Context() { return io_; }
    // A function that hands work to the owner's thread; safe to keep and
    // call from the I/O thread after the owner has gone.
    std::function<void(std::function<void()>)> Deliverer() const;
    // Marks the owner gone, runs last on the I/O thread, then ends the
    // thread. Waits for a delivered function that is running to finish.
    void Stop(std::function<void()> last);

  private:
    struct Life {
        std::recursive_mutex mutex;
        std::atomic<bool> alive{true};
        Dispatcher dispatcher;
    };

    asio::io_context io_;
    asio::executor_work_guard<asio::io_context::executor_type> work_;
    std::shared_ptr<Life> life_;
    std::thread thread_;
};

}  // namespace cv::ua
