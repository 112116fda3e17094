#include "platform/qt/QtModelessMessages.h"

#include <QPushButton>
#include <QString>
#include <utility>

namespace cv::qtui {

namespace {

QString ToQt(const std::string& text) {
    return QString::fromStdString(text).replace(QStringLiteral("\r\n"), QStringLiteral("\n"));
}

}  // namespace

QtModelessMessages::QtModelessMessages(std::string defaultTitle)
    : defaultTitle_(std::move(defaultTitle)) {}

QtModelessMessages::~QtModelessMessages() {
    for (auto& [id, window] : windows_) {
        delete window.data();
    }
}

QtModelessMessages::WindowId QtModelessMessages::Launch(const std::string& sTitle,
                                                        const std::string& sText,
                                                        const std::string& sButton) {
    auto* box = new QMessageBox();
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->setWindowModality(Qt::NonModal);
    box->setWindowTitle(ToQt(sTitle.empty() ? defaultTitle_ : sTitle));
    box->setText(ToQt(sText));
    box->addButton(ToQt(sButton), QMessageBox::AcceptRole);
    box->show();
    windows_[++lastId_] = box;
    return lastId_;
}

void QtModelessMessages::Close(WindowId id) {
    const auto found = windows_.find(id);
    if (found == windows_.end()) {
        return;
    }
    if (found->second) {
        found->second->close();
    }
    windows_.erase(found);
}

}  // namespace cv::qtui
