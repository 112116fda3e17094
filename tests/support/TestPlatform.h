#pragma once

#include "platform/Platform.h"
#include "platform/fake/FixedComputerName.h"
#include "platform/fake/FixedLocale.h"
#include "platform/fake/FixedProgramInfo.h"
#include "platform/fake/RecordingHelp.h"
#include "platform/fake/ScriptedDialogs.h"
#include "platform/fake/VirtualEventLoop.h"

namespace cv::test {

// A Platform made of fakes: dialogs that record and answer from a queue, a
// pinned locale (point decimal unless the test asks for the comma one) and a
// clock that moves only by hand.
struct TestPlatform {
    explicit TestPlatform(fake::FixedLocale localeToUse = fake::FixedLocale::Point())
        : locale(std::move(localeToUse)) {}

    TestPlatform(const TestPlatform&) = delete;
    TestPlatform& operator=(const TestPlatform&) = delete;

    fake::ScriptedDialogs dialogs;
    fake::FixedLocale locale;
    fake::FixedProgramInfo program;
    fake::RecordingHelp help;
    fake::FixedComputerName computer;
    fake::VirtualEventLoop events;
    RunSwitches run;
    Platform platform{dialogs, locale, program, help, computer, events, run};
};

}  // namespace cv::test
