#include <functional>
#include <memory>

#include <QColorDialog>
#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QToolButton>
#include <QtTest>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "stores/RegClass.h"
#include "support/TestPlatform.h"
#include "ui/test/frmDDETest.h"
#include "ui/widgets/ctlProgress.h"

namespace {

constexpr const char* kPlant = "Sim.Plant.1";

}  // namespace

class frmDDETestTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::TunFile> doc;
    std::unique_ptr<cv::frmDDETest> window;

    cv::Channel& Channel() { return *doc->Archives().SPChannel(); }
    template <typename Widget = QLabel>
    Widget* Find(const char* name) {
        return window->findChild<Widget*>(name);
    }
    QString Text(const char* name) { return Find(name)->text(); }
    QColor LineColour() {
        const int32_t lColor = Channel().LineColor();
        return QColor(lColor & 0xFF, (lColor >> 8) & 0xFF, (lColor >> 16) & 0xFF);
    }
    void Open(const std::string& sServer, const std::string& sItem) {
        Channel().SetOpcNodeAndServer(sServer);
        Channel().SetItemName(sItem);
        Channel().SetDescription(sItem);
        window = std::make_unique<cv::frmDDETest>(tp->platform, *doc, Channel());
        window->show();
    }
    // Moves the virtual clock and lets the window's queued work run.
    void Advance(uint32_t ms) {
        tp->events.Advance(ms);
        QCoreApplication::processEvents();
    }
    void Click(QWidget* control) { QTest::mouseClick(control, Qt::LeftButton); }
    const auto& Messages() { return tp->dialogs.Messages(); }
    cv::RegClass Settings() {
        cv::RegClass cReg(tp->platform.registry);
        cReg.SetMainKey(cv::platform::kHkeyCurrentUser);
        return cReg;
    }

  private slots:
    void init() {
        tp = std::make_unique<cv::test::TestPlatform>();
        doc = std::make_unique<cv::TunFile>(tp->platform);
        doc->SetDefaults(9);
    }
    void cleanup() {
        window.reset();
        doc.reset();
        tp.reset();
    }

    void showsAGoodValueScaledWithItsTimeStamp() {
        QVERIFY(!tp->plant.SetItemValue("", kPlant, "Types.Memory.R8", cv::Variant::R8(12)));
        doc->General().SetScalePVandCO(true);
        doc->General().SetScaleSP(true);
        Channel().SetRange(cv::RangeType::Instrument, 4, 20);
        Open(kPlant, "Types.Memory.R8");
        QCOMPARE(window->windowTitle(), QString("Trying to connect..."));
        QVERIFY(!Find<QGroupBox>("fraEngValue")->isVisible());
        QVERIFY(!Find("lblBackend")->isVisible());
        Advance(100);
        QCOMPARE(window->windowTitle(), QString("Testing Item: Types.Memory.R8"));
        QCOMPARE(Find<QGroupBox>("fraTestItem")->title(),
                 QString("OPC Item name: Types.Memory.R8"));
        Advance(2000);
        QCOMPARE(Text("lblInstValue"), QString("12"));
        QCOMPARE(Find("lblInstValue")->toolTip(), QString("12"));
        QCOMPARE(Text("lblEngValue"), QString("50.00"));
        QCOMPARE(Text("lblTimeStamp"), QString("12:00:00.000 AM  1/1/2025"));
        QVERIFY(!Find("lblSourceTimeStamp")->isVisible());
        QCOMPARE(Text("lblQuality"), QString("Quality: good"));
        QVERIFY(Find("lblQuality")->isVisible());
        QVERIFY(!Find("lblOutOfRange")->isVisible());
        QCOMPARE(Text("lblInstLabel"), QString("Raw Instrument value :"));
        QCOMPARE(Text("lblBackend"), QString("Backend: simulated plant"));
        QVERIFY(Find("lblBackend")->isVisible());
        QVERIFY(Find("lblTimeStampLabel")->isVisible());
        QVERIFY(Find("lblTestResult")->isVisible());
        QVERIFY(Find<QGroupBox>("fraEngValue")->isVisible());
        QVERIFY(!Find<QGroupBox>("fraModeSelect")->isVisible());
        QVERIFY(!Find<cv::ctlProgress>("ctlProgress")->isVisible());
        QCOMPARE(Find<QLineEdit>("txtDecimalPlaces")->text(), QString("2"));
        QCOMPARE(Find("lblEngValue")->palette().color(QPalette::WindowText), LineColour());
        QVERIFY(Find<QPushButton>("cmdHelp")->isEnabled());
        QVERIFY(Messages().empty());
        Click(Find<QPushButton>("cmdClose"));
        QVERIFY(!window->isVisible());
        QVERIFY(doc->OpcClients().empty());
    }

    void uncertainValueWarnsOnce_data() {
        QTest::addColumn<int>("answer");
        QTest::newRow("Yes") << int{cv::MsgBoxResult::Yes};
        QTest::newRow("No") << int{cv::MsgBoxResult::No};
    }
    void uncertainValueWarnsOnce() {
        QFETCH(int, answer);
        tp->dialogs.QueueAnswer(answer);
        Open(kPlant, "Quality.Uncertain");
        Advance(5000);
        QCOMPARE(Messages().size(), size_t{1});
        QCOMPARE(tp->dialogs.Last().title, std::string("Quality.Uncertain: Uncertain OPC Value"));
        QCOMPARE(tp->run.UncertainWarningOff, answer == cv::MsgBoxResult::No);
        QCOMPARE(Text("lblInstValue"), QString("3"));
        QVERIFY(window->isVisible());
    }

    // Under the progress bar, what the server answered while the test tries
    // again; until the wait ends, or at once when no retry can help.
    void failuresShowTheirDiagnosisAndClose_data() {
        QTest::addColumn<QString>("server");
        QTest::addColumn<QString>("item");
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("answer");
        QTest::newRow("bad quality") << kPlant << "Quality.CommFailure"
                                     << "Communications failure"
                                     << "The server answered: bad, communication failure; trying "
                                        "again until the wait ends";
        QTest::newRow("unknown item") << kPlant << "No.Such.Item"
                                      << "Either the Access Path or the Item Name are unknown"
                                      << "The server answered: Either the Access Path or the Item "
                                         "Name are unknown to the OPC Server; trying again until "
                                         "the wait ends";
        QTest::newRow("not registered") << "Sim.Nothing.1"
                                        << "X"
                                        << "is not registered as an OPC Server in this computer."
                                        << "";
    }
    void failuresShowTheirDiagnosisAndClose() {
        QFETCH(QString, server);
        QFETCH(QString, item);
        QFETCH(QString, text);
        QFETCH(QString, answer);
        Open(server.toStdString(), item.toStdString());
        Advance(answer.isEmpty() ? 100 : 5000);
        QCOMPARE(window->isVisible(), !answer.isEmpty());
        QCOMPARE(Find("lblServerAnswer")->isVisible(), !answer.isEmpty());
        QCOMPARE(Text("lblServerAnswer"), answer);
        Advance(answer.isEmpty() ? 0 : 5300);
        QVERIFY(!window->isVisible());
        QVERIFY(!Messages().empty());
        QVERIFY2(QString::fromStdString(tp->dialogs.Last().text).contains(text),
                 tp->dialogs.Last().text.c_str());
    }

    // Beside "Test successful": the quality, bad here although the value is
    // shown (a last known value), and a mark outside the engineering range.
    void qualityAndRangeShowBesideTheResult() {
        tp->run.UncertainWarningOff = true;
        doc->General().SetScalePVandCO(true);
        doc->General().SetScaleSP(true);
        Channel().SetRange(cv::RangeType::Instrument, 0, 10);
        Channel().SetRange(cv::RangeType::Engineering, 0, 10);
        Open(kPlant, "Quality.LastKnown");
        Advance(2000);
        QCOMPARE(Text("lblTestResult"), QString("Test successful"));
        QCOMPARE(Text("lblQuality"), QString("Quality: bad, last known value"));
        QCOMPARE(Find("lblQuality")->palette().color(QPalette::WindowText), QColor(0xC0, 0, 0));
        QVERIFY(Find("lblOutOfRange")->isVisible());
        QCOMPARE(Text("lblOutOfRange"), QString("out of range 0.00 to 10.00"));
        QCOMPARE(Text("lblEngValue"), QString("13.00"));
        QVERIFY(Messages().empty());
    }

    void theSlowServerShowsItsBusyNotice() {
        Open("Sim.Slow.1", "Unit1.FIC101.PV");
        Advance(120000);
        QVERIFY(!tp->busy.Shown().empty());
        QVERIFY(window->isVisible());
        QVERIFY(Find<QGroupBox>("fraEngValue")->isVisible());
    }

    void theWaitButtonsChangeTheRememberedWait() {
        Open(kPlant, "No.Such.Item");
        Advance(300);
        auto* progress = Find<cv::ctlProgress>("ctlProgress");
        QVERIFY(progress->isVisible());
        auto* longer = progress->findChild<QPushButton*>("cmdButton2");
        auto* shorter = progress->findChild<QPushButton*>("cmdButton1");
        QVERIFY(longer->isEnabled());
        Click(longer);
        QCOMPARE(Settings().ReadLong("Software\\Corvalent\\Faceplate", "TimeOut", 0, 0, 0), 15000);
        Advance(12000);
        QVERIFY(window->isVisible());
        Click(shorter);
        Click(shorter);
        QCOMPARE(Settings().ReadLong("Software\\Corvalent\\Faceplate", "TimeOut", 0, 0, 0), 5000);
        Advance(200);
        QVERIFY(!window->isVisible());
    }

    void aServerShutdownEndsTheTest() {
        Open(kPlant, "Signals.Ramp");
        Advance(2000);
        QVERIFY(!tp->plant.ShutDownServer("", kPlant, "Maintenance"));
        Advance(2000);
        QVERIFY(!window->isVisible());
        // The OPC client's message is the only one.
        QCOMPARE(tp->dialogs.Messages().size(), size_t{1});
        QCOMPARE(tp->dialogs.Last().text, std::string("The OPC Server has been shutdown"));
    }

    void hotLinksOffReadsEachRefresh() {
        doc->General().SetUseHotLinks(false);
        Open(kPlant, "Types.Memory.R8");
        Advance(2000);
        QVERIFY(!tp->plant.SetItemValue("", kPlant, "Types.Memory.R8", cv::Variant::R8(7)));
        Advance(1000);
        QCOMPARE(Text("lblInstValue"), QString("7"));
    }

    void aModeStringIsApplied() {
        QVERIFY(!tp->plant.SetItemValue("", kPlant, "Types.Memory.BSTR", cv::Variant::Str("MAN")));
        Channel().SetSpecificChannelType(4);
        Channel().SetExpectANumber(false);
        Open(kPlant, "Types.Memory.BSTR");
        Advance(2000);
        QVERIFY(Find<QGroupBox>("fraModeSelect")->isVisible());
        QVERIFY(!Find<QGroupBox>("fraEngValue")->isVisible());
        QCOMPARE(Text("lblInstLabel"), QString("Current value :"));
        auto* modes = Find<QComboBox>("cmbAutoManual");
        QCOMPARE(modes->count(), 2);
        QCOMPARE(modes->currentIndex(), 0);  // no key matches: the first
        modes->setCurrentIndex(1);
        tp->dialogs.QueueAnswer(cv::MsgBoxResult::Yes);
        Click(Find<QPushButton>("cmdApply"));
        QCOMPARE(doc->General().ModeKey(2), std::string("MAN"));
        QVERIFY(window->Test().Changed());
    }

    void decimalPlacesFromTheArrowsAndTheBox() {
        QVERIFY(!tp->plant.SetItemValue("", kPlant, "Types.Memory.R8", cv::Variant::R8(1.23456)));
        Open(kPlant, "Types.Memory.R8");
        Advance(2000);
        Click(Find<QToolButton>("updDecimalPlacesUp"));
        QCOMPARE(Text("lblEngValue"), QString("1.235"));
        QCOMPARE(Find<QLineEdit>("txtDecimalPlaces")->text(), QString("3"));
        auto* box = Find<QLineEdit>("txtDecimalPlaces");
        box->setFocus();
        box->selectAll();
        QTest::keyClicks(box, "9");
        QTest::keyClick(box, Qt::Key_Return);
        QCOMPARE(tp->dialogs.Last().text,
                 std::string("Number of decimal places must be in range 0 to 5."));
        QCOMPARE(Channel().DecimalPlaces(), 3);
        // Closing with the refused number in the box keeps the window open.
        Click(Find<QPushButton>("cmdClose"));
        QVERIFY(window->isVisible());
        box->selectAll();
        QTest::keyClicks(box, "1");
        QTest::keyClick(box, Qt::Key_Return);
        QCOMPARE(Text("lblEngValue"), QString("1.2"));
        Click(Find<QToolButton>("updDecimalPlacesDown"));
        Click(Find<QToolButton>("updDecimalPlacesDown"));
        QCOMPARE(Channel().DecimalPlaces(), 0);
        QVERIFY(window->Test().Changed());
    }

    void theColourDialogColoursTheValue() {
        Open(kPlant, "Types.Memory.R8");
        Advance(2000);
        QTimer::singleShot(0, this, [this] {
            auto* dialog = qobject_cast<QColorDialog*>(QApplication::activeModalWidget());
            QVERIFY(dialog != nullptr);
            QCOMPARE(dialog->currentColor(), LineColour());
            dialog->setCurrentColor(QColor(255, 0, 0));
            dialog->accept();
        });
        QTest::mouseClick(Find("lblEngValue"), Qt::LeftButton);
        QCOMPARE(Channel().LineColor(), 0x0000FF);
        QCOMPARE(Find("lblEngValue")->palette().color(QPalette::WindowText), QColor(255, 0, 0));
        QVERIFY(window->Test().Changed());
    }
};

QTEST_MAIN(frmDDETestTest)
#include "frmDDETestTest.moc"
