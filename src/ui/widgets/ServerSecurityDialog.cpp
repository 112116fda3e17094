#include "ui/widgets/ServerSecurityDialog.h"

#include <QComboBox>
#include <QDialogButtonBox>
#include <QFormLayout>
#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>

namespace cv {

namespace {

using ua::MessageSecurityMode;

const char* const kPolicyBase = "http://opcfoundation.org/UA/SecurityPolicy#";

QComboBox* Choices(const char* name, const QStringList& items) {
    auto* box = new QComboBox;
    box->setObjectName(name);
    box->addItems(items);
    return box;
}

}  // namespace

ServerSecurityDialog::ServerSecurityDialog(security::ServerSettings& settings,
                                           std::string endpointUrl, QWidget* parent)
    : QDialog(parent),
      settings_(settings),
      url_(std::move(endpointUrl)),
      mode_(Choices("cboMode", {"Most secure offered", "None", "Sign", "SignAndEncrypt"})),
      policy_(
          Choices("cboPolicy", {"Most secure offered", "Basic256Sha256", "Aes128_Sha256_RsaOaep"})),
      identity_(Choices("cboIdentity", {"Anonymous", "User name"})),
      userName_(new QLineEdit) {
    setObjectName("dlgServerSecurity");
    setWindowTitle("Server Security");
    setModal(true);
    userName_->setObjectName("txtUserName");
    auto* form = new QFormLayout;
    form->addRow("Server:", new QLabel(QString::fromStdString(url_)));
    form->addRow("Security mode:", mode_);
    form->addRow("Security policy:", policy_);
    form->addRow("Identity:", identity_);
    form->addRow("User name:", userName_);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    connect(buttons, &QDialogButtonBox::accepted, this, [this] {
        Save();
        accept();
    });
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    connect(identity_, &QComboBox::currentIndexChanged, this,
            [this](int index) { userName_->setEnabled(index == 1); });
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(form);
    layout->addWidget(buttons);
    Show(settings_.Read(url_));
}

void ServerSecurityDialog::Show(const security::ServerSecurity& chosen) {
    mode_->setCurrentIndex(chosen.mode == MessageSecurityMode::None             ? 1
                           : chosen.mode == MessageSecurityMode::Sign           ? 2
                           : chosen.mode == MessageSecurityMode::SignAndEncrypt ? 3
                                                                                : 0);
    const std::string base = kPolicyBase;
    const std::string& uri = chosen.policyUri;
    const int policy = uri.rfind(base, 0) == 0
                           ? policy_->findText(QString::fromStdString(uri.substr(base.size())))
                           : -1;
    policy_->setCurrentIndex(policy < 0 ? 0 : policy);
    identity_->setCurrentIndex(chosen.identity == ua::UserTokenType::UserName ? 1 : 0);
    userName_->setText(QString::fromStdString(chosen.userName));
    userName_->setEnabled(identity_->currentIndex() == 1);
}

security::ServerSecurity ServerSecurityDialog::Chosen() const {
    constexpr MessageSecurityMode kModes[] = {MessageSecurityMode::Invalid,
                                              MessageSecurityMode::None, MessageSecurityMode::Sign,
                                              MessageSecurityMode::SignAndEncrypt};
    security::ServerSecurity chosen;
    chosen.mode = kModes[mode_->currentIndex()];
    if (policy_->currentIndex() > 0 && chosen.mode != MessageSecurityMode::None) {
        chosen.policyUri = kPolicyBase + policy_->currentText().toStdString();
    }
    if (identity_->currentIndex() == 1) {
        chosen.identity = ua::UserTokenType::UserName;
        chosen.userName = userName_->text().trimmed().toStdString();
    }
    return chosen;
}

void ServerSecurityDialog::Save() {
    settings_.Write(url_, Chosen());
}

}  // namespace cv
