#pragma once

#include <string>
#include <vector>

#include "platform/ModelessMessages.h"

namespace cv::test {

// Records the modeless windows launched and which are still open.
class RecordingModeless : public platform::ModelessMessages {
  public:
    struct Window {
        std::string title;
        std::string text;
        std::string button;
        bool open = true;
    };

    WindowId Launch(const std::string& sTitle, const std::string& sText,
                    const std::string& sButton) override {
        windows.push_back({sTitle, sText, sButton, true});
        return static_cast<WindowId>(windows.size());
    }
    void Close(WindowId id) override {
        if (id >= 1 && static_cast<size_t>(id) <= windows.size()) {
            windows[static_cast<size_t>(id) - 1].open = false;
        }
    }
    size_t OpenCount() const {
        size_t count = 0;
        for (const Window& window : windows) {
            count += window.open ? 1 : 0;
        }
        return count;
    }

    std::vector<Window> windows;
};

}  // namespace cv::test
