#include "platform/qt/QtDialogs.h"

#include <array>
#include <vector>

#include <QApplication>

namespace cv::qtui {

namespace {

using Button = QMessageBox::StandardButton;

struct ButtonSet {
    std::vector<Button> buttons;  // in the order they are shown
    Button escape;
};

// Indexed by the style's button code (0 to 5); other codes show OK alone.
const ButtonSet& SetFor(int32_t style) {
    static const std::array<ButtonSet, 6> sets = {{
        {{QMessageBox::Ok}, QMessageBox::Ok},
        {{QMessageBox::Ok, QMessageBox::Cancel}, QMessageBox::Cancel},
        {{QMessageBox::Abort, QMessageBox::Retry, QMessageBox::Ignore}, QMessageBox::Abort},
        {{QMessageBox::Yes, QMessageBox::No, QMessageBox::Cancel}, QMessageBox::Cancel},
        {{QMessageBox::Yes, QMessageBox::No}, QMessageBox::No},
        {{QMessageBox::Retry, QMessageBox::Cancel}, QMessageBox::Cancel},
    }};
    const int32_t code = style & 0xF;
    return code < static_cast<int32_t>(sets.size()) ? sets[static_cast<size_t>(code)] : sets[0];
}

}  // namespace

QMessageBox::StandardButtons QtDialogs::ButtonsFor(int32_t style) {
    QMessageBox::StandardButtons buttons;
    for (const Button button : SetFor(style).buttons) {
        buttons |= button;
    }
    return buttons;
}

QMessageBox::StandardButton QtDialogs::DefaultButtonFor(int32_t style) {
    // 256 and 512 make the second and third button the default one.
    const auto& buttons = SetFor(style).buttons;
    const auto index = static_cast<size_t>((style >> 8) & 3);
    return index < buttons.size() ? buttons[index] : buttons.front();
}

QMessageBox::Icon QtDialogs::IconFor(int32_t style) {
    switch (style & 0x70) {
        case MsgBoxStyle::Critical:
            return QMessageBox::Critical;
        case MsgBoxStyle::Question:
            return QMessageBox::Question;
        case MsgBoxStyle::Exclamation:
            return QMessageBox::Warning;
        case MsgBoxStyle::Information:
            return QMessageBox::Information;
        default:
            return QMessageBox::NoIcon;
    }
}

int32_t QtDialogs::AnswerFor(QMessageBox::StandardButton button, int32_t style) {
    switch (button) {
        case QMessageBox::Ok:
            return MsgBoxResult::OK;
        case QMessageBox::Cancel:
            return MsgBoxResult::Cancel;
        case QMessageBox::Abort:
            return MsgBoxResult::Abort;
        case QMessageBox::Retry:
            return MsgBoxResult::Retry;
        case QMessageBox::Ignore:
            return MsgBoxResult::Ignore;
        case QMessageBox::Yes:
            return MsgBoxResult::Yes;
        case QMessageBox::No:
            return MsgBoxResult::No;
        default:
            return AnswerFor(SetFor(style).escape, style);
    }
}

QString QtDialogs::DisplayText(const std::string& text) {
    QString shown = QString::fromStdString(text);
    shown.replace(QLatin1String("\r\n"), QLatin1String("\n"));
    shown.replace(QLatin1Char('\r'), QLatin1Char('\n'));
    return shown;
}

int32_t QtDialogs::MsgBox(const std::string& text, int32_t style, const std::string& title) {
    // Owned by the topmost modal window, if any, so that the box comes up in
    // front of it; application-modal either way.
    QWidget* owner = QApplication::activeModalWidget();
    if (owner == nullptr) {
        owner = QApplication::activeWindow();
    }
    QMessageBox box(owner);
    box.setWindowModality(Qt::ApplicationModal);
    box.setWindowTitle(QString::fromStdString(title.empty() ? defaultTitle_ : title));
    box.setTextFormat(Qt::PlainText);
    box.setText(DisplayText(text));
    box.setIcon(IconFor(style));
    box.setStandardButtons(ButtonsFor(style));
    box.setDefaultButton(DefaultButtonFor(style));
    box.setEscapeButton(SetFor(style).escape);
    box.exec();
    return AnswerFor(box.standardButton(box.clickedButton()), style);
}

}  // namespace cv::qtui
