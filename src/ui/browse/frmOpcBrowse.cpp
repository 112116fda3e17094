#include "ui/browse/frmOpcBrowse.h"

#include <QComboBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QStringList>
#include <QTreeWidget>
#include <QVBoxLayout>

#include "platform/Platform.h"
#include "ui/widgets/HelpTopics.h"

namespace cv {

namespace {

QString Text(const std::string& text) {
    return QString::fromStdString(text);
}

template <typename Widget>
Widget* Named(Widget* widget, const char* name) {
    widget->setObjectName(QLatin1String(name));
    return widget;
}

}  // namespace

bool frmOpcBrowse::DoIt(Platform& platform, const std::string& sServerId,
                        const std::string& sComputer, std::string& sItemID,
                        std::string& sAccessPath, bool /*bHda*/, bool bAllowBranchSelect,
                        QWidget* parent) {
    frmOpcBrowse window(platform, sServerId, sComputer, sItemID, sAccessPath, bAllowBranchSelect,
                        parent);
    if (!window.Connect()) {
        return false;
    }
    window.Load();
    window.exec();
    window.Disconnect();
    if (window.Changed()) {
        sItemID = window.ItemID();
        sAccessPath = window.AccessPath();
    }
    return window.Changed();
}

frmOpcBrowse::frmOpcBrowse(Platform& platform, const std::string& sServerId,
                           const std::string& sComputer, const std::string& sItemID,
                           const std::string& sAccessPath, bool bAllowBranchSelect, QWidget* parent)
    : QDialog(parent),
      mPlatform(platform),
      mcMousePointer([this](int16_t code) { mcScreenPointer.Show(code); }),
      mcTree(platform, mcNodes, mcMousePointer, sServerId, sComputer, sItemID, sAccessPath,
             bAllowBranchSelect) {
    setObjectName(QStringLiteral("frmOpcBrowse"));
    setWindowTitle(QStringLiteral("Browse OPC Item names"));
    CreateControls();
    mcView = std::make_unique<TreeNodesView>(*tvwItems, mcNodes, ilstImages);
    ConnectControls();
}

void frmOpcBrowse::CreateControls() {
    tvwItems = Named(new QTreeWidget(), "tvwItems");
    tvwItems->setHeaderHidden(true);
    tvwItems->setUniformRowHeights(true);
    tvwItems->header()->setSectionResizeMode(QHeaderView::ResizeToContents);
    tvwItems->header()->setStretchLastSection(false);
    tvwItems->setMinimumSize(360, 340);

    cmdOK = Named(new QPushButton(QStringLiteral("OK")), "cmdOK");
    cmdCancel = Named(new QPushButton(QStringLiteral("Cancel")), "cmdCancel");
    cmdHelp = Named(new QPushButton(QStringLiteral("Help")), "cmdHelp");
    cmdOK->setDefault(true);
    auto* buttons = new QVBoxLayout();
    buttons->addWidget(cmdOK);
    buttons->addWidget(cmdCancel);
    buttons->addWidget(cmdHelp);
    buttons->addStretch();

    auto* layout = new QGridLayout(this);
    layout->addWidget(tvwItems, 0, 0);
    layout->addLayout(buttons, 0, 1);
    layout->addWidget(CreateSelectedFrame(), 1, 0, 1, 2);
    layout->setRowStretch(0, 1);
    layout->setColumnStretch(0, 1);
}

QGroupBox* frmOpcBrowse::CreateSelectedFrame() {
    Frame1 = Named(new QGroupBox(QStringLiteral("Selected Item")), "Frame1");
    Label2 = Named(new QLabel(QStringLiteral("Name :")), "Label2");
    lblItemID = Named(new QLabel(), "lblItemID");
    lblItemID->setTextFormat(Qt::PlainText);  // the server's node id
    lblItemID->setTextInteractionFlags(Qt::TextSelectableByMouse);
    lblAccessPath = Named(new QLabel(QStringLiteral("Access Paths :")), "lblAccessPath");
    cmbAccessPaths = Named(new QComboBox(), "cmbAccessPaths");
    cmbAccessPaths->setSizeAdjustPolicy(QComboBox::AdjustToContents);
    cmbAccessPaths->setMinimumContentsLength(12);
    auto* grid = new QGridLayout(Frame1);
    grid->addWidget(Label2, 0, 0);
    grid->addWidget(lblItemID, 0, 1);
    grid->addWidget(lblAccessPath, 1, 0);
    grid->addWidget(cmbAccessPaths, 1, 1, Qt::AlignLeft);
    grid->setColumnStretch(1, 1);
    return Frame1;
}

void frmOpcBrowse::ConnectControls() {
    connect(tvwItems, &QTreeWidget::itemExpanded, this,
            [this](QTreeWidgetItem* item) { tvwItems_Expand(item); });
    connect(tvwItems, &QTreeWidget::itemCollapsed, this,
            [this](QTreeWidgetItem* item) { tvwItems_Collapse(item); });
    // A node the user selects, by mouse or keys; not the current node the
    // control picks by itself when it gets the focus.
    connect(tvwItems, &QTreeWidget::itemSelectionChanged, this, [this] {
        const auto selected = tvwItems->selectedItems();
        tvwItems_NodeClick(selected.isEmpty() ? nullptr : selected.front());
    });
    connect(tvwItems, &QTreeWidget::itemDoubleClicked, this, [this] { tvwItems_DblClick(); });
    connect(cmbAccessPaths, &QComboBox::currentIndexChanged, this,
            [this](int index) { cmbAccessPaths_Click(index); });
    connect(cmdOK, &QPushButton::clicked, this, [this] { cmdOK_Click(); });
    connect(cmdCancel, &QPushButton::clicked, this, &QDialog::reject);
    connect(cmdHelp, &QPushButton::clicked, this, [this] { cmdHelp_Click(); });
}

void frmOpcBrowse::Load() {
    mcTree.Load();
    mcView->Flush();
    ShowSelection();
}

// The item ID and access paths as the tree has them now.
void frmOpcBrowse::ShowSelection() {
    lblItemID->setText(Text(mcTree.ItemIDText()));
    QStringList paths;
    for (const std::string& path : mcTree.AccessPaths()) {
        paths << Text(path);
    }
    mbShowing = true;
    QStringList shown;
    for (int i = 0; i < cmbAccessPaths->count(); ++i) {
        shown << cmbAccessPaths->itemText(i);
    }
    if (shown != paths) {
        cmbAccessPaths->clear();
        cmbAccessPaths->addItems(paths);
    }
    cmbAccessPaths->setCurrentIndex(mcTree.AccessPathIndex());
    mbShowing = false;
}

void frmOpcBrowse::tvwItems_Expand(QTreeWidgetItem* item) {
    if (!mcView->Syncing()) {
        mcTree.Expand(mcView->IdOf(item));
        mcView->Flush();
    }
}

void frmOpcBrowse::tvwItems_Collapse(QTreeWidgetItem* item) {
    if (!mcView->Syncing()) {
        mcTree.Collapse(mcView->IdOf(item));
    }
}

void frmOpcBrowse::tvwItems_NodeClick(QTreeWidgetItem* item) {
    if (!mcView->Syncing() && item != nullptr) {
        mcTree.NodeClick(mcView->IdOf(item));
        ShowSelection();
    }
}

void frmOpcBrowse::tvwItems_DblClick() {
    // OK closes the window and empties the tree, which the control is
    // still using for this double click: it waits its turn.
    if (mcTree.DblClickChooses()) {
        QMetaObject::invokeMethod(
            this, [this] { cmdOK_Click(); }, Qt::QueuedConnection);
    }
}

void frmOpcBrowse::cmbAccessPaths_Click(int index) {
    if (!mbShowing) {
        mcTree.SelectAccessPath(index);
    }
}

void frmOpcBrowse::cmdOK_Click() {
    mcTree.OK();
    accept();
}

void frmOpcBrowse::cmdHelp_Click() {
    ShowHelpTopic(mPlatform, 411);
}

void frmOpcBrowse::done(int result) {
    mcTree.Unload();
    QDialog::done(result);
}

}  // namespace cv
