#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTimer>
#include <QtTest>
#include <functional>
#include <vector>

#include "platform/qt/PasswordDialog.h"
#include "platform/qt/TrustDialog.h"

using cv::platform::PasswordRequest;
using cv::platform::TrustAnswer;
using cv::platform::TrustQuestion;

namespace {

TrustQuestion Question(bool hostMatches) {
    TrustQuestion question;
    question.endpointUrl = "opc.tcp://plant:4840";
    question.facts.subject = "CN=UA test peer,O=Test";
    question.facts.applicationUri = "urn:test:peer";
    question.facts.thumbprint = "0123456789ABCDEF0123456789ABCDEF01234567";
    question.facts.validFrom = "2026-01-01 00:00:00 UTC";
    question.facts.validTo = "2027-01-01 00:00:00 UTC";
    question.facts.host = "plant";
    question.facts.hostMatches = hostMatches;
    question.diagnosis = "1. Nobody has said to trust this certificate.";
    return question;
}

// Acts on the modal dialog open at the time, once the event loop runs it.
void WhenShown(const std::function<void(QWidget&)>& act) {
    QTimer::singleShot(0, [act] {
        QWidget* dialog = QApplication::activeModalWidget();
        QVERIFY(dialog != nullptr);
        act(*dialog);
    });
}

QString LabelText(QWidget& dialog, const char* name) {
    auto* label = dialog.findChild<QLabel*>(name);
    return label ? label->text() : QString("<missing %1>").arg(name);
}

}  // namespace

class SecurityDialogsTest : public QObject {
    Q_OBJECT

  private slots:
    void trustDialogShowsTheFacts() {
        cv::qtui::TrustDialog dialog(Question(false));
        QCOMPARE(LabelText(dialog, "lblSubject"), QString("CN=UA test peer,O=Test"));
        QCOMPARE(LabelText(dialog, "lblApplicationUri"), QString("urn:test:peer"));
        QCOMPARE(LabelText(dialog, "lblThumbprint"),
                 QString("0123456789ABCDEF0123456789ABCDEF01234567"));
        QCOMPARE(LabelText(dialog, "lblValidity"),
                 QString("2026-01-01 00:00:00 UTC to 2027-01-01 00:00:00 UTC"));
        QCOMPARE(LabelText(dialog, "lblHost"), QString("No: it does not name plant"));
        QCOMPARE(LabelText(dialog, "lblDiagnosis"),
                 QString("1. Nobody has said to trust this certificate."));
        cv::qtui::TrustDialog matching(Question(true));
        QCOMPARE(LabelText(matching, "lblHost"), QString("Yes: it names plant"));
    }

    void trustDialogShowsTheServersTextsAsTheyAre() {
        TrustQuestion question = Question(true);
        question.facts.subject = "<b>CN=Plant</b><img src=\"x\">";
        question.facts.applicationUri = "<a href=\"x\">urn:test:peer</a>";
        cv::qtui::TrustDialog dialog(question);
        for (const char* name : {"lblEndpoint", "lblSubject", "lblApplicationUri", "lblThumbprint",
                                 "lblValidity", "lblHost", "lblDiagnosis"}) {
            QCOMPARE(dialog.findChild<QLabel*>(name)->textFormat(), Qt::PlainText);
        }
        QCOMPARE(LabelText(dialog, "lblSubject"), QString("<b>CN=Plant</b><img src=\"x\">"));
    }

    void eachButtonGivesItsAnswer() {
        struct Row {
            const char* button;  // null: the window is closed with Escape
            TrustAnswer answer;
        };
        const std::vector<Row> rows = {
            {"cmdRefuse", TrustAnswer::Refuse},
            {"cmdTrustSession", TrustAnswer::TrustForSession},
            {"cmdTrustAlways", TrustAnswer::TrustAlways},
            {nullptr, TrustAnswer::Refuse},
        };
        for (const Row& row : rows) {
            WhenShown([&row](QWidget& dialog) {
                if (row.button) {
                    QTest::mouseClick(dialog.findChild<QPushButton*>(row.button), Qt::LeftButton);
                } else {
                    QTest::keyClick(&dialog, Qt::Key_Escape);
                }
            });
            cv::qtui::QtCertificateTrust trust;
            QCOMPARE(trust.Ask(Question(true)), row.answer);
        }
    }

    void passwordPromptGivesTheTypedTextOrNothing() {
        struct Row {
            bool refusedBefore;
            bool cancel;
            std::optional<std::string> password;
            QString prompt;
        };
        const std::vector<Row> rows = {
            {false, false, "secret", "Password of bob at opc.tcp://plant:4840:"},
            {true, false, "",
             "The server refused the password. Password of bob at "
             "opc.tcp://plant:4840:"},
            {false, true, std::nullopt, "Password of bob at opc.tcp://plant:4840:"},
        };
        for (const Row& row : rows) {
            WhenShown([&row](QWidget& dialog) {
                QCOMPARE(LabelText(dialog, "lblPrompt"), row.prompt);
                auto* edit = dialog.findChild<QLineEdit*>("txtPassword");
                QCOMPARE(edit->echoMode(), QLineEdit::Password);
                QTest::keyClicks(edit, QString::fromStdString(row.password.value_or("typed")));
                QTest::keyClick(edit, row.cancel ? Qt::Key_Escape : Qt::Key_Return);
            });
            cv::qtui::QtPasswordPrompt prompt;
            QCOMPARE(prompt.AskPassword(
                         PasswordRequest{"opc.tcp://plant:4840", "bob", row.refusedBefore}),
                     row.password);
        }
    }
};

QTEST_MAIN(SecurityDialogsTest)
#include "SecurityDialogsTest.moc"
