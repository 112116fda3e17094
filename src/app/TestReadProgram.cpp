#include "app/TestReadProgram.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <iostream>

#include "app/PlainOutput.h"
#include "itemtest/CommandLineTestRead.h"
#include "itemtest/TestReadCommandLine.h"
#include "platform/Platform.h"
#include "platform/ServerCallWait.h"
#include "platform/TraceLog.h"
#include "platform/opc/RoutingServerFactory.h"
#include "platform/posix/ConsoleBusyNotice.h"
#include "platform/posix/ConsoleDialogs.h"
#include "platform/posix/ConsoleHelp.h"
#include "platform/posix/ConsoleLocale.h"
#include "platform/posix/ConsoleModeless.h"
#include "platform/posix/ConsolePasswordPrompt.h"
#include "platform/posix/FilePki.h"
#include "platform/posix/FileProfiles.h"
#include "platform/posix/FileRegistry.h"
#include "platform/posix/HostComputerName.h"
#include "platform/posix/PosixProgramInfo.h"
#include "platform/posix/SteadyEventLoop.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimDdeServers.h"
#include "platform/sim/SimulatedPlant.h"
#include "platform/ua/UaBackend.h"
#include "security/ThumbprintTrust.h"
#include "security/UaSecurity.h"

namespace cv {

const char* const kWindowUsage =
    "usage: cvopctestclient [--plant FILE] [--quit-when-shown] [Qt options]\n"
    "  --plant FILE       simulate the plant FILE describes instead of the built-in one\n"
    "                     (or set CVOPCTESTCLIENT_PLANT=FILE)\n"
    "  --quit-when-shown  end as soon as the main window has been drawn (start-up timing)\n"
    "\n";

namespace {

// The command line's security options as choices for this run.
security::RunChoices RunChoicesOf(const TestReadOptions& options) {
    security::RunChoices choices;
    if (!options.securityMode.empty()) {
        choices.mode = options.securityMode == "None"   ? ua::MessageSecurityMode::None
                       : options.securityMode == "Sign" ? ua::MessageSecurityMode::Sign
                                                        : ua::MessageSecurityMode::SignAndEncrypt;
    }
    if (!options.securityPolicy.empty()) {
        choices.policyUri = "http://opcfoundation.org/UA/SecurityPolicy#" + options.securityPolicy;
    }
    choices.userName = options.userName;
    return choices;
}

// The user's wait for the server is also the one wait of each connection to
// an OPC UA server; a call into a server may then take that long, and a
// second more, so the connection's own diagnosis comes before the call limit.
void ApplyWait(const TestReadOptions& options, uaopc::UaOptions& uaOptions,
               platform::ServerCallWait& serverCalls) {
    if (!options.timeoutSec) {
        return;
    }
    const auto waitMs = static_cast<uint32_t>(std::lround(*options.timeoutSec * 1000));
    uaOptions.session.channel.connectTimeoutMs = waitMs;
    serverCalls.SetCallLimit(std::max(serverCalls.CallLimit(), waitMs + 1000));
}

// Standard output and error carry no control characters but line breaks and
// tabs, whatever a server sent.
int Run(const TestReadOptions& options, const std::vector<std::string>& arguments) {
    PlainOutput plainOut(std::cout);
    PlainOutput plainErr(std::cerr);
    std::ostream out(&plainOut);
    std::ostream err(&plainErr);
    const sim::PlantChoice choice = sim::ChoosePlant(
        sim::UserPlantFile(arguments, std::getenv(sim::kPlantEnvironmentVariable)));
    if (!choice.message.empty()) {
        err << posix::ConsoleDialogs::PlainLines(choice.message) << '\n';
        return TestReadExit::kPlantUnusable;
    }
    posix::ConsoleDialogs dialogs(err);
    posix::ConsoleLocale locale;
    posix::PosixProgramInfo program;
    posix::ConsoleHelp help(err);
    posix::HostComputerName computer;
    posix::SteadyEventLoop events;
    posix::FileRegistry registry;
    posix::FileProfiles profiles;
    RunSwitches run;
    posix::ConsoleBusyNotice busy(err);
    platform::ServerCallWait serverCalls(events, busy);
    sim::SimulatedPlant plant(choice.plant, serverCalls,
                              sim::PlantOptions{computer.Query().value_or(""), {}});
    posix::FilePki pki(posix::FilePki::DefaultRoot());
    security::ThumbprintTrust trust(options.trustThumbprint);
    posix::ConsolePasswordPrompt prompt(std::getenv(posix::ConsolePasswordPrompt::kVariable),
                                        std::cin);
    uaopc::UaOptions uaOptions;
    ApplyWait(options, uaOptions, serverCalls);
    security::UaSecurity security(
        registry, pki,
        {uaOptions.session.applicationUri, uaOptions.session.applicationName,
         computer.Query().value_or("localhost")},
        &trust, &prompt);
    security.Settings().SetRunChoices(RunChoicesOf(options));
    uaOptions.security = &security;
    uaopc::UaBackend ua(serverCalls, uaOptions);
    platform::RoutingServerFactory servers(plant, ua);
    platform::TraceLog trace;
    posix::ConsoleModeless modeless(err);
    Platform platform{
        dialogs,  locale, program, help,        computer, events,          registry,
        profiles, run,    servers, serverCalls, trace,    plant.NetEnum(), plant.DdeServers(),
        modeless};
    return CommandLineTestRead(platform, options, out, err).Run();
}

}  // namespace

int RunTestReadProgram(const std::vector<std::string>& arguments) {
    const TestReadCommand command = ParseTestReadCommand(arguments);
    switch (command.action) {
        case TestReadCommand::Action::Help:
            std::cout << kWindowUsage << TestReadUsage();
            return TestReadExit::kValuesRead;
        case TestReadCommand::Action::Version: {
            const posix::PosixProgramInfo program;
            std::cout << "cvopctestclient " << program.VersionMajor() << '.'
                      << program.VersionMinor() << '.' << program.VersionRevision() << '\n';
            return TestReadExit::kValuesRead;
        }
        case TestReadCommand::Action::Usage:
            std::cerr << "cvopctestclient: " << command.error
                      << "\nTry 'cvopctestclient --help' for more information.\n";
            return TestReadExit::kUsage;
        case TestReadCommand::Action::Run:
            break;
    }
    return Run(command.options, arguments);
}

}  // namespace cv
