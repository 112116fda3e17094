#include <algorithm>
#include <utility>

#include "opc/OpcClientFixture.h"

namespace cv::test {
namespace {

bool Has(const std::vector<std::string>& labels, const std::string& label) {
    return std::find(labels.begin(), labels.end(), label) != labels.end();
}

TEST_F(OpcClientTest, CreateServerAndGroupAnswersEachFailureWithItsCode) {
    struct Row {
        const char* id;
        const char* node;
        bool createFails;
        int32_t result;
    };
    const Row rows[] = {
        {kPlant, "", false, 0},
        {"", "", false, E_FAIL},
        {kPlant, "", true, CannotCreateServer},
        {"Sim.NoSubscribe.1", "", false, CannotSubscribe},
        {"Sim.NotRunning.1", "", false, CO_E_SERVER_EXEC_FAILURE},
        {kPlant, "SECURE1", false, E_ACCESSDENIED},
        {"Sim.Unknown.1", "", false, E_FAIL},
    };
    for (const Row& row : rows) {
        tp.plant.SetCreateFails(row.createFails);
        CvOpcAutoClient client(tp.platform);
        const ErrorInfo result = client.CreateServerAndGroup(row.id, row.node);
        EXPECT_EQ(result.Number, row.result) << row.id;
        const auto labels = Trace();
        EXPECT_EQ(Has(labels, std::string("Server.Connect ") + row.id + ", " + row.node),
                  !row.createFails && *row.id != '\0')
            << row.id;
        EXPECT_EQ(Has(labels, "CannotSubcribeError: " + result.Description),
                  row.result == CannotSubscribe);
    }
}

// Each step that fails ends the connection there with its error; only the
// client name may fail.
TEST_F(OpcClientTest, EachConnectionStepEndsItOnFailure) {
    constexpr int32_t kScripted = Hresult(0x80041234);
    struct Row {
        const char* failing;
        int32_t result;
        const char* lastCall;
    };
    const Row rows[] = {
        {"CreateServer", CannotCreateServer, "CreateServer"},
        {"ServerName", CannotCreateServer, "ServerName"},
        {"Connect", kScripted, "Connect"},
        {"SetClientName", 0, "SetIsSubscribed"},
        {"Add", kScripted, "Add"},
        {"SetIsActive", kScripted, "SetIsActive"},
        {"SetIsSubscribed", CannotSubscribe, "SetIsSubscribed"},
    };
    for (const Row& row : rows) {
        script.failures = {{row.failing, kScripted}};
        script.calls.clear();
        CvOpcAutoClient client(scripted);
        EXPECT_EQ(client.CreateServerAndGroup("X.1", "").Number, row.result) << row.failing;
        EXPECT_EQ(script.calls.back(), row.lastCall) << row.failing;
        EXPECT_EQ(Has(Trace(), "ClientName error"), row.result == 0) << row.failing;
    }
}

TEST_F(OpcClientTest, ConnectionNamesTheClientAndSetsTheBusyNotice) {
    tp.program.fileName = "cvopctestclient.bin";
    const auto client = Connected(tp.platform);
    std::vector<std::string> names;
    ASSERT_FALSE(tp.plant.ClientNames("", kPlant, names));
    EXPECT_EQ(names, std::vector<std::string>{"TESTPC;/opt/cvopctestclient\\cvopctestclient.exe"});
    EXPECT_EQ(tp.serverCalls.BusyText(),
              "Please wait...\r\n\r\nThe OPC Server, \"Sim.Plant.1\", is still busy.");
    EXPECT_EQ(client->ServerID(), kPlant);
    EXPECT_EQ(client->ServerNode(), "");
}

// The whole life of a client, as its trace tells it: connection, a read
// channel, a write channel of the same item (made active), an extra-group
// channel, advice, a channel added while advised, and going offline.
TEST_F(OpcClientTest, TraceTellsEveryCallInOrder) {
    const auto client = Connected(tp.platform);
    ASSERT_FALSE(client->AddChannel(NewChannel("Area1.Unit1.FIC101.PV")));
    ASSERT_FALSE(client->AddChannel(NewChannel("Area1.Unit1.FIC101.PV", 6)));
    ASSERT_FALSE(client->AddChannel(NewChannel("Signals.Ramp", 13)));
    ASSERT_FALSE(client->UpdateRate(1, 500));
    client->Advise(1, true);
    ASSERT_FALSE(client->AddChannel(NewChannel("Signals.Sine", 7)));
    ASSERT_FALSE(client->GoOffline());
    const std::vector<std::string> expected = {
        "Read server name", "Server.Connect Sim.Plant.1, ",
        "Server.ClientName = TESTPC;/opt/cvopctestclient\\cvopctestclient.exe",
        "Call Server.OPCGroups", "OPCGroups.Add Corvalent", "OPCGroup.IsActive = False",
        "OPCGroup.IsSubscribed = True",
        // a read channel
        "Read OpcGroup.OPCItems", "Read OpcGroup.IsActive", "OpcItems.GetOpcItem 1",
        "OpcItem.IsActive = True", "Read OpcItem.IsActive",
        // a write channel of the same item
        "Read OpcGroup.OPCItems", "Read OpcGroup.IsActive", "OpcItems.GetOpcItem 2",
        "OpcItem.IsActive = False", "Read OpcItem.IsActive", "OpcItem.IsActive = True",
        // the first extra-group channel
        "Call Server.OPCGroups", "OPCGroups.Add Corvalent2", "OPCGroup2.IsActive = False",
        "OPCGroup2.IsSubscribed = True", "OpcItems.GetOpcItem 3", "OpcItem.IsActive = True",
        "Read OpcItem.IsActive",
        // advice, then a write channel of its own item: it stays inactive
        "OPCGroup.UpdateRate = 500", "OPCGroup.IsActive = True", "Read OpcGroup.OPCItems",
        "Read OpcGroup.IsActive", "OpcGroup.IsActive = False", "OpcItems.GetOpcItem 4",
        "OpcItem.IsActive = False", "Read OpcItem.IsActive",
        // offline
        "OPCGroup.IsActive = False", "OPCGroup.IsActive = False", "Read OpcGroup.OPCItems",
        "OPCItems.Remove 3, 1", "OPCItems.Remove 1, 3", "Server.OPCGroups.RemoveAll",
        "Server.Disconnect"};
    EXPECT_EQ(Trace(), expected);
    for (const auto& channel : channels) {
        EXPECT_EQ(channel->OpcClient(), nullptr);
        EXPECT_FALSE(channel->IsOnline());
    }
    EXPECT_EQ(client->Channels().Count(), 0);
    EXPECT_EQ(client->ServerID(), "");
}

TEST_F(OpcClientTest, RefusedItemsLeaveTheChannelOut) {
    struct Row {
        const char* item;
        const char* path;
        int32_t result;
    };
    const Row rows[] = {
        {"Types.Memory.R8", "", 0},
        {"No.Such.Item", "", OPC_E_UNKNOWNITEMID},
        {"Bad..Item", "", OPC_E_INVALIDITEMID},
        {"Special.PathItem", "", OPC_E_UNKNOWNPATH},
        {"Special.PathItem", "COM1", 0},
    };
    const auto client = Connected(tp.platform);
    int32_t served = 0;
    for (const Row& row : rows) {
        Channel& channel = NewChannel(row.item, 0, row.path);
        EXPECT_EQ(client->AddChannel(channel).Number, row.result) << row.item;
        served += row.result == 0 ? 1 : 0;
        EXPECT_EQ(channel.OpcClient(), row.result == 0 ? client.get() : nullptr);
        EXPECT_EQ(client->Channels().Count(), served);
    }
}

// A failure after the server took the item takes the item back.
TEST_F(OpcClientTest, FailedAddChannelRemovesTheItemItAdded) {
    constexpr int32_t kScripted = Hresult(0x80041234);
    const std::pair<const char*, bool> rows[] = {
        {"IsActive", false}, {"AddItems", false}, {"GetOPCItem", true}, {"Item.SetIsActive", true}};
    for (const auto& [failing, added] : rows) {
        const auto client = Connected(scripted);
        script.failures = {{failing, kScripted}};
        script.calls.clear();
        Channel& channel = NewChannel("A.B");
        EXPECT_EQ(client->AddChannel(channel).Number, kScripted) << failing;
        EXPECT_EQ(script.Count("RemoveItems"), added ? 1 : 0) << failing;
        EXPECT_EQ(client->Channels().Count(), 0);
        EXPECT_EQ(channel.OpcClient(), nullptr);
        script.failures.clear();
    }
}

TEST_F(OpcClientTest, ExtraGroupIsMadeOnceAndRemovedWithItsChannels) {
    const auto client = Connected(tp.platform);
    Channel& main = NewChannel("Types.Memory.I4");
    Channel& extra1 = NewChannel("Types.Memory.R8", 13);
    Channel& extra2 = NewChannel("Types.Memory.I2", 13);
    for (Channel* channel : {&main, &extra1, &extra2}) {
        ASSERT_FALSE(client->AddChannel(*channel));
    }
    const auto added = Trace();
    EXPECT_EQ(std::count(added.begin(), added.end(), "OPCGroups.Add Corvalent2"), 1);
    extra1.GoOffline();
    EXPECT_EQ(Trace(), (std::vector<std::string>{"OPCItems.Remove 2, 2",
                                                 "Server.OPCGroups.Remove Corvalent2"}));
    EXPECT_EQ(client->Channels().Count(), 1);
    EXPECT_EQ(extra2.OpcClient(), nullptr);
    EXPECT_EQ(main.OpcClient(), client.get());
    EXPECT_EQ(client->SingleShotReadGroup(2).Number, 91);
    ASSERT_FALSE(client->AddChannel(NewChannel("Types.Memory.R8", 13)));
    EXPECT_TRUE(Has(Trace(), "OPCGroups.Add Corvalent2"));
}

}  // namespace
}  // namespace cv::test
