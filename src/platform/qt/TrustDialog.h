#pragma once

#include <QDialog>

#include "platform/CertificateTrust.h"

class QPushButton;

namespace cv::qtui {

// Shows who a server's certificate says it is and why it needs the user's
// word (subject, application URI, thumbprint, validity, host name match,
// the diagnosis), and takes the answer: Refuse, Trust for this session or
// Trust always. Closing the window refuses.
class TrustDialog : public QDialog {
  public:
    explicit TrustDialog(const platform::TrustQuestion& question, QWidget* parent = nullptr);

    platform::TrustAnswer Answer() const { return answer_; }

  private:
    QPushButton* AddButton(const char* name, const QString& text, platform::TrustAnswer answer);

    platform::TrustAnswer answer_ = platform::TrustAnswer::Refuse;
};

// The window's CertificateTrust: asks with a modal TrustDialog.
class QtCertificateTrust : public platform::CertificateTrust {
  public:
    platform::TrustAnswer Ask(const platform::TrustQuestion& question) override;
};

}  // namespace cv::qtui
