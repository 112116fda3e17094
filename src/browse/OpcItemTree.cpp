#include "browse/OpcItemTree.h"

#include <cinttypes>
#include <cstdio>

#include "browse/MousePointer.h"
#include "browse/Placeholder.h"
#include "opc/PriorToConnect.h"
#include "platform/AsciiCase.h"
#include "platform/Platform.h"

namespace cv {

namespace {

const std::string kRootKey = "k1";

// An error number as the messages show it: upper-case hexadecimal digits
// without leading zeros, negative numbers in their 32 bits.
std::string Hex(int32_t lNumber) {
    char sDigits[16];
    std::snprintf(sDigits, sizeof sDigits, "%" PRIX32, static_cast<uint32_t>(lNumber));
    return sDigits;
}

std::vector<std::string> SplitAtDots(const std::string& sText) {
    std::vector<std::string> aParts;
    size_t lStart = 0;
    for (size_t lDot = sText.find('.'); lDot != std::string::npos; lDot = sText.find('.', lStart)) {
        aParts.push_back(sText.substr(lStart, lDot - lStart));
        lStart = lDot + 1;
    }
    aParts.push_back(sText.substr(lStart));
    return aParts;
}

}  // namespace

OpcItemTree::OpcItemTree(Platform& platform, TreeNodes& cNodes, MousePointer& cPointer,
                         std::string sServerId, std::string sComputer, std::string sItemID,
                         std::string sAccessPath, bool bAllowBranchSelect)
    : mPlatform(platform),
      mcNodes(cNodes),
      mcPointer(cPointer),
      msServerId(std::move(sServerId)),
      msComputer(std::move(sComputer)),
      msItemID(std::move(sItemID)),
      msAccessPath(std::move(sAccessPath)),
      mbAllowBranchSelect(bAllowBranchSelect) {}

OpcItemTree::~OpcItemTree() {
    Disconnect();
}

bool OpcItemTree::Connect() {
    mbChanged = false;
    if (msServerId.empty()) {
        ConnectionFailed({});
        return false;
    }
    PriorToConnect(mPlatform.serverCalls, msServerId, msComputer);
    mcPointer.Set(MousePointer::kHourglass);
    ErrorInfo error = mPlatform.opc.CreateServer(mcOpcServer);
    if (!error) {
        error = mcOpcServer->Connect(msServerId, msComputer);
    }
    if (error) {
        ConnectionFailed(error);
        return false;
    }
    std::shared_ptr<platform::OPCBrowser> cBrowser;
    if (mcOpcServer->CreateBrowser(cBrowser) || !cBrowser) {
        mcPointer.Set(MousePointer::kDefault);
        mPlatform.dialogs.MsgBox(
            "The OPC Server \"" + msServerId + "\" does not support browsing for Item names.",
            MsgBoxStyle::Exclamation, "");
        Disconnect();
        return false;
    }
    mcBrowser = std::move(cBrowser);
    return true;
}

void OpcItemTree::ConnectionFailed(const ErrorInfo& error) {
    mcPointer.Set(MousePointer::kDefault);
    const std::string sWhere =
        msComputer.empty() ? "this computer." : "computer \"\\\\" + msComputer + "\".";
    mPlatform.dialogs.MsgBox("Cannot connect to the OPC Server \"" + msServerId + "\" in " +
                                 sWhere + "\r\nError (0x" + Hex(error.Number) + ") - " +
                                 error.Description,
                             MsgBoxStyle::Exclamation, "");
    Disconnect();
}

void OpcItemTree::Disconnect() {
    mcBrowser.reset();
    if (mcOpcServer) {
        // The connection is given up either way.
        (void)mcOpcServer->Disconnect();
        mcOpcServer.reset();
    }
}

std::string OpcItemTree::RootText() const {
    return msComputer.empty() ? msServerId : "\\\\" + msComputer + "\\" + msServerId;
}

void OpcItemTree::Load() {
    msItemIDText = msItemID;
    maAccessPaths.clear();
    mlAccessPathIndex = -1;
    ShowAccessPath(msAccessPath);
    mlNodeCount = 1;
    const TreeNodes::Id lRoot = mcNodes.Add(0, kRootKey, RootText(), "OpcServer");
    if (lRoot == 0 || !mcBrowser) {
        return;
    }
    Expand(lRoot);
    if (mcBrowser->MoveToRoot()) {
        mcPointer.Set(MousePointer::kDefault);
        BrowserError();
        return;
    }
    if (!FillChildren(lRoot)) {
        mcPointer.Set(MousePointer::kDefault);
        return;
    }
    WalkToItem();
    mcPointer.Set(MousePointer::kDefault);
}

void OpcItemTree::WalkToItem() {
    // Each part of the item ID is looked for after the node the part before
    // it was found at; a branch found is opened, a leaf found ends the walk.
    TreeNodes::Id lAfter = mcNodes.First();
    for (const std::string& sPart : SplitAtDots(msItemID)) {
        TreeNodes::Id lFound = mcNodes.Next(lAfter);
        while (lFound != 0 && mcNodes.Text(lFound) != sPart) {
            lFound = mcNodes.Next(lFound);
        }
        if (lFound == 0) {
            continue;
        }
        lAfter = lFound;
        mcNodes.Select(lFound);
        if (IsLeaf(lFound)) {
            NodeClick(lFound);
            return;
        }
        Expand(lFound);
    }
}

void OpcItemTree::Expand(TreeNodes::Id lNode) {
    if (!mcNodes.Exists(lNode)) {
        return;
    }
    mcNodes.SetExpanded(lNode, true);
    if (!HasPlaceholder(mcNodes, lNode)) {
        return;  // filled before: the server is not asked again
    }
    const MousePointer::Busy busy(mcPointer);
    mcNodes.Remove(mcNodes.FirstChild(lNode));
    if (MoveBrowserTo(lNode)) {
        FillChildren(lNode);
    } else {
        mcNodes.SetExpanded(lNode, false);
    }
}

void OpcItemTree::Collapse(TreeNodes::Id lNode) {
    if (mcNodes.Exists(lNode)) {
        mcNodes.SetExpanded(lNode, false);
    }
}

bool OpcItemTree::FillChildren(TreeNodes::Id lNode) {
    if (FillBranches(lNode) && FillLeafs(lNode)) {
        return true;
    }
    BrowserError();
    return false;
}

bool OpcItemTree::FillBranches(TreeNodes::Id lNode) {
    if (mcBrowser->ShowBranches()) {
        return false;
    }
    const int32_t lCount = mcBrowser->Count();
    for (int32_t i = 1; i <= lCount; ++i) {
        std::string sName;
        if (mcBrowser->Item(i, sName)) {
            return false;
        }
        ++mlNodeCount;
        const TreeNodes::Id lBranch = mcNodes.Add(lNode, "k" + std::to_string(mlNodeCount), sName,
                                                  "ClosedFolder", "OpenFolder");
        if (lBranch == 0 || AddPlaceholder(mcNodes, lBranch) == 0) {
            return false;
        }
    }
    return true;
}

bool OpcItemTree::FillLeafs(TreeNodes::Id lNode) {
    if (mcBrowser->ShowLeafs()) {
        return false;
    }
    const int32_t lCount = mcBrowser->Count();
    for (int32_t i = 1; i <= lCount; ++i) {
        std::string sName;
        if (mcBrowser->Item(i, sName) || mcNodes.Add(lNode, std::string(), sName, "ItemID") == 0) {
            return false;
        }
    }
    return true;
}

bool OpcItemTree::MoveBrowserTo(TreeNodes::Id lNode) {
    std::vector<std::string> aPath;
    for (TreeNodes::Id lUp = lNode; lUp != 0 && mcNodes.Key(lUp) != kRootKey;
         lUp = mcNodes.Parent(lUp)) {
        aPath.push_back(mcNodes.Text(lUp));
    }
    if (mcBrowser->MoveToRoot()) {
        return false;
    }
    for (auto it = aPath.rbegin(); it != aPath.rend(); ++it) {
        if (mcBrowser->MoveDown(*it)) {
            return false;
        }
    }
    return true;
}

void OpcItemTree::NodeClick(TreeNodes::Id lNode) {
    if (!mcNodes.Exists(lNode)) {
        return;
    }
    mcNodes.Select(lNode);
    if (mbAllowBranchSelect) {
        msItemIDText = PathOf(lNode);
    }
    if (IsLeaf(lNode) && mcBrowser) {
        const MousePointer::Busy busy(mcPointer);
        ShowLeaf(lNode);
    }
}

void OpcItemTree::ShowLeaf(TreeNodes::Id lNode) {
    if (!MoveBrowserTo(mcNodes.Parent(lNode))) {
        return;
    }
    std::string sItemID;
    if (mcBrowser->GetItemID(mcNodes.Text(lNode), sItemID)) {
        msItemIDText.clear();
        return;
    }
    msItemIDText = sItemID;
    Variant vPaths;
    if (mcBrowser->GetAccessPaths(sItemID, vPaths)) {
        return;
    }
    ShowAccessPaths(vPaths);
}

void OpcItemTree::ShowAccessPaths(const Variant& vPaths) {
    // The path handed in comes first, in its own spelling; the server's
    // paths follow unless they name it in other letter case.
    maAccessPaths.clear();
    mlAccessPathIndex = -1;
    ShowAccessPath(msAccessPath);
    if (vPaths.IsArray()) {
        for (const Variant& vPath : vPaths.Elements()) {
            if (!EqualsIgnoringCase(vPath.AsStr(), msAccessPath)) {
                ShowAccessPath(vPath.AsStr());
            }
        }
    }
    if (!maAccessPaths.empty()) {
        mlAccessPathIndex = 0;
    }
}

void OpcItemTree::ShowAccessPath(const std::string& sPath) {
    if (sPath.empty()) {
        return;
    }
    maAccessPaths.push_back(sPath);
    for (size_t i = 0; i < maAccessPaths.size(); ++i) {
        if (maAccessPaths[i] == sPath) {
            mlAccessPathIndex = static_cast<int32_t>(i);
            break;
        }
    }
}

std::string OpcItemTree::PathOf(TreeNodes::Id lNode) const {
    std::string sPath;
    for (TreeNodes::Id lUp = lNode; lUp != 0 && mcNodes.Key(lUp) != kRootKey;
         lUp = mcNodes.Parent(lUp)) {
        sPath = sPath.empty() ? mcNodes.Text(lUp) : mcNodes.Text(lUp) + "." + sPath;
    }
    return sPath;
}

void OpcItemTree::SelectAccessPath(int32_t lIndex) {
    const bool bInList = lIndex >= 0 && static_cast<size_t>(lIndex) < maAccessPaths.size();
    mlAccessPathIndex = bInList ? lIndex : -1;
}

std::string OpcItemTree::AccessPathText() const {
    return mlAccessPathIndex < 0 ? std::string()
                                 : maAccessPaths[static_cast<size_t>(mlAccessPathIndex)];
}

bool OpcItemTree::DblClickChooses() const {
    const TreeNodes::Id lNode = mcNodes.Selected();
    return lNode != 0 && IsLeaf(lNode);
}

void OpcItemTree::OK() {
    if (msItemIDText != msItemID) {
        msItemID = msItemIDText;
        mbChanged = true;
    }
    const std::string sAccessPath = AccessPathText();
    if (sAccessPath != msAccessPath) {
        msAccessPath = sAccessPath;
        mbChanged = true;
    }
}

void OpcItemTree::BrowserError() {
    mPlatform.dialogs.MsgBox("The Browser facility of the OPC Server is not working correctly",
                             MsgBoxStyle::Exclamation, "");
}

void OpcItemTree::Unload() {
    mcNodes.Clear();
}

}  // namespace cv
