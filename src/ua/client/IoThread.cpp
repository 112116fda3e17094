#include "ua/client/IoThread.h"

#include <asio/post.hpp>

namespace cv::ua {

IoThread::IoThread(Dispatcher dispatcher)
    : work_(asio::make_work_guard(io_)), life_(std::make_shared<Life>()) {
    life_->dispatcher = std::move(dispatcher);
    thread_ = std::thread([this] { io_.run(); });
}

IoThread::~IoThread() {
    if (thread_.joinable()) {
        Stop([] {});
    }
}

std::function<void(std::function<void()>)> IoThread::Deliverer() const {
    return [life = life_](std::function<void()> work) {
        if (!life->alive) {
            return;
        }
        life->dispatcher([life, work = std::move(work)] {
            std::lock_guard lock(life->mutex);
            if (life->alive) {
                work();
            }
        });
    };
}

void IoThread::Stop(std::function<void()> last) {
    {
        std::lock_guard lock(life_->mutex);
        life_->alive = false;
    }
    asio::post(io_, [this, last = std::move(last)] {
        last();
        io_.stop();
    });
    thread_.join();
}

}  // namespace cv::ua
