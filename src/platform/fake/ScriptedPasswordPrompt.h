#pragma once

#include <deque>
#include <optional>
#include <string>
#include <vector>

#include "platform/PasswordStore.h"

namespace cv::fake {

// Answers with the scripted passwords in turn, then cancels; records the
// requests.
class ScriptedPasswordPrompt : public platform::PasswordPrompt {
  public:
    std::optional<std::string> AskPassword(const platform::PasswordRequest& request) override {
        requests.push_back(request);
        if (answers.empty()) {
            return std::nullopt;
        }
        std::string next = std::move(answers.front());
        answers.pop_front();
        return next;
    }

    std::deque<std::string> answers;
    std::vector<platform::PasswordRequest> requests;
};

}  // namespace cv::fake
