#pragma once

#include <cstdint>
#include <string>

#include "platform/ComputerName.h"
#include "platform/DdeLink.h"
#include "platform/Dialogs.h"
#include "platform/EventLoop.h"
#include "platform/Help.h"
#include "platform/Locale.h"
#include "platform/ModelessMessages.h"
#include "platform/NetEnumApi.h"
#include "platform/ProfileApi.h"
#include "platform/ProgramInfo.h"
#include "platform/RegistryApi.h"
#include "platform/ServerCallWait.h"
#include "platform/TraceLog.h"
#include "platform/opc/OpcServerFactory.h"

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
    // OPC servers: the object factory, how calls into them wait, and the
    // trace of what the OPC client did.
    platform::OpcServerFactory& opc;
    platform::ServerCallWait& serverCalls;
    platform::TraceLog& trace;
    // The computers of the network, for the server browser.
    platform::NetEnumApi& network;
    // DDE links for DDE channels and the item test window.
    platform::DdeLinkFactory& dde;
    // Message windows that stay open, one per failing charted channel.
    platform::ModelessMessages& modeless;
};

}  // namespace cv
