#include "ui/widgets/FormUtility.h"

#include <algorithm>
#include <limits>

#include <QComboBox>
#include <QGroupBox>
#include <QGuiApplication>
#include <QListWidget>
#include <QPushButton>
#include <QScreen>
#include <QStringList>
#include <QVariant>
#include <QWidget>

namespace cv {

namespace {

Qt::CursorShape ShapeFor(int16_t mousePointer) {
    switch (mousePointer) {
        case 1:
            return Qt::ArrowCursor;
        case 2:
            return Qt::CrossCursor;
        case 3:
            return Qt::IBeamCursor;
        case 5:
        case 15:
            return Qt::SizeAllCursor;
        case 6:
            return Qt::SizeBDiagCursor;
        case 7:
            return Qt::SizeVerCursor;
        case 8:
            return Qt::SizeFDiagCursor;
        case 9:
            return Qt::SizeHorCursor;
        case 10:
            return Qt::UpArrowCursor;
        case 11:
            return Qt::WaitCursor;
        case 12:
            return Qt::ForbiddenCursor;
        case 13:
            return Qt::BusyCursor;
        case 14:
            return Qt::WhatsThisCursor;
        default:
            return Qt::ArrowCursor;
    }
}

QStringList Entries(const QWidget& list) {
    QStringList entries;
    if (const auto* combo = qobject_cast<const QComboBox*>(&list)) {
        for (int i = 0; i < combo->count(); ++i) {
            entries << combo->itemText(i);
        }
    } else if (const auto* box = qobject_cast<const QListWidget*>(&list)) {
        for (int i = 0; i < box->count(); ++i) {
            entries << box->item(i)->text();
        }
    }
    return entries;
}

}  // namespace

void CenterForm(QWidget& form, int16_t offset) {
    const QScreen* screen = form.screen();
    if (screen == nullptr) {
        screen = QGuiApplication::primaryScreen();
    }
    if (screen == nullptr) {
        return;
    }
    const QRect area = screen->geometry();
    const QSize size = form.frameGeometry().size();
    form.move(area.left() + area.width() / 2 - size.width() / 2 + offset,
              area.top() + area.height() / 2 - size.height() / 2 + offset);
}

void SetControlsBusy(int16_t mousePointer, QWidget& form) {
    const bool enabled = mousePointer == 0;
    for (QGroupBox* frame : form.findChildren<QGroupBox*>()) {
        frame->setEnabled(enabled);
    }
    for (QPushButton* button : form.findChildren<QPushButton*>()) {
        if (button->property("Tag").toString() != QLatin1String("Cancel")) {
            button->setEnabled(enabled);
        }
    }
    if (mousePointer == 0) {
        form.unsetCursor();
    } else {
        form.setCursor(ShapeFor(mousePointer));
    }
}

int16_t FindListEntry(const QWidget& list, const std::string& text, std::optional<int32_t> extra) {
    const QStringList entries = Entries(list);
    const QString wanted = QString::fromStdString(text);
    const QString wantedUpper = wanted.toUpper();
    // The index is 16-bit: entries beyond its range cannot be answered.
    const qsizetype count =
        std::min<qsizetype>(entries.size(), std::numeric_limits<int16_t>::max());
    for (qsizetype i = 0; i < count; ++i) {
        const bool found = extra.has_value()
                               ? QString::compare(entries[i].toUpper(), wantedUpper) >= 0
                               : entries[i] == wanted;
        if (found) {
            return static_cast<int16_t>(i);
        }
    }
    return -1;
}

}  // namespace cv
