#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>

#include "itemtest/ItemTest.h"
#include "itemtest/TestReadCommandLine.h"

namespace cv {

class Channel;
struct Platform;

// The test read without a window: the same item test as the window's, on
// the document the main window would make, printing one line per value:
//
//   2025-01-01T00:00:01.000+01:00<TAB>12.5<TAB>53.13<TAB>good<TAB>
//
// (the server's time stamp, the raw value, the scaled value with the
// channel's decimal places, the quality in words, the source time stamp
// where the server sends one). A value the test does not take (a bad one)
// has its line too, without a scaled value. Once the server is reached, err
// gets the kind of server that answered, as "Backend: OPC UA" or "Backend:
// simulated plant", and with --verbose each answer of the server while the
// test waits. Failures are told by the platform's dialogs, as the window
// tells them.
class CommandLineTestRead : private ItemTest::Listener {
  public:
    CommandLineTestRead(Platform& platform, const TestReadOptions& options, std::ostream& out,
                        std::ostream& err);

    // Runs until the values were read or the test failed; the exit code.
    int Run();

  private:
    void Configure(TunFile& cTunFile, Channel& cChannel) const;
    void DisplayChanged() override;
    void CloseRequested() override { mbFailed = true; }
    void ValuesShown() override;
    void ValueRefused() override;
    void PrintValue(bool bTaken);

    Platform& mPlatform;
    const TestReadOptions& mOptions;
    std::ostream& mOut;
    std::ostream& mErr;
    Channel* mcChannel = nullptr;
    ItemTest* mcTest = nullptr;
    int32_t mlShown = 0;
    bool mbFailed = false;
    bool mbBackendTold = false;
    std::string msAnswerTold;
};

}  // namespace cv
