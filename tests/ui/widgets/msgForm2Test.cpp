#include <functional>
#include <optional>
#include <string>

#include <QCheckBox>
#include <QLabel>
#include <QPushButton>
#include <QScreen>
#include <QtTest>

#include "support/TestPlatform.h"
#include "ui/widgets/msgForm2.h"

namespace {

// The clicks to make once the window is up: object names, in order.
using Clicks = QStringList;

struct Shown {
    int32_t answer = -1;
    QStringList visibleButtons;
    QRect geometry;
    QRect client;
    QRect label;
    QRect moreHelp;
    QRect button1;
    int buttonTop = 0;
    bool checkShown = false;
};

}  // namespace

class msgForm2Test : public QObject {
    Q_OBJECT

  private:
    // Runs response, looks at the window once it is shown, then clicks.
    Shown Respond(const Clicks& clicks, const std::function<int32_t(cv::msgForm2&)>& call) {
        cv::test::TestPlatform t;
        cv::msgForm2 form(t.platform);
        Shown shown;
        QTimer::singleShot(0, &form, [&] {
            for (const char* name : {"cmdButton1", "cmdButton2", "cmdButton3", "cmdMoreHelp"}) {
                if (form.findChild<QPushButton*>(name)->isVisible()) {
                    shown.visibleButtons << name;
                }
            }
            shown.geometry = form.frameGeometry();
            shown.client = form.geometry();
            shown.label = form.findChild<QLabel*>("Label1")->geometry();
            shown.moreHelp = form.findChild<QPushButton*>("cmdMoreHelp")->geometry();
            shown.button1 = form.findChild<QPushButton*>("cmdButton1")->geometry();
            shown.buttonTop = shown.button1.top();
            shown.checkShown = form.findChild<QCheckBox*>("Check1")->isVisible();
            for (const QString& name : clicks) {
                QWidget* control = form.findChild<QWidget*>(name);
                QTest::mouseClick(control, Qt::LeftButton, {}, QPoint(4, control->height() / 2));
            }
            if (form.isVisible()) {
                form.close();
            }
        });
        shown.answer = call(form);
        lastHelp = t.help.requests;
        return shown;
    }

    std::vector<cv::fake::RecordingHelp::Request> lastHelp;

  private slots:
    void answersTheButtonPlusTenForTheBox_data() {
        QTest::addColumn<QStringList>("clicks");
        QTest::addColumn<int>("answer");
        QTest::newRow("button 1") << Clicks{"cmdButton1"} << 1;
        QTest::newRow("button 3") << Clicks{"cmdButton3"} << 3;
        QTest::newRow("ticked then cleared") << Clicks{"Check1", "Check1", "cmdButton2"} << 2;
        QTest::newRow("ticked") << Clicks{"Check1", "cmdButton2"} << 12;
        QTest::newRow("closed") << Clicks{} << 0;
        QTest::newRow("ticked and closed") << Clicks{"Check1"} << 10;
        QTest::newRow("help keeps it open") << Clicks{"cmdMoreHelp", "cmdButton1"} << 1;
    }
    void answersTheButtonPlusTenForTheBox() {
        QFETCH(QStringList, clicks);
        QFETCH(int, answer);
        const Shown shown = Respond(clicks, [](cv::msgForm2& form) {
            return form.response("Title", "Message", "One", 409.7, std::string("Two"),
                                 std::string("Do not ask again"), "Three");
        });
        QCOMPARE(shown.answer, answer);
        QCOMPARE(shown.checkShown, true);
        const bool helped = clicks.contains("cmdMoreHelp");
        QCOMPARE(lastHelp.size(), size_t{helped ? 1u : 0u});
        if (helped) {
            QCOMPARE(lastHelp[0].context, 409);
        }
    }

    void oneCaptionGivesOneCentredButton() {
        const Shown shown = Respond({"cmdButton1"}, [](cv::msgForm2& form) {
            return form.response("Title", "Message", "OK");
        });
        QCOMPARE(shown.answer, 1);
        QCOMPARE(shown.visibleButtons, QStringList{"cmdButton1"});
        QVERIFY(!shown.checkShown);
        const int middle = shown.button1.center().x();
        QVERIFY(std::abs(middle - shown.client.width() / 2) <= 1);
        // The buttons sit below the message.
        QVERIFY(shown.buttonTop > shown.label.bottom());
    }

    void allButtonsWidenTheWindowAndTheMessage() {
        const Shown shown = Respond({"cmdButton1"}, [](cv::msgForm2& form) {
            return form.response("Title", "Message", "One", 1.0, std::string("Two"), std::nullopt,
                                 "Three");
        });
        QCOMPARE(shown.visibleButtons.size(), 4);
        QVERIFY(shown.moreHelp.right() < shown.geometry.width());
        QVERIFY(shown.label.right() > shown.moreHelp.left());
    }

    void helpAloneStandsWhereTheThirdButtonWas() {
        cv::test::TestPlatform t;
        const int third = cv::msgForm2(t.platform).findChild<QPushButton*>("cmdButton3")->x();
        const Shown shown = Respond({"cmdButton1"}, [](cv::msgForm2& form) {
            return form.response("Title", "Message", "One", 5.0);
        });
        QCOMPARE(shown.visibleButtons, (QStringList{"cmdButton1", "cmdMoreHelp"}));
        QCOMPARE(shown.moreHelp.x(), third);
    }

    void aMessageTallerThanTheScreenFitsIt() {
        std::string lines;
        for (int i = 0; i < 400; ++i) {
            lines += "line\r\n";
        }
        const Shown shown = Respond({"cmdButton1"}, [&](cv::msgForm2& form) {
            return form.response("Title", lines, "OK");
        });
        const int screenHeight = QGuiApplication::primaryScreen()->availableGeometry().height();
        QCOMPARE(shown.geometry.height(), screenHeight);
        QCOMPARE(shown.geometry.top(), 0);
        QVERIFY(shown.buttonTop + shown.button1.height() <= screenHeight);
    }

    void modelessShowsOneButtonAndDoesNotWait() {
        cv::test::TestPlatform t;
        cv::msgForm2 form(t.platform);
        QVERIFY(form.LaunchModeless("Error reading PV", "No value", "OK"));
        QVERIFY(form.isVisible());
        QVERIFY(!form.isModal());
        QVERIFY(!form.findChild<QPushButton*>("cmdButton2")->isVisible());
        QVERIFY(!form.findChild<QPushButton*>("cmdMoreHelp")->isVisible());
        QCOMPARE(form.windowTitle(), QString("Error reading PV"));
        QTest::mouseClick(form.findChild<QPushButton*>("cmdButton1"), Qt::LeftButton);
        QVERIFY(!form.isVisible());
        QCOMPARE(form.Answer(), 1);
    }
};

QTEST_MAIN(msgForm2Test)
#include "msgForm2Test.moc"
