#include "platform/qt/HelpWindow.h"

#include <QFile>
#include <QUrl>

namespace cv::qtui {

namespace {

QString NoTopicPage(int32_t context) {
    return QStringLiteral(
               "<html><head><title>Help</title></head><body>"
               "<p>There is no help for this topic (number %1).</p></body></html>")
        .arg(context);
}

}  // namespace

HelpWindow::HelpWindow() = default;
HelpWindow::~HelpWindow() = default;

QString HelpWindow::TopicPath(int32_t context) {
    return QStringLiteral(":/help/topic%1.html").arg(context);
}

QTextBrowser& HelpWindow::EnsureWindow() {
    if (!window_) {
        window_ = std::make_unique<QTextBrowser>();
        window_->setObjectName(QStringLiteral("HelpWindow"));
        window_->setOpenExternalLinks(true);
        window_->resize(560, 640);
    }
    return *window_;
}

void HelpWindow::ShowTopic(const std::string& /*helpFile*/, int32_t context) {
    QTextBrowser& window = EnsureWindow();
    const QString path = TopicPath(context);
    if (QFile::exists(path)) {
        window.setSource(QUrl(QStringLiteral("qrc") + path));
    } else {
        window.setHtml(NoTopicPage(context));
    }
    window.setWindowTitle(window.documentTitle());
    window.show();
    window.raise();
    window.activateWindow();
}

}  // namespace cv::qtui
