#include "platform/sim/ErrorTexts.h"
#include "platform/sim/SimFixture.h"

namespace cv::sim::test {
namespace {

using SimServerTest = SimFixture;

TEST_F(SimServerTest, ConnectAnswersAsTheComputerAndServerAre) {
    struct Case {
        const char* id;
        const char* node;
        int32_t result;
    };
    const Case cases[] = {
        {"Sim.Plant.1", "", S_OK},
        {"sim.plant.1", "MYPC", S_OK},
        {"Sim.Plant.1", "\\\\THISCOMPUTER", S_OK},
        {"Sim.Plant.1", "OPCHOST1", S_OK},
        {"No.Such.Server", "", E_FAIL},
        {"", "", E_FAIL},
        {"Sim.Shutdown.1", "OPCHOST1", E_FAIL},  // registered elsewhere only
        {"Sim.NotRunning.1", "", CO_E_SERVER_EXEC_FAILURE},
        {"Sim.Plant.1", "SECURE1", E_ACCESSDENIED},
        {"No.Such.Server", "SECURE1", E_ACCESSDENIED},
        {"Sim.Plant.1", "NOWHERE", RPC_S_SERVER_UNAVAILABLE},
    };
    for (const Case& c : cases) {
        auto server = NewServer();
        const ErrorInfo error = server->Connect(c.id, c.node);
        EXPECT_EQ(error.Number, c.result) << c.id << " on " << c.node;
        EXPECT_EQ(error.Description.empty(), c.result == S_OK) << c.id;
    }
    EXPECT_EQ(plant.LocalComputerName(), "MYPC");
}

TEST_F(SimServerTest, NameAndNodeAreWhatConnectWasGivenWhileConnected) {
    auto server = NewServer();
    std::string name = "?";
    std::string node = "?";
    EXPECT_FALSE(server->ServerName(name));
    EXPECT_EQ(name, "") << "the probe right after creation";
    ASSERT_FALSE(server->Connect("sim.plant.1", "opchost1"));
    EXPECT_FALSE(server->ServerName(name));
    EXPECT_FALSE(server->ServerNode(node));
    EXPECT_EQ(name + "|" + node, "sim.plant.1|opchost1");
    EXPECT_TRUE(server->Connect("Sim.Plant.1", "")) << "a second Connect must fail";
    EXPECT_FALSE(server->Disconnect());
    EXPECT_FALSE(server->ServerName(name));
    EXPECT_EQ(name, "");
}

TEST_F(SimServerTest, ASilentComputerKeepsTheCallWaitingWithEventsRunningThenFails) {
    int ticks = 0;
    events.StartTimer(1000, true, [&] { ++ticks; });
    wait.SetBusyText("busy FIELD7");
    auto server = NewServer();
    const uint32_t start = events.TimeGetTime();
    EXPECT_EQ(server->Connect("Sim.Plant.1", "FIELD7").Number, RPC_S_SERVER_UNAVAILABLE);
    EXPECT_EQ(events.TimeGetTime() - start, 20000u);
    EXPECT_EQ(ticks, 20);
    EXPECT_EQ(notice.Shown(), std::vector<std::string>{"busy FIELD7"});
    EXPECT_FALSE(notice.Visible());

    wait.SetCallLimit(10000);
    Variant servers;
    EXPECT_EQ(server->GetOPCServers("FIELD7", servers).Number, RPC_E_TIMEOUT);
}

TEST_F(SimServerTest, GetOPCServersListsEachComputersServers) {
    struct Case {
        std::optional<std::string> node;
        int32_t result;
        std::vector<std::string> ids;
    };
    const std::vector<Case> cases = {
        {std::nullopt,
         S_OK,
         {"Sim.Plant.1", "Sim.NoBrowse.1", "Sim.Slow.1", "Sim.Shutdown.1", "Sim.NoSubscribe.1",
          "Sim.NotRunning.1"}},
        {"OPCHOST1", S_OK, {"Sim.Plant.1", "Sim.Slow.1"}},
        {"FILESRV", S_OK, {}},
        {"SECURE1", E_ACCESSDENIED, {}},
        {"NOWHERE", RPC_S_SERVER_UNAVAILABLE, {}},
    };
    auto server = NewServer();
    for (const Case& c : cases) {
        Variant list;
        EXPECT_EQ(server->GetOPCServers(c.node, list).Number, c.result) << c.node.value_or("-");
        if (c.result == S_OK) {
            EXPECT_EQ(list.VarType(), VT_ARRAY | VT_BSTR);
            EXPECT_EQ(list.LowerBound(), 1);
            std::vector<std::string> ids;
            for (const Variant& id : list.Elements()) {
                ids.push_back(id.AsStr());
            }
            EXPECT_EQ(ids, c.ids) << c.node.value_or("-");
        }
    }
}

TEST_F(SimServerTest, GetErrorStringKnowsTheServersCodesOnly) {
    auto server = Connected("Sim.Plant.1");
    for (const int32_t code : {OPC_E_INVALIDHANDLE, OPC_E_BADTYPE, OPC_E_BADRIGHTS,
                               OPC_E_UNKNOWNITEMID, OPC_E_INVALIDITEMID, OPC_E_UNKNOWNPATH,
                               OPC_E_RANGE, OPC_E_DUPLICATENAME, E_FAIL, E_ACCESSDENIED}) {
        std::string text;
        EXPECT_FALSE(server->GetErrorString(code, text)) << code;
        EXPECT_FALSE(text.empty()) << code;
    }
    std::string text;
    EXPECT_EQ(server->GetErrorString(12345, text).Number, E_INVALIDARG);
    EXPECT_EQ(NewServer()->GetErrorString(OPC_E_RANGE, text).Number, RPC_E_DISCONNECTED);
}

TEST_F(SimServerTest, EveryCallOfTheSlowServerShowsTheBusyNotice) {
    wait.SetBusyText("slow");
    auto server = Connected("Sim.Slow.1");
    auto group = AddGroup(*server);
    EXPECT_EQ(notice.Shown().size(), 2u) << "Connect and OPCGroups.Add each took 6 s";
    EXPECT_EQ(events.TimeGetTime(), 12000u);

    ASSERT_FALSE(plant.SetCallDelay("", "Sim.Slow.1", 0));
    EXPECT_FALSE(group->SetIsActive(false));
    EXPECT_EQ(notice.Shown().size(), 2u);
    ASSERT_FALSE(plant.SetCallDelay("", "Sim.Slow.1", 31000));
    EXPECT_EQ(group->SetIsActive(true).Number, RPC_E_TIMEOUT);
}

TEST_F(SimServerTest, GroupsHaveUniqueNamesAndGoWithRemove) {
    auto server = Connected("Sim.Plant.1");
    auto& groups = server->OPCGroups();
    auto first = AddGroup(*server, "One");
    std::shared_ptr<OPCGroup> again;
    EXPECT_EQ(groups.Add("One", again).Number, OPC_E_DUPLICATENAME);
    auto unnamed = AddGroup(*server, "");
    EXPECT_FALSE(unnamed->Name().empty());
    EXPECT_EQ(groups.Count(), 2);
    EXPECT_EQ(groups.Remove("Nope").Number, E_INVALIDARG);
    EXPECT_FALSE(groups.Remove("One"));
    bool active = false;
    EXPECT_EQ(first->IsActive(active).Number, RPC_E_DISCONNECTED) << "a removed group";
    EXPECT_FALSE(groups.RemoveAll());
    EXPECT_EQ(groups.Count(), 0);
    EXPECT_EQ(unnamed->SetIsActive(true).Number, RPC_E_DISCONNECTED);
}

TEST_F(SimServerTest, ACreationFailureIsObjectCreation) {
    plant.SetCreateFails(true);
    std::unique_ptr<OPCServer> server;
    EXPECT_EQ(plant.CreateServer(server).Number, 429);
    EXPECT_EQ(server, nullptr);
}

TEST_F(SimServerTest, TheServerKnowsTheNamesItsClientsGaveThemselves) {
    auto server = Connected("Sim.Plant.1");
    EXPECT_FALSE(server->SetClientName("MYPC;/opt/client.exe"));
    std::vector<std::string> names;
    ASSERT_FALSE(plant.ClientNames("", "Sim.Plant.1", names));
    EXPECT_EQ(names, std::vector<std::string>{"MYPC;/opt/client.exe"});
    EXPECT_EQ(NewServer()->SetClientName("x").Number, RPC_E_DISCONNECTED);
}

}  // namespace
}  // namespace cv::sim::test
