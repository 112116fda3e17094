#pragma once

#include <cstdint>
#include <string>

#include "browse/Network.h"
#include "browse/TreeNodes.h"

namespace cv {

class MousePointer;
struct Platform;

// What the server browser lists.
namespace BrowseMode {
inline constexpr int32_t OpcServers = 0;
inline constexpr int32_t OpcHdaServers = 1;
inline constexpr int32_t NetworkComputers = 2;
}  // namespace BrowseMode

// The server browser without its window: the tree of this computer and the
// network, filled a node at a time when it is first opened, and the choice
// it hands back ("Sim.Plant.1" on this computer, "\\Node\Sim.Plant.1" on
// another, or a bare computer name when it browses computers).
//
// A node's key tells its kind by its first letter and carries a number:
//   M1     the top ("OPC Servers"); C1 this computer; N1 the network;
//   E, D   a provider ("Entire Network"), a domain or workgroup;
//   S      a computer; L, R a server on this computer, on a computer.
// E, D, S and N carry the resource's key in the Network; L and R carry the
// count of server nodes so far, so they are unique across the tree.
class OpcServerTree {
  public:
    OpcServerTree(Platform& platform, TreeNodes& cNodes, MousePointer& cPointer, int32_t eBrowse,
                  std::string sServerText);

    // The window's texts for the browse mode.
    std::string Caption() const;
    std::string FrameCaption() const;
    std::string LabelCaption() const;

    // Adds the top of the tree; a server on this computer named by the text
    // handed in is shown and selected.
    void Load();
    // The user opened or closed a node. Opening fills it the first time.
    void Expand(TreeNodes::Id lNode);
    void Collapse(TreeNodes::Id lNode);
    // The user selected a node: a choice updates SelectedText.
    void NodeClick(TreeNodes::Id lNode);
    // Whether a double click on the selected node means OK.
    bool DblClickChooses() const;
    // Takes SelectedText when it differs from the text handed in.
    void OK();
    // Removes every node.
    void Unload();

    // What the window shows as the selection.
    const std::string& SelectedText() const { return msSelected; }
    // True once OK took a new choice; ServerText is then that choice.
    bool Chosen() const { return mbChosen; }
    const std::string& ServerText() const { return msServerText; }

  private:
    void FillNode(TreeNodes::Id lNode);
    void FillTop(TreeNodes::Id lNode);
    void FillNetwork(TreeNodes::Id lNode, int32_t lKey);
    void FillServers(TreeNodes::Id lNode, char cKind);
    bool AddNetworkChild(TreeNodes::Id lNode, const NetResource& cResource);
    // Adds a node, with a placeholder below it when it can be opened; false
    // when the tree refused it.
    bool AddNode(TreeNodes::Id lParent, const std::string& sKey, const std::string& sText,
                 const std::string& sImage, bool bOpens);
    char KindOf(TreeNodes::Id lNode) const;
    void SelectIncomingServer();

    Platform& mPlatform;
    TreeNodes& mcNodes;
    MousePointer& mcPointer;
    Network mcNetwork;
    int32_t meBrowse;
    std::string msServerText;
    std::string msSelected;
    bool mbChosen = false;
    int32_t mlServerCount = 0;
};

}  // namespace cv
