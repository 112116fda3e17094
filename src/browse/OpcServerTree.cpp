#include "browse/OpcServerTree.h"

#include <charconv>
#include <memory>
#include <optional>

#include "browse/MousePointer.h"
#include "browse/Placeholder.h"
#include "platform/AsciiCase.h"
#include "platform/Platform.h"

namespace cv {

namespace {

// The number after a key's first letter; 0 when there is none.
int32_t NumberOfKey(const std::string& sKey) {
    int32_t lNumber = 0;
    if (sKey.size() > 1) {
        std::from_chars(sKey.data() + 1, sKey.data() + sKey.size(), lNumber);
    }
    return lNumber;
}

}  // namespace

OpcServerTree::OpcServerTree(Platform& platform, TreeNodes& cNodes, MousePointer& cPointer,
                             int32_t eBrowse, std::string sServerText)
    : mPlatform(platform),
      mcNodes(cNodes),
      mcPointer(cPointer),
      mcNetwork(platform.network),
      meBrowse(eBrowse),
      msServerText(std::move(sServerText)),
      msSelected(msServerText) {}

std::string OpcServerTree::Caption() const {
    if (meBrowse == BrowseMode::NetworkComputers) {
        return "Browse network computers";
    }
    return meBrowse == BrowseMode::OpcHdaServers ? "Browse OPC HDA Servers" : "Browse OPC Servers";
}

std::string OpcServerTree::FrameCaption() const {
    return meBrowse == BrowseMode::NetworkComputers ? "Selected computer" : "Selected Server";
}

std::string OpcServerTree::LabelCaption() const {
    return meBrowse == BrowseMode::NetworkComputers ? "Computer :" : "\\\\Node\\Server :";
}

void OpcServerTree::Load() {
    mlServerCount = 0;
    msSelected = msServerText;
    if (meBrowse == BrowseMode::NetworkComputers) {
        mcNetwork.GoToRoot();
        AddNode(0, "N" + std::to_string(mcNetwork.Key()), "Network Neighborhood", "NetNeighbor",
                true);
        return;
    }
    const std::string sTitle =
        meBrowse == BrowseMode::OpcHdaServers ? "OPC HDA Servers" : "OPC Servers";
    if (!AddNode(0, "M1", sTitle, "AllOpcServers", false)) {
        return;
    }
    const TreeNodes::Id lTop = mcNodes.Find("M1");
    FillNode(lTop);
    mcNodes.SetExpanded(lTop, true);
    if (!msServerText.empty() && msServerText.rfind("\\\\", 0) != 0) {
        SelectIncomingServer();
    }
}

void OpcServerTree::SelectIncomingServer() {
    // A server on this computer: open it, then select the first node that
    // carries the server's name.
    const TreeNodes::Id lComputer = mcNodes.Find("C1");
    if (lComputer == 0) {
        return;
    }
    Expand(lComputer);
    for (TreeNodes::Id lNode = mcNodes.First(); lNode != 0; lNode = mcNodes.Next(lNode)) {
        if (EqualsIgnoringCase(mcNodes.Text(lNode), msServerText)) {
            mcNodes.Select(lNode);
            return;
        }
    }
}

void OpcServerTree::Expand(TreeNodes::Id lNode) {
    mcNodes.SetExpanded(lNode, true);
    if (HasPlaceholder(mcNodes, lNode)) {
        mcNodes.Remove(mcNodes.FirstChild(lNode));
        FillNode(lNode);
    }
}

void OpcServerTree::Collapse(TreeNodes::Id lNode) {
    mcNodes.SetExpanded(lNode, false);
}

void OpcServerTree::FillNode(TreeNodes::Id lNode) {
    // A failure ends the filling at once, without a message; what was added
    // stays. The placeholder is gone, so opening the node again does not
    // retry.
    const MousePointer::Busy busy(mcPointer);
    const char cKind = KindOf(lNode);
    switch (cKind) {
        case 'M':
            FillTop(lNode);
            break;
        case 'N':
        case 'E':
        case 'D':
            FillNetwork(lNode, NumberOfKey(mcNodes.Key(lNode)));
            break;
        case 'C':
        case 'S':
            if (meBrowse == BrowseMode::OpcServers) {
                FillServers(lNode, cKind);
            }
            break;
        default:
            break;
    }
}

void OpcServerTree::FillTop(TreeNodes::Id lNode) {
    if (!AddNode(lNode, "C1", "My Computer", "MyComputer", true)) {
        return;
    }
    mcNetwork.GoToRoot();
    AddNode(lNode, "N" + std::to_string(mcNetwork.Key()), "Network Neighborhood", "NetNeighbor",
            true);
}

void OpcServerTree::FillNetwork(TreeNodes::Id lNode, int32_t lKey) {
    mcNetwork.GoToKey(lKey);
    mcNetwork.GetResources();
    const int32_t lCount = mcNetwork.Count();
    for (int32_t i = 1; i <= lCount; ++i) {
        const NetResource* cResource = mcNetwork.Item(i);
        if (cResource == nullptr || !AddNetworkChild(lNode, *cResource)) {
            return;
        }
    }
}

bool OpcServerTree::AddNetworkChild(TreeNodes::Id lNode, const NetResource& cResource) {
    const std::string sKey = std::to_string(cResource.Key());
    switch (cResource.DisplayType()) {
        case platform::kDisplayTypeDomain:
            return AddNode(lNode, "D" + sKey, cResource.RemoteNameMixedCase(), "Domain", true);
        case platform::kDisplayTypeServer: {
            std::string sName = cResource.RemoteNameMixedCase();
            if (sName.rfind("\\\\", 0) == 0) {
                sName.erase(0, 2);
            }
            return AddNode(lNode, "S" + sKey, sName, "Server",
                           meBrowse != BrowseMode::NetworkComputers);
        }
        case platform::kDisplayTypeNetwork:
            return AddNode(lNode, "E" + sKey, "Entire Network", "EntireNetwork", true);
        default:
            return true;  // shares and other resources are not shown
    }
}

void OpcServerTree::FillServers(TreeNodes::Id lNode, char cKind) {
    std::unique_ptr<platform::OPCServer> cServer;
    if (mPlatform.opc.CreateServer(cServer)) {
        return;
    }
    const std::optional<std::string> sComputer =
        cKind == 'S' ? std::optional(mcNodes.Text(lNode)) : std::nullopt;
    Variant vServers;
    if (cServer->GetOPCServers(sComputer, vServers) || !vServers.IsArray()) {
        return;
    }
    const std::string sPrefix = cKind == 'S' ? "R" : "L";
    for (const Variant& vServer : vServers.Elements()) {
        ++mlServerCount;
        if (!AddNode(lNode, sPrefix + std::to_string(mlServerCount), vServer.AsStr(), "OpcServer",
                     false)) {
            return;
        }
    }
}

bool OpcServerTree::AddNode(TreeNodes::Id lParent, const std::string& sKey,
                            const std::string& sText, const std::string& sImage, bool bOpens) {
    const TreeNodes::Id lNode = mcNodes.Add(lParent, sKey, sText, sImage);
    return lNode != 0 && (!bOpens || AddPlaceholder(mcNodes, lNode) != 0);
}

char OpcServerTree::KindOf(TreeNodes::Id lNode) const {
    const std::string& sKey = mcNodes.Key(lNode);
    return sKey.empty() ? '\0' : sKey.front();
}

void OpcServerTree::NodeClick(TreeNodes::Id lNode) {
    if (!mcNodes.Exists(lNode)) {
        return;
    }
    mcNodes.Select(lNode);
    const char cKind = KindOf(lNode);
    if (meBrowse == BrowseMode::NetworkComputers) {
        if (cKind == 'S') {
            msSelected = mcNodes.Text(lNode);
        }
    } else if (cKind == 'L') {
        msSelected = mcNodes.Text(lNode);
    } else if (cKind == 'R') {
        msSelected = "\\\\" + mcNodes.Text(mcNodes.Parent(lNode)) + "\\" + mcNodes.Text(lNode);
    }
}

bool OpcServerTree::DblClickChooses() const {
    const TreeNodes::Id lNode = mcNodes.Selected();
    if (lNode == 0) {
        return false;
    }
    const char cKind = KindOf(lNode);
    return meBrowse == BrowseMode::NetworkComputers ? cKind == 'S' : cKind == 'L' || cKind == 'R';
}

void OpcServerTree::OK() {
    if (msSelected != msServerText) {
        msServerText = msSelected;
        mbChosen = true;
    }
}

void OpcServerTree::Unload() {
    mcNodes.Clear();
}

}  // namespace cv
