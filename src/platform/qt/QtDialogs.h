#pragma once

#include <string>

#include <QMessageBox>
#include <QString>

#include "platform/Dialogs.h"

namespace cv::qtui {

// Message boxes as Qt message boxes. The style's button set and icon codes
// become QMessageBox buttons and icon; the answer is the pressed button's code.
class QtDialogs : public platform::Dialogs {
  public:
    explicit QtDialogs(std::string defaultTitle) : defaultTitle_(std::move(defaultTitle)) {}

    int32_t MsgBox(const std::string& text, int32_t style, const std::string& title) override;

    // The parts of a box for a style, kept apart from showing it.
    static QMessageBox::StandardButtons ButtonsFor(int32_t style);
    static QMessageBox::StandardButton DefaultButtonFor(int32_t style);
    static QMessageBox::Icon IconFor(int32_t style);
    // The answer code for the button that closed the box; a box closed
    // without a button answers as its escape button would.
    static int32_t AnswerFor(QMessageBox::StandardButton button, int32_t style);
    // CR LF (and lone CR) line breaks as the line breaks Qt shows.
    static QString DisplayText(const std::string& text);

  private:
    std::string defaultTitle_;
};

}  // namespace cv::qtui
