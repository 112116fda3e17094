// The program: builds the production platform and shows the main window;
// closing it ends the run.
//
//   cvopctestclient [--plant FILE] [--quit-when-shown] [Qt options]
//
// --plant FILE       simulates the plant that FILE describes instead of the
//                    built-in one (also CVOPCTESTCLIENT_PLANT=FILE)
// --quit-when-shown  ends the program as soon as the main window has been
//                    drawn for the first time (used to measure start-up).
//
// Server IDs that are OPC UA endpoint URLs (opc.tcp://host:port/path) go to
// OPC UA servers, all others to the simulated plant. OPC UA servers are
// found at a computer's discovery port: CVOPCTESTCLIENT_UA_DISCOVERY_PORT,
// else the user's setting UaDiscoveryPort (HKEY_CURRENT_USER
// Software\Corvalent\TestClient), else 4840.
//
//   cvopctestclient --test-read SERVER --item ID [options] | --help | --version
//
// reads an item on a terminal without a window (TestReadCommandLine.h).

#include <cstdio>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include <QApplication>

#include "app/TestReadProgram.h"
#include "app/frmOpcTestClient.h"
#include "itemtest/TestReadCommandLine.h"
#include "platform/Platform.h"
#include "platform/ServerCallWait.h"
#include "platform/TraceLog.h"
#include "platform/opc/RoutingServerFactory.h"
#include "platform/posix/FilePki.h"
#include "platform/posix/FileProfiles.h"
#include "platform/posix/FileRegistry.h"
#include "platform/posix/HostComputerName.h"
#include "platform/posix/PosixProgramInfo.h"
#include "platform/qt/HelpWindow.h"
#include "platform/qt/PasswordDialog.h"
#include "platform/qt/QtBusyNotice.h"
#include "platform/qt/QtDialogs.h"
#include "platform/qt/QtEventLoop.h"
#include "platform/qt/QtLocale.h"
#include "platform/qt/TrustDialog.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimDdeServers.h"
#include "platform/sim/SimulatedPlant.h"
#include "platform/ua/UaBackend.h"
#include "security/UaSecurity.h"
#include "stores/RegClass.h"
#include "ui/widgets/ModelessMessageForms.h"
#include "util/ProgramRoutines.h"

namespace {

bool IsSet(const char* variable) {
    const char* value = std::getenv(variable);
    return value != nullptr && *value != '\0';
}

// Qt can show a window when a display server is named or a platform plugin
// is chosen, in the environment or with -platform.
bool HasDisplay(int argc, char** argv) {
    for (int i = 1; i < argc; ++i) {
        const std::string_view argument(argv[i]);
        if (argument == "-platform" || argument == "--platform") {
            return true;
        }
    }
    return IsSet("DISPLAY") || IsSet("WAYLAND_DISPLAY") || IsSet("QT_QPA_PLATFORM");
}

// Where OPC UA discovery asks a computer for its servers.
uint16_t DiscoveryPort(cv::platform::RegistryApi& registry) {
    if (const auto port = cv::uaopc::PortFromText(std::getenv(cv::uaopc::kDiscoveryPortVariable))) {
        return *port;
    }
    cv::RegClass settings(registry);
    settings.SetMainKey(cv::platform::kHkeyCurrentUser);
    return static_cast<uint16_t>(settings.ReadLong("Software\\Corvalent\\TestClient",
                                                   "UaDiscoveryPort",
                                                   cv::uaopc::kDefaultDiscoveryPort, 1, 65535));
}

// Ends the event loop after the watched window's first paint.
class QuitWhenPainted : public QObject {
  public:
    bool eventFilter(QObject* watched, QEvent* event) override {
        if (event->type() == QEvent::Paint) {
            watched->removeEventFilter(this);
            QMetaObject::invokeMethod(qApp, &QCoreApplication::quit, Qt::QueuedConnection);
        }
        return false;
    }
};

}  // namespace

int main(int argc, char** argv) {
    const std::vector<std::string> arguments(argv + 1, argv + argc);
    bool quitWhenShown = false;
    for (int i = 1; i < argc; ++i) {
        const std::string_view argument(argv[i]);
        if (argument == "--quit-when-shown") {
            quitWhenShown = true;
        } else if (argument == "--help" || argument == "-h") {
            std::fputs(cv::kWindowUsage, stdout);
            std::fputs(cv::TestReadUsage().c_str(), stdout);
            return 0;
        }
    }
    // A test read on a terminal needs no display.
    if (cv::WantsTestRead(arguments)) {
        return cv::RunTestReadProgram(arguments);
    }
    if (!HasDisplay(argc, argv)) {
        std::fputs(
            "cvopctestclient: there is no display to show the window on (DISPLAY and "
            "WAYLAND_DISPLAY are unset).\nRun it in a desktop session, or under xvfb-run "
            "(xvfb-run cvopctestclient).\n",
            stderr);
        return 1;
    }

    QApplication application(argc, argv);
    cv::qtui::QtDialogs dialogs(cv::ProgramTitle());
    cv::qtui::QtLocale locale;
    cv::posix::PosixProgramInfo program;
    cv::qtui::HelpWindow help;
    cv::posix::HostComputerName computer;
    cv::qtui::QtEventLoop events;
    cv::posix::FileRegistry registry;
    cv::posix::FileProfiles profiles;
    cv::RunSwitches run;
    cv::qtui::QtBusyNotice busy(cv::ProgramTitle());
    cv::platform::ServerCallWait serverCalls(events, busy);
    const cv::sim::PlantChoice choice = cv::sim::ChoosePlant(
        cv::sim::UserPlantFile(arguments, std::getenv(cv::sim::kPlantEnvironmentVariable)));
    cv::sim::SimulatedPlant plant(choice.plant, serverCalls,
                                  cv::sim::PlantOptions{computer.Query().value_or(""), {}});
    cv::uaopc::UaOptions uaOptions;
    uaOptions.discoveryPort = DiscoveryPort(registry);
    cv::posix::FilePki pki(cv::posix::FilePki::DefaultRoot());
    cv::qtui::QtCertificateTrust trustQuestion;
    cv::qtui::QtPasswordPrompt passwordPrompt;
    cv::security::UaSecurity security(
        registry, pki,
        {uaOptions.session.applicationUri, uaOptions.session.applicationName,
         computer.Query().value_or("localhost")},
        &trustQuestion, &passwordPrompt);
    uaOptions.security = &security;
    cv::uaopc::UaBackend ua(serverCalls, uaOptions);
    cv::platform::RoutingServerFactory servers(plant, ua);
    cv::platform::TraceLog trace;
    cv::ModelessMessageForms modeless;
    cv::Platform platform{
        dialogs,  locale, program, help,        computer, events,          registry,
        profiles, run,    servers, serverCalls, trace,    plant.NetEnum(), plant.DdeServers(),
        modeless};
    modeless.SetPlatform(platform);
    if (!choice.message.empty()) {
        dialogs.MsgBox(choice.message, cv::MsgBoxStyle::Exclamation, "");
    }

    QuitWhenPainted quitter;
    cv::frmOpcTestClient window(platform);
    window.OfferServerSecurity(security.Settings());
    if (quitWhenShown) {
        window.installEventFilter(&quitter);
    }
    window.show();
    return QApplication::exec();
}
