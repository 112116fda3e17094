#include "platform/sim/SimFixture.h"

namespace cv::sim::test {
namespace {

struct SimFaultTest : SimFixture {
    std::vector<std::string> reasons;

    // A server with one active, subscribed group holding one item.
    struct Client {
        std::unique_ptr<OPCServer> server;
        std::shared_ptr<OPCGroup> group;
        int32_t handle = 0;
        Notifications heard;
    };

    void Start(Client& client, const std::string& id, const std::string& item = "Signals.Ramp") {
        client.server = Connected(id);
        client.server->SetShutDownHandler([this](const std::string& r) { reasons.push_back(r); });
        client.group = AddGroup(*client.server);
        client.handle = AddItem(*client.group, item);
        client.heard.Listen(*client.group, events);
        ASSERT_FALSE(client.group->SetIsSubscribed(true));
    }
};

TEST_F(SimFaultTest, AServerThatShutsDownTellsItsClientsFromTheEventLoopThenRefusesCalls) {
    Client client;
    Start(client, "Sim.Shutdown.1", "Signals.Ramp");
    events.Advance(119999);
    EXPECT_TRUE(reasons.empty());
    const size_t before = client.heard.Count();
    events.Advance(1);
    EXPECT_EQ(reasons, std::vector<std::string>{"The server is shutting down for maintenance."});
    events.Advance(5000);
    EXPECT_EQ(client.heard.Count(), before) << "no notifications after the shutdown";
    EXPECT_EQ(ReadOne(*client.group, client.handle).call.Number, RPC_E_DISCONNECTED);
    EXPECT_EQ(client.server->OPCGroups().RemoveAll().Number, RPC_E_DISCONNECTED);
    EXPECT_FALSE(client.server->Disconnect());

    ASSERT_FALSE(client.server->Connect("Sim.Shutdown.1", "")) << "a new start";
    events.Advance(120000);
    EXPECT_EQ(reasons.size(), 2u);
}

TEST_F(SimFaultTest, AShutdownOnRequestIsHeardOnlyOnceEventsRun) {
    Client client;
    Start(client, "Sim.Plant.1");
    ASSERT_FALSE(plant.ShutDownServer("", "Sim.Plant.1", "maintenance"));
    EXPECT_TRUE(reasons.empty());
    events.DoEvents();
    EXPECT_EQ(reasons, std::vector<std::string>{"maintenance"});
}

TEST_F(SimFaultTest, AServerThatDisappearsFailsEveryLaterCall) {
    Client client;
    Start(client, "Sim.Plant.1");
    ASSERT_FALSE(plant.DropServer("MYPC", "Sim.Plant.1"));
    events.Advance(5000);
    EXPECT_TRUE(reasons.empty()) << "it says nothing";
    EXPECT_EQ(ReadOne(*client.group, client.handle).call.Number, RPC_S_SERVER_UNAVAILABLE);
    EXPECT_EQ(client.group->SetIsActive(true).Number, RPC_S_SERVER_UNAVAILABLE);
    std::shared_ptr<platform::OPCBrowser> browser;
    EXPECT_EQ(client.server->CreateBrowser(browser).Number, RPC_S_SERVER_UNAVAILABLE);
    EXPECT_FALSE(Connected("Sim.Plant.1")->OPCGroups().RemoveAll()) << "started anew";
}

TEST_F(SimFaultTest, AHandlerMayReleaseTheServerAndGroupWhileTheirCallWaits) {
    Client client;
    Start(client, "Sim.Slow.1");
    ASSERT_FALSE(client.group->SetUpdateRate(1000));
    client.group->SetDataChangeHandler([&](const DataChangeArgs&) {
        client.group.reset();
        client.server.reset();
    });
    // The read waits 6 s for the slow server; a notification comes meanwhile.
    EXPECT_EQ(ReadOne(*client.group, client.handle).call.Number, RPC_E_DISCONNECTED);
    EXPECT_EQ(client.server, nullptr);

    Client other;
    Start(other, "Sim.Slow.1");
    other.server->SetShutDownHandler([&](const std::string&) { other.server.reset(); });
    events.StartTimer(1000, false,
                      [&] { EXPECT_FALSE(plant.ShutDownServer("", "Sim.Slow.1", "bye")); });
    std::string text;
    EXPECT_EQ(other.server->GetErrorString(OPC_E_RANGE, text).Number, RPC_E_DISCONNECTED);
    EXPECT_EQ(other.server, nullptr);
}

TEST_F(SimFaultTest, ValuesAndQualitiesSetByATestReachTheClientUnchanged) {
    Client client;
    Start(client, "Sim.Plant.1", "Types.Memory.R8");
    const std::vector<Variant> values = {
        Variant::Str(std::string("a\0b", 3)),
        Variant::Null(),
        Variant(),
        Variant::Array(VT_VARIANT, {Variant::I2(1), Variant::Str("x")}),
        Variant::Array(VT_R8, std::vector<Variant>(100000, Variant::R8(1.5))),
        Variant::Date(-657434.0),
    };
    for (const Variant& value : values) {
        ASSERT_FALSE(plant.SetItemValue("", "Sim.Plant.1", "types.memory.r8", value));
        events.Advance(1000);
        EXPECT_EQ(client.heard.entries.back().args.ItemValues(1), value);
    }
    ASSERT_FALSE(plant.SetItemQuality("", "Sim.Plant.1", "Types.Memory.R8", 0x54));
    events.Advance(1000);
    EXPECT_EQ(client.heard.entries.back().args.Qualities(1), 0x54);
    EXPECT_EQ(ReadOne(*client.group, client.handle).quality, 0x54);
}

TEST_F(SimFaultTest, ObjectsHandedOutMayOutliveThePlantObject) {
    auto own = std::make_unique<SimulatedPlant>(BuiltInPlant(), wait);
    std::unique_ptr<OPCServer> server;
    ASSERT_FALSE(own->CreateServer(server));
    ASSERT_FALSE(server->Connect("Sim.Plant.1", ""));
    auto group = AddGroup(*server);
    const int32_t handle = AddItem(*group, "Signals.Sine");
    own.reset();
    events.Advance(2000);
    EXPECT_EQ(ReadOne(*group, handle).quality, 0xC0);
}

TEST_F(SimFaultTest, ChangesNamingNothingInThePlantAreRefused) {
    EXPECT_EQ(plant.DropServer("NOWHERE", "Sim.Plant.1").Number, E_INVALIDARG);
    EXPECT_EQ(plant.DropServer("FILESRV", "Sim.Plant.1").Number, E_INVALIDARG);
    EXPECT_EQ(plant.SetItemValue("", "Sim.Plant.1", "No.Item", Variant()).Number, E_INVALIDARG);
    EXPECT_FALSE(plant.ShutDownServer("", "Sim.Plant.1", "not running: nothing to tell"));
}

}  // namespace
}  // namespace cv::sim::test
