#pragma once

#include <cstdint>
#include <initializer_list>
#include <utility>
#include <vector>

namespace cv::platform {

// An array indexed from 1, as the automation interface passes them. An index
// outside 1..Count() is a programming fault and throws std::out_of_range.
template <typename T>
class OneBased {
  public:
    OneBased() = default;
    explicit OneBased(std::vector<T> values) : values_(std::move(values)) {}
    OneBased(std::initializer_list<T> values) : values_(values) {}
    // count default values; a negative count gives none.
    static OneBased Sized(int32_t count) {
        return OneBased(std::vector<T>(count > 0 ? static_cast<size_t>(count) : 0));
    }

    int32_t Count() const { return static_cast<int32_t>(values_.size()); }
    const T& operator()(int32_t i) const { return values_.at(static_cast<size_t>(i) - 1); }
    T& operator()(int32_t i) { return values_.at(static_cast<size_t>(i) - 1); }
    void Add(T value) { values_.push_back(std::move(value)); }
    void Reserve(int32_t count) { values_.reserve(count > 0 ? static_cast<size_t>(count) : 0); }
    void Clear() { values_.clear(); }
    const std::vector<T>& Values() const { return values_; }
    bool operator==(const OneBased&) const = default;

  private:
    std::vector<T> values_;
};

}  // namespace cv::platform
