#include <algorithm>
#include <cmath>

#include <QCheckBox>
#include <QCloseEvent>
#include <QFocusEvent>
#include <QLineEdit>

#include "app/frmOpcTestClient.h"
#include "platform/Platform.h"
#include "stores/RegClass.h"
#include "util/FloatText.h"
#include "util/TextToNumber.h"

namespace cv {

namespace {

// Focus moves that check the field left behind: the user going to another
// control of this window. Focus lost to another window (a message box, the
// help window) or moved by the program checks nothing.
bool ChecksField(Qt::FocusReason reason) {
    return reason == Qt::TabFocusReason || reason == Qt::BacktabFocusReason ||
           reason == Qt::MouseFocusReason || reason == Qt::ShortcutFocusReason;
}

const std::string kTooLongText =
    "Must be at most 254 characters long (letters outside plain ASCII count as two or more).";

std::string TrimmedText(const QLineEdit& box) {
    return box.text().trimmed().toStdString();
}

}  // namespace

bool frmOpcTestClient::eventFilter(QObject* watched, QEvent* event) {
    if (event->type() == QEvent::MouseButtonDblClick &&
        (watched == txtServerID || watched == txtItemID)) {
        // The browser opens once the box has finished with the click.
        QMetaObject::invokeMethod(
            this,
            [this, server = watched == txtServerID] {
                server ? cmdBrowseServers_Click() : cmdBrowseItems_Click();
            },
            Qt::QueuedConnection);
    }
    if (event->type() == QEvent::FocusOut &&
        ChecksField(static_cast<QFocusEvent*>(event)->reason())) {
        QueueValidation(qobject_cast<QWidget*>(watched));
    }
    // However the focus came to another field (the window system hands it
    // back where it was going when a message box closes), a refused field
    // keeps it.
    if (event->type() == QEvent::FocusIn && mRefusedField && watched != mRefusedField) {
        QMetaObject::invokeMethod(
            this, [this] { KeepFocusInRefusedField(); }, Qt::QueuedConnection);
    }
    return QWidget::eventFilter(watched, event);
}

void frmOpcTestClient::changeEvent(QEvent* event) {
    if (event->type() == QEvent::ActivationChange && isActiveWindow()) {
        KeepFocusInRefusedField();
    }
    QWidget::changeEvent(event);
}

void frmOpcTestClient::KeepFocusInRefusedField() {
    if (mRefusedField && !mbValidating && !mRefusedField->hasFocus()) {
        mRefusedField->setFocus(Qt::OtherFocusReason);
    }
}

void frmOpcTestClient::QueueValidation(QWidget* field) {
    // The check runs once the focus change is complete, not inside it, so
    // that a message box and the return of the focus are ordinary events.
    // A mouse press that moved the focus has been delivered by then, and the
    // box takes the focus from the pressed button, which then never clicks.
    mPendingValidations.emplace_back(field);
    QMetaObject::invokeMethod(
        this, [this] { RunPendingValidations(); }, Qt::QueuedConnection);
}

bool frmOpcTestClient::RunPendingValidations() {
    if (mbValidating) {
        return false;  // a check is showing a message; it runs the rest after it
    }
    mbValidating = true;
    bool bPassed = true;
    while (bPassed && !mPendingValidations.empty()) {
        const QPointer<QWidget> field = mPendingValidations.front();
        mPendingValidations.pop_front();
        if (!field) {
            continue;
        }
        if (Validate(field)) {
            mEditedFields.removeAll(field);
            if (field == mRefusedField) {
                mRefusedField = nullptr;
            }
            continue;
        }
        // The field shows what was read from it, which the channel does not
        // hold: it keeps the focus, and is checked again before any use.
        // Later moves never happened.
        mPendingValidations.clear();
        mRefusedField = field;
        if (!mEditedFields.contains(field)) {
            mEditedFields.prepend(field);
        }
        field->setFocus(Qt::OtherFocusReason);
        bPassed = false;
    }
    mbValidating = false;
    return bPassed;
}

bool frmOpcTestClient::ChecksPassed() {
    if (mRefusedField) {
        mEditedFields.removeAll(mRefusedField.data());
        mEditedFields.prepend(mRefusedField.data());
    }
    for (QWidget* field : mEditedFields) {
        if (std::find(mPendingValidations.begin(), mPendingValidations.end(), field) ==
            mPendingValidations.end()) {
            mPendingValidations.emplace_back(field);
        }
    }
    return RunPendingValidations();
}

void frmOpcTestClient::closeEvent(QCloseEvent* event) {
    // A focus move made just before closing is still checked; the window
    // closes either way, as closing never checks the field that has the
    // focus. Then the values the objects hold are remembered.
    RunPendingValidations();
    WriteRememberedValues();
    QWidget::closeEvent(event);
}

bool frmOpcTestClient::Validate(QWidget* field) {
    Channel& channel = TestChannel();
    if (field == txtServerID) {
        // Checked in the form it is remembered in: "\\Node\Server".
        const std::string sHeld = channel.OpcNodeAndServer();
        channel.SetOpcNodeAndServer(TrimmedText(*txtServerID));
        if (!FitsRemembered(channel.OpcNodeAndServer())) {
            channel.SetOpcNodeAndServer(sHeld);
            return false;
        }
    } else if (field == txtAccessPath) {
        if (!FitsRemembered(TrimmedText(*txtAccessPath))) {
            return false;
        }
        channel.SetOpcAccessPath(TrimmedText(*txtAccessPath));
    } else if (field == txtItemID) {
        if (!FitsRemembered(TrimmedText(*txtItemID))) {
            return false;
        }
        channel.SetItemName(TrimmedText(*txtItemID));
    } else if (field == chkUseScaling) {
        General().SetScalePVandCO(chkUseScaling->isChecked());
    } else if (field == txtEngMin) {
        return ValidateRangeBox(*txtEngMin, "Eng span", RangeType::Engineering, false,
                                channel.EngMax());
    } else if (field == txtEngMax) {
        return ValidateRangeBox(*txtEngMax, "Eng span", RangeType::Engineering, true,
                                channel.EngMin());
    } else if (field == txtInstMin) {
        return ValidateRangeBox(*txtInstMin, "Inst span", RangeType::Instrument, false,
                                channel.InstMax());
    } else if (field == txtInstMax) {
        return ValidateRangeBox(*txtInstMax, "Inst span", RangeType::Instrument, true,
                                channel.InstMin());
    } else if (field == txtSI) {
        return ValidateSI();
    }
    return true;
}

bool frmOpcTestClient::ValidateRangeBox(QLineEdit& box, const std::string& sSpanName,
                                        RangeType eRange, bool bIsMax, double dOtherLimit) {
    const float v = TextToSingle(mPlatform, box.text().toStdString());
    // Whatever was typed, the box then shows the number read from it, so a
    // text read only in part ("1e60", "12,5") never stands for another value.
    box.setText(QString::fromStdString(RangeText(v)));
    // The box shows single-precision numbers, so the held limit is compared
    // at that precision.
    if (v == static_cast<float>(TestChannel().GetRangeValue(eRange, bIsMax ? 1 : 0))) {
        return true;
    }
    const double dMin = bIsMax ? dOtherLimit : v;
    const double dMax = bIsMax ? v : dOtherLimit;
    if (!CheckMinMax(dMin, dMax, sSpanName)) {
        return false;
    }
    TestChannel().SetRange(eRange, dMin, dMax);
    return true;
}

bool frmOpcTestClient::CheckMinMax(double dMin, double dMax, const std::string& sSpanName) {
    if (dMin <= dMax) {
        if (std::fabs(dMax - dMin) >= 0.05) {
            return true;
        }
        mPlatform.dialogs.MsgBox(sSpanName + " Min must be more than .05 from Max.",
                                 MsgBoxStyle::Exclamation, "");
        return false;
    }
    mPlatform.dialogs.MsgBox(sSpanName + " Min must be less than Max.", MsgBoxStyle::Exclamation,
                             "");
    return false;
}

bool frmOpcTestClient::ValidateSI() {
    TunFileGeneral& general = General();
    if (TrimmedText(*txtSI) == FormatFloat(mPlatform.locale, general.SIinSec(), 4)) {
        return true;
    }
    const float v = TextToSingle(mPlatform, txtSI->text().toStdString());
    if (v >= 0.1 && v <= 61) {
        general.SetSIinSec(v);
        // The interval in use, after the settings have rounded it.
        txtSI->setText(QString::fromStdString(FormatFloat(mPlatform.locale, general.SIinSec(), 4)));
        return true;
    }
    mPlatform.dialogs.MsgBox("Must be less than 61 and greater or equal to .1",
                             MsgBoxStyle::Exclamation, "");
    return false;
}

// A longer text would be remembered but read back on the next start as
// empty, so it is refused while the user can still change it.
bool frmOpcTestClient::FitsRemembered(const std::string& sText) {
    if (sText.size() <= static_cast<size_t>(RegClass::kMaxTextBytes)) {
        return true;
    }
    mPlatform.dialogs.MsgBox(kTooLongText, MsgBoxStyle::Exclamation, "");
    return false;
}

std::string frmOpcTestClient::RangeText(double dValue) const {
    return FormatFloat(mPlatform.locale, dValue, 7);
}

}  // namespace cv
