#include "browse/OpcItemTree.h"

#include <gtest/gtest.h>

#include <memory>

#include "browse/MousePointer.h"
#include "browse/TreeDump.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

using Strings = std::vector<std::string>;

struct OpcItemTreeTest : ::testing::Test {
    test::TestPlatform tp;
    TreeNodes nodes;
    std::vector<int16_t> pointer;
    MousePointer mousePointer{[this](int16_t code) { pointer.push_back(code); }};
    std::unique_ptr<OpcItemTree> tree;

    bool Connect(const std::string& server, const std::string& computer = "",
                 const std::string& item = "", const std::string& path = "",
                 bool branches = false) {
        tree = std::make_unique<OpcItemTree>(tp.platform, nodes, mousePointer, server, computer,
                                             item, path, branches);
        return tree->Connect();
    }
    void Open(const std::string& server, const std::string& item = "", const std::string& path = "",
              bool branches = false) {
        ASSERT_TRUE(Connect(server, "", item, path, branches));
        tree->Load();
    }
    // The node with that text under the parent (0: the root's children).
    TreeNodes::Id Child(const std::string& text, TreeNodes::Id parent = 0) {
        const TreeNodes::Id under = parent != 0 ? parent : nodes.First();
        for (TreeNodes::Id child : nodes.Children(under)) {
            if (nodes.Text(child) == text) {
                return child;
            }
        }
        ADD_FAILURE() << "no " << text;
        return 0;
    }
    // Opens the branches of a dotted path and answers the last node.
    TreeNodes::Id OpenPath(const std::string& path) {
        TreeNodes::Id node = 0;
        size_t start = 0;
        for (;;) {
            const size_t dot = path.find('.', start);
            node = Child(path.substr(start, dot - start), node);
            if (dot == std::string::npos) {
                return node;
            }
            tree->Expand(node);
            start = dot + 1;
        }
    }
    Strings Texts(TreeNodes::Id parent) {
        Strings texts;
        for (TreeNodes::Id child : nodes.Children(parent)) {
            texts.push_back(nodes.Text(child));
        }
        return texts;
    }
    int Connections(const std::string& server, const std::string& computer = "") {
        std::vector<std::string> names;
        EXPECT_FALSE(tp.plant.ClientNames(computer, server, names));
        return static_cast<int>(names.size());
    }
};

TEST_F(OpcItemTreeTest, ConnectionFailuresAreToldAndTheConnectionIsDropped) {
    struct Case {
        const char* server;
        const char* computer;
        bool createFails;
        const char* message;
    };
    const Case cases[] = {
        {"", "", false,
         "Cannot connect to the OPC Server \"\" in this computer.\r\nError (0x0) - "},
        {"Sim.None.1", "", false,
         "Cannot connect to the OPC Server \"Sim.None.1\" in this computer.\r\n"
         "Error (0x80004005) - Unspecified error."},
        {"Sim.Plant.1", "SECURE1", false,
         "Cannot connect to the OPC Server \"Sim.Plant.1\" in computer \"\\\\SECURE1\".\r\n"
         "Error (0x80070005) - Access is denied."},
        {"Sim.NotRunning.1", "", false,
         "Cannot connect to the OPC Server \"Sim.NotRunning.1\" in this computer.\r\n"
         "Error (0x80080005) - The server process could not be started."},
        {"Sim.Plant.1", "", true,
         "Cannot connect to the OPC Server \"Sim.Plant.1\" in this computer.\r\n"
         "Error (0x1AD) - ActiveX component can't create object"},
        {"Sim.NoBrowse.1", "", false,
         "The OPC Server \"Sim.NoBrowse.1\" does not support browsing for Item names."},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.message);
        tp.dialogs.Clear();
        pointer.clear();
        tp.plant.SetCreateFails(c.createFails);
        const std::string busyText = tp.serverCalls.BusyText();
        EXPECT_FALSE(Connect(c.server, c.computer));
        if (*c.server == '\0') {
            EXPECT_EQ(tp.serverCalls.BusyText(), busyText) << "nothing was set up";
        }
        ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
        EXPECT_EQ(tp.dialogs.Last().text, c.message);
        EXPECT_EQ(tp.dialogs.Last().style, MsgBoxStyle::Exclamation);
        EXPECT_EQ(pointer.back(), MousePointer::kDefault);
    }
    EXPECT_EQ(Connections("Sim.NoBrowse.1"), 0);
}

TEST_F(OpcItemTreeTest, ConnectingSetsUpTheBusyNoticeForTheServer) {
    ASSERT_TRUE(Connect("Sim.Plant.1", "OPCHOST1"));
    EXPECT_EQ(tp.serverCalls.BusyText(),
              "Please wait...\r\n\r\nThe OPC Server, \"Sim.Plant.1\", in computer \"OPCHOST1\", "
              "is still busy.");
    EXPECT_EQ(pointer, std::vector<int16_t>{MousePointer::kHourglass});
    EXPECT_EQ(Connections("Sim.Plant.1", "OPCHOST1"), 1);
    tree->Load();
    EXPECT_EQ(pointer.back(), MousePointer::kDefault);
    EXPECT_EQ(nodes.Text(nodes.First()), "\\\\OPCHOST1\\Sim.Plant.1");
    tree->Disconnect();
    EXPECT_EQ(Connections("Sim.Plant.1", "OPCHOST1"), 0);
}

TEST_F(OpcItemTreeTest, TheRootShowsTheServersTopLevel) {
    Open("Sim.Plant.1");
    EXPECT_EQ(test::Dump(nodes),
              "k1 Sim.Plant.1 [OpcServer] +\n"
              "  k2 Area1 [ClosedFolder]\n    ...\n"
              "  k3 Area2 [ClosedFolder]\n    ...\n"
              "  k4 Signals [ClosedFolder]\n    ...\n"
              "  k5 Types [ClosedFolder]\n    ...\n"
              "  k6 Quality [ClosedFolder]\n    ...\n"
              "  k7 Special [ClosedFolder]\n    ...\n");
    EXPECT_TRUE(tp.dialogs.Messages().empty());
    const TreeNodes::Id unit1 = OpenPath("Area1.Unit1");
    tree->Expand(unit1);
    EXPECT_EQ(nodes.Key(unit1), "k8") << "branch keys go on counting";
    EXPECT_EQ(Texts(unit1), (Strings{"FIC101", "TIC102"}));
    EXPECT_EQ(nodes.Key(Child("TIC102", unit1)), "k11");
    const TreeNodes::Id fic = Child("FIC101", unit1);
    tree->Expand(fic);
    EXPECT_EQ(Texts(fic), (Strings{"PV", "RAW", "SP", "OUT", "MODE", "EU"}));
    EXPECT_EQ(nodes.Key(Child("PV", fic)), "") << "leaves have no key";
    EXPECT_EQ(nodes.Image(Child("PV", fic)), "ItemID");
    EXPECT_EQ(nodes.Image(fic), "OpenFolder");
    tree->Collapse(fic);
    EXPECT_EQ(nodes.Image(fic), "ClosedFolder");
}

TEST_F(OpcItemTreeTest, TheItemHandedInOpensTheTreeDownToItsLeaf) {
    struct Case {
        const char* item;
        const char* path;
        const char* selected;
        Strings paths;
        const char* shown;
    };
    const Case cases[] = {
        {"Area1.Unit1.FIC101.PV", "", "PV", {}, "Area1.Unit1.FIC101.PV"},
        // The path handed in comes first in its own spelling, and once.
        {"Special.PathItem", "com2", "PathItem", {"com2", "COM1"}, "Special.PathItem"},
        {"Special.OptionalPath", "", "OptionalPath", {"Fast", "Slow"}, "Special.OptionalPath"},
        {"Special.OptionalPath",
         "Other",
         "OptionalPath",
         {"Other", "Fast", "Slow"},
         "Special.OptionalPath"},
        // Parts that match nothing are passed over.
        {"Area2.Nothing.Unit3", "", "Unit3", {}, "Area2.Nothing.Unit3"},
        {"area1.unit1", "Path", "", {"Path"}, "area1.unit1"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.item);
        nodes.Clear();
        Open("Sim.Plant.1", c.item, c.path);
        const TreeNodes::Id selected = nodes.Selected();
        EXPECT_EQ(selected == 0 ? "" : nodes.Text(selected), std::string(c.selected));
        EXPECT_EQ(tree->AccessPaths(), c.paths);
        EXPECT_EQ(tree->AccessPathIndex(), c.paths.empty() ? -1 : 0);
        EXPECT_EQ(tree->ItemIDText(), c.shown);
        EXPECT_TRUE(tp.dialogs.Messages().empty());
    }
}

TEST_F(OpcItemTreeTest, ClickingALeafShowsItsItemIDAndAccessPaths) {
    Open("Sim.Plant.1", "", "Fast");
    const TreeNodes::Id special = OpenPath("Special");
    tree->Expand(special);
    tree->NodeClick(Child("OptionalPath", special));
    EXPECT_EQ(tree->ItemIDText(), "Special.OptionalPath");
    EXPECT_EQ(tree->AccessPaths(), (Strings{"Fast", "Slow"}));
    EXPECT_EQ(tree->AccessPathText(), "Fast");
    tree->SelectAccessPath(1);
    EXPECT_EQ(tree->AccessPathText(), "Slow");
    tree->SelectAccessPath(7);
    EXPECT_EQ(tree->AccessPathText(), "");

    tree->NodeClick(Child("ReadOnly", special));
    EXPECT_EQ(tree->ItemIDText(), "Special.ReadOnly");
    EXPECT_EQ(tree->AccessPaths(), Strings{"Fast"}) << "the path handed in stays";
    tree->NodeClick(special);
    EXPECT_EQ(tree->ItemIDText(), "Special.ReadOnly") << "a branch is no choice";
}

TEST_F(OpcItemTreeTest, BranchesCanBeChosenWhenAllowed) {
    Open("Sim.Plant.1", "", "", true);
    const TreeNodes::Id unit = OpenPath("Area2.Unit3");
    tree->NodeClick(unit);
    EXPECT_EQ(tree->ItemIDText(), "Area2.Unit3");
    tree->NodeClick(nodes.First());
    EXPECT_EQ(tree->ItemIDText(), "");
    tree->Expand(unit);
    tree->Expand(Child("PIC201", unit));
    tree->NodeClick(Child("EU", Child("PIC201", unit)));
    EXPECT_EQ(tree->ItemIDText(), "Area2.Unit3.PIC201.EU");
}

TEST_F(OpcItemTreeTest, OKReportsOnlyAChange) {
    struct Case {
        const char* item;
        const char* path;
        const char* click;  // a leaf of Special, or none
        bool changed;
        const char* newItem;
        const char* newPath;
    };
    const Case cases[] = {
        {"Special.ReadOnly", "", nullptr, false, "Special.ReadOnly", ""},
        {"Special.PathItem", "COM1", nullptr, false, "Special.PathItem", "COM1"},
        {"Special.ReadOnly", "", "NaN", true, "Special.NaN", ""},
        // A leaf with paths offers its first one when none was handed in.
        {"Special.ReadOnly", "", "PathItem", true, "Special.PathItem", "COM1"},
        {"Whatever", "", nullptr, false, "Whatever", ""},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.item);
        nodes.Clear();
        Open("Sim.Plant.1", c.item, c.path);
        if (c.click != nullptr) {
            const TreeNodes::Id special = OpenPath("Special");
            tree->Expand(special);
            tree->NodeClick(Child(c.click, special));
        }
        tree->OK();
        EXPECT_EQ(tree->Changed(), c.changed);
        EXPECT_EQ(tree->ItemID(), c.newItem);
        EXPECT_EQ(tree->AccessPath(), c.newPath);
    }
}

TEST_F(OpcItemTreeTest, ABranchIsFilledOnceAndASlowServerShowsTheBusyNotice) {
    Open("Sim.Slow.1");
    const TreeNodes::Id area = Child("Unit1");
    pointer.clear();
    const size_t notices = tp.busy.Shown().size();
    const uint32_t before = tp.events.TimeGetTime();
    tree->Expand(area);
    const uint32_t took = tp.events.TimeGetTime() - before;
    EXPECT_EQ(took, 4u * 6000) << "to the root, down, branches, leaves";
    EXPECT_EQ(tp.busy.Shown().size(), notices + 4) << "each call took more than 5 s";
    EXPECT_FALSE(tp.busy.Visible());
    EXPECT_EQ(tp.busy.Shown().back(),
              "Please wait...\r\n\r\nThe OPC Server, \"Sim.Slow.1\", is still busy.");
    EXPECT_EQ(pointer, (std::vector<int16_t>{11, 0}));
    EXPECT_EQ(Texts(area), Strings{"FIC101"});

    tree->Collapse(area);
    tree->Expand(area);
    EXPECT_EQ(tp.events.TimeGetTime() - before, took) << "the server was not asked again";
    EXPECT_EQ(Texts(area), Strings{"FIC101"});
}

TEST_F(OpcItemTreeTest, ABrowserThatStopsWorkingIsToldAndTheTreeStaysAsFilled) {
    Open("Sim.Plant.1");
    ASSERT_FALSE(tp.plant.DropServer("", "Sim.Plant.1"));
    const TreeNodes::Id area = Child("Area1");
    tree->Expand(area);
    EXPECT_FALSE(nodes.Expanded(area)) << "closed again";
    EXPECT_TRUE(nodes.Children(area).empty());
    EXPECT_TRUE(tp.dialogs.Messages().empty());
    tree->NodeClick(area);
    EXPECT_EQ(nodes.Count(), 12) << "the root, six branches and five placeholders";

    // A browser that fails while the window loads is told once.
    TreeNodes again;
    MousePointer quiet;
    OpcItemTree second(tp.platform, again, quiet, "Sim.Plant.1", "", "", "", false);
    ASSERT_TRUE(second.Connect());
    ASSERT_FALSE(tp.plant.DropServer("", "Sim.Plant.1"));
    second.Load();
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Last().text,
              "The Browser facility of the OPC Server is not working correctly");
    EXPECT_EQ(tp.dialogs.Last().style, MsgBoxStyle::Exclamation);
    EXPECT_EQ(quiet.Code(), MousePointer::kDefault);
    EXPECT_EQ(again.Count(), 1) << "the root alone";
}

}  // namespace
}  // namespace cv
