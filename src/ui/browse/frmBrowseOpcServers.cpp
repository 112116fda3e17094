#include "ui/browse/frmBrowseOpcServers.h"

#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
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

bool frmBrowseOpcServers::DoIt(Platform& platform, std::string& sServerAndNode, int32_t eBrowse,
                               QWidget* parent) {
    frmBrowseOpcServers window(platform, sServerAndNode, eBrowse, parent);
    window.exec();
    if (window.Chosen()) {
        sServerAndNode = window.ServerText();
    }
    return window.Chosen();
}

frmBrowseOpcServers::frmBrowseOpcServers(Platform& platform, std::string sServerAndNode,
                                         int32_t eBrowse, QWidget* parent)
    : QDialog(parent),
      mPlatform(platform),
      mcMousePointer([this](int16_t code) { mcScreenPointer.Show(code); }),
      mcTree(platform, mcNodes, mcMousePointer, eBrowse, std::move(sServerAndNode)) {
    setObjectName(QStringLiteral("frmBrowseOpcServers"));
    setWindowTitle(QStringLiteral("Browse OPC Servers"));
    CreateControls();
    mcView = std::make_unique<TreeNodesView>(*tvwItems, mcNodes, ilstImages);
    ConnectControls();

    lblServerID->setText(Text(mcTree.SelectedText()));
    setWindowTitle(Text(mcTree.Caption()));
    fraSelected->setTitle(Text(mcTree.FrameCaption()));
    lblSelected->setText(Text(mcTree.LabelCaption()));
    mcTree.Load();
    mcView->Flush();
}

void frmBrowseOpcServers::CreateControls() {
    tvwItems = Named(new QTreeWidget(), "tvwItems");
    tvwItems->setHeaderHidden(true);
    tvwItems->setUniformRowHeights(true);
    tvwItems->header()->setSectionResizeMode(QHeaderView::ResizeToContents);
    tvwItems->header()->setStretchLastSection(false);
    tvwItems->setMinimumSize(340, 320);

    fraSelected = Named(new QGroupBox(QStringLiteral("Selected Server")), "fraSelected");
    lblSelected = Named(new QLabel(QStringLiteral("\\\\Node\\Server :")), "lblSelected");
    lblServerID = Named(new QLabel(), "lblServerID");
    lblServerID->setTextFormat(Qt::PlainText);  // names discovery found
    lblServerID->setTextInteractionFlags(Qt::TextSelectableByMouse);
    auto* selected = new QHBoxLayout(fraSelected);
    selected->addWidget(lblSelected);
    selected->addWidget(lblServerID, 1);

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
    layout->addWidget(fraSelected, 1, 0, 1, 2);
    layout->setRowStretch(0, 1);
    layout->setColumnStretch(0, 1);
}

void frmBrowseOpcServers::ConnectControls() {
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
    connect(cmdOK, &QPushButton::clicked, this, [this] { cmdOK_Click(); });
    connect(cmdCancel, &QPushButton::clicked, this, &QDialog::reject);
    connect(cmdHelp, &QPushButton::clicked, this, [this] { cmdHelp_Click(); });
}

void frmBrowseOpcServers::tvwItems_Expand(QTreeWidgetItem* item) {
    if (!mcView->Syncing()) {
        mcTree.Expand(mcView->IdOf(item));
        mcView->Flush();
    }
}

void frmBrowseOpcServers::tvwItems_Collapse(QTreeWidgetItem* item) {
    if (!mcView->Syncing()) {
        mcTree.Collapse(mcView->IdOf(item));
    }
}

void frmBrowseOpcServers::tvwItems_NodeClick(QTreeWidgetItem* item) {
    if (!mcView->Syncing() && item != nullptr) {
        mcTree.NodeClick(mcView->IdOf(item));
        lblServerID->setText(Text(mcTree.SelectedText()));
    }
}

void frmBrowseOpcServers::tvwItems_DblClick() {
    // OK closes the window and empties the tree, which the control is
    // still using for this double click: it waits its turn.
    if (mcTree.DblClickChooses()) {
        QMetaObject::invokeMethod(
            this, [this] { cmdOK_Click(); }, Qt::QueuedConnection);
    }
}

void frmBrowseOpcServers::cmdOK_Click() {
    mcTree.OK();
    accept();
}

void frmBrowseOpcServers::cmdHelp_Click() {
    ShowHelpTopic(mPlatform, 407);
}

void frmBrowseOpcServers::done(int result) {
    mcTree.Unload();
    QDialog::done(result);
}

}  // namespace cv
