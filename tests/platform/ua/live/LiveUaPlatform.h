#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "channel/Channel.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/Platform.h"
#include "platform/ServerCallWait.h"
#include "platform/TraceLog.h"
#include "platform/fake/FixedComputerName.h"
#include "platform/fake/FixedLocale.h"
#include "platform/fake/FixedProgramInfo.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/RecordingHelp.h"
#include "platform/fake/ScriptedDialogs.h"
#include "platform/opc/RoutingServerFactory.h"
#include "platform/posix/FileProfiles.h"
#include "platform/posix/FileRegistry.h"
#include "platform/posix/SteadyEventLoop.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimDdeServers.h"
#include "platform/sim/SimulatedPlant.h"
#include "platform/ua/UaBackend.h"
#include "support/RecordingModeless.h"
#include "support/TempFolder.h"

namespace cv::test {

// The endpoint URL of the node-opcua peer CTest started for this test.
inline std::string PeerUrl() {
    const char* file = std::getenv("CV_UA_PEER_URL_FILE");
    std::ifstream in(file ? file : "");
    std::string url;
    std::getline(in, url);
    return url;
}

// The peer's port, from its endpoint URL.
inline uint16_t PeerPort() {
    const std::string url = PeerUrl();
    const size_t colon = url.rfind(':');
    return static_cast<uint16_t>(std::atoi(url.c_str() + colon + 1));
}

// The program's platform on a real event loop, so that OPC UA answers
// arrive: the router over the simulated plant and the OPC UA backend, whose
// discovery asks the peer's port.
struct LiveUaPlatform {
    fake::ScriptedDialogs dialogs;
    fake::FixedLocale locale = fake::FixedLocale::Point();
    fake::FixedProgramInfo program;
    fake::RecordingHelp help;
    fake::FixedComputerName computer;
    posix::SteadyEventLoop events;
    TempFolder folder;
    posix::FileRegistry registry{folder.Path()};
    posix::FileProfiles profiles{folder.Path()};
    RunSwitches run;
    fake::RecordingBusyNotice busy;
    platform::ServerCallWait serverCalls{events, busy};
    sim::SimulatedPlant plant{sim::BuiltInPlant(), serverCalls,
                              sim::PlantOptions{computer.name.value_or(""), {}}};
    uaopc::UaBackend ua{serverCalls, [] {
                            uaopc::UaOptions options;
                            options.discoveryPort = PeerPort();
                            options.discoveryTimeoutMs = 2'000;
                            return options;
                        }()};
    platform::RoutingServerFactory servers{plant, ua};
    platform::TraceLog trace;
    RecordingModeless modeless;
    Platform platform{
        dialogs,  locale, program, help,        computer, events,          registry,
        profiles, run,    servers, serverCalls, trace,    plant.NetEnum(), plant.DdeServers(),
        modeless};
};

// A test with the OPC client connected to the peer through the router.
struct LiveUaTest : ::testing::Test {
    static constexpr uint32_t kPatienceMs = 20'000;

    void SetUp() override {
        url = PeerUrl();
        ASSERT_FALSE(url.empty()) << "CV_UA_PEER_URL_FILE names no endpoint URL";
        ASSERT_FALSE(client.CreateServerAndGroup(url, ""));
    }

    // An OPC channel of the peer's node ns=1;s=<path>, added to group 1.
    Channel& AddChannel(const std::string& path) {
        auto channel = std::make_unique<Channel>(lp.platform);
        channel->SetComType(ComTypeCode::Opc);
        channel->SetItemName("ns=1;s=" + path);
        channel->SetExpectANumber(false);
        channel->MarkGoingOnline();
        EXPECT_FALSE(client.AddChannel(*channel)) << path;
        channels.push_back(std::move(channel));
        return *channels.back();
    }

    bool WaitUntil(const std::function<bool()>& done) {
        return lp.events.WaitUntil(done, kPatienceMs);
    }

    LiveUaPlatform lp;
    std::string url;
    CvOpcAutoClient client{lp.platform};
    std::vector<std::unique_ptr<Channel>> channels;
};

}  // namespace cv::test
