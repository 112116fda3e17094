#include <QApplication>
#include <QDialog>
#include <QPushButton>
#include <QTimer>
#include <QtTest>

#include "platform/qt/QtDialogs.h"

using cv::qtui::QtDialogs;

namespace {

// Presses a button of the next message box once it is up, and notes what
// the box showed.
struct BoxAnswerer {
    QMessageBox::StandardButton press;
    QString title{};
    QString text{};
    QWidget* owner = nullptr;

    void Arm(int iPolls = 1000) {
        QTimer::singleShot(0, [this, iPolls] {
            auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
            if (box == nullptr) {
                if (iPolls > 0) {
                    Arm(iPolls - 1);
                }
                return;
            }
            title = box->windowTitle();
            text = box->text();
            owner = box->parentWidget();
            box->button(press)->click();
        });
    }
};

}  // namespace

class QtDialogsTest : public QObject {
    Q_OBJECT

  private slots:
    void stylesAndAnswersAreTheWindowsCodes() {
        // The button code and the icon code are added together; the box tests
        // below show the common ones, these the edges.
        QCOMPARE(QtDialogs::ButtonsFor(2 + 16),
                 QMessageBox::Abort | QMessageBox::Retry | QMessageBox::Ignore);
        QCOMPARE(QtDialogs::ButtonsFor(7), QMessageBox::StandardButtons(QMessageBox::Ok));
        QCOMPARE(QtDialogs::IconFor(3 + 64 + 256), QMessageBox::Information);
        // 256 makes the second button the default one.
        QCOMPARE(QtDialogs::DefaultButtonFor(4 + 256), QMessageBox::No);
        QCOMPARE(QtDialogs::DefaultButtonFor(0 + 512), QMessageBox::Ok);
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::Ignore, 2), 5);
        // Closed without a button: the escape button's answer.
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::NoButton, 4), 7);
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::NoButton, 3), 2);
    }

    void showsTextAndTitleAsGivenAndAnswers() {
        QtDialogs dialogs("Corvalent OPC Test Client");
        BoxAnswerer answerer{QMessageBox::No};
        answerer.Arm();
        QCOMPARE(dialogs.MsgBox("<b>x</b>\r\n\r\nContinue?\rc\nd", 4 + 32, "Conversion errors"), 7);
        QCOMPARE(answerer.title, QStringLiteral("Conversion errors"));
        QCOMPARE(answerer.text, QStringLiteral("<b>x</b>\n\nContinue?\nc\nd"));

        answerer.press = QMessageBox::Ok;
        answerer.Arm();
        QCOMPARE(dialogs.MsgBox("Eng span Min must be less than Max.", 48, ""), 1);
        QCOMPARE(answerer.title, QStringLiteral("Corvalent OPC Test Client"));
    }

    void worksOverAnotherModalWindow() {
        QtDialogs dialogs("Title");
        QDialog modal;
        BoxAnswerer answerer{QMessageBox::Yes};
        int32_t answer = 0;
        QTimer::singleShot(0, &modal, [&] {
            answerer.Arm();
            answer = dialogs.MsgBox("Over the dialog", 4, "");
            modal.accept();
        });
        modal.exec();
        QCOMPARE(answer, 6);
        QCOMPARE(answerer.owner, &modal);
    }
};

QTEST_MAIN(QtDialogsTest)
#include "QtDialogsTest.moc"
