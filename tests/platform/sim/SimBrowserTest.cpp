#include "platform/sim/ErrorTexts.h"
#include "platform/sim/SimFixture.h"

namespace cv::sim::test {
namespace {

struct SimBrowserTest : SimFixture {
    std::unique_ptr<OPCServer> server = Connected("Sim.Plant.1");
    std::shared_ptr<platform::OPCBrowser> browser;

    void SetUp() override { ASSERT_FALSE(server->CreateBrowser(browser)); }

    std::vector<std::string> Listed() const {
        std::vector<std::string> names;
        for (int32_t i = 1; i <= browser->Count(); ++i) {
            std::string name;
            EXPECT_FALSE(browser->Item(i, name));
            names.push_back(name);
        }
        return names;
    }
    std::vector<std::string> Branches() {
        EXPECT_FALSE(browser->ShowBranches());
        return Listed();
    }
    std::vector<std::string> Leafs() {
        EXPECT_FALSE(browser->ShowLeafs());
        return Listed();
    }
};

using Names = std::vector<std::string>;

TEST_F(SimBrowserTest, WalksTheNamespaceBranchByBranch) {
    EXPECT_EQ(Branches(), (Names{"Area1", "Area2", "Signals", "Types", "Quality", "Special"}));
    EXPECT_EQ(Leafs(), Names{});
    for (const char* branch : {"area1", "Unit1", "FIC101"}) {
        ASSERT_FALSE(browser->MoveDown(branch)) << branch;
    }
    EXPECT_EQ(Branches(), Names{});
    EXPECT_EQ(Leafs(), (Names{"PV", "RAW", "SP", "OUT", "MODE", "EU"}));
    std::string id;
    EXPECT_FALSE(browser->GetItemID("pv", id));
    EXPECT_EQ(id, "Area1.Unit1.FIC101.PV");
    EXPECT_EQ(browser->GetItemID("Nothing", id).Number, E_INVALIDARG);
    EXPECT_EQ(browser->MoveDown("Nothing").Number, E_INVALIDARG);
    std::string name;
    EXPECT_EQ(browser->Item(0, name).Number, E_INVALIDARG);
    EXPECT_EQ(browser->Item(browser->Count() + 1, name).Number, E_INVALIDARG);

    ASSERT_FALSE(browser->MoveToRoot());
    ASSERT_FALSE(browser->MoveDown("Types"));
    EXPECT_EQ(Branches(), (Names{"ReadOnly", "Memory", "Arrays"}));
    EXPECT_FALSE(browser->GetItemID("Memory", id)) << "a branch has an ID too";
    EXPECT_EQ(id, "Types.Memory");
}

TEST_F(SimBrowserTest, AccessPathsComeAsAnArrayOrAnEmptyValue) {
    struct Case {
        const char* id;
        int32_t result;
        Variant paths;
    };
    const std::vector<Case> cases = {
        {"Special.PathItem", S_OK,
         Variant::Array(VT_BSTR, {Variant::Str("COM1"), Variant::Str("COM2")}, 1)},
        {"special.optionalpath", S_OK,
         Variant::Array(VT_BSTR, {Variant::Str("Fast"), Variant::Str("Slow")}, 1)},
        {"Signals.Ramp", S_OK, Variant()},
        {"Signals.Nothing", OPC_E_UNKNOWNITEMID, Variant()},
        {"Signals..Ramp", OPC_E_INVALIDITEMID, Variant()},
    };
    for (const Case& c : cases) {
        Variant paths = Variant::Str("untouched");
        EXPECT_EQ(browser->GetAccessPaths(c.id, paths).Number, c.result) << c.id;
        if (c.result == S_OK) {
            EXPECT_EQ(paths, c.paths) << c.id;
        }
    }
}

TEST_F(SimBrowserTest, AServerWithoutBrowsingAndAGoneServerRefuse) {
    std::shared_ptr<platform::OPCBrowser> none;
    EXPECT_EQ(Connected("Sim.NoBrowse.1")->CreateBrowser(none).Number, SimResult::E_NOINTERFACE);
    EXPECT_EQ(none, nullptr);
    EXPECT_EQ(NewServer()->CreateBrowser(none).Number, RPC_E_DISCONNECTED);

    ASSERT_FALSE(server->Disconnect());
    ASSERT_FALSE(server->Connect("Sim.Plant.1", ""));
    EXPECT_EQ(browser->ShowBranches().Number, RPC_E_DISCONNECTED) << "its session ended";
    server.reset();
    EXPECT_EQ(browser->MoveToRoot().Number, RPC_E_DISCONNECTED);
}

}  // namespace
}  // namespace cv::sim::test
