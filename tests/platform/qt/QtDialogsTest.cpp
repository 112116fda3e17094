#include <QApplication>
#include <QDialog>
#include <QPushButton>
#include <QTimer>
#include <QtTest>

#include "platform/qt/QtDialogs.h"

using cv::qtui::QtDialogs;

namespace {

// Presses a button of the next message box as soon as it is up, and notes
// what the box showed.
struct BoxAnswerer {
    QMessageBox::StandardButton press;
    QString title;
    QString text;
    QWidget* owner = nullptr;
    int polls = 0;

    void Arm() {
        polls = 0;
        Poll();
    }
    void Poll() {
        QTimer::singleShot(0, [this] { Answer(); });
    }
    void Answer() {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        if (box == nullptr) {
            if (++polls < 1000) {
                Poll();
            }
            return;
        }
        title = box->windowTitle();
        text = box->text();
        owner = box->parentWidget();
        box->button(press)->click();
    }
};

}  // namespace

class QtDialogsTest : public QObject {
    Q_OBJECT

  private slots:
    void stylesGiveButtonsIconAndDefault() {
        // The button code and the icon code are added together.
        QCOMPARE(QtDialogs::ButtonsFor(0), QMessageBox::StandardButtons(QMessageBox::Ok));
        QCOMPARE(QtDialogs::ButtonsFor(4 + 32), QMessageBox::Yes | QMessageBox::No);
        QCOMPARE(QtDialogs::ButtonsFor(2 + 16),
                 QMessageBox::Abort | QMessageBox::Retry | QMessageBox::Ignore);
        QCOMPARE(QtDialogs::ButtonsFor(7), QMessageBox::StandardButtons(QMessageBox::Ok));
        QCOMPARE(QtDialogs::IconFor(0), QMessageBox::NoIcon);
        QCOMPARE(QtDialogs::IconFor(4 + 32), QMessageBox::Question);
        QCOMPARE(QtDialogs::IconFor(48), QMessageBox::Warning);
        QCOMPARE(QtDialogs::IconFor(3 + 64 + 256), QMessageBox::Information);
        // 256 makes the second button the default one.
        QCOMPARE(QtDialogs::DefaultButtonFor(4 + 256), QMessageBox::No);
        QCOMPARE(QtDialogs::DefaultButtonFor(0 + 512), QMessageBox::Ok);
    }

    void answersAreTheButtonCodes() {
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::Ok, 0), 1);
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::Ignore, 2), 5);
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::Yes, 4), 6);
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::No, 4), 7);
        // Closed without a button: the escape button's answer.
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::NoButton, 4), 7);
        QCOMPARE(QtDialogs::AnswerFor(QMessageBox::NoButton, 3), 2);
    }

    void lineBreaksBecomeNewlines() {
        QCOMPARE(QtDialogs::DisplayText("a\r\n\r\nb\rc\nd"), QStringLiteral("a\n\nb\nc\nd"));
    }

    void showsTextAndTitleAsGivenAndAnswers() {
        QtDialogs dialogs("Corvalent OPC Test Client");
        BoxAnswerer answerer{QMessageBox::No, {}, {}, nullptr};
        answerer.Arm();
        QCOMPARE(dialogs.MsgBox("<b>x</b>\r\nContinue?", 4 + 32, "Conversion errors"), 7);
        QCOMPARE(answerer.title, QStringLiteral("Conversion errors"));
        QCOMPARE(answerer.text, QStringLiteral("<b>x</b>\nContinue?"));

        answerer.press = QMessageBox::Ok;
        answerer.Arm();
        QCOMPARE(dialogs.MsgBox("Eng span Min must be less than Max.", 48, ""), 1);
        QCOMPARE(answerer.title, QStringLiteral("Corvalent OPC Test Client"));
    }

    void worksOverAnotherModalWindow() {
        QtDialogs dialogs("Title");
        QDialog modal;
        BoxAnswerer answerer{QMessageBox::Yes, {}, {}, nullptr};
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
