#include <algorithm>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/opc/OpcResult.h"
#include "platform/ua/UaServer.h"
#include "platform/ua/live/LiveUaPlatform.h"

namespace cv::test {
namespace {

using namespace platform::OpcResult;
using platform::OneBased;

// The channels of the read-only variables get their first value, of the
// automation type each UA type maps to, with a time stamp.
TEST_F(LiveUaTest, ChannelsGetTheFirstValueOfEachType) {
    struct Row {
        const char* path;
        Variant value;
    };
    const Row rows[] = {
        {"Static.Boolean", Variant::Bool(true)},
        {"Static.Int16", Variant::I2(-12345)},
        {"Static.Int32", Variant::I4(-123456789)},
        {"Static.Float", Variant::R4(3.25f)},
        {"Static.Double", Variant::R8(2.718281828459045)},
        {"Static.String", Variant::Str("Flow ≥ 10 m³/h")},
        {"Static.LocalizedText", Variant::Str("Pumpe läuft")},
        {"Static.NodeId", Variant::Str("ns=1;s=Plant.Area1.FIC101")},
        {"Static.UInt32", Variant::R8(3123456789.0)},
    };
    for (const Row& row : rows) {
        AddChannel(row.path);
    }
    Channel& date = AddChannel("Static.DateTime");
    client.Advise(1, true);
    ASSERT_TRUE(WaitUntil([&] {
        return std::all_of(channels.begin(), channels.end(),
                           [](const auto& channel) { return channel->IsOnline(); });
    }));
    for (size_t i = 0; i < std::size(rows); ++i) {
        EXPECT_EQ(channels[i]->RawValue(), rows[i].value) << rows[i].path;
        EXPECT_GT(channels[i]->OpcTimeStamp(), 45000.0) << rows[i].path;
    }
    EXPECT_EQ(date.RawValue().VarType(), VT_DATE);
    EXPECT_NEAR(date.RawValue().AsR8(), 45366.52, 0.1);  // 2024-03-15 12:34 UTC
}

// A device read straight through the automation interface: each status
// becomes its quality; bad item IDs and access paths are refused per item.
TEST_F(LiveUaTest, DeviceReadsGiveQualitiesAndItemsTheirErrors) {
    std::unique_ptr<platform::OPCServer> server;
    ASSERT_FALSE(lp.servers.CreateServer(server));
    ASSERT_FALSE(server->Connect(url, ""));
    EXPECT_EQ(server->BackendName(), uaopc::UaServer::kBackendName);
    std::shared_ptr<platform::OPCGroup> group;
    ASSERT_FALSE(server->OPCGroups().Add("Reads", group));
    struct Row {
        std::string itemId;
        std::string path;
        int32_t error;
        int32_t quality;
    };
    const std::vector<Row> rows = {
        {"ns=1;s=Quality.Good", "", 0, 0xC0},
        {"ns=1;s=Quality.Good_LocalOverride", "", 0, 0xD8},
        {"ns-1;s-Quality.Uncertain_SensorNotAccurate_LimitLow", "", 0, 0x51},
        {"ns=1;s=Quality.Bad_SensorFailure_LimitConstant", "", 0, 0x13},
        {"ns=1;s=Quality.Bad_WaitingForInitialData", "", 0, 0x20},
        {"ns=1;s=No.Such.Node", "", OPC_E_UNKNOWNITEMID, 0},
        {"ns=1;x=Broken", "", OPC_E_INVALIDITEMID, 0},
        {"ns=1;s=Quality.Good", "Path", OPC_E_UNKNOWNPATH, 0},
    };
    OneBased<std::string> ids;
    OneBased<std::string> paths;
    OneBased<int32_t> clientHandles;
    for (const Row& row : rows) {
        ids.Add(row.itemId);
        paths.Add(row.path);
        clientHandles.Add(clientHandles.Count() + 1);
    }
    const auto count = static_cast<int32_t>(rows.size());
    OneBased<int32_t> handles;
    OneBased<int32_t> errors;
    ASSERT_FALSE(group->OPCItems().AddItems(count, ids, clientHandles, paths, handles, errors));
    OneBased<int32_t> added;
    for (int32_t i = 1; i <= count; ++i) {
        EXPECT_EQ(errors(i), rows[i - 1].error) << rows[i - 1].itemId;
        if (errors(i) == 0) {
            added.Add(handles(i));
        }
    }
    OneBased<Variant> values;
    OneBased<int32_t> readErrors;
    OneBased<int32_t> qualities;
    OneBased<double> stamps;
    OneBased<platform::ValueDetail> details;
    ASSERT_FALSE(group->SyncRead(platform::OpcDataSource::Device, added.Count(), added, values,
                                 readErrors, qualities, stamps, details));
    ASSERT_EQ(details.Count(), added.Count());
    for (int32_t i = 1; i <= added.Count(); ++i) {
        EXPECT_EQ(readErrors(i), 0) << rows[i - 1].itemId;
        EXPECT_EQ(qualities(i), rows[i - 1].quality) << rows[i - 1].itemId;
        EXPECT_EQ(values(i), Variant::R8(12.5)) << rows[i - 1].itemId;
        EXPECT_GT(stamps(i), 45000.0) << rows[i - 1].itemId;
    }
    std::string text;
    ASSERT_FALSE(server->GetErrorString(OPC_E_UNKNOWNITEMID, text));
    EXPECT_EQ(text, "Bad_NodeIdUnknown: The node id refers to a node that does not exist.");
}

// A text written through a channel reaches the variable in its own type and
// reads back; a read-only variable refuses it with the server's words.
TEST_F(LiveUaTest, WritesOfEachTypeReadBackAndReadOnlyVariablesRefuse) {
    struct Row {
        const char* path;
        const char* text;
        Variant readBack;
    };
    const Row rows[] = {
        {"Memory.Boolean", "0", Variant::Bool(false)},
        {"Memory.Int16", "-321", Variant::I2(-321)},
        {"Memory.Int32", "654321", Variant::I4(654321)},
        {"Memory.Float", "1.5", Variant::R4(1.5f)},
        {"Memory.Double", "-0.125", Variant::R8(-0.125)},
        {"Memory.String", "Neu", Variant::Str("Neu")},
        {"Memory.Byte", "17", Variant::I2(17)},
        {"Memory.UInt32", "4000000000", Variant::R8(4e9)},
    };
    for (const Row& row : rows) {
        Channel& channel = AddChannel(row.path);
        ErrorInfo error;
        EXPECT_EQ(client.SendValue(channel, row.text, error), "") << row.path;
        EXPECT_FALSE(error) << row.path << " " << error.Description;
        ASSERT_FALSE(client.SingleShotReadOneItem(channel)) << row.path;
        EXPECT_EQ(channel.RawValue(), row.readBack) << row.path;
    }
    Channel& readOnly = AddChannel("Static.Double");
    ErrorInfo error;
    EXPECT_EQ(client.SendValue(readOnly, "1", error),
              "Error message from OPC Server: \"Bad_NotWritable: The access level does not "
              "allow writing.\".");
}

// The item browser walks from the Objects folder down to a leaf; a folder
// larger than one Browse answer is listed whole.
TEST_F(LiveUaTest, BrowserWalksTheFoldersToALeaf) {
    std::unique_ptr<platform::OPCServer> server;
    ASSERT_FALSE(lp.servers.CreateServer(server));
    ASSERT_FALSE(server->Connect(url, ""));
    std::shared_ptr<platform::OPCBrowser> browser;
    ASSERT_FALSE(server->CreateBrowser(browser));
    const auto names = [&] {
        std::vector<std::string> list;
        for (int32_t i = 1; i <= browser->Count(); ++i) {
            std::string name;
            EXPECT_FALSE(browser->Item(i, name));
            list.push_back(name);
        }
        return list;
    };
    const auto has = [](const std::vector<std::string>& list, const std::string& name) {
        return std::find(list.begin(), list.end(), name) != list.end();
    };
    ASSERT_FALSE(browser->ShowBranches());
    EXPECT_TRUE(has(names(), "Plant"));
    EXPECT_TRUE(has(names(), "Large"));
    for (const char* branch : {"Plant", "Area1", "FIC101"}) {
        ASSERT_FALSE(browser->MoveDown(branch)) << branch;
    }
    ASSERT_FALSE(browser->ShowLeafs());
    const std::vector<std::string> leaves = names();
    EXPECT_TRUE(has(leaves, "PV"));
    EXPECT_FALSE(has(leaves, "EURange"));
    std::string itemId;
    ASSERT_FALSE(browser->GetItemID("PV", itemId));
    EXPECT_EQ(itemId, "ns=1;s=Plant.Area1.FIC101.PV");
    Variant paths;
    ASSERT_FALSE(browser->GetAccessPaths(itemId, paths));
    EXPECT_TRUE(paths.IsEmpty());
    ASSERT_FALSE(browser->MoveToRoot());
    ASSERT_FALSE(browser->MoveDown("Large"));
    ASSERT_FALSE(browser->ShowLeafs());
    EXPECT_EQ(browser->Count(), 3000);
}

// The server list of this computer holds the peer (found by FindServers at
// the discovery port of localhost) after the plant's own servers; a port
// nobody answers on adds nothing.
TEST_F(LiveUaTest, DiscoveryListsThePeerAfterThePlantsServers) {
    std::unique_ptr<platform::OPCServer> server;
    ASSERT_FALSE(lp.servers.CreateServer(server));
    Variant list;
    ASSERT_FALSE(server->GetOPCServers(std::nullopt, list));
    std::vector<std::string> ids;
    for (const Variant& id : list.Elements()) {
        ids.push_back(id.AsStr());
    }
    ASSERT_FALSE(ids.empty());
    EXPECT_EQ(ids.back().rfind("opc.tcp://localhost:" + std::to_string(PeerPort()), 0), 0u)
        << ids.back();
    EXPECT_GT(ids.size(), 1u);

    uaopc::UaOptions options;
    options.discoveryPort = 9;  // discard: nothing listens there
    options.discoveryTimeoutMs = 500;
    uaopc::UaBackend silent(lp.serverCalls, options);
    EXPECT_TRUE(silent.FindServers("127.0.0.1").empty());
    EXPECT_TRUE(lp.dialogs.Messages().empty());
}

// Runs against a peer of its own, which it shuts down: the client goes
// offline and says so once.
TEST_F(LiveUaTest, PeerShutdownTakesTheClientOffline) {
    Channel& channel = AddChannel("Dynamic.Counter");
    client.Advise(1, true);
    ASSERT_TRUE(WaitUntil([&] { return channel.IsOnline(); }));
    for (const auto& [path, text] :
         {std::pair("Control.ShutdownReason", "Maintenance"),
          std::pair("Control.ShutdownDelay", "300"), std::pair("Control.Shutdown", "1")}) {
        ErrorInfo error;
        EXPECT_EQ(client.SendValue(AddChannel(path), text, error), "") << path;
    }
    ASSERT_TRUE(WaitUntil([&] { return client.ServerID().empty(); }));
    lp.events.WaitUntil([] { return false; }, 1'000);
    ASSERT_EQ(lp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(lp.dialogs.Last().text, "The OPC Server has been shutdown");
    EXPECT_FALSE(channel.IsOnline());
}

}  // namespace
}  // namespace cv::test
