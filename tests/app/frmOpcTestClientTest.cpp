#include <QCheckBox>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QWindow>
#include <QtTest>
#include <filesystem>
#include <fstream>
#include <memory>

#include "app/Utility.h"
#include "app/frmOpcTestClient.h"
#include "stores/RegClass.h"
#include "support/TestPlatform.h"

using cv::frmOpcTestClient;
using cv::RangeType;

namespace {

const std::string kEngTooClose = "Eng span Min must be more than .05 from Max.";
const std::string kSIRange = "Must be less than 61 and greater or equal to .1";
const std::string kKey = "Software\\Corvalent\\TestClient";
const QStringList kFirstRunBoxes = {"", "", "", "0", "100", "0", "100", "1"};

}  // namespace

class frmOpcTestClientTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<frmOpcTestClient> window;

    QLineEdit* Box(const char* name) { return window->findChild<QLineEdit*>(name); }
    template <typename Widget = QWidget>
    Widget* Control(const char* name) {
        return window->findChild<Widget*>(name);
    }
    cv::Channel& Channel() { return window->TestChannel(); }
    const std::vector<cv::fake::ScriptedDialogs::Shown>& Messages() {
        return tp->dialogs.Messages();
    }

    // Types text into a box as the user would: the box gets the focus and
    // its old text is replaced.
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
        window = std::make_unique<frmOpcTestClient>(tp->platform);
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
    // The user's settings as another program reading the folder finds them.
    cv::RegClass Settings(cv::platform::RegistryApi& cRegistry) {
        cv::RegClass cReg(cRegistry);
        cReg.SetMainKey(cv::platform::kHkeyCurrentUser);
        return cReg;
    }
    std::string RegistryFile() {
        return tp->folder.File(cv::posix::FileRegistry::kCurrentUserFile);
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

    void firstRunShowsTheDefaults() {
        QCOMPARE(Box("txtServerID")->text(), QString());
        QCOMPARE(Box("txtAccessPath")->text(), QString());
        QCOMPARE(Box("txtItemID")->text(), QString());
        QCOMPARE(Box("txtEngMin")->text(), QStringLiteral("0"));
        QCOMPARE(Box("txtEngMax")->text(), QStringLiteral("100"));
        QCOMPARE(Box("txtInstMin")->text(), QStringLiteral("0"));
        QCOMPARE(Box("txtInstMax")->text(), QStringLiteral("100"));
        QVERIFY(Control<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(Control("fraScalingValues")->isEnabled());
        QCOMPARE(Box("txtSI")->text().toStdString(), cv::FormatFloat(tp->locale, 1.0, 4));
        QCOMPARE(Channel().DecimalPlaces(), 2);
        QCOMPARE(Channel().LineColor(), 65280);
        QVERIFY(window->Document().General().ScalePVandCO());
        QVERIFY(Messages().empty());
    }

    void worksOnTheDefaultDocumentsSPChannel() {
        cv::TunFile& document = window->Document();
        QCOMPARE(document.TunerType(), 9);
        QCOMPARE(&Channel(), document.Archives().SPChannel());
        QCOMPARE(document.Archives().Count(), 3);
        QCOMPARE(Channel().ComType(), 4);
        // The fake program folder does not exist, so the file goes to the data folder.
        QCOMPARE(document.TunFilePath(), tp->program.dataFolder + "/LoopTag.tun");
    }

    void showsVersionNoticeAndCaptions() {
        QCOMPARE(window->windowTitle(), QStringLiteral("Corvalent OPC Test Client"));
        QCOMPARE(Control<QLabel>("lblVersion")->text(), QStringLiteral("Version 13.2.1"));
        QCOMPARE(Control<QLabel>("lblCopyright")->text(),
                 QStringLiteral("Copyright (C) Corvalent"));
        QCOMPARE(Control<QLabel>("Label1")->text(), QStringLiteral("\\\\Node\\Server :"));
        QCOMPARE(Control<QPushButton>("cmdBrowseServers")->toolTip(),
                 QStringLiteral("Browse for OPC Servers"));
        QCOMPARE(Control<QPushButton>("cmdBrowseItems")->toolTip(),
                 QStringLiteral("Browse for OPC Items"));
        // Until their windows exist.
        QVERIFY(!Control("cmdTest")->isEnabled());
        QVERIFY(!Control("cmdBrowseServers")->isEnabled());
        QVERIFY(!Control("cmdBrowseItems")->isEnabled());
    }

    void helpShowsTopicOneOfTheProgramHelpFile() {
        QCOMPARE(tp->run.HelpFile.substr(0, tp->program.folder.size()), tp->program.folder);
        QVERIFY(QString::fromStdString(tp->run.HelpFile).endsWith("CvOpcTestClient.hlp>StepsSub"));
        QTest::mouseClick(Control("cmdHelp"), Qt::LeftButton);
        QCOMPARE(tp->help.requests.size(), size_t{1});
        QCOMPARE(tp->help.requests[0].context, 1);
        QCOMPARE(tp->help.requests[0].file, tp->run.HelpFile);
    }

    void rangeTooNarrowIsRefusedAndKeepsTheFocus() {
        Enter("txtEngMax", "0.03");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].text, kEngTooClose);
        QCOMPARE(Messages()[0].style, 48);
        QCOMPARE(Messages()[0].title, std::string());
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QCOMPARE(Box("txtEngMax")->text(), QStringLiteral("0.03"));
        QCOMPARE(Channel().EngMax(), 100.0);
    }

    void minimumAboveMaximumIsRefused() {
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
        // A valid value then passes and reaches the channel.
        Enter("txtInstMin", "-4");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Channel().InstMin(), -4.0);
        QCOMPARE(Channel().ScaleFactor(), 100.0 / 8.0);
    }

    void theHeldValuePassesWithoutACheck() {
        // A range the check would refuse, held by the channel.
        Channel().SetRange(RangeType::Engineering, 100, 100.02);
        Enter("txtEngMax", "100.02");
        QVERIFY(Messages().empty());
        QCOMPARE(Channel().EngMax(), 100.02);
        QCOMPARE(Focused(), QStringLiteral("txtInstMin"));
    }

    void mouseMoveChecksButLosingActivationDoesNot() {
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

    void clicksWaitForThePendingCheck() {
        Type("txtEngMax", "0.03");
        // Press and release arrive before the queued check has run.
        QTest::mouseClick(Control("cmdHelp"), Qt::LeftButton);
        QCOMPARE(Messages().size(), size_t{1});
        QVERIFY(tp->help.requests.empty());
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QCoreApplication::processEvents();
        QCOMPARE(Messages().size(), size_t{1});
        // So does the scaling switch, which stays as it was.
        QTest::mouseClick(Control("chkUseScaling"), Qt::LeftButton);
        QCOMPARE(Messages().size(), size_t{2});
        QVERIFY(Control<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(Box("txtEngMax")->isEnabled());
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
    }

    void sampleIntervalLimits() {
        Enter("txtSI", "0.1");
        QVERIFY(Messages().empty());
        QCOMPARE(window->Document().General().SIinMSec(), 100);
        QCOMPARE(Box("txtSI")->text().toStdString(), cv::FormatFloat(tp->locale, 0.1, 4));
        Enter("txtSI", "61");
        QVERIFY(Messages().empty());
        QCOMPARE(window->Document().General().SIinMSec(), 61000);

        for (const char* refused : {"0.09", "61.5"}) {
            tp->dialogs.Clear();
            Enter("txtSI", refused);
            QCOMPARE(Messages().size(), size_t{1});
            QCOMPARE(Messages()[0].text, kSIRange);
            QCOMPARE(Messages()[0].style, 48);
            QCOMPARE(Focused(), QStringLiteral("txtSI"));
            QCOMPARE(window->Document().General().SIinMSec(), 61000);
        }
    }

    void sampleIntervalShowsTheIntervalInUse() {
        // 0.1234 s runs in steps of 5 ms: 0.125 s.
        Enter("txtSI", "0.1234");
        QCOMPARE(window->Document().General().SIinMSec(), 125);
        QCOMPARE(Box("txtSI")->text().toStdString(), cv::FormatFloat(tp->locale, 0.125, 4));
    }

    void junkTextIsQuestionedAndReadAsWellAsPossible() {
        Enter("txtEngMax", "abc");
        QCOMPARE(Messages().size(), size_t{2});
        QCOMPARE(Messages()[0].title, std::string("Conversion errors"));
        QCOMPARE(Messages()[1].text, kEngTooClose);
        QCOMPARE(Box("txtEngMax")->text(), QStringLiteral("0"));
        QCOMPARE(Channel().EngMax(), 100.0);
    }

    void hugeNumbersNeverReachTheChannel() {
        Enter("txtEngMax", "1e60");
        QCOMPARE(Focused(), QStringLiteral("txtEngMax"));
        QCOMPARE(Box("txtEngMax")->text(), QStringLiteral("1E-05"));
        QCOMPARE(Channel().EngMax(), 100.0);
        // Too large for a single: questioned, and read as the error value 1E-5.
        tp->dialogs.Clear();
        Enter("txtInstMin", "-1e60");
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(Messages()[0].title, std::string("Conversion errors"));
        QCOMPARE(Channel().InstMin(), double(1E-5F));
        Enter("txtSI", "1e60");
        QCOMPARE(Messages().back().text, kSIRange);
        QCOMPARE(window->Document().General().SIinMSec(), 1000);
        // The largest single-precision numbers are still ranges.
        tp->dialogs.Clear();
        Enter("txtEngMax", "3e38");
        QVERIFY(Messages().empty());
        QCOMPARE(Channel().EngMax(), double(3e38f));
        QVERIFY(std::isfinite(Channel().ScaleFactor()));
    }

    void serverTextIsSplitIntoNodeAndServer() {
        Enter("txtServerID", "\\\\PLANT7\\Vendor.Server.1 ");
        QCOMPARE(Box("txtServerID")->text(), QStringLiteral("\\\\PLANT7\\Vendor.Server.1 "));
        QCOMPARE(Channel().OpcComputer(), std::string("PLANT7"));
        QCOMPARE(Channel().OpcServerID(), std::string("Vendor.Server.1"));
        Enter("txtAccessPath", " Path1 ");
        QCOMPARE(Channel().OpcAccessPath(), std::string("Path1"));
        Enter("txtItemID", " Area1.FIC101.PV");
        QCOMPARE(Channel().ItemName(), std::string("Area1.FIC101.PV"));
        QVERIFY(Messages().empty());
    }

    void scalingSwitchEnablesTheRangeBoxes() {
        auto* scaling = Control<QCheckBox>("chkUseScaling");
        QTest::mouseClick(scaling, Qt::LeftButton);
        QVERIFY(!scaling->isChecked());
        QVERIFY(!Control("fraScalingValues")->isEnabled());
        for (const char* name : {"txtEngMin", "txtEngMax", "txtInstMin", "txtInstMax"}) {
            QVERIFY(!Box(name)->isEnabled());
        }
        QVERIFY(!window->Document().General().ScalePVandCO());
        QCOMPARE(Channel().EngMax(), 100.0);
        QTest::mouseClick(scaling, Qt::LeftButton);
        QVERIFY(Box("txtEngMin")->isEnabled());
        QVERIFY(window->Document().General().ScalePVandCO());
    }

    void closeButtonAndTitleBarClose() {
        QTest::mouseClick(Control("cmdClose"), Qt::LeftButton);
        QVERIFY(!window->isVisible());
        window->show();
        Type("txtEngMax", "0.03");
        QVERIFY(window->close());
        QVERIFY(Messages().empty());
        QCOMPARE(Channel().EngMax(), 100.0);
    }

    void valuesAreRememberedBetweenRuns() {
        Enter("txtServerID", "\\\\PLANT7\\Vendor.Server.1");
        Enter("txtItemID", "Area1.FIC101.PV");
        Enter("txtEngMin", "-50");
        Enter("txtInstMin", "0.1");
        Enter("txtInstMax", "20");
        Enter("txtSI", "2.5");
        QTest::mouseClick(Control("chkUseScaling"), Qt::LeftButton);
        Channel().SetDecimalPlaces(4);
        Channel().SetLineColor(255);
        const QStringList shown = Boxes();
        QTest::mouseClick(Control("cmdClose"), Qt::LeftButton);

        cv::posix::FileRegistry disk(tp->folder.Path());
        QCOMPARE(Settings(disk).ReadDouble(kKey, "InstMin", 0), double(0.1F));
        QCOMPARE(Settings(disk).ReadString(kKey, "Scaling", ""), std::string("0"));
        QCOMPARE(Settings(disk).ReadLong(kKey, "DecPt", 0, 0, 0), 4);
        Open();
        QCOMPARE(Boxes(), shown);
        QVERIFY(!Control<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(!Control("fraScalingValues")->isEnabled());
        QCOMPARE(Channel().OpcComputer(), std::string("PLANT7"));
        QCOMPARE(Channel().LineColor(), 255);
        QCOMPARE(window->Document().General().SIinMSec(), 2500);

        // Closed from the title bar: a checked field is saved, a typed one is not.
        Enter("txtItemID", "Area1.FIC101.SP");
        Type("txtAccessPath", "NotChecked");
        window->windowHandle()->close();
        QVERIFY(!window->isVisible());
        cv::posix::FileRegistry after(tp->folder.Path());
        QCOMPARE(Settings(after).ReadString(kKey, "ItemName", ""), std::string("Area1.FIC101.SP"));
        QCOMPARE(Settings(after).ReadString(kKey, "AccessPath", "?"), std::string());
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
        QVERIFY(Control<QCheckBox>("chkUseScaling")->isChecked());
        QVERIFY(Messages().empty());

        // The channel allows an inverted range, the settings a 20 ms interval.
        window.reset();
        hand.WriteString(kKey, "EngMin", "100");
        hand.WriteString(kKey, "EngMax", "0");
        hand.WriteString(kKey, "SI", ".02");
        Open();
        QCOMPARE(Channel().ScaleFactor(), -1.0);
        QCOMPARE(window->Document().General().SIinMSec(), 20);
    }

    void aBrokenRegistryFileGivesTheDefaultsSilently() {
        window.reset();
        std::ofstream(RegistryFile()) << "not a registry\n[Software\n\"EngMax\"=7\n";
        Open();
        QCOMPARE(Boxes(), kFirstRunBoxes);
        // A file that cannot be read: not read, and not replaced on closing.
        window.reset();
        std::filesystem::remove(RegistryFile());
        std::filesystem::create_directory(RegistryFile());
        Open();
        QCOMPARE(Boxes(), kFirstRunBoxes);
        Enter("txtItemID", "A.B");
        QVERIFY(window->close());
        QVERIFY(std::filesystem::is_directory(RegistryFile()));
        QVERIFY(Messages().empty());
    }
};

QTEST_MAIN(frmOpcTestClientTest)
#include "frmOpcTestClientTest.moc"
