#include <filesystem>
#include <fstream>
#include <memory>

#include <QCheckBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QWindow>
#include <QtTest>

#include "app/frmOpcTestClient.h"
#include "stores/RegClass.h"
#include "support/TestPlatform.h"

namespace {

const std::string kEngTooClose = "Eng span Min must be more than .05 from Max.";
const std::string kSIRange = "Must be less than 61 and greater or equal to .1";
const std::string kTooLong =
    "Must be at most 254 characters long (letters outside plain ASCII count as two or more).";
const std::string kKey = "Software\\Corvalent\\TestClient";
const QStringList kFirstRunBoxes = {"", "", "", "0", "100", "0", "100", "1"};

}  // namespace

class frmOpcTestClientTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::frmOpcTestClient> window;

    template <typename Widget = QLineEdit>
    Widget* Box(const char* name) {
        return window->findChild<Widget*>(name);
    }
    cv::Channel& Channel() { return window->TestChannel(); }
    int32_t SIinMSec() { return window->Document().General().SIinMSec(); }
    const auto& Messages() { return tp->dialogs.Messages(); }

    // Types into a box as the user would: focus it and replace its text.
    void Type(const char* name, const QString& text) {
        QLineEdit* box = Box(name);
        box->setFocus();
        QTRY_VERIFY(box->hasFocus());
        box->selectAll();
        QTest::keyClicks(box, text);
    }
    // Leaves the focused control with a key and lets its check run.
    void Leave(Qt::Key key = Qt::Key_Tab) {
        QTest::keyClick(QApplication::focusWidget(), key);
        QCoreApplication::processEvents();
    }
    void Enter(const char* name, const QString& text) {
        Type(name, text);
        Leave();
    }
    QString Focused() {
        return QApplication::focusWidget() ? QApplication::focusWidget()->objectName() : QString();
    }
    // The program's next run on the same settings folder.
    void Open() {
        window = std::make_unique<cv::frmOpcTestClient>(tp->platform);
        window->show();
        window->activateWindow();
        QVERIFY(QTest::qWaitForWindowActive(window.get()));
    }
    QStringList Boxes() {
        QStringList texts;
        for (const char* name : {"txtServerID", "txtAccessPath", "txtItemID", "txtEngMin",
                                 "txtEngMax", "txtInstMin", "txtInstMax", "txtSI"}) {
            texts << Box(name)->text();
        }
        return texts;
    }
    cv::RegClass Settings(cv::platform::RegistryApi& cRegistry) {
        cv::RegClass cReg(cRegistry);
        cReg.SetMainKey(cv::platform::kHkeyCurrentUser);
        return cReg;
    }

  private slots:
    void init() {
        tp = std::make_unique<cv::test::TestPlatform>();
        Open();
    }
    void cleanup() {
        window.reset();
        tp.reset();
    }

    void firstRunShowsDefaultsCaptionsAndHelp() {
        QCOMPARE(Boxes(), kFirstRunBoxes);
        QVERIFY(Box<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(Box<QWidget>("fraScalingValues")->isEnabled());
        QCOMPARE(Channel().DecimalPlaces(), 2);
        QCOMPARE(Channel().LineColor(), 65280);
        QVERIFY(window->Document().General().ScalePVandCO());
        QVERIFY(Messages().empty());
        // The window works on the default document's SP channel.
        QCOMPARE(&Channel(), window->Document().Archives().SPChannel());

        QCOMPARE(window->windowTitle(), QStringLiteral("Corvalent OPC Test Client"));
        QCOMPARE(Box<QLabel>("lblVersion")->text(), QStringLiteral("Version 13.2.1"));
        QCOMPARE(Box<QLabel>("lblCopyright")->text(), QStringLiteral("Copyright (C) Corvalent"));
        QVERIFY(Box<QWidget>("cmdTest")->isEnabled());
        QVERIFY(Box<QWidget>("cmdBrowseServers")->isEnabled());
        QVERIFY(Box<QWidget>("cmdBrowseItems")->isEnabled());

        QCOMPARE(tp->run.HelpFile.substr(0, tp->program.folder.size()), tp->program.folder);
        QVERIFY(QString::fromStdString(tp->run.HelpFile).endsWith("CvOpcTestClient.hlp>StepsSub"));
        QTest::mouseClick(Box<QWidget>("cmdHelp"), Qt::LeftButton);
        QCOMPARE(tp->help.requests.size(), size_t{1});
        QCOMPARE(tp->help.requests[0].context, 1);
        QCOMPARE(tp->help.requests[0].file, tp->run.HelpFile);
    }

    void refusedRangesKeepTheFocusAndTheHeldValuePasses() {
        Enter("txtInstMax", "4");
        QVERIFY(Messages().empty());
        QCOMPARE(Channel().InstMax(), 4.0);
        QCOMPARE(Focused(), QStringLiteral("txtSI"));
        Type("txtInstMin", "5");
        Leave(Qt::Key_Backtab);
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].text, std::string("Inst span Min must be less than Max."));
        QCOMPARE(Focused(), QStringLiteral("txtInstMin"));
        QCOMPARE(Channel().InstMin(), 0.0);
        Enter("txtInstMin", "-4");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Channel().InstMin(), -4.0);
        QCOMPARE(Channel().ScaleFactor(), 100.0 / 8.0);

        tp->dialogs.Clear();
        Enter("txtEngMax", "0.03");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].text, kEngTooClose);
        QCOMPARE(Messages()[0].style, 48);
        QCOMPARE(Messages()[0].title, std::string());
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QCOMPARE(Box("txtEngMax")->text(), QStringLiteral("0.03"));
        QCOMPARE(Channel().EngMax(), 100.0);

        // A range the check would refuse, already held by the channel.
        Channel().SetRange(cv::RangeType::Engineering, 100, 100.02);
        Enter("txtEngMax", "100.02");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Channel().EngMax(), 100.02);
        QCOMPARE(Focused(), QStringLiteral("txtInstMin"));
    }

    void mouseMovesAndClicksCheckButLosingActivationDoesNot() {
        Type("txtEngMax", "0.03");
        QWidget other;
        other.show();
        other.activateWindow();
        QVERIFY(QTest::qWaitForWindowActive(&other));
        QCoreApplication::processEvents();
        QVERIFY(Messages().empty());
        window->activateWindow();
        QVERIFY(QTest::qWaitForWindowActive(window.get()));
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QTest::mouseClick(Box("txtInstMin"), Qt::LeftButton);
        QCoreApplication::processEvents();
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].text, kEngTooClose);
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));

        // Press and release arrive before the queued check has run.
        tp->dialogs.Clear();
        QTest::mouseClick(Box<QWidget>("cmdHelp"), Qt::LeftButton);
        QCOMPARE(Messages().size(), size_t{1});
        QVERIFY(tp->help.requests.empty());
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QCoreApplication::processEvents();
        QCOMPARE(Messages().size(), size_t{1});
        // So does the scaling switch, which stays as it was.
        QTest::mouseClick(Box<QWidget>("chkUseScaling"), Qt::LeftButton);
        QCOMPARE(Messages().size(), size_t{2});
        QVERIFY(Box<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(Box("txtEngMax")->isEnabled());
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
    }

    void aRefusedFieldCancelsTheMovesThatFollowedIt() {
        Type("txtEngMax", "0.03");
        QTest::keyClick(Box("txtEngMax"), Qt::Key_Tab);
        // Before the first check runs, the next box is changed and left too.
        QTest::keyClicks(Box("txtInstMin"), "7");
        QTest::keyClick(Box("txtInstMin"), Qt::Key_Tab);
        QCoreApplication::processEvents();
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QCOMPARE(Channel().InstMin(), 0.0);
    }

    void sampleIntervalLimitsAndSteps() {
        Enter("txtSI", "0.1");
        QVERIFY(Messages().empty());
        QCOMPARE(SIinMSec(), 100);
        QCOMPARE(Box("txtSI")->text(), QStringLiteral("0.1"));
        Enter("txtSI", "61");
        QVERIFY(Messages().empty());
        QCOMPARE(SIinMSec(), 61000);
        for (const char* refused : {"0.09", "61.5"}) {
            tp->dialogs.Clear();
            Enter("txtSI", refused);
            QCOMPARE(Messages().size(), size_t{1});
            QCOMPARE(Messages()[0].text, kSIRange);
            QCOMPARE(Messages()[0].style, 48);
            QCOMPARE(Focused(), QStringLiteral("txtSI"));
            QCOMPARE(SIinMSec(), 61000);
        }
        // 0.1234 s runs in steps of 5 ms: the box shows the 0.125 s in use.
        Enter("txtSI", "0.1234");
        QCOMPARE(SIinMSec(), 125);
        QCOMPARE(Box("txtSI")->text(), QStringLiteral("0.125"));
    }

    // The registry gives back 254 bytes; a longer text would be remembered
    // but come back empty on the next start.
    void textsTooLongToRememberAreRefused() {
        const QString item(254, 'i');
        Enter("txtItemID", item);
        QVERIFY(Messages().empty());
        QCOMPARE(Channel().ItemName(), item.toStdString());
        Type("txtItemID", item + "j");
        Leave();
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].text, kTooLong);
        QCOMPARE(Focused(), QStringLiteral("txtItemID"));
        QCOMPARE(Channel().ItemName(), item.toStdString());
        // A server is remembered with two leading backslashes: 254 typed, 255 kept.
        Type("txtServerID", "\\N\\" + QString(251, 's'));
        Leave();
        QCOMPARE(Messages().size(), size_t{2});
        QCOMPARE(Channel().OpcNodeAndServer(), std::string());
        // Letters beyond ASCII take two bytes each (pasted: keys type ASCII only).
        Type("txtAccessPath", "");
        Box("txtAccessPath")->setText(QString(128, QChar(0xE9)));
        Leave();
        QCOMPARE(Messages().size(), size_t{3});
        QCOMPARE(Channel().OpcAccessPath(), std::string());
    }

    void junkAndHugeNumbersNeverReachTheChannel() {
        Enter("txtEngMax", "abc");
        QCOMPARE(Messages().size(), size_t{2});
        QCOMPARE(Messages()[0].title, std::string("Conversion errors"));
        QCOMPARE(Messages()[1].text, kEngTooClose);
        QCOMPARE(Box("txtEngMax")->text(), QStringLiteral("0"));
        QCOMPARE(Channel().EngMax(), 100.0);
        tp->dialogs.Clear();
        // The largest single-precision numbers are still ranges.
        Enter("txtEngMax", "3e38");
        QCOMPARE(Channel().EngMax(), double(3e38f));
        // Too large for a single: questioned, and read as the error value 1E-5.
        Enter("txtInstMin", "-1e60");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].title, std::string("Conversion errors"));
        QCOMPARE(Channel().InstMin(), double(1E-5F));
        QCOMPARE(Box("txtInstMin")->text(), QStringLiteral("1E-05"));
        QVERIFY(std::isfinite(Channel().ScaleFactor()));
    }

    void valuesAreRememberedBetweenRuns() {
        // Node and server are split, the other texts trimmed.
        Enter("txtServerID", "\\\\PLANT7\\Vendor.Server.1 ");
        QCOMPARE(Channel().OpcComputer(), std::string("PLANT7"));
        QCOMPARE(Channel().OpcServerID(), std::string("Vendor.Server.1"));
        Enter("txtAccessPath", " Path1 ");
        QCOMPARE(Channel().OpcAccessPath(), std::string("Path1"));
        Enter("txtItemID", " Area1.FIC101.PV");
        QCOMPARE(Channel().ItemName(), std::string("Area1.FIC101.PV"));
        Enter("txtEngMin", "-50");
        Enter("txtInstMin", "0.1");
        Enter("txtInstMax", "20");
        Enter("txtSI", "2.5");
        QTest::mouseClick(Box<QWidget>("chkUseScaling"), Qt::LeftButton);
        QVERIFY(!Box<QWidget>("fraScalingValues")->isEnabled());
        QVERIFY(!window->Document().General().ScalePVandCO());
        QCOMPARE(Channel().EngMin(), -50.0);
        Channel().SetDecimalPlaces(4);
        Channel().SetLineColor(255);
        QTest::mouseClick(Box<QWidget>("cmdClose"), Qt::LeftButton);

        // As another program reading the settings folder finds them.
        cv::posix::FileRegistry disk(tp->folder.Path());
        cv::RegClass saved = Settings(disk);
        QCOMPARE(saved.ReadDouble(kKey, "InstMin", 0), double(0.1F));
        QCOMPARE(saved.ReadString(kKey, "Scaling", ""), std::string("0"));
        QCOMPARE(saved.ReadLong(kKey, "DecPt", 0, 0, 0), 4);
        Open();
        QCOMPARE(Boxes(), QStringList({"\\\\PLANT7\\Vendor.Server.1", "Path1", "Area1.FIC101.PV",
                                       "-50", "100", "0.1", "20", "2.5"}));
        QVERIFY(!Box<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(!Box<QWidget>("fraScalingValues")->isEnabled());
        QCOMPARE(Channel().OpcComputer(), std::string("PLANT7"));
        QCOMPARE(Channel().LineColor(), 255);
        QCOMPARE(SIinMSec(), 2500);

        // Closed from the title bar: a checked field is saved; a typed one is
        // neither checked nor taken.
        Enter("txtItemID", "Area1.FIC101.SP");
        Type("txtSI", "0.01");
        window->windowHandle()->close();
        QVERIFY(!window->isVisible());
        QVERIFY(Messages().empty());
        QCOMPARE(saved.ReadString(kKey, "ItemName", ""), std::string("Area1.FIC101.SP"));
        QCOMPARE(saved.ReadString(kKey, "SI", ""), std::string("2.5"));
    }

    void handEditedValuesPassTheObjectsRules() {
        window.reset();
        cv::RegClass hand = Settings(tp->registry);
        hand.WriteString(kKey, "ServerID", std::string(300, 'x'));
        hand.WriteLong(kKey, "AccessPath", 7);
        hand.WriteString(kKey, "EngMin", "-1e400");
        hand.WriteString(kKey, "EngMax", "1e400");
        hand.WriteString(kKey, "InstMin", "4");
        hand.WriteString(kKey, "InstMax", "4.0000000001");
        hand.WriteLong(kKey, "DecPt", 6);
        hand.WriteLong(kKey, "Colour", -1);
        hand.WriteString(kKey, "Scaling", "yes");
        hand.WriteString(kKey, "SI", "0.01");
        Open();
        QCOMPARE(Boxes(), kFirstRunBoxes);
        QCOMPARE(Channel().ScaleFactor(), 1.0);
        QCOMPARE(Channel().DecimalPlaces(), 2);
        QCOMPARE(Channel().LineColor(), 65535);  // the SP channel keeps its own yellow
        QVERIFY(Box<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(Messages().empty());

        // The channel allows an inverted range, the settings a 20 ms interval.
        window.reset();
        hand.WriteString(kKey, "EngMin", "100");
        hand.WriteString(kKey, "EngMax", "0");
        hand.WriteString(kKey, "SI", ".02");
        Open();
        QCOMPARE(Channel().ScaleFactor(), -1.0);
        QCOMPARE(SIinMSec(), 20);
    }

    void aBrokenRegistryFileGivesTheDefaultsSilently() {
        const std::string file = tp->folder.File(cv::posix::FileRegistry::kCurrentUserFile);
        window.reset();
        std::ofstream(file) << "not a registry\n[Software\n\"EngMax\"=7\n";
        Open();
        QCOMPARE(Boxes(), kFirstRunBoxes);
        // A file that cannot be read: not read, and not replaced on closing.
        window.reset();
        std::filesystem::remove(file);
        std::filesystem::create_directory(file);
        Open();
        QCOMPARE(Boxes(), kFirstRunBoxes);
        Enter("txtItemID", "A.B");
        QVERIFY(window->close());
        QVERIFY(std::filesystem::is_directory(file));
        QVERIFY(Messages().empty());
    }
};

QTEST_MAIN(frmOpcTestClientTest)
#include "frmOpcTestClientTest.moc"
