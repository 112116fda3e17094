#pragma once

#include <cstdint>
#include <string>

#include "platform/ComputerName.h"
#include "platform/Dialogs.h"
#include "platform/EventLoop.h"
#include "platform/Help.h"
#include "platform/Locale.h"
#include "platform/ProfileApi.h"
#include "platform/ProgramInfo.h"
#include "platform/RegistryApi.h"

namespace cv {

// Counts failed text-to-number conversions; while ShowWarning is set the
// "Conversion errors" question is asked.
struct ConversionWarningState {
    int32_t ErrorCount = 0;
    bool ShowWarning = false;
};

// The switches and names that live for the whole run of the program.
struct RunSwitches {
    ConversionWarningState ConversionWarning;
    bool UncertainWarningOff = false;
    std::string HelpFile;
};

// Everything the core reaches outside itself. Created once in main (or by a
// test from fakes) and handed down by reference.
struct Platform {
    platform::Dialogs& dialogs;
    platform::Locale& locale;
    platform::ProgramInfo& program;
    platform::Help& help;
    platform::ComputerName& computer;
    platform::EventLoop& events;
    platform::RegistryApi& registry;
    platform::ProfileApi& profiles;
    RunSwitches& run;
};

}  // namespace cv
