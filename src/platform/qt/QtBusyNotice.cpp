#include "platform/qt/QtBusyNotice.h"

#include <QApplication>
#include <QVBoxLayout>

#include "platform/qt/QtDialogs.h"

namespace cv::qtui {

QtBusyNotice::QtBusyNotice(std::string title)
    : window_(nullptr, Qt::Dialog | Qt::WindowTitleHint | Qt::CustomizeWindowHint),
      label_(new QLabel(&window_)) {
    window_.setObjectName("BusyNotice");
    window_.setWindowTitle(QString::fromStdString(title));
    window_.setWindowModality(Qt::NonModal);
    label_->setObjectName("lblBusyText");
    label_->setWordWrap(true);
    label_->setMinimumWidth(320);
    auto* layout = new QVBoxLayout(&window_);
    layout->setContentsMargins(18, 14, 18, 14);
    layout->addWidget(label_);
}

void QtBusyNotice::Show(const std::string& text) {
    label_->setText(QtDialogs::DisplayText(text));
    window_.adjustSize();
    if (QWidget* over = QApplication::activeWindow(); over != nullptr && over != &window_) {
        window_.move(over->geometry().center() - window_.rect().center());
    }
    window_.show();
    window_.raise();
}

void QtBusyNotice::Hide() {
    window_.hide();
}

}  // namespace cv::qtui
