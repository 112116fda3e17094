#pragma once

#include "platform/Platform.h"
#include "platform/ServerCallWait.h"
#include "platform/TraceLog.h"
#include "platform/fake/FixedComputerName.h"
#include "platform/fake/FixedLocale.h"
#include "platform/fake/FixedProgramInfo.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/RecordingHelp.h"
#include "platform/fake/ScriptedDialogs.h"
#include "platform/fake/VirtualEventLoop.h"
#include "platform/posix/FileProfiles.h"
#include "platform/posix/FileRegistry.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimDdeServers.h"
#include "platform/sim/SimulatedPlant.h"
#include "support/RecordingModeless.h"
#include "support/TempFolder.h"

namespace cv::test {

// A Platform made of fakes: dialogs that record and answer from a queue, a
// pinned locale (point decimal unless the test asks for the comma one) and a
// clock that moves only by hand. The registry and the profile files are the
// real ones, kept in a fresh temporary folder that goes with the object. OPC
// servers, DDE applications and the network are the built-in simulated plant on the virtual
// clock, starting at kStartDate, with this computer named as the computer
// name says.
struct TestPlatform {
    // 2025-01-01 00:00 local time.
    static constexpr double kStartDate = 45658.0;

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
    TempFolder folder;
    posix::FileRegistry registry{folder.Path()};
    posix::FileProfiles profiles{folder.Path()};
    RunSwitches run;
    fake::RecordingBusyNotice busy;
    platform::ServerCallWait serverCalls{events, busy};
    sim::SimulatedPlant plant{sim::BuiltInPlant(), serverCalls,
                              sim::PlantOptions{computer.name.value_or(""), kStartDate}};
    platform::TraceLog trace;
    RecordingModeless modeless;
    Platform platform{
        dialogs,  locale, program, help,        computer, events,          registry,
        profiles, run,    plant,   serverCalls, trace,    plant.NetEnum(), plant.DdeServers(),
        modeless};
};

}  // namespace cv::test
