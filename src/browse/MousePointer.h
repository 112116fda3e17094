#pragma once

#include <cstdint>
#include <functional>
#include <utility>

namespace cv {

// The screen's mouse pointer as the browsers set it: 11 (the hourglass)
// while they wait for a server or the network, 0 (the default) otherwise.
// The window decides what the codes look like; while the hourglass shows it
// takes no input, so nothing can move a browser while it waits.
class MousePointer {
  public:
    static constexpr int16_t kDefault = 0;
    static constexpr int16_t kHourglass = 11;

    explicit MousePointer(std::function<void(int16_t)> show = {}) : show_(std::move(show)) {}

    int16_t Code() const { return code_; }
    void Set(int16_t code) {
        code_ = code;
        if (show_) {
            show_(code);
        }
    }

    // The hourglass for one operation, then the pointer it found.
    class Busy {
      public:
        explicit Busy(MousePointer& pointer) : pointer_(pointer), before_(pointer.Code()) {
            pointer_.Set(kHourglass);
        }
        ~Busy() { pointer_.Set(before_); }
        Busy(const Busy&) = delete;
        Busy& operator=(const Busy&) = delete;

      private:
        MousePointer& pointer_;
        int16_t before_;
    };

  private:
    std::function<void(int16_t)> show_;
    int16_t code_ = kDefault;
};

}  // namespace cv
