#pragma once

#include <map>

#include <QPointer>

#include "platform/ModelessMessages.h"

namespace cv {

class msgForm2;
struct Platform;

// Message windows that do not wait, as msgForm2 windows with one button.
// Each closes itself when its button is pressed, or when its owner closes
// it; closing one that is gone does nothing.
class ModelessMessageForms : public platform::ModelessMessages {
  public:
    ModelessMessageForms() = default;
    ~ModelessMessageForms() override;
    ModelessMessageForms(const ModelessMessageForms&) = delete;
    ModelessMessageForms& operator=(const ModelessMessageForms&) = delete;

    // The platform the windows belong to; it holds this object, so it is
    // given once both exist. Nothing is shown before.
    void SetPlatform(Platform& platform) { mPlatform = &platform; }

    WindowId Launch(const std::string& sTitle, const std::string& sText,
                    const std::string& sButton) override;
    void Close(WindowId id) override;

  private:
    Platform* mPlatform = nullptr;
    std::map<WindowId, QPointer<msgForm2>> mWindows;
    WindowId mLastId = 0;
};

}  // namespace cv
