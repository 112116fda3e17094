#include "itemtest/WaitProgress.h"

#include "platform/Platform.h"
#include "stores/RegClass.h"

namespace cv {

namespace {

RegClass UserSettings(Platform& platform) {
    RegClass cReg(platform.registry);
    cReg.SetMainKey(platform::kHkeyCurrentUser);
    return cReg;
}

}  // namespace

WaitProgress::WaitProgress(Platform& platform) : mPlatform(platform) {}

void WaitProgress::Initialise(const std::string& sDescription, bool bTimeOut,
                              const std::string& sRegSection, const std::string& sRegItem) {
    msRegSection = sRegSection;
    msRegItem = sRegItem;
    msText = sDescription;
    msCompletion = "0";
    mcTimer.reset();
    if (bTimeOut) {
        int32_t lWait =
            UserSettings(mPlatform).ReadLong(sRegSection, sRegItem, kDefaultWaitMs, 0, 0);
        if (lWait <= 0) {
            lWait = kDefaultWaitMs;
        }
        mcTimer = std::make_unique<CvTimer>(mPlatform.events);
        mcTimer->InitializeNow(lWait);
    }
    SetButton(kShorter, "Shorter wait", bTimeOut);
    SetButton(kLonger, "Longer wait", bTimeOut);
    Changed();
}

void WaitProgress::ReInitialize() {
    if (mcTimer) {
        mcTimer->InitializeNow(mcTimer->WaitTime());
    }
}

void WaitProgress::OverrideWaitTime(int32_t lWaitMs) {
    if (mcTimer) {
        mcTimer->InitializeNow(lWaitMs);
    }
}

bool WaitProgress::ShowIt(const std::string& sDescription, const std::string& sLeftButton,
                          const std::string& sRightButton) {
    msText = sDescription;
    msCompletion = "0";
    SetButton(kShorter, sLeftButton, !sLeftButton.empty());
    SetButton(kLonger, sRightButton, !sRightButton.empty());
    Changed();
    return true;
}

void WaitProgress::UpdateCompletion(int32_t lPercent, const std::string& sDescript) {
    mlBarValue = lPercent > 100 ? 100 : lPercent;
    msCompletion = std::to_string(mlBarValue) + " %";
    if (!sDescript.empty()) {
        msText = sDescript;
    }
    Changed();
}

bool WaitProgress::TimeUp() {
    if (!mcTimer) {
        return true;
    }
    UpdateCompletion(mcTimer->PerCentElapsed(), "");
    return mcTimer->TimeUp();
}

void WaitProgress::ButtonPressed(int iIndex) {
    if (!mcTimer) {
        return;
    }
    if (iIndex == kLonger) {
        mcTimer->ChangeWaitTimeBy(kStepMs);
    } else if (mcTimer->WaitTime() >= 2 * kStepMs) {
        mcTimer->ChangeWaitTimeBy(-kStepMs);
    }
    (void)TimeUp();  // redraws the bar against the new time-out
    (void)UserSettings(mPlatform).WriteLong(msRegSection, msRegItem, mcTimer->WaitTime());
}

void WaitProgress::SetVisible(bool bVisible) {
    mbVisible = bVisible;
    Changed();
}

void WaitProgress::SetButton(int iIndex, const std::string& sCaption, bool bVisible) {
    mvButtons[Slot(iIndex)] = Button{sCaption, bVisible};
}

void WaitProgress::Changed() {
    if (mOnChange) {
        mOnChange();
    }
}

}  // namespace cv
