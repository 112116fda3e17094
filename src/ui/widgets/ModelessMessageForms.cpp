#include "ui/widgets/ModelessMessageForms.h"

#include "ui/widgets/msgForm2.h"

namespace cv {

ModelessMessageForms::~ModelessMessageForms() {
    for (auto& [id, window] : mWindows) {
        delete window.data();
    }
}

platform::ModelessMessages::WindowId ModelessMessageForms::Launch(const std::string& sTitle,
                                                                  const std::string& sText,
                                                                  const std::string& sButton) {
    if (mPlatform == nullptr) {
        return 0;
    }
    auto* window = new msgForm2(*mPlatform);
    window->setAttribute(Qt::WA_DeleteOnClose);
    if (!window->LaunchModeless(sTitle, sText, sButton)) {
        delete window;
        return 0;
    }
    mWindows[++mLastId] = window;
    return mLastId;
}

void ModelessMessageForms::Close(WindowId id) {
    const auto found = mWindows.find(id);
    if (found == mWindows.end()) {
        return;
    }
    if (found->second) {
        found->second->close();
    }
    mWindows.erase(found);
}

}  // namespace cv
