#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include <QDialog>

#include "browse/MousePointer.h"
#include "browse/OpcServerTree.h"
#include "browse/TreeNodes.h"
#include "ui/browse/BrowseImages.h"
#include "ui/browse/ScreenPointer.h"
#include "ui/browse/TreeNodesView.h"

class QGroupBox;
class QLabel;
class QPushButton;
class QTreeWidget;
class QTreeWidgetItem;

namespace cv {

struct Platform;

// "Browse OPC Servers": picks a server on this computer or on a computer
// of the network, or (browsing computers) a network computer. The tree
// fills a node at a time as the user opens it.
class frmBrowseOpcServers : public QDialog {
    Q_OBJECT

  public:
    // Shows the window modally over parent. sServerAndNode is the choice
    // in and, when the user confirmed a new one, out (a server ID, a
    // "\\Node\Server", or a computer name); answers whether that happened.
    static bool DoIt(Platform& platform, std::string& sServerAndNode, int32_t eBrowse,
                     QWidget* parent = nullptr);

    // Builds and loads the window without showing it.
    frmBrowseOpcServers(Platform& platform, std::string sServerAndNode, int32_t eBrowse,
                        QWidget* parent = nullptr);

    bool Chosen() const { return mcTree.Chosen(); }
    const std::string& ServerText() const { return mcTree.ServerText(); }

    // Unloading removes every node of the tree.
    void done(int result) override;

  private:
    void CreateControls();
    void ConnectControls();
    void tvwItems_Expand(QTreeWidgetItem* item);
    void tvwItems_Collapse(QTreeWidgetItem* item);
    void tvwItems_NodeClick(QTreeWidgetItem* item);
    void tvwItems_DblClick();
    void cmdOK_Click();
    void cmdHelp_Click();

    Platform& mPlatform;
    ScreenPointer mcScreenPointer;
    MousePointer mcMousePointer;
    TreeNodes mcNodes;
    OpcServerTree mcTree;
    BrowseImages ilstImages;

    QTreeWidget* tvwItems = nullptr;
    QGroupBox* fraSelected = nullptr;
    QLabel* lblSelected = nullptr;
    QLabel* lblServerID = nullptr;
    QPushButton* cmdOK = nullptr;
    QPushButton* cmdCancel = nullptr;
    QPushButton* cmdHelp = nullptr;

    // Shows mcNodes in tvwItems.
    std::unique_ptr<TreeNodesView> mcView;
};

}  // namespace cv
