#pragma once

#include <array>

#include <QFrame>

class QLabel;
class QProgressBar;
class QPushButton;

namespace cv {

class WaitProgress;

// The wait progress control: shows a WaitProgress (its text, bar,
// percentage and the two wait buttons) and passes the buttons on to it.
// Visible while the WaitProgress says so. A plain frame, not a group box, so
// that a busy window (SetControlsBusy) leaves its wait buttons usable.
class ctlProgress : public QFrame {
    Q_OBJECT

  public:
    explicit ctlProgress(WaitProgress& progress, QWidget* parent = nullptr);
    ~ctlProgress() override;

  private:
    void Show();

    WaitProgress& mProgress;
    QLabel* lblText = nullptr;
    QProgressBar* ProgressBar1 = nullptr;
    QLabel* lblCompletion = nullptr;
    // Index 0 is button 1 ("Shorter wait"), index 1 button 2 ("Longer wait").
    std::array<QPushButton*, 2> cmdButton{};
};

}  // namespace cv
