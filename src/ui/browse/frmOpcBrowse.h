#pragma once

#include <memory>
#include <string>

#include <QDialog>

#include "browse/MousePointer.h"
#include "browse/OpcItemTree.h"
#include "browse/TreeNodes.h"
#include "ui/browse/BrowseImages.h"
#include "ui/browse/ScreenPointer.h"
#include "ui/browse/TreeNodesView.h"

class QComboBox;
class QGroupBox;
class QLabel;
class QPushButton;
class QTreeWidget;
class QTreeWidgetItem;

namespace cv {

struct Platform;

// "Browse OPC Item names": connects to a server on its own and shows the
// server's address space as a tree, filled a branch at a time, to pick an
// item ID and an access path.
class frmOpcBrowse : public QDialog {
    Q_OBJECT

  public:
    // Connects, shows the window modally over parent and disconnects.
    // sItemID and sAccessPath are the item in and, when the user confirmed
    // a change, out; answers whether that happened. bHda makes no
    // difference. A server that cannot be reached or browsed is reported
    // and no window opens.
    static bool DoIt(Platform& platform, const std::string& sServerId, const std::string& sComputer,
                     std::string& sItemID, std::string& sAccessPath, bool bHda,
                     bool bAllowBranchSelect, QWidget* parent = nullptr);

    frmOpcBrowse(Platform& platform, const std::string& sServerId, const std::string& sComputer,
                 const std::string& sItemID, const std::string& sAccessPath,
                 bool bAllowBranchSelect, QWidget* parent = nullptr);

    // The steps of DoIt: connect (false when the window is not to open),
    // load the tree, and after the window closed, disconnect.
    bool Connect() { return mcTree.Connect(); }
    void Load();
    void Disconnect() { mcTree.Disconnect(); }

    bool Changed() const { return mcTree.Changed(); }
    const std::string& ItemID() const { return mcTree.ItemID(); }
    const std::string& AccessPath() const { return mcTree.AccessPath(); }

    // Unloading removes every node of the tree.
    void done(int result) override;

  private:
    void CreateControls();
    QGroupBox* CreateSelectedFrame();
    void ConnectControls();
    void ShowSelection();
    void tvwItems_Expand(QTreeWidgetItem* item);
    void tvwItems_Collapse(QTreeWidgetItem* item);
    void tvwItems_NodeClick(QTreeWidgetItem* item);
    void tvwItems_DblClick();
    void cmbAccessPaths_Click(int index);
    void cmdOK_Click();
    void cmdHelp_Click();

    Platform& mPlatform;
    ScreenPointer mcScreenPointer;
    MousePointer mcMousePointer;
    TreeNodes mcNodes;
    OpcItemTree mcTree;
    BrowseImages ilstImages;
    bool mbShowing = false;

    QTreeWidget* tvwItems = nullptr;
    QGroupBox* Frame1 = nullptr;
    QLabel* Label2 = nullptr;
    QLabel* lblItemID = nullptr;
    QLabel* lblAccessPath = nullptr;
    QComboBox* cmbAccessPaths = nullptr;
    QPushButton* cmdOK = nullptr;
    QPushButton* cmdCancel = nullptr;
    QPushButton* cmdHelp = nullptr;

    // Shows mcNodes in tvwItems.
    std::unique_ptr<TreeNodesView> mcView;
};

}  // namespace cv
