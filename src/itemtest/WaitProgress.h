#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "util/CvTimer.h"

namespace cv {

struct Platform;

// What the wait progress control shows and does, without its window: a
// text, a bar of 0 to 100 with its percentage text, and two buttons that
// shorten or lengthen the time-out by 5 s. The time-out is kept for the
// user in the registry (HKEY_CURRENT_USER). A control window listens to
// OnChange and shows the fields.
class WaitProgress {
  public:
    static constexpr int32_t kDefaultWaitMs = 10000;
    static constexpr int32_t kStepMs = 5000;
    // Button indexes.
    static constexpr int kShorter = 1;
    static constexpr int kLonger = 2;

    explicit WaitProgress(Platform& platform);

    // With bTimeOut, the time-out comes from the registry value sRegItem of
    // key sRegSection; a stored time-out of 0 or below is taken as the
    // default, so the bar always has a wait to measure.
    void Initialise(const std::string& sDescription, bool bTimeOut, const std::string& sRegSection,
                    const std::string& sRegItem);
    // Restarts the count, keeping the time-out.
    void ReInitialize();
    // Waits lWaitMs from now instead, without remembering it.
    void OverrideWaitTime(int32_t lWaitMs);
    bool ShowIt(const std::string& sDescription, const std::string& sLeftButton,
                const std::string& sRightButton);
    void UpdateCompletion(int32_t lPercent, const std::string& sDescript);
    // Also moves the bar. True at once without a time-out.
    bool TimeUp();
    // "Shorter wait" (1) or "Longer wait" (2) pressed; the time-out is
    // written back in either case.
    void ButtonPressed(int iIndex);

    // The time-out in milliseconds; 0 without one.
    int32_t WaitTime() const { return mcTimer ? mcTimer->WaitTime() : 0; }

    // What the control shows.
    const std::string& Text() const { return msText; }
    int32_t BarValue() const { return mlBarValue; }
    const std::string& CompletionText() const { return msCompletion; }
    const std::string& ButtonCaption(int iIndex) const { return mvButtons[Slot(iIndex)].caption; }
    bool ButtonVisible(int iIndex) const { return mvButtons[Slot(iIndex)].visible; }
    bool Visible() const { return mbVisible; }
    void SetVisible(bool bVisible);
    // Called after every change of what is shown.
    void SetOnChange(std::function<void()> onChange) { mOnChange = std::move(onChange); }

  private:
    struct Button {
        std::string caption;
        bool visible = false;
    };

    static size_t Slot(int iIndex) { return iIndex == kLonger ? 1 : 0; }
    void SetButton(int iIndex, const std::string& sCaption, bool bVisible);
    void Changed();

    Platform& mPlatform;
    std::unique_ptr<CvTimer> mcTimer;
    std::string msRegSection;
    std::string msRegItem;
    std::string msText;
    int32_t mlBarValue = 0;
    std::string msCompletion = "0";
    std::array<Button, 2> mvButtons;
    bool mbVisible = false;
    std::function<void()> mOnChange;
};

}  // namespace cv
