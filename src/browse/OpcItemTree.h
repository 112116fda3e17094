#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "browse/TreeNodes.h"
#include "platform/opc/OPCBrowser.h"
#include "platform/opc/OPCServer.h"

namespace cv {

class MousePointer;
struct Platform;

// The item browser without its window: its own connection to one server,
// the server's address space as a tree filled one branch at a time through
// the server's browser, and the item ID and access path the user picks.
//
// Nodes: the root (key "k1", the server's name), branches (keys "k2",
// "k3", ... in the order they are found, a placeholder below each until it
// is opened) and leaves (no key).
class OpcItemTree {
  public:
    OpcItemTree(Platform& platform, TreeNodes& cNodes, MousePointer& cPointer,
                std::string sServerId, std::string sComputer, std::string sItemID,
                std::string sAccessPath, bool bAllowBranchSelect);
    ~OpcItemTree();
    OpcItemTree(const OpcItemTree&) = delete;
    OpcItemTree& operator=(const OpcItemTree&) = delete;

    // Connects and asks the server for its browser. A failure is told to
    // the user; then the connection is dropped and the answer is false.
    bool Connect();
    void Disconnect();

    // Shows the root and its children, then opens the tree at the item ID
    // handed in.
    void Load();
    // The user opened or closed a branch. Opening fills it the first time.
    void Expand(TreeNodes::Id lNode);
    void Collapse(TreeNodes::Id lNode);
    // The user selected a node: a leaf shows its item ID and access paths.
    void NodeClick(TreeNodes::Id lNode);
    // The user chose an entry of the access path list (-1: none).
    void SelectAccessPath(int32_t lIndex);
    // Whether a double click on the selected node means OK.
    bool DblClickChooses() const;
    // Takes the item ID and access path shown when they differ from those
    // handed in.
    void OK();
    // Removes every node.
    void Unload();

    // What the window shows: the item ID, the access paths to choose from
    // and the one chosen (-1: none).
    const std::string& ItemIDText() const { return msItemIDText; }
    const std::vector<std::string>& AccessPaths() const { return maAccessPaths; }
    int32_t AccessPathIndex() const { return mlAccessPathIndex; }
    std::string AccessPathText() const;

    // True once OK took a change; ItemID and AccessPath are then the choice.
    bool Changed() const { return mbChanged; }
    const std::string& ItemID() const { return msItemID; }
    const std::string& AccessPath() const { return msAccessPath; }

  private:
    void ConnectionFailed(const ErrorInfo& error);
    std::string RootText() const;
    bool FillChildren(TreeNodes::Id lNode);
    bool FillBranches(TreeNodes::Id lNode);
    bool FillLeafs(TreeNodes::Id lNode);
    bool MoveBrowserTo(TreeNodes::Id lNode);
    void WalkToItem();
    void ShowLeaf(TreeNodes::Id lNode);
    void ShowAccessPaths(const Variant& vPaths);
    void ShowAccessPath(const std::string& sPath);
    std::string PathOf(TreeNodes::Id lNode) const;
    bool IsLeaf(TreeNodes::Id lNode) const { return mcNodes.Key(lNode).empty(); }
    void BrowserError();

    Platform& mPlatform;
    TreeNodes& mcNodes;
    MousePointer& mcPointer;
    std::string msServerId;
    std::string msComputer;
    std::string msItemID;
    std::string msAccessPath;
    bool mbAllowBranchSelect;
    std::unique_ptr<platform::OPCServer> mcOpcServer;
    std::shared_ptr<platform::OPCBrowser> mcBrowser;
    int32_t mlNodeCount = 0;
    bool mbChanged = false;
    std::string msItemIDText;
    std::vector<std::string> maAccessPaths;
    int32_t mlAccessPathIndex = -1;
};

}  // namespace cv
