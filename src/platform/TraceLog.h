#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <string>

namespace cv::platform {

// The most recent trace labels of the OPC client, with the millisecond clock
// at which each was written: a bounded ring that a diagnosis view or a log
// file can show. The oldest entries go first once it is full.
class TraceLog {
  public:
    struct Entry {
        uint32_t timeMs = 0;
        std::string label;
        bool operator==(const Entry&) const = default;
    };

    explicit TraceLog(size_t capacity = 2000) : capacity_(capacity) {}

    void Add(uint32_t timeMs, std::string label);
    const std::deque<Entry>& Entries() const { return entries_; }
    size_t Capacity() const { return capacity_; }
    void Clear() { entries_.clear(); }

  private:
    size_t capacity_;
    std::deque<Entry> entries_;
};

}  // namespace cv::platform
