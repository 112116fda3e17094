#include "ui/widgets/LoopControls.h"

#include <string>

#include <QComboBox>
#include <QListWidget>
#include <QStringList>
#include <QVariant>
#include <QWidget>

#include "document/LoopClass.h"
#include "util/FloatText.h"

namespace cv {

namespace {

void ShowText(QWidget* control, const std::string& sText) {
    if (control != nullptr) {
        control->setProperty("text", QString::fromStdString(sText));
    }
}

std::string SettingText(const platform::Locale& locale, double dValue, bool bZeroIsNA) {
    return bZeroIsNA && dValue == 0.0 ? "N/A" : FormatFloat(locale, dValue, 4);
}

}  // namespace

void ShowCurrentPIDF(const LoopClass& cLoop, const platform::Locale& locale, QWidget* p, QWidget* i,
                     QWidget* d, QWidget* f) {
    ShowText(p, SettingText(locale, cLoop.CurrentP(), true));
    ShowText(i, SettingText(locale, cLoop.CurrentI(), true));
    ShowText(d, SettingText(locale, cLoop.CurrentD(), false));
    ShowText(f, SettingText(locale, cLoop.CurrentF(), false));
}

void FillFilterUnitsCombo(QWidget& combo) {
    QStringList names;
    for (const char* sName : LoopClass::kFilterUnitNames) {
        names << QString::fromUtf8(sName);
    }
    if (auto* box = qobject_cast<QComboBox*>(&combo)) {
        box->clear();
        box->addItems(names);
    } else if (auto* list = qobject_cast<QListWidget*>(&combo)) {
        list->clear();
        list->addItems(names);
    }
}

}  // namespace cv
