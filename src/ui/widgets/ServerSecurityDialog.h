#pragma once

#include <QDialog>
#include <string>

#include "security/ServerSettings.h"

class QComboBox;
class QLineEdit;

namespace cv {

// The security choices for one server (endpoint URL): mode, policy,
// identity and user name, read from and saved to the per-server settings
// when OK is pressed. The password is asked when connecting, never here.
class ServerSecurityDialog : public QDialog {
  public:
    ServerSecurityDialog(security::ServerSettings& settings, std::string endpointUrl,
                         QWidget* parent = nullptr);

    // The choices as the fields show them.
    security::ServerSecurity Chosen() const;

  private:
    void Show(const security::ServerSecurity& chosen);
    void Save();

    security::ServerSettings& settings_;
    std::string url_;
    QComboBox* mode_;
    QComboBox* policy_;
    QComboBox* identity_;
    QLineEdit* userName_;
};

}  // namespace cv
