#pragma once

#include <string>
#include <vector>

#include "platform/Help.h"

namespace cv::fake {

// Remembers which help topics were asked for.
class RecordingHelp : public platform::Help {
  public:
    struct Request {
        std::string file;
        int32_t context = 0;
    };

    void ShowTopic(const std::string& helpFile, int32_t context) override {
        requests.push_back({helpFile, context});
    }

    std::vector<Request> requests;
};

}  // namespace cv::fake
