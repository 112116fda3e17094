#include "app/frmOpcTestClient.h"

#include <array>

#include <QCheckBox>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

#include "platform/Platform.h"
#include "ui/browse/frmBrowseOpcServers.h"
#include "ui/browse/frmOpcBrowse.h"
#include "ui/test/frmDDETest.h"
#include "ui/widgets/HelpTopics.h"
#include "util/FloatText.h"
#include "util/ProgramRoutines.h"

namespace cv {

namespace {

template <typename Widget>
Widget* Named(Widget* widget, const char* name) {
    widget->setObjectName(QLatin1String(name));
    return widget;
}

QLineEdit* NewTextBox(const char* name) {
    auto* box = Named(new QLineEdit(QStringLiteral("Text1")), name);
    box->setMinimumWidth(260);
    return box;
}

// A box for one number, wide enough for the longest single-precision text.
QLineEdit* NewNumberBox(const char* name) {
    auto* box = Named(new QLineEdit(QStringLiteral("Text1")), name);
    box->setFixedWidth(box->fontMetrics().horizontalAdvance(QStringLiteral("-3.402823E+38")) + 16);
    return box;
}

QPushButton* NewButton(const char* name, const char* caption, const char* toolTip = nullptr) {
    auto* button = Named(new QPushButton(QString::fromUtf8(caption)), name);
    button->setAutoDefault(false);
    if (toolTip != nullptr) {
        button->setToolTip(QString::fromUtf8(toolTip));
    }
    return button;
}

QLabel* NewLabel(const char* name, const char* caption) {
    return Named(new QLabel(QString::fromUtf8(caption)), name);
}

}  // namespace

frmOpcTestClient::frmOpcTestClient(Platform& platform, QWidget* parent)
    : QWidget(parent), mPlatform(platform), mcTunFile(platform) {
    setObjectName(QStringLiteral("frmOpcTestClient"));
    setWindowTitle(QString::fromStdString(ProgramTitle()));
    CreateControls();
    SetTabOrder();
    WatchFields();
    Load();
}

void frmOpcTestClient::CreateControls() {
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(CreateAddressFrame());
    layout->addWidget(CreateScalingFrame());
    layout->addWidget(CreateSampleIntervalRow());
    layout->addWidget(CreateButtonRow());
    lblVersion = NewLabel("lblVersion", "version");
    lblCopyright = NewLabel("lblCopyright", "Copyright");
    lblCopyright->setWordWrap(true);
    layout->addWidget(lblVersion);
    layout->addWidget(lblCopyright);
}

QGroupBox* frmOpcTestClient::CreateAddressFrame() {
    Frame1 = Named(new QGroupBox(QStringLiteral("OPC Addresses")), "Frame1");
    Label1 = NewLabel("Label1", "\\\\Node\\Server :");
    txtServerID = NewTextBox("txtServerID");
    cmdBrowseServers = NewButton("cmdBrowseServers", "Browse", "Browse for OPC Servers");
    Label2 = NewLabel("Label2", "Access path :");
    txtAccessPath = NewTextBox("txtAccessPath");
    Label3 = NewLabel("Label3", "Item name :");
    txtItemID = NewTextBox("txtItemID");
    cmdBrowseItems = NewButton("cmdBrowseItems", "Browse", "Browse for OPC Items");
    cmdTest = NewButton("cmdTest", "Test read");
    connect(cmdTest, &QPushButton::clicked, this, [this] { cmdTest_Click(); });
    connect(cmdBrowseServers, &QPushButton::clicked, this, [this] { cmdBrowseServers_Click(); });
    connect(cmdBrowseItems, &QPushButton::clicked, this, [this] { cmdBrowseItems_Click(); });

    auto* grid = new QGridLayout(Frame1);
    grid->addWidget(Label1, 0, 0);
    grid->addWidget(txtServerID, 0, 1);
    grid->addWidget(cmdBrowseServers, 0, 2);
    grid->addWidget(Label2, 1, 0);
    grid->addWidget(txtAccessPath, 1, 1);
    grid->addWidget(Label3, 2, 0);
    grid->addWidget(txtItemID, 2, 1);
    grid->addWidget(cmdBrowseItems, 2, 2);
    grid->addWidget(cmdTest, 3, 2);
    lblBackend = Named(new QLabel, "lblBackend");
    grid->addWidget(lblBackend, 3, 1);
    connect(txtServerID, &QLineEdit::textChanged, this, [this] { ShowBackend(); });
    grid->setColumnStretch(1, 1);
    return Frame1;
}

QGroupBox* frmOpcTestClient::CreateScalingFrame() {
    fraScaling = Named(new QGroupBox(QStringLiteral("Scaling")), "fraScaling");
    Label8 = NewLabel("Label8", "Scale the incoming");
    chkUseScaling = Named(new QCheckBox(QStringLiteral("value")), "chkUseScaling");
    connect(chkUseScaling, &QCheckBox::clicked, this, [this] { chkUseScaling_Click(); });

    fraScalingValues = Named(new QGroupBox(), "fraScalingValues");
    fraScalingValues->setFlat(true);
    Label5 = NewLabel("Label5", "Min");
    Label4 = NewLabel("Label4", "Max");
    Label6 = NewLabel("Label6", "Eng span :");
    txtEngMin = NewNumberBox("txtEngMin");
    txtEngMax = NewNumberBox("txtEngMax");
    Label7 = NewLabel("Label7", "Inst span :");
    txtInstMin = NewNumberBox("txtInstMin");
    txtInstMax = NewNumberBox("txtInstMax");
    auto* grid = new QGridLayout(fraScalingValues);
    grid->addWidget(Label5, 0, 1);
    grid->addWidget(Label4, 0, 2);
    grid->addWidget(Label6, 1, 0);
    grid->addWidget(txtEngMin, 1, 1);
    grid->addWidget(txtEngMax, 1, 2);
    grid->addWidget(Label7, 2, 0);
    grid->addWidget(txtInstMin, 2, 1);
    grid->addWidget(txtInstMax, 2, 2);
    grid->setColumnStretch(3, 1);

    auto* switchRow = new QHBoxLayout();
    switchRow->addWidget(Label8);
    switchRow->addWidget(chkUseScaling);
    switchRow->addStretch();
    auto* column = new QVBoxLayout(fraScaling);
    column->addLayout(switchRow);
    column->addWidget(fraScalingValues);
    return fraScaling;
}

QWidget* frmOpcTestClient::CreateSampleIntervalRow() {
    auto* row = new QWidget();
    Label9 = NewLabel("Label9", "Sample interval :");
    txtSI = NewNumberBox("txtSI");
    Label10 = NewLabel("Label10", "(sec)");
    auto* layout = new QHBoxLayout(row);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(Label9);
    layout->addWidget(txtSI);
    layout->addWidget(Label10);
    layout->addStretch();
    return row;
}

QWidget* frmOpcTestClient::CreateButtonRow() {
    auto* row = new QWidget();
    cmdHelp = NewButton("cmdHelp", "Help");
    cmdClose = NewButton("cmdClose", "Close");
    connect(cmdHelp, &QPushButton::clicked, this, [this] { cmdHelp_Click(); });
    connect(cmdClose, &QPushButton::clicked, this, [this] { cmdClose_Click(); });
    auto* layout = new QHBoxLayout(row);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addStretch();
    layout->addWidget(cmdHelp);
    layout->addWidget(cmdClose);
    return row;
}

void frmOpcTestClient::SetTabOrder() {
    QWidget* const order[] = {txtServerID,    cmdBrowseServers, txtAccessPath, txtItemID,
                              cmdBrowseItems, cmdTest,          chkUseScaling, txtEngMin,
                              txtEngMax,      txtInstMin,       txtInstMax,    txtSI,
                              cmdHelp,        cmdClose};
    for (size_t i = 1; i < std::size(order); ++i) {
        setTabOrder(order[i - 1], order[i]);
    }
}

void frmOpcTestClient::WatchFields() {
    const std::array<QWidget*, 9> fields = {txtServerID,   txtAccessPath, txtItemID,
                                            chkUseScaling, txtEngMin,     txtEngMax,
                                            txtInstMin,    txtInstMax,    txtSI};
    for (QWidget* field : fields) {
        field->installEventFilter(this);
        if (auto* box = qobject_cast<QLineEdit*>(field)) {
            connect(box, &QLineEdit::textEdited, this, [this, field] {
                if (!mEditedFields.contains(field)) {
                    mEditedFields.append(field);
                }
            });
        }
    }
}

void frmOpcTestClient::Load() {
    lblCopyright->setText(QString::fromStdString(mPlatform.program.LegalNotice()));
    lblVersion->setText(QStringLiteral("Version %1.%2.%3")
                            .arg(mPlatform.program.VersionMajor())
                            .arg(mPlatform.program.VersionMinor())
                            .arg(mPlatform.program.VersionRevision()));
    mPlatform.run.HelpFile = "CvOpcTestClient.hlp";
    SetHelpPath(mPlatform);
    mPlatform.run.HelpFile += ">StepsSub";

    // The default document of this program's tuner kind; the channel under
    // test is its SP channel.
    mcTunFile.SetDefaults(ProgramTunerKind());
    mcChannel = mcTunFile.Archives().SPChannel();

    ReadRememberedValues();
    FillFields();
}

void frmOpcTestClient::FillFields() {
    const Channel& channel = TestChannel();
    txtServerID->setText(QString::fromStdString(channel.OpcNodeAndServer()));
    txtAccessPath->setText(QString::fromStdString(channel.OpcAccessPath()));
    txtItemID->setText(QString::fromStdString(channel.ItemName()));
    txtEngMin->setText(QString::fromStdString(RangeText(channel.EngMin())));
    txtEngMax->setText(QString::fromStdString(RangeText(channel.EngMax())));
    txtInstMin->setText(QString::fromStdString(RangeText(channel.InstMin())));
    txtInstMax->setText(QString::fromStdString(RangeText(channel.InstMax())));
    chkUseScaling->setChecked(General().ScalePVandCO());
    chkUseScaling_Click();
    txtSI->setText(QString::fromStdString(FormatFloat(mPlatform.locale, General().SIinSec(), 4)));
}

void frmOpcTestClient::chkUseScaling_Click() {
    if (!ChecksPassed()) {
        // The click came with a focus move that was refused: it never happened.
        chkUseScaling->setChecked(!chkUseScaling->isChecked());
        return;
    }
    fraScalingValues->setEnabled(chkUseScaling->isChecked());
    // Written at once as well as when the box is left, so that a change
    // made just before the window is closed is not lost.
    General().SetScalePVandCO(chkUseScaling->isChecked());
}

// Buttons act only once the field the focus came from has passed its check
// (the check may still be waiting when press and release arrive together).
void frmOpcTestClient::cmdBrowseServers_Click() {
    if (!ChecksPassed()) {
        return;
    }
    std::string sServer = TestChannel().OpcNodeAndServer();
    if (frmBrowseOpcServers::DoIt(mPlatform, sServer, BrowseMode::OpcServers, this)) {
        TestChannel().SetOpcNodeAndServer(sServer);
        txtServerID->setText(QString::fromStdString(sServer));
    }
}

// The test window opens where the copyright notice is, so that it covers the
// lower part of this window and leaves the item's address in sight.
void frmOpcTestClient::cmdTest_Click() {
    if (!ChecksPassed()) {
        return;
    }
    TestChannel().SetDescription(TestChannel().ItemName());
    General().SetScaleSP(General().ScalePVandCO());
    const QPoint position = lblCopyright->mapToGlobal(QPoint(0, 0));
    (void)frmDDETest::DoIt(mPlatform, mcTunFile, TestChannel(), position.y(), position.x(), false,
                           this);  // the window's changes are in the channel already
}

void frmOpcTestClient::cmdBrowseItems_Click() {
    if (!ChecksPassed()) {
        return;
    }
    std::string sItemID = txtItemID->text().toStdString();
    std::string sAccessPath = txtAccessPath->text().toStdString();
    const Channel& channel = TestChannel();
    if (frmOpcBrowse::DoIt(mPlatform, channel.OpcServerID(), channel.OpcComputer(), sItemID,
                           sAccessPath, false, false, this)) {
        txtItemID->setText(QString::fromStdString(sItemID));
        TestChannel().SetItemName(txtItemID->text().trimmed().toStdString());
        txtAccessPath->setText(QString::fromStdString(sAccessPath));
        TestChannel().SetOpcAccessPath(txtAccessPath->text().trimmed().toStdString());
    }
}

void frmOpcTestClient::cmdHelp_Click() {
    if (RunPendingValidations()) {
        ShowHelpTopic(mPlatform, 1);
    }
}

void frmOpcTestClient::cmdClose_Click() {
    if (RunPendingValidations()) {
        close();
    }
}

}  // namespace cv
