#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>

#include "itemtest/ItemTestDisplay.h"
#include "itemtest/WaitProgress.h"

namespace cv {

class Channel;
class CvOpcAutoClient;
class TunFile;
struct OpcSample;
struct Platform;

namespace platform {
class DdeLink;
}

// The item test without its window: connects one channel of a document,
// waits for its first value behind a wait progress, then refreshes the
// value at the document's sample interval until it is closed. One timer
// drives seven states:
//
//   0 start   1 prepare (DDE goes online here and skips to 5)
//   2 create the communication objects; 3 retry that each tick until the
//   wait is up   4 go online (OPC: the group's update rate is the sample
//   interval)   5 wait for the first value   6 refresh
//
// While it retries or waits, the display shows what the server answered
// last. Any failure shows its diagnosis (the channel's own, or the stored
// error text through GetErrorString) and closes the test; one that no retry
// can change (an item ID the server's syntax refuses, a server that is not
// registered) does so at once. A tick that finds another still running (a
// message box is open, a server call waits) returns at once.
class ItemTest {
  public:
    // The window (or the terminal) that shows the test.
    class Listener {
      public:
        virtual ~Listener() = default;
        // Display() or Progress() changed.
        virtual void DisplayChanged() = 0;
        // The test ended itself (a failure); it is unloaded already.
        virtual void CloseRequested() = 0;
        // A refresh put new values into Display().
        virtual void ValuesShown() {}
        // A value the channel did not take arrived (a bad quality, or no
        // number where one is expected): Display() holds its time stamps
        // and quality, and the test ends or waits on.
        virtual void ValueRefused() {}
    };

    static constexpr uint32_t kConnectTickMs = 100;

    ItemTest(Platform& platform, TunFile& cTunFile, Channel& cChannel, Listener& listener);
    ~ItemTest();
    ItemTest(const ItemTest&) = delete;
    ItemTest& operator=(const ItemTest&) = delete;

    // Overrides the remembered wait (milliseconds) for this test only.
    void SetWaitOverride(int32_t lWaitMs) { mlWaitOverride = lWaitMs; }
    // Starts the timer at 100 ms.
    void Start();
    // One tick of the timer.
    void Tick();
    // Stops the timer and takes the channel and the document's OPC clients
    // offline; once only.
    void Unload();

    int16_t State() const { return miState; }
    bool InTimer() const { return mbInTimer; }
    bool Closed() const { return mbClosed; }
    // True once the user changed the decimal places or the colour, or
    // applied a mode string.
    bool Changed() const { return mbChanged; }
    const ItemTestDisplay& Display() const { return mDisplay; }
    WaitProgress& Progress() { return mProgress; }
    Channel& TestChannel() { return mcChannel; }
    uint32_t RefreshIntervalMs() const { return mlIntervalMs; }

    // The user's actions. SetDecimalPlaces answers true when the number is
    // refused (with a message unless bQuiet).
    bool SetDecimalPlaces(int32_t lPlaces, bool bQuiet);
    void DecimalPlacesUp();
    void DecimalPlacesDown();
    // The decimal places box: Enter applies its text; leaving it checks a
    // changed number and answers false when it is refused.
    void DecimalPlacesEntered(const std::string& sText);
    bool ValidateDecimalPlaces(const std::string& sText);
    void ColourChosen(int32_t lColor);
    // cmdApply with the mode at 0-based iIndex selected: asks first.
    void ApplyMode(int32_t iIndex);
    // cmdClose: false while the decimal places box holds a refused number.
    bool CanClose(const std::string& sDecimalPlaces);

  private:
    // The states' steps (ItemTest.cpp).
    void RunStep();
    void Prepare();
    void Create();
    void RetryCreate();
    void GoOnline();
    void FirstValue();
    void Refresh();
    void Close();
    void SetBusy(int16_t iPointer);
    void NoteBackend();
    void ShowReadError(const std::string& sPrefix, int32_t lIcon);
    void StartTimer(uint32_t lIntervalMs);
    CvOpcAutoClient* ServingClient() const;

    // What the server answered while the test waits (ItemTest_wait.cpp).
    void AnswerOrEnd();
    void ShowServerAnswer(const std::string& sAnswer);
    bool NoteRefusedValue();

    // The value display (ItemTest_display.cpp).
    void LayOutValueDisplay();
    void SelectMode();
    void ShowValues();
    void ShowSample(const OpcSample& sample);
    void ShowRange(double dValue);
    std::string StatusName(uint32_t lStatus);
    int32_t PlacesFromText(const std::string& sText);
    void Notify();

    Platform& mPlatform;
    TunFile& mcTunFile;
    Channel& mcChannel;
    Listener& mListener;
    WaitProgress mProgress;
    std::shared_ptr<platform::DdeLink> mcDdeLabel;
    std::optional<int32_t> mlWaitOverride;
    ItemTestDisplay mDisplay;
    // The server's names for the statuses it gave, once asked.
    std::map<uint32_t, std::string> mStatusNames;
    // The number of the last value shown or told (OpcSample::number).
    uint32_t mlSampleShown = 0;
    int16_t miState = 0;
    bool mbInTimer = false;
    bool mbChanged = false;
    bool mbClosed = false;
    bool mbUnloaded = false;
    int32_t mlTimer = 0;
    uint32_t mlIntervalMs = 0;
};

}  // namespace cv
