#include "ui/test/frmDDETest.h"

#include <initializer_list>

#include <QCloseEvent>
#include <QColorDialog>
#include <QComboBox>
#include <QFocusEvent>
#include <QGridLayout>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTimer>
#include <QToolButton>
#include <QVBoxLayout>

#include "platform/Platform.h"
#include "ui/widgets/FormUtility.h"
#include "ui/widgets/HelpTopics.h"
#include "ui/widgets/ctlProgress.h"

namespace cv {

namespace {

constexpr int32_t kHelpTopic = 409;

template <typename Widget>
Widget* Named(Widget* widget, const char* name) {
    widget->setObjectName(QLatin1String(name));
    return widget;
}

// Values and names come from the server: labels never show rich text.
QLabel* NewLabel(const char* name, const char* caption = "") {
    auto* label = Named(new QLabel(QString::fromUtf8(caption)), name);
    label->setTextFormat(Qt::PlainText);
    return label;
}

// A label for text that comes from a server: never read as markup.
QLabel* NewPlainLabel(const char* name) {
    QLabel* label = NewLabel(name);
    label->setTextFormat(Qt::PlainText);
    return label;
}

void SetTextColour(QLabel& label, const QColor& colour) {
    QPalette palette = label.palette();
    palette.setColor(QPalette::WindowText, colour);
    label.setPalette(palette);
}

QString Text(const std::string& text) {
    return QString::fromStdString(text);
}

// 0x00BBGGRR and back.
QColor ToQColor(int32_t lColor) {
    return QColor(lColor & 0xFF, (lColor >> 8) & 0xFF, (lColor >> 16) & 0xFF);
}
int32_t FromQColor(const QColor& color) {
    return color.red() | (color.green() << 8) | (color.blue() << 16);
}

}  // namespace

frmDDETest::frmDDETest(Platform& platform, TunFile& cTunFile, Channel& cChannel, QWidget* parent)
    : QDialog(parent), mPlatform(platform), mTest(platform, cTunFile, cChannel, *this) {
    setObjectName(QStringLiteral("frmDDETest"));
    CreateControls();
    mTest.Start();
}

frmDDETest::~frmDDETest() {
    mTest.Unload();
    // The control shows the test's wait progress: it goes before the test.
    delete mcProgress;
}

bool frmDDETest::DoIt(Platform& platform, TunFile& cTunFile, Channel& cChannel, int32_t lTop,
                      int32_t lLeft, bool /*bOption*/, QWidget* parent) {
    frmDDETest form(platform, cTunFile, cChannel, parent);
    form.adjustSize();
    if (lTop == 1 && lLeft == 1) {
        CenterForm(form, 0);
    } else {
        form.move(lLeft, lTop);
    }
    form.exec();
    return form.mTest.Changed();
}

void frmDDETest::CreateControls() {
    fraTestItem = Named(new QGroupBox(), "fraTestItem");
    lblDdeLabel = NewLabel("lblDdeLabel");
    lblInstLabel = NewLabel("lblInstLabel", "Raw Instrument value :");
    lblInstValue = NewLabel("lblInstValue");
    lblInstValue->setTextInteractionFlags(Qt::TextSelectableByMouse);
    lblTimeStampLabel = NewLabel("lblTimeStampLabel", "Server timestamp :");
    lblTimeStamp = NewLabel("lblTimeStamp");
    lblSourceTimeStampLabel = NewLabel("lblSourceTimeStampLabel", "Source timestamp :");
    lblSourceTimeStamp = NewLabel("lblSourceTimeStamp");
    auto* grid = new QGridLayout(fraTestItem);
    grid->addWidget(lblDdeLabel, 0, 0, 1, 2);
    grid->addWidget(lblInstLabel, 1, 0);
    grid->addWidget(lblInstValue, 1, 1);
    grid->addWidget(lblTimeStampLabel, 2, 0);
    grid->addWidget(lblTimeStamp, 2, 1);
    grid->addWidget(lblSourceTimeStampLabel, 3, 0);
    grid->addWidget(lblSourceTimeStamp, 3, 1);
    grid->addWidget(CreateEngValueFrame(), 4, 0, 1, 2);
    grid->addWidget(CreateModeFrame(), 5, 0, 1, 2);
    grid->setColumnStretch(1, 1);
    lblBackend = NewLabel("lblBackend");
    mcProgress = new ctlProgress(mTest.Progress());
    lblServerAnswer = NewPlainLabel("lblServerAnswer");
    lblServerAnswer->setWordWrap(true);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(fraTestItem);
    layout->addWidget(CreateStatusRow());
    layout->addWidget(lblBackend);
    layout->addWidget(mcProgress);
    layout->addWidget(lblServerAnswer);
    layout->addWidget(CreateButtonRow());
    layout->setSizeConstraint(QLayout::SetFixedSize);
    for (QWidget* hidden :
         std::initializer_list<QWidget*>{lblDdeLabel, lblTimeStampLabel, lblTimeStamp,
                                         lblSourceTimeStampLabel, lblSourceTimeStamp, lblTestResult,
                                         lblQuality, lblOutOfRange, lblBackend, lblServerAnswer}) {
        hidden->hide();
    }
    setMinimumWidth(fontMetrics().horizontalAdvance(QLatin1Char('x')) * 60);
}

QGroupBox* frmDDETest::CreateEngValueFrame() {
    fraEngValue = Named(new QGroupBox(), "fraEngValue");
    fraEngValue->setFlat(true);
    lblEngLabel = NewLabel("lblEngLabel", "Scaled engineering value :");
    lblEngValue = NewLabel("lblEngValue");
    lblEngValue->setToolTip(QStringLiteral("Click to change color"));
    lblEngValue->setCursor(Qt::PointingHandCursor);
    QFont big = lblEngValue->font();
    big.setPointSizeF(big.pointSizeF() * 1.6);
    big.setBold(true);
    lblEngValue->setFont(big);
    lblEngValue->installEventFilter(this);
    Label11 = NewLabel("Label11", "Decimal places :");
    txtDecimalPlaces = Named(new QLineEdit(), "txtDecimalPlaces");
    txtDecimalPlaces->setFixedWidth(txtDecimalPlaces->fontMetrics().horizontalAdvance("000") + 16);
    txtDecimalPlaces->installEventFilter(this);
    connect(txtDecimalPlaces, &QLineEdit::returnPressed, this,
            [this] { mTest.DecimalPlacesEntered(txtDecimalPlaces->text().toStdString()); });
    updDecimalPlaces = Named(new QWidget(), "updDecimalPlaces");
    updDecimalPlacesUp = Named(new QToolButton(), "updDecimalPlacesUp");
    updDecimalPlacesUp->setArrowType(Qt::UpArrow);
    updDecimalPlacesDown = Named(new QToolButton(), "updDecimalPlacesDown");
    updDecimalPlacesDown->setArrowType(Qt::DownArrow);
    connect(updDecimalPlacesUp, &QToolButton::clicked, this, [this] { mTest.DecimalPlacesUp(); });
    connect(updDecimalPlacesDown, &QToolButton::clicked, this,
            [this] { mTest.DecimalPlacesDown(); });
    auto* arrows = new QVBoxLayout(updDecimalPlaces);
    arrows->setContentsMargins(0, 0, 0, 0);
    arrows->setSpacing(0);
    arrows->addWidget(updDecimalPlacesUp);
    arrows->addWidget(updDecimalPlacesDown);
    auto* grid = new QGridLayout(fraEngValue);
    grid->setContentsMargins(0, 0, 0, 0);
    grid->addWidget(lblEngLabel, 0, 0);
    grid->addWidget(lblEngValue, 0, 1, 1, 3);
    grid->addWidget(Label11, 1, 0);
    grid->addWidget(txtDecimalPlaces, 1, 1);
    grid->addWidget(updDecimalPlaces, 1, 2);
    grid->setColumnStretch(3, 1);
    fraEngValue->hide();
    return fraEngValue;
}

QGroupBox* frmDDETest::CreateModeFrame() {
    fraModeSelect = Named(new QGroupBox(), "fraModeSelect");
    fraModeSelect->setFlat(true);
    Label1 = NewLabel("Label1", "This is the ");
    cmbAutoManual = Named(new QComboBox(), "cmbAutoManual");
    Label2 = NewLabel("Label2", "mode string.");
    cmdApply = Named(new QPushButton(QStringLiteral("Apply")), "cmdApply");
    cmdApply->setAutoDefault(false);
    connect(cmdApply, &QPushButton::clicked, this,
            [this] { mTest.ApplyMode(cmbAutoManual->currentIndex()); });
    auto* row = new QHBoxLayout(fraModeSelect);
    row->setContentsMargins(0, 0, 0, 0);
    row->addWidget(Label1);
    row->addWidget(cmbAutoManual);
    row->addWidget(Label2);
    row->addWidget(cmdApply);
    row->addStretch();
    fraModeSelect->hide();
    return fraModeSelect;
}

QWidget* frmDDETest::CreateStatusRow() {
    auto* row = new QWidget();
    lblTestResult = NewLabel("lblTestResult", "Test successful");
    lblQuality = NewPlainLabel("lblQuality");
    lblOutOfRange = NewLabel("lblOutOfRange");
    QFont bold = lblOutOfRange->font();
    bold.setBold(true);
    lblOutOfRange->setFont(bold);
    auto* layout = new QHBoxLayout(row);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(lblTestResult);
    layout->addWidget(lblQuality);
    layout->addWidget(lblOutOfRange);
    layout->addStretch();
    return row;
}

QWidget* frmDDETest::CreateButtonRow() {
    auto* row = new QWidget();
    cmdClose = Named(new QPushButton(QStringLiteral("&Close")), "cmdClose");
    cmdHelp = Named(new QPushButton(QStringLiteral("&Help")), "cmdHelp");
    // Close stays usable while the window waits for the server.
    cmdClose->setProperty("Tag", QStringLiteral("Cancel"));
    cmdClose->setAutoDefault(false);
    cmdHelp->setAutoDefault(false);
    connect(cmdClose, &QPushButton::clicked, this, [this] { cmdClose_Click(); });
    connect(cmdHelp, &QPushButton::clicked, this, [this] { ShowHelpTopic(mPlatform, kHelpTopic); });
    auto* layout = new QHBoxLayout(row);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addStretch();
    layout->addWidget(cmdClose);
    layout->addWidget(cmdHelp);
    return row;
}

void frmDDETest::DisplayChanged() {
    const ItemTestDisplay& shown = mTest.Display();
    setWindowTitle(Text(shown.caption));
    fraTestItem->setTitle(Text(shown.frameCaption));
    lblDdeLabel->setText(Text(shown.ddeLabel));
    lblDdeLabel->setVisible(!shown.ddeLabel.empty());
    lblInstLabel->setText(Text(shown.instLabel));
    lblInstValue->setText(Text(shown.instValue));
    lblInstValue->setToolTip(Text(shown.instValue));
    lblTimeStamp->setText(Text(shown.timeStamp));
    lblTimeStamp->setToolTip(Text(shown.timeStamp));
    lblTimeStampLabel->setVisible(shown.showTimeStamp);
    lblTimeStamp->setVisible(shown.showTimeStamp);
    lblSourceTimeStamp->setText(Text(shown.sourceTimeStamp));
    const bool bSourceStamp = shown.showTimeStamp && !shown.sourceTimeStamp.empty();
    lblSourceTimeStampLabel->setVisible(bSourceStamp);
    lblSourceTimeStamp->setVisible(bSourceStamp);
    lblEngValue->setText(Text(shown.engValue));
    SetTextColour(*lblEngValue, ToQColor(shown.engColor));
    // The box keeps what the user types until the test takes a new number.
    if (shown.decimalPlaces != msPlacesShown) {
        msPlacesShown = shown.decimalPlaces;
        txtDecimalPlaces->setText(Text(msPlacesShown));
    }
    fraEngValue->setVisible(shown.showEngValue);
    ShowModes();
    lblTestResult->setText(Text(shown.testResult));
    lblTestResult->setVisible(shown.showTestResult);
    ShowQuality();
    lblServerAnswer->setText(Text(shown.serverAnswer));
    lblServerAnswer->setVisible(!shown.serverAnswer.empty());
    lblBackend->setText(Text("Backend: " + shown.backend));
    lblBackend->setVisible(!shown.backend.empty());
    if (shown.mousePointer != miPointerShown) {
        miPointerShown = shown.mousePointer;
        SetControlsBusy(miPointerShown, *this);
    }
}

// Beside "Test successful", which the designed window always shows.
void frmDDETest::ShowQuality() {
    const ItemTestDisplay& shown = mTest.Display();
    lblQuality->setText(Text("Quality: " + shown.quality));
    lblQuality->setToolTip(lblQuality->text());
    SetTextColour(*lblQuality, ToQColor(shown.qualityColor));
    lblQuality->setVisible(shown.showTestResult && !shown.quality.empty());
    lblOutOfRange->setText(Text(shown.rangeMark));
    SetTextColour(*lblOutOfRange, ToQColor(ItemTestDisplay::kBadColor));
    lblOutOfRange->setVisible(shown.showEngValue && shown.outOfRange);
}

void frmDDETest::ShowModes() {
    const ItemTestDisplay& shown = mTest.Display();
    if (shown.showModeSelect && !mbModesShown) {
        mbModesShown = true;
        for (const std::string& sMode : shown.modes) {
            cmbAutoManual->addItem(Text(sMode));
        }
        cmbAutoManual->setCurrentIndex(shown.modeIndex);
    }
    fraModeSelect->setVisible(shown.showModeSelect);
}

void frmDDETest::CloseRequested() {
    // Later: the test is still inside its tick.
    QTimer::singleShot(0, this, [this] { close(); });
}

void frmDDETest::closeEvent(QCloseEvent* event) {
    mTest.Unload();
    QDialog::closeEvent(event);
}

bool frmDDETest::eventFilter(QObject* watched, QEvent* event) {
    if (watched == lblEngValue && event->type() == QEvent::MouseButtonRelease) {
        lblEngValue_Click();
        return true;
    }
    if (watched == txtDecimalPlaces && event->type() == QEvent::FocusIn) {
        QTimer::singleShot(0, txtDecimalPlaces, [this] { txtDecimalPlaces->selectAll(); });
    }
    // Checked when the focus goes to another control, not when a message
    // box or another window takes it.
    if (watched == txtDecimalPlaces && event->type() == QEvent::FocusOut) {
        const Qt::FocusReason reason = static_cast<QFocusEvent*>(event)->reason();
        if (reason != Qt::ActiveWindowFocusReason && reason != Qt::PopupFocusReason) {
            mbCheckPending = true;
            QTimer::singleShot(0, this, [this] {
                if (mbCheckPending) {
                    (void)txtDecimalPlaces_Validate();
                }
            });
        }
    }
    return QDialog::eventFilter(watched, event);
}

void frmDDETest::lblEngValue_Click() {
    QColorDialog dlgCommon(ToQColor(mTest.Display().engColor), this);
    dlgCommon.setObjectName(QStringLiteral("dlgCommon"));
    if (dlgCommon.exec() == QDialog::Accepted) {
        mTest.ColourChosen(FromQColor(dlgCommon.selectedColor()));
    }
}

// Leaving the box with a refused number keeps the focus in it.
bool frmDDETest::txtDecimalPlaces_Validate() {
    mbCheckPending = false;
    if (mTest.CanClose(txtDecimalPlaces->text().toStdString())) {
        return true;
    }
    txtDecimalPlaces->setFocus();
    return false;
}

// The box's check runs once, whether the focus left it for this button or not.
void frmDDETest::cmdClose_Click() {
    if (txtDecimalPlaces_Validate()) {
        close();
    }
}

}  // namespace cv
