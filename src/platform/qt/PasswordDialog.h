#pragma once

#include <QDialog>
#include <optional>
#include <string>

#include "platform/PasswordStore.h"

class QLineEdit;

namespace cv::qtui {

// Asks for the password of a user name at a server; the text is hidden.
// Says so when the server refused the password given before.
class PasswordDialog : public QDialog {
  public:
    explicit PasswordDialog(const platform::PasswordRequest& request, QWidget* parent = nullptr);

    std::string Password() const;

  private:
    QLineEdit* password_;
};

// The window's PasswordPrompt: asks with a modal PasswordDialog; nothing when
// the user cancels.
class QtPasswordPrompt : public platform::PasswordPrompt {
  public:
    std::optional<std::string> AskPassword(const platform::PasswordRequest& request) override;
};

}  // namespace cv::qtui
