#include <QGridLayout>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>

#include "app/frmOpcTestClient.h"
#include "platform/Platform.h"
#include "platform/ua/UaBackend.h"
#include "ui/widgets/ServerSecurityDialog.h"

namespace cv {

void frmOpcTestClient::OfferServerSecurity(security::ServerSettings& settings) {
    mServerSettings = &settings;
    if (cmdServerSecurity) {
        return;
    }
    cmdServerSecurity = new QPushButton(QStringLiteral("Security..."));
    cmdServerSecurity->setObjectName("cmdServerSecurity");
    cmdServerSecurity->setToolTip(QStringLiteral("OPC UA security for this server"));
    connect(cmdServerSecurity, &QPushButton::clicked, this, [this] { cmdServerSecurity_Click(); });
    static_cast<QGridLayout*>(Frame1->layout())->addWidget(cmdServerSecurity, 0, 3);
    setTabOrder(cmdBrowseServers, cmdServerSecurity);
}

void frmOpcTestClient::cmdServerSecurity_Click() {
    const std::string url = txtServerID->text().trimmed().toStdString();
    if (!uaopc::UaBackend::IsEndpointUrl(url)) {
        mPlatform.dialogs.MsgBox(
            "Security choices belong to OPC UA servers: enter the server's endpoint URL "
            "(opc.tcp://host:port/path) first.",
            MsgBoxStyle::Exclamation, "");
        return;
    }
    ServerSecurityDialog dialog(*mServerSettings, url, this);
    dialog.exec();
}

// The router sends endpoint URLs to OPC UA and every other server ID to the
// simulated plant; the label says so before the user presses "Test read".
void frmOpcTestClient::ShowBackend() {
    const std::string id = txtServerID->text().trimmed().toStdString();
    if (id.empty()) {
        lblBackend->clear();
        return;
    }
    lblBackend->setText(uaopc::UaBackend::IsEndpointUrl(id)
                            ? QStringLiteral("Backend: OPC UA")
                            : QStringLiteral("Backend: simulated plant"));
}

}  // namespace cv
