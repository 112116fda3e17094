#include "platform/TraceLog.h"

namespace cv::platform {

void TraceLog::Add(uint32_t timeMs, std::string label) {
    if (capacity_ == 0) {
        return;
    }
    if (entries_.size() == capacity_) {
        entries_.pop_front();
    }
    entries_.push_back(Entry{timeMs, std::move(label)});
}

}  // namespace cv::platform
