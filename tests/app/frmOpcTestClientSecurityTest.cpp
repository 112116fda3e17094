#include <QComboBox>
#include <QDialog>
#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTimer>
#include <QtTest>
#include <functional>
#include <memory>

#include "app/frmOpcTestClient.h"
#include "security/ServerSettings.h"
#include "support/TestPlatform.h"

using cv::security::ServerSecurity;
using cv::ua::MessageSecurityMode;
using cv::ua::UserTokenType;

namespace {

const std::string kUrl = "opc.tcp://plant:4840";
const std::string kBasic = "http://opcfoundation.org/UA/SecurityPolicy#Basic256Sha256";

// What the user does in the security dialog.
struct Choice {
    int mode;
    int policy;
    int identity;
    QString userName;
    bool ok;
};

}  // namespace

class frmOpcTestClientSecurityTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::security::ServerSettings> settings;
    std::unique_ptr<cv::frmOpcTestClient> window;

    void OpenSecurity(const QString& server, const std::function<void(QWidget&)>& act) {
        auto* box = window->findChild<QLineEdit*>("txtServerID");
        box->setText(server);
        QTimer::singleShot(0, [act] {
            if (QWidget* dialog = QApplication::activeModalWidget()) {
                act(*dialog);
            }
        });
        QTest::mouseClick(window->findChild<QPushButton*>("cmdServerSecurity"), Qt::LeftButton);
    }

    static void Answer(QWidget& dialog, const Choice& choice) {
        dialog.findChild<QComboBox*>("cboMode")->setCurrentIndex(choice.mode);
        dialog.findChild<QComboBox*>("cboPolicy")->setCurrentIndex(choice.policy);
        dialog.findChild<QComboBox*>("cboIdentity")->setCurrentIndex(choice.identity);
        dialog.findChild<QLineEdit*>("txtUserName")->setText(choice.userName);
        auto* buttons = dialog.findChild<QDialogButtonBox*>();
        buttons->button(choice.ok ? QDialogButtonBox::Ok : QDialogButtonBox::Cancel)->click();
    }

  private slots:
    void init() {
        tp = std::make_unique<cv::test::TestPlatform>();
        settings = std::make_unique<cv::security::ServerSettings>(tp->registry);
        window = std::make_unique<cv::frmOpcTestClient>(tp->platform);
        window->OfferServerSecurity(*settings);
        window->show();
    }
    void theBoxSaysWhichBackendATestReadUses() {
        const std::pair<QString, QString> cases[] = {
            {"", ""},
            {"Sim.Plant.1", "Backend: simulated plant"},
            {"\\\\OPCHOST1\\Sim.Plant.1", "Backend: simulated plant"},
            {QString::fromStdString(kUrl), "Backend: OPC UA"},
            {" opc.tcp://127.0.0.1:4841/UA ", "Backend: OPC UA"},
        };
        auto* box = window->findChild<QLineEdit*>("txtServerID");
        for (const auto& [server, shown] : cases) {
            box->setText(server);
            QCOMPARE(window->findChild<QLabel*>("lblBackend")->text(), shown);
        }
    }

    void cleanup() {
        window.reset();
        settings.reset();
        tp.reset();
    }

    void theDialogSavesTheChoicesOfTheServerInTheBox() {
        struct Row {
            Choice choice;
            ServerSecurity saved;
        };
        const std::vector<Row> rows = {
            {{0, 0, 0, "", true}, ServerSecurity{}},
            {{3, 1, 1, " bob ", true},
             {MessageSecurityMode::SignAndEncrypt, kBasic, UserTokenType::UserName, "bob"}},
            {{1, 1, 0, "ignored", true},
             {MessageSecurityMode::None, "", UserTokenType::Anonymous, ""}},
            {{2, 2, 1, "ann", false}, ServerSecurity{}},
        };
        for (const Row& row : rows) {
            settings->Write(kUrl, ServerSecurity{});
            OpenSecurity(QString::fromStdString(kUrl),
                         [&row](QWidget& dialog) { Answer(dialog, row.choice); });
            QCOMPARE(settings->Read(kUrl), row.saved);
        }
        QVERIFY(tp->dialogs.Messages().empty());
    }

    void theDialogShowsWhatWasSaved() {
        const ServerSecurity stored{MessageSecurityMode::Sign, kBasic, UserTokenType::UserName,
                                    "ann"};
        settings->Write(kUrl, stored);
        OpenSecurity(QString::fromStdString(kUrl), [](QWidget& dialog) {
            QCOMPARE(dialog.findChild<QComboBox*>("cboMode")->currentText(), QString("Sign"));
            QCOMPARE(dialog.findChild<QComboBox*>("cboPolicy")->currentText(),
                     QString("Basic256Sha256"));
            QCOMPARE(dialog.findChild<QLineEdit*>("txtUserName")->text(), QString("ann"));
            dialog.close();
        });
        QCOMPARE(settings->Read(kUrl), stored);
    }

    void aServerThatIsNotAnEndpointUrlGetsAMessage() {
        OpenSecurity("\\\\PLANT2\\Sim.Plant.1", [](QWidget& dialog) {
            QFAIL(qPrintable("unexpected dialog " + dialog.objectName()));
        });
        QCOMPARE(tp->dialogs.Messages().size(), size_t(1));
    }
};

QTEST_MAIN(frmOpcTestClientSecurityTest)
#include "frmOpcTestClientSecurityTest.moc"
