#pragma once

#include <memory>

#include <QString>
#include <QTextBrowser>

#include "platform/Help.h"

namespace cv::qtui {

// Help as a window of bundled HTML topics: context number n shows
// :/help/topic<n>.html, titled by the topic's own title. The topics travel
// inside the program, so the help file name is not needed to find them. One
// window serves every request.
class HelpWindow : public platform::Help {
  public:
    HelpWindow();
    ~HelpWindow() override;
    HelpWindow(const HelpWindow&) = delete;
    HelpWindow& operator=(const HelpWindow&) = delete;

    void ShowTopic(const std::string& helpFile, int32_t context) override;

    // The window, once a topic has been shown; null before.
    QTextBrowser* Window() const { return window_.get(); }

    static QString TopicPath(int32_t context);

  private:
    QTextBrowser& EnsureWindow();

    std::unique_ptr<QTextBrowser> window_;
};

}  // namespace cv::qtui
