#pragma once

#include <deque>
#include <string>
#include <vector>

#include "platform/Dialogs.h"

namespace cv::fake {

// Records every message box and answers from a queue. With the queue empty it
// answers with the first button of the box (OK, Yes, Abort or Retry).
class ScriptedDialogs : public platform::Dialogs {
  public:
    struct Shown {
        std::string text;
        int32_t style = 0;
        std::string title;
    };

    int32_t MsgBox(const std::string& text, int32_t style, const std::string& title) override;

    void QueueAnswer(int32_t answer) { answers_.push_back(answer); }
    const std::vector<Shown>& Messages() const { return shown_; }
    const Shown& Last() const { return shown_.back(); }
    void Clear() { shown_.clear(); }

  private:
    std::deque<int32_t> answers_;
    std::vector<Shown> shown_;
};

}  // namespace cv::fake
