#include "ui/browse/ScreenPointer.h"

#include <QApplication>
#include <QEvent>
#include <QMessageBox>
#include <QWidget>

namespace cv {

namespace {

bool IsUserInput(const QEvent& event) {
    switch (event.type()) {
        case QEvent::MouseButtonPress:
        case QEvent::MouseButtonRelease:
        case QEvent::MouseButtonDblClick:
        case QEvent::Wheel:
        case QEvent::KeyPress:
        case QEvent::KeyRelease:
        case QEvent::ShortcutOverride:
        case QEvent::Shortcut:
        case QEvent::ContextMenu:
        case QEvent::TouchBegin:
        case QEvent::TouchUpdate:
        case QEvent::TouchEnd:
            return true;
        case QEvent::Close:
            return event.spontaneous();  // the window's close button, not the program
        default:
            return false;
    }
}

}  // namespace

ScreenPointer::~ScreenPointer() {
    Show(0);
}

void ScreenPointer::Show(int16_t code) {
    const bool busy = code == 11;
    if (busy == busy_) {
        return;
    }
    busy_ = busy;
    if (busy) {
        QApplication::setOverrideCursor(Qt::WaitCursor);
        qApp->installEventFilter(this);
    } else {
        qApp->removeEventFilter(this);
        QApplication::restoreOverrideCursor();
    }
}

bool ScreenPointer::eventFilter(QObject* watched, QEvent* event) {
    const auto* widget = qobject_cast<const QWidget*>(watched);
    if (widget == nullptr || !IsUserInput(*event) ||
        qobject_cast<const QMessageBox*>(widget->window()) != nullptr) {
        return false;
    }
    event->ignore();  // a refused close keeps the window open
    return true;
}

}  // namespace cv
