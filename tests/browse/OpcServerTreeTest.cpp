#include "browse/OpcServerTree.h"

#include <gtest/gtest.h>

#include <memory>

#include "browse/MousePointer.h"
#include "browse/ScriptedNetEnum.h"
#include "browse/TreeDump.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

using namespace platform;

struct OpcServerTreeTest : ::testing::Test {
    test::TestPlatform tp;
    TreeNodes nodes;
    std::vector<int16_t> pointer;
    MousePointer mousePointer{[this](int16_t code) { pointer.push_back(code); }};
    std::unique_ptr<OpcServerTree> tree;

    void Open(int32_t mode, const std::string& text = "", Platform* platform = nullptr) {
        tree = std::make_unique<OpcServerTree>(platform != nullptr ? *platform : tp.platform, nodes,
                                               mousePointer, mode, text);
        tree->Load();
    }
    TreeNodes::Id Node(const std::string& key) {
        const TreeNodes::Id id = nodes.Find(key);
        EXPECT_NE(id, 0) << key;
        return id;
    }
    void Expand(const std::string& key) { tree->Expand(Node(key)); }
    void Click(const std::string& key) { tree->NodeClick(Node(key)); }
    // Opens the network down to the computers of the domain "Plant".
    void OpenPlantDomain() {
        for (const char* key : {"N1", "E2", "D4"}) {
            Expand(key);
        }
    }
    std::string Under(const std::string& key) {
        std::string text;
        for (TreeNodes::Id child : nodes.Children(Node(key))) {
            text += nodes.Key(child) + " " + nodes.Text(child) + "\n";
        }
        return text;
    }
};

TEST_F(OpcServerTreeTest, OpensWithThisComputerAndTheNetworkBelowTheTop) {
    Open(BrowseMode::OpcServers);
    EXPECT_EQ(test::Dump(nodes),
              "M1 OPC Servers [AllOpcServers] +\n"
              "  C1 My Computer [MyComputer]\n"
              "    ...\n"
              "  N1 Network Neighborhood [NetNeighbor]\n"
              "    ...\n");
    EXPECT_EQ(tree->SelectedText(), "");
    EXPECT_EQ(pointer, (std::vector<int16_t>{11, 0})) << "the hourglass while the top fills";
    tree->OK();
    EXPECT_FALSE(tree->Chosen());
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST_F(OpcServerTreeTest, AServerOnThisComputerHandedInIsShownAndSelected) {
    Open(BrowseMode::OpcServers, "sim.slow.1");
    EXPECT_EQ(test::Dump(nodes),
              "M1 OPC Servers [AllOpcServers] +\n"
              "  C1 My Computer [MyComputer] +\n"
              "    L1 Sim.Plant.1 [OpcServer]\n"
              "    L2 Sim.NoBrowse.1 [OpcServer]\n"
              "    L3 Sim.Slow.1 [OpcServer] *\n"
              "    L4 Sim.Shutdown.1 [OpcServer]\n"
              "    L5 Sim.NoSubscribe.1 [OpcServer]\n"
              "    L6 Sim.NotRunning.1 [OpcServer]\n"
              "  N1 Network Neighborhood [NetNeighbor]\n"
              "    ...\n");
    EXPECT_EQ(tree->SelectedText(), "sim.slow.1") << "selecting is not clicking";
    tree->OK();
    EXPECT_FALSE(tree->Chosen());
    EXPECT_EQ(tree->ServerText(), "sim.slow.1");
}

TEST_F(OpcServerTreeTest, AServerOnAnotherComputerHandedInOpensNothing) {
    for (const char* text : {"\\\\OPCHOST1\\Sim.Plant.1", "\\\\"}) {
        nodes.Clear();
        Open(BrowseMode::OpcServers, text);
        EXPECT_FALSE(nodes.Expanded(Node("C1"))) << text;
        EXPECT_EQ(nodes.Selected(), 0) << text;
        EXPECT_EQ(tree->SelectedText(), text);
    }
}

TEST_F(OpcServerTreeTest, TheNetworkOpensDownToTheServersOfEachComputer) {
    Open(BrowseMode::OpcServers);
    OpenPlantDomain();
    EXPECT_EQ(Under("N1"), "E2 Entire Network\nE3 Entire Network\n");
    EXPECT_EQ(Under("E2"), "D4 Plant\nD5 Office\nD6 Workgroup\n");
    EXPECT_EQ(Under("D4"), "S7 Opchost1\nS8 Opchost2\nS9 Secure1\nS10 Field7\n");
    EXPECT_EQ(nodes.Image(Node("S7")), "Server");
    EXPECT_EQ(nodes.Image(Node("D4")), "Domain");
    EXPECT_EQ(nodes.Image(Node("E2")), "EntireNetwork");
    Expand("E3");
    EXPECT_EQ(Under("E3"), "") << "a provider without domains has no children";

    // Server keys are counted across the whole tree.
    Expand("S8");
    Expand("S7");
    Expand("C1");
    EXPECT_EQ(Under("S8"), "R1 Sim.Plant.1\nR2 Sim.Shutdown.1\n");
    EXPECT_EQ(Under("S7"), "R3 Sim.Plant.1\nR4 Sim.Slow.1\n");
    EXPECT_EQ(nodes.Key(nodes.FirstChild(Node("C1"))), "L5");
    Expand("D6");
    EXPECT_EQ(Under("D6"), "S11 Testpc\nS12 Laptop3\n");
}

TEST_F(OpcServerTreeTest, ClickingAServerChoosesItAndOKHandsItBack) {
    Open(BrowseMode::OpcServers, "Sim.Plant.1");
    OpenPlantDomain();
    Expand("S8");
    struct Case {
        const char* key;
        const char* selected;
    };
    const Case cases[] = {
        {"L3", "Sim.Slow.1"},
        {"R7", "\\\\Opchost2\\Sim.Plant.1"},
        {"S8", "\\\\Opchost2\\Sim.Plant.1"},  // a computer is no choice here
        {"D4", "\\\\Opchost2\\Sim.Plant.1"},
        {"L1", "Sim.Plant.1"},
        {"R8", "\\\\Opchost2\\Sim.Shutdown.1"},
    };
    for (const Case& c : cases) {
        Click(c.key);
        EXPECT_EQ(tree->SelectedText(), c.selected) << c.key;
        EXPECT_EQ(nodes.Selected(), Node(c.key));
    }
    tree->OK();
    EXPECT_TRUE(tree->Chosen());
    EXPECT_EQ(tree->ServerText(), "\\\\Opchost2\\Sim.Shutdown.1");
}

TEST_F(OpcServerTreeTest, OKWithTheTextHandedInChoosesNothing) {
    Open(BrowseMode::OpcServers, "Sim.Plant.1");
    Click("L2");
    Click("L1");
    tree->OK();
    EXPECT_FALSE(tree->Chosen());
    Click("L2");
    tree->OK();
    EXPECT_TRUE(tree->Chosen());
    EXPECT_EQ(tree->ServerText(), "Sim.NoBrowse.1");
}

TEST_F(OpcServerTreeTest, ADoubleClickChoosesOnlyWhatTheModeBrowsesFor) {
    struct Case {
        int32_t mode;
        const char* key;
        bool chooses;
    };
    const Case cases[] = {
        {BrowseMode::OpcServers, "L1", true},        {BrowseMode::OpcServers, "R7", true},
        {BrowseMode::OpcServers, "S7", false},       {BrowseMode::OpcServers, "C1", false},
        {BrowseMode::OpcServers, "D4", false},       {BrowseMode::NetworkComputers, "S7", true},
        {BrowseMode::NetworkComputers, "D4", false}, {BrowseMode::NetworkComputers, "N1", false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.key);
        nodes.Clear();
        Open(c.mode);
        EXPECT_FALSE(tree->DblClickChooses()) << "nothing selected";
        if (c.mode == BrowseMode::OpcServers) {
            Expand("C1");
            OpenPlantDomain();
            Expand("S7");
        } else {
            OpenPlantDomain();
        }
        Click(c.key);
        EXPECT_EQ(tree->DblClickChooses(), c.chooses);
    }
}

TEST_F(OpcServerTreeTest, AComputerThatDoesNotAnswerStaysEmptyWithoutAMessage) {
    Open(BrowseMode::OpcServers);
    OpenPlantDomain();
    pointer.clear();
    const uint32_t before = tp.events.TimeGetTime();
    Expand("S10");
    EXPECT_EQ(tp.events.TimeGetTime() - before, 20000u) << "it waited for the computer";
    EXPECT_EQ(tp.busy.Shown().size(), 1u) << "and said so past 5 s";
    EXPECT_FALSE(tp.busy.Visible());
    EXPECT_EQ(Under("S10"), "");
    EXPECT_TRUE(nodes.Expanded(Node("S10")));
    EXPECT_EQ(pointer, (std::vector<int16_t>{11, 0}));

    Expand("S9");  // access denied
    EXPECT_EQ(Under("S9"), "");
    tree->Collapse(Node("S10"));
    Expand("S10");
    EXPECT_EQ(tp.events.TimeGetTime() - before, 20000u) << "not asked again";
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST_F(OpcServerTreeTest, NothingIsListedWhereTheModeListsNoServers) {
    Open(BrowseMode::OpcHdaServers, "Sim.Plant.1");
    EXPECT_TRUE(nodes.Expanded(Node("C1")));
    EXPECT_EQ(Under("C1"), "");
    OpenPlantDomain();
    const uint32_t before = tp.events.TimeGetTime();
    Expand("S10");
    EXPECT_EQ(tp.events.TimeGetTime(), before) << "no server was asked";
    EXPECT_EQ(Under("S10"), "");
}

TEST_F(OpcServerTreeTest, BrowsingComputersShowsBareNamesWithoutExpandButtons) {
    Open(BrowseMode::NetworkComputers, "OLDPC");
    EXPECT_EQ(test::Dump(nodes), "N1 Network Neighborhood [NetNeighbor]\n  ...\n");
    for (const char* key : {"N1", "E2", "D4"}) {
        Expand(key);
    }
    EXPECT_TRUE(nodes.Children(Node("S7")).empty());
    Click("D4");
    EXPECT_EQ(tree->SelectedText(), "OLDPC");
    Click("S7");
    EXPECT_EQ(tree->SelectedText(), "Opchost1");
    tree->OK();
    EXPECT_EQ(tree->ServerText(), "Opchost1");
}

TEST_F(OpcServerTreeTest, SharesAndOtherResourcesAreNotShown) {
    test::ScriptedNetEnum net;
    net.containers[""].records = {
        test::ScriptedNetEnum::Record(kDisplayTypeShare, "\\\\A\\Public"),
        test::ScriptedNetEnum::Record(kDisplayTypeServer, "\\\\A"),
        test::ScriptedNetEnum::Record(kDisplayTypeGeneric, "Printers"),
        test::ScriptedNetEnum::Record(kDisplayTypeDomain, "DOM"),
        test::ScriptedNetEnum::Record(kDisplayTypeNetwork, "Net"),
        test::ScriptedNetEnum::Record(kDisplayTypeServer, "B"),
    };
    Platform platform{tp.dialogs,
                      tp.locale,
                      tp.program,
                      tp.help,
                      tp.computer,
                      tp.events,
                      tp.registry,
                      tp.profiles,
                      tp.run,
                      tp.plant,
                      tp.serverCalls,
                      tp.trace,
                      net,
                      tp.plant.DdeServers(),
                      tp.modeless};
    Open(BrowseMode::OpcServers, "", &platform);
    Expand("N1");
    EXPECT_EQ(Under("N1"), "S3 A\nD5 Dom\nE6 Entire Network\nS7 B\n");
}

TEST_F(OpcServerTreeTest, AFailingServerObjectEndsTheFillingQuietly) {
    Open(BrowseMode::OpcServers);
    tp.plant.SetCreateFails(true);
    Expand("C1");
    EXPECT_EQ(Under("C1"), "");
    tp.plant.SetCreateFails(false);
    Expand("C1");
    EXPECT_EQ(Under("C1"), "") << "the placeholder is gone: no retry";
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

}  // namespace
}  // namespace cv
