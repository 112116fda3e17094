#pragma once

#include <cstdint>

#include <QObject>

namespace cv {

// The screen's mouse pointer for the browsers: code 11 shows the hourglass
// over the whole program, and until the code goes back to 0 the program
// takes no input (mouse, keys, closing a window) except in message boxes.
// Windows still repaint and the busy notice still shows, but nothing can
// move a browser while it waits for a server or the network.
class ScreenPointer : public QObject {
  public:
    ScreenPointer() = default;
    ~ScreenPointer() override;
    ScreenPointer(const ScreenPointer&) = delete;
    ScreenPointer& operator=(const ScreenPointer&) = delete;

    void Show(int16_t code);
    bool Busy() const { return busy_; }

  protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

  private:
    bool busy_ = false;
};

}  // namespace cv
