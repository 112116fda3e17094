#include <functional>
#include <memory>

#include <QComboBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTreeWidget>
#include <QtTest>

#include "app/frmOpcTestClient.h"
#include "support/TestPlatform.h"
#include "ui/browse/TreeClicks.h"
#include "ui/browse/frmBrowseOpcServers.h"
#include "ui/browse/frmOpcBrowse.h"

using cv::test::ItemAt;

// The main window's two browse buttons, and the double clicks that do the
// same, as the user meets them.
class frmOpcTestClientBrowseTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::frmOpcTestClient> window;
    QStringList seen;  // what the browser showed when it opened

    QLineEdit* Box(const char* name) { return window->findChild<QLineEdit*>(name); }
    cv::Channel& Channel() { return window->TestChannel(); }
    void Enter(const char* name, const QString& text) {
        QLineEdit* box = Box(name);
        box->setFocus();
        QTRY_VERIFY(box->hasFocus());
        box->selectAll();
        QTest::keyClicks(box, text);
        QTest::keyClick(box, Qt::Key_Tab);
        QCoreApplication::processEvents();
    }
    // Acts in the browser once it is open, as the user would.
    template <typename Window>
    void InBrowser(std::function<void(Window*, QTreeWidget*)> act, int tries = 200) {
        QTimer::singleShot(tries == 200 ? 0 : 10, this, [this, act, tries] {
            auto* browser = qobject_cast<Window*>(QApplication::activeModalWidget());
            if (browser == nullptr) {
                QVERIFY2(tries > 0, "the browser did not open");
                InBrowser<Window>(act, tries - 1);
                return;
            }
            seen << browser->windowTitle();
            act(browser, browser->template findChild<QTreeWidget*>("tvwItems"));
        });
    }
    static void Press(QWidget* browser, const char* button) {
        QTest::mouseClick(browser->findChild<QPushButton*>(button), Qt::LeftButton);
    }

  private slots:
    void init() {
        tp = std::make_unique<cv::test::TestPlatform>();
        window = std::make_unique<cv::frmOpcTestClient>(tp->platform);
        window->show();
        window->activateWindow();
        QVERIFY(QTest::qWaitForWindowActive(window.get()));
        seen.clear();
    }
    void cleanup() {
        window.reset();
        tp.reset();
    }

    void aServerChosenInTheBrowserGoesToTheBoxAndTheChannel_data() {
        QTest::addColumn<QStringList>("path");
        QTest::addColumn<QString>("chosen");
        QTest::addColumn<QString>("computer");
        QTest::addColumn<QString>("server");
        QTest::newRow("this computer")
            << QStringList{"OPC Servers", "My Computer", "Sim.Slow.1"} << "Sim.Slow.1"
            << ""
            << "Sim.Slow.1";
        QTest::newRow("another computer")
            << QStringList{"OPC Servers", "Network Neighborhood", "Entire Network", "Plant",
                           "Opchost1",    "Sim.Plant.1"}
            << "\\\\Opchost1\\Sim.Plant.1"
            << "Opchost1"
            << "Sim.Plant.1";
    }
    void aServerChosenInTheBrowserGoesToTheBoxAndTheChannel() {
        QFETCH(QStringList, path);
        Enter("txtServerID", "Sim.Plant.1");
        QString shown;
        InBrowser<cv::frmBrowseOpcServers>([&](QWidget* browser, QTreeWidget* tree) {
            shown = browser->findChild<QLabel*>("lblServerID")->text();
            for (int depth = 2; depth < path.size(); ++depth) {
                cv::test::Open(tree, path.mid(0, depth));
            }
            cv::test::Click(tree, ItemAt(tree, path));
            Press(browser, "cmdOK");
        });
        QTest::mouseClick(window->findChild<QPushButton*>("cmdBrowseServers"), Qt::LeftButton);
        QCOMPARE(seen, QStringList{"Browse OPC Servers"});
        QCOMPARE(shown, QString("Sim.Plant.1"));
        QFETCH(QString, chosen);
        QCOMPARE(Box("txtServerID")->text(), chosen);
        QFETCH(QString, computer);
        QCOMPARE(QString::fromStdString(Channel().OpcComputer()), computer);
        QFETCH(QString, server);
        QCOMPARE(QString::fromStdString(Channel().OpcServerID()), server);
    }

    void aDoubleClickInTheServerBoxBrowsesAndCancelKeepsIt() {
        Enter("txtServerID", "\\\\OPCHOST2\\Sim.Plant.1");
        InBrowser<cv::frmBrowseOpcServers>([](QWidget* browser, QTreeWidget* tree) {
            cv::test::Open(tree, {"OPC Servers", "My Computer"});
            cv::test::Click(tree, ItemAt(tree, {"OPC Servers", "My Computer", "Sim.Plant.1"}));
            Press(browser, "cmdCancel");
        });
        QTest::mouseDClick(Box("txtServerID"), Qt::LeftButton);
        QTRY_COMPARE(seen.size(), 1);
        QCOMPARE(Box("txtServerID")->text(), QString("\\\\OPCHOST2\\Sim.Plant.1"));
        QCOMPARE(Channel().OpcComputer(), std::string("OPCHOST2"));
    }

    void anItemChosenInTheBrowserGoesToTheBoxesAndTheChannel() {
        Enter("txtServerID", "\\\\OPCHOST1\\Sim.Plant.1");
        Enter("txtItemID", "Special.ReadOnly");
        QStringList paths;
        InBrowser<cv::frmOpcBrowse>([&](QWidget* browser, QTreeWidget* tree) {
            QCOMPARE(tree->topLevelItem(0)->text(0), QString("\\\\OPCHOST1\\Sim.Plant.1"));
            QCOMPARE(tree->currentItem()->text(0), QString("ReadOnly"));
            cv::test::Click(tree,
                            ItemAt(tree, {tree->topLevelItem(0)->text(0), "Special", "PathItem"}));
            auto* combo = browser->findChild<QComboBox*>("cmbAccessPaths");
            for (int i = 0; i < combo->count(); ++i) {
                paths << combo->itemText(i);
            }
            combo->setCurrentIndex(1);
            Press(browser, "cmdOK");
        });
        QTest::mouseClick(window->findChild<QPushButton*>("cmdBrowseItems"), Qt::LeftButton);
        QCOMPARE(seen, QStringList{"Browse OPC Item names"});
        QCOMPARE(paths, (QStringList{"COM1", "COM2"}));
        QCOMPARE(Box("txtItemID")->text(), QString("Special.PathItem"));
        QCOMPARE(Box("txtAccessPath")->text(), QString("COM2"));
        QCOMPARE(Channel().ItemName(), std::string("Special.PathItem"));
        QCOMPARE(Channel().OpcAccessPath(), std::string("COM2"));
    }

    void aDoubleClickInTheItemBoxBrowsesAndCancelKeepsTheTexts() {
        Enter("txtServerID", "Sim.Plant.1");
        Enter("txtItemID", "Signals.Ramp");
        Enter("txtAccessPath", "Fast");
        InBrowser<cv::frmOpcBrowse>([](QWidget* browser, QTreeWidget* tree) {
            cv::test::Click(tree, tree->currentItem()->parent()->child(1));
            Press(browser, "cmdCancel");
        });
        QTest::mouseDClick(Box("txtItemID"), Qt::LeftButton);
        QTRY_COMPARE(seen.size(), 1);
        QCOMPARE(Box("txtItemID")->text(), QString("Signals.Ramp"));
        QCOMPARE(Box("txtAccessPath")->text(), QString("Fast"));
        QCOMPARE(Channel().ItemName(), std::string("Signals.Ramp"));
    }

    void aServerThatCannotBeBrowsedIsReportedAndChangesNothing() {
        Enter("txtServerID", "Sim.NoBrowse.1");
        Enter("txtItemID", "X");
        QTest::mouseClick(window->findChild<QPushButton*>("cmdBrowseItems"), Qt::LeftButton);
        QCOMPARE(tp->dialogs.Messages().size(), size_t{1});
        QCOMPARE(tp->dialogs.Last().text,
                 std::string("The OPC Server \"Sim.NoBrowse.1\" does not support browsing for "
                             "Item names."));
        QCOMPARE(Box("txtItemID")->text(), QString("X"));
    }
};

QTEST_MAIN(frmOpcTestClientBrowseTest)
#include "frmOpcTestClientBrowseTest.moc"
