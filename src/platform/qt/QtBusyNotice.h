#pragma once

#include <QLabel>
#include <QWidget>
#include <string>

#include "platform/BusyNotice.h"

namespace cv::qtui {

// The busy notice as a small window without buttons, over the active window,
// that stays until the pending call returns.
class QtBusyNotice : public platform::BusyNotice {
  public:
    explicit QtBusyNotice(std::string title);

    void Show(const std::string& text) override;
    void Hide() override;

    QWidget& Window() { return window_; }

  private:
    QWidget window_;
    QLabel* label_;
};

}  // namespace cv::qtui
