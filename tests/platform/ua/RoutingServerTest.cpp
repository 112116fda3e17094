#include "platform/opc/RoutingServerFactory.h"

#include <gtest/gtest.h>

#include "platform/ServerCallWait.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/VirtualEventLoop.h"
#include "platform/opc/OpcResult.h"
#include "platform/sim/PlantLoader.h"
#include "platform/sim/SimulatedPlant.h"

namespace cv::platform {
namespace {

using namespace OpcResult;

// A backend whose servers are "fake://" addresses: Connect takes the
// backend's delay (events run meanwhile), then works. It finds the servers
// it was told to and knows one by name.
class FakeBackend : public ServerBackend {
  public:
    explicit FakeBackend(ServerCallWait& wait) : wait_(wait) {}

    class NoGroups : public OPCGroups {
      public:
        int32_t Count() const override { return 0; }
        ErrorInfo Add(const std::string&, std::shared_ptr<OPCGroup>&) override {
            return {E_NOTIMPL, ""};
        }
        ErrorInfo Remove(const std::string&) override { return {E_NOTIMPL, ""}; }
        ErrorInfo RemoveAll() override { return {E_NOTIMPL, ""}; }
    };

    class Server : public OPCServer {
      public:
        explicit Server(FakeBackend& backend) : backend_(backend) {}
        ~Server() override { *alive_ = false; }
        ErrorInfo ServerName(std::string& sName) const override {
            sName = address_;
            return {};
        }
        ErrorInfo ServerNode(std::string& sNode) const override {
            sNode.clear();
            return {};
        }
        ErrorInfo Connect(const std::string& sProgID, const std::string& sNode) override {
            FakeBackend& backend = backend_;
            const auto alive = alive_;
            backend.connects.emplace_back(sProgID, sNode);
            bool done = false;
            const auto timer =
                backend.wait_.Events().StartTimer(backend.delayMs, false, [&done] { done = true; });
            const ErrorInfo waited = backend.wait_.Wait([&] { return done || !*alive; });
            backend.wait_.Events().StopTimer(timer);
            if (waited || !*alive) {
                return waited ? waited : ErrorInfo{RPC_E_DISCONNECTED, "released"};
            }
            address_ = sProgID;
            backend.connected = this;
            return {};
        }
        ErrorInfo SetClientName(const std::string&) override { return {}; }
        platform::OPCGroups& OPCGroups() override { return groups_; }
        ErrorInfo GetOPCServers(const std::optional<std::string>&, Variant&) override {
            return {E_NOTIMPL, ""};
        }
        ErrorInfo CreateBrowser(std::shared_ptr<OPCBrowser>&) override { return {E_NOTIMPL, ""}; }
        ErrorInfo GetErrorString(int32_t, std::string& sText) override {
            sText = "fake text";
            return {};
        }
        ErrorInfo Disconnect() override {
            backend_.disconnects++;
            return {};
        }
        void SetShutDownHandler(ShutDownHandler handler) override { handler_ = std::move(handler); }
        std::string BackendName() const override { return "fake"; }
        void ShutDown(const std::string& reason) { handler_(reason); }

      private:
        FakeBackend& backend_;
        std::shared_ptr<bool> alive_ = std::make_shared<bool>(true);
        NoGroups groups_;
        std::string address_;
        ShutDownHandler handler_;
    };

    ErrorInfo CreateServer(std::unique_ptr<OPCServer>& cServer) override {
        cServer = std::make_unique<Server>(*this);
        return {};
    }
    bool Serves(const std::string& sProgID) const override {
        return sProgID.starts_with("fake://");
    }
    std::vector<std::string> FindServers(const std::string& sNode) override {
        asked.push_back(sNode);
        return found;
    }
    std::optional<std::string> FindServerNamed(const std::string& sName,
                                               const std::string& sNode) override {
        asked.push_back(sNode);
        return sName == "Fake Server" ? std::optional<std::string>("fake://named") : std::nullopt;
    }

    std::vector<std::string> found;
    std::vector<std::string> asked;
    std::vector<std::pair<std::string, std::string>> connects;
    uint32_t delayMs = 0;
    int disconnects = 0;
    Server* connected = nullptr;

  private:
    ServerCallWait& wait_;
};

struct RoutingServerTest : ::testing::Test {
    fake::VirtualEventLoop events;
    fake::RecordingBusyNotice notice;
    ServerCallWait wait{events, notice};
    sim::SimulatedPlant plant{sim::BuiltInPlant(), wait, sim::PlantOptions{"MYPC", 45658.0}};
    FakeBackend addressed{wait};
    RoutingServerFactory factory{plant, addressed};

    std::unique_ptr<OPCServer> NewServer() {
        std::unique_ptr<OPCServer> server;
        EXPECT_FALSE(factory.CreateServer(server));
        return server;
    }
    static std::vector<std::string> Texts(const Variant& list) {
        std::vector<std::string> texts;
        for (const Variant& text : list.Elements()) {
            texts.push_back(text.AsStr());
        }
        return texts;
    }
};

struct Route {
    const char* id;
    const char* node;
    const char* backend;
    const char* connectedTo;  // what the addressed backend was asked for
};

TEST_F(RoutingServerTest, AddressesGoToTheirBackendOtherIdsToThePlantAndUnknownNamesAreLookedUp) {
    const Route routes[] = {
        {"fake://plant2:4840/x", "", "fake", "fake://plant2:4840/x"},
        {"Sim.Plant.1", "", "simulated plant", nullptr},
        {"Fake Server", "PLANT9", "fake", "fake://named"},
    };
    for (const Route& route : routes) {
        addressed.connects.clear();
        auto server = NewServer();
        EXPECT_EQ(server->BackendName(), "") << "before Connect";
        ASSERT_FALSE(server->Connect(route.id, route.node)) << route.id;
        EXPECT_EQ(server->BackendName(), route.backend) << route.id;
        std::string name;
        std::string node;
        EXPECT_FALSE(server->ServerName(name));
        EXPECT_FALSE(server->ServerNode(node));
        EXPECT_EQ(name, route.id);
        EXPECT_EQ(node, route.node);
        if (route.connectedTo) {
            ASSERT_EQ(addressed.connects.size(), 1u) << route.id;
            EXPECT_EQ(addressed.connects[0].first, route.connectedTo);
            EXPECT_EQ(addressed.connects[0].second, route.node);
        } else {
            EXPECT_TRUE(addressed.connects.empty()) << route.id;
        }
    }
}

TEST_F(RoutingServerTest, AnIdNobodyKnowsKeepsThePlantsErrorAndDisconnectingForgetsTheRoute) {
    auto server = NewServer();
    EXPECT_EQ(server->Connect("Nobody.Here", "").Number, E_FAIL);
    EXPECT_EQ(server->Connect("Nobody.Here", "NOSUCHPC").Number, RPC_S_SERVER_UNAVAILABLE);
    EXPECT_EQ(addressed.asked, (std::vector<std::string>{"", "NOSUCHPC"}));
    EXPECT_TRUE(addressed.connects.empty());

    ASSERT_FALSE(server->Connect("fake://a", ""));
    EXPECT_EQ(server->Connect("Sim.Plant.1", "").Number, E_FAIL) << "connected already";
    EXPECT_FALSE(server->Disconnect());
    EXPECT_EQ(addressed.disconnects, 1);
    EXPECT_EQ(server->BackendName(), "");
    ASSERT_FALSE(server->Connect("Sim.Plant.1", ""));
    EXPECT_EQ(server->BackendName(), "simulated plant");
}

TEST_F(RoutingServerTest, ListsThePlantsServersFollowedByTheOnesFound) {
    auto server = NewServer();
    Variant plantOnly;
    ASSERT_FALSE(server->GetOPCServers(std::nullopt, plantOnly));
    ASSERT_FALSE(Texts(plantOnly).empty());

    addressed.found = {"opc.tcp://localhost:4840/a", "opc.tcp://localhost:4841"};
    Variant both;
    ASSERT_FALSE(server->GetOPCServers(std::nullopt, both));
    std::vector<std::string> expected = Texts(plantOnly);
    expected.insert(expected.end(), addressed.found.begin(), addressed.found.end());
    EXPECT_EQ(Texts(both), expected);
    EXPECT_EQ(both.VarType(), VT_ARRAY | VT_BSTR);
    EXPECT_EQ(both.LowerBound(), 1);

    Variant foundOnly;
    ASSERT_FALSE(server->GetOPCServers("NOSUCHPC", foundOnly));
    EXPECT_EQ(Texts(foundOnly), addressed.found);
    addressed.found.clear();
    EXPECT_EQ(server->GetOPCServers("NOSUCHPC", foundOnly).Number, RPC_S_SERVER_UNAVAILABLE);
    EXPECT_EQ(addressed.asked, (std::vector<std::string>{"", "", "NOSUCHPC", "NOSUCHPC"}));
}

TEST_F(RoutingServerTest, TheShutdownOfEitherBackendReachesTheHandlerSetLast) {
    auto server = NewServer();
    std::vector<std::string> heard;
    server->SetShutDownHandler([&heard](const std::string&) { heard.push_back("old"); });
    ASSERT_FALSE(server->Connect("fake://a", ""));
    server->SetShutDownHandler([&heard](const std::string& reason) { heard.push_back(reason); });
    addressed.connected->ShutDown("going down");
    EXPECT_EQ(heard, (std::vector<std::string>{"going down"}));

    auto simServer = NewServer();
    simServer->SetShutDownHandler([&heard](const std::string& reason) { heard.push_back(reason); });
    ASSERT_FALSE(simServer->Connect("Sim.Plant.1", ""));
    ASSERT_FALSE(plant.ShutDownServer("", "Sim.Plant.1", "maintenance"));
    events.DoEvents();
    EXPECT_EQ(heard, (std::vector<std::string>{"going down", "maintenance"}));
}

TEST_F(RoutingServerTest, ReleasingTheServerWhileItsConnectWaitsEndsTheConnect) {
    addressed.delayMs = 1000;
    auto server = NewServer();
    events.StartTimer(10, false, [&server] { server.reset(); });
    const ErrorInfo error = server->Connect("fake://slow", "");
    EXPECT_EQ(error.Number, RPC_E_DISCONNECTED);
    EXPECT_EQ(server, nullptr);
}

}  // namespace
}  // namespace cv::platform
