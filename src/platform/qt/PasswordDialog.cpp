#include "platform/qt/PasswordDialog.h"

#include <QApplication>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>

namespace cv::qtui {

PasswordDialog::PasswordDialog(const platform::PasswordRequest& request, QWidget* parent)
    : QDialog(parent), password_(new QLineEdit) {
    setObjectName("dlgPassword");
    setWindowTitle("Password");
    setModal(true);
    QString text = "Password of " + QString::fromStdString(request.userName) + " at " +
                   QString::fromStdString(request.endpointUrl) + ":";
    if (request.refusedBefore) {
        text = "The server refused the password. " + text;
    }
    auto* label = new QLabel(text);
    label->setObjectName("lblPrompt");
    label->setTextFormat(Qt::PlainText);
    label->setWordWrap(true);
    password_->setObjectName("txtPassword");
    password_->setEchoMode(QLineEdit::Password);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(label);
    layout->addWidget(password_);
    layout->addWidget(buttons);
}

std::string PasswordDialog::Password() const {
    return password_->text().toStdString();
}

std::optional<std::string> QtPasswordPrompt::AskPassword(const platform::PasswordRequest& request) {
    PasswordDialog dialog(request, QApplication::activeWindow());
    if (dialog.exec() != QDialog::Accepted) {
        return std::nullopt;
    }
    return dialog.Password();
}

}  // namespace cv::qtui
