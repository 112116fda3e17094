#include <memory>

#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QtTest>

#include "app/frmOpcTestClient.h"
#include "support/TestPlatform.h"
#include "ui/test/frmDDETest.h"

// "Test read" from the main window, as the user meets it: the address typed,
// the button pressed, the value in the test window.
class frmOpcTestClientTestReadTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::frmOpcTestClient> window;

    void Enter(const char* name, const QString& text) {
        auto* box = window->findChild<QLineEdit*>(name);
        box->setFocus();
        QTRY_VERIFY(box->hasFocus());
        box->selectAll();
        QTest::keyClicks(box, text);
        QTest::keyClick(box, Qt::Key_Tab);
        QCoreApplication::processEvents();
    }

  private slots:
    void init() {
        tp = std::make_unique<cv::test::TestPlatform>();
        window = std::make_unique<cv::frmOpcTestClient>(tp->platform);
        window->show();
        QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    }
    void cleanup() {
        window.reset();
        tp.reset();
    }

    void testReadShowsTheValueInATestWindowAtTheCopyright() {
        QVERIFY(!tp->plant.SetItemValue("", "Sim.Plant.1", "Area1.Unit1.FIC101.SP",
                                        cv::Variant::R8(12)));
        Enter("txtServerID", "Sim.Plant.1");
        Enter("txtItemID", "Area1.Unit1.FIC101.SP");
        Enter("txtInstMin", "4");
        Enter("txtInstMax", "20");
        auto* cmdTest = window->findChild<QPushButton*>("cmdTest");
        QVERIFY(cmdTest->isEnabled());
        const QPoint copyright =
            window->findChild<QLabel*>("lblCopyright")->mapToGlobal(QPoint(0, 0));
        QString shown;
        QString scaled;
        QString title;
        QPoint at;
        QTimer::singleShot(0, this, [&] {
            auto* test = qobject_cast<cv::frmDDETest*>(QApplication::activeModalWidget());
            QVERIFY(test != nullptr);
            at = test->pos();
            tp->events.Advance(2000);
            QCoreApplication::processEvents();
            shown = test->findChild<QLabel*>("lblInstValue")->text();
            scaled = test->findChild<QLabel*>("lblEngValue")->text();
            title = test->windowTitle();
            QTest::mouseClick(test->findChild<QPushButton*>("cmdClose"), Qt::LeftButton);
        });
        QTest::mouseClick(cmdTest, Qt::LeftButton);
        QCOMPARE(at, copyright);
        QCOMPARE(title, QString("Testing Item: Area1.Unit1.FIC101.SP"));
        QCOMPARE(shown, QString("12"));
        QCOMPARE(scaled, QString("50.00"));
        QCOMPARE(window->TestChannel().Description(), std::string("Area1.Unit1.FIC101.SP"));
        QVERIFY(window->Document().General().ScaleSP());
        QVERIFY(window->Document().OpcClients().empty());
        QVERIFY(tp->dialogs.Messages().empty());
    }

    // A refused field keeps the focus, however the window system hands it
    // back after the message boxes, and no test read uses a value other
    // than the one shown: the field is checked again first.
    void aRefusedFieldKeepsTheFocusAndATestReadUsesWhatIsShown() {
        QVERIFY(
            !tp->plant.SetItemValue("", "Sim.Plant.1", "Types.Memory.R8", cv::Variant::R8(47.095)));
        Enter("txtServerID", "Sim.Plant.1");
        Enter("txtItemID", "Types.Memory.R8");
        tp->dialogs.QueueAnswer(cv::MsgBoxResult::Yes);  // to "Continue showing this message?"
        Enter("txtEngMax", "abc");
        auto* txtEngMax = window->findChild<QLineEdit*>("txtEngMax");
        QCOMPARE(txtEngMax->text(), QString("0"));
        QCOMPARE(window->TestChannel().EngMax(), 100.0);
        window->findChild<QLineEdit*>("txtInstMin")->setFocus(Qt::ActiveWindowFocusReason);
        QCoreApplication::processEvents();
        QVERIFY(txtEngMax->hasFocus());

        QString scaled;
        const auto readScaled = [&] {
            scaled.clear();
            QTimer::singleShot(0, this, [&] {
                if (auto* test = qobject_cast<cv::frmDDETest*>(QApplication::activeModalWidget())) {
                    tp->events.Advance(2000);
                    QCoreApplication::processEvents();
                    scaled = test->findChild<QLabel*>("lblEngValue")->text();
                    test->close();
                }
            });
            QTest::mouseClick(window->findChild<QPushButton*>("cmdTest"), Qt::LeftButton);
            QCoreApplication::processEvents();
        };
        tp->dialogs.Clear();
        readScaled();
        QCOMPARE(scaled, QString());
        QCOMPARE(tp->dialogs.Last().text,
                 std::string("Eng span Min must be more than .05 from Max."));
        QVERIFY(txtEngMax->hasFocus());

        // A later field typed in before the refusal cancelled its check is
        // checked before the test read as well.
        txtEngMax->selectAll();
        QTest::keyClicks(txtEngMax, "50");
        window->findChild<QLineEdit*>("txtInstMax")->setText("");
        QTest::keyClicks(window->findChild<QLineEdit*>("txtInstMax"), "200");
        readScaled();
        QCOMPARE(window->TestChannel().EngMax(), 50.0);
        QCOMPARE(window->TestChannel().InstMax(), 200.0);
        QCOMPARE(scaled, QString("11.77"));
    }
};

QTEST_MAIN(frmOpcTestClientTestReadTest)
#include "frmOpcTestClientTestReadTest.moc"
