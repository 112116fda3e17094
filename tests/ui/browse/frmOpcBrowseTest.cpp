#include <memory>

#include <QComboBox>
#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QTreeWidget>
#include <QtTest>

#include "support/TestPlatform.h"
#include "ui/browse/TreeClicks.h"
#include "ui/browse/frmOpcBrowse.h"

using cv::test::ChildTexts;
using cv::test::ItemAt;

class frmOpcBrowseTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::frmOpcBrowse> window;

    void Show(const std::string& server, const std::string& item = "", const std::string& path = "",
              bool branches = false) {
        window = std::make_unique<cv::frmOpcBrowse>(tp->platform, server, "", item, path, branches);
        QVERIFY(window->Connect());
        window->Load();
        window->show();
        QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    }
    QTreeWidget* Tree() { return window->findChild<QTreeWidget*>("tvwItems"); }
    QTreeWidgetItem* At(const QStringList& path) { return ItemAt(Tree(), path); }
    QString ItemText() { return window->findChild<QLabel*>("lblItemID")->text(); }
    QComboBox* Paths() { return window->findChild<QComboBox*>("cmbAccessPaths"); }
    QStringList PathEntries() {
        QStringList entries;
        for (int i = 0; i < Paths()->count(); ++i) {
            entries << Paths()->itemText(i);
        }
        return entries;
    }
    QPushButton* Button(const char* name) { return window->findChild<QPushButton*>(name); }

  private slots:
    void init() { tp = std::make_unique<cv::test::TestPlatform>(); }
    void cleanup() {
        window.reset();
        tp.reset();
    }

    void showsTheServersTopLevelWithItsCaptions() {
        Show("Sim.Plant.1");
        QCOMPARE(window->windowTitle(), QString("Browse OPC Item names"));
        QCOMPARE(window->findChild<QGroupBox*>("Frame1")->title(), QString("Selected Item"));
        QCOMPARE(window->findChild<QLabel*>("Label2")->text(), QString("Name :"));
        QCOMPARE(window->findChild<QLabel*>("lblAccessPath")->text(), QString("Access Paths :"));
        QVERIFY(window->findChild<QLabel*>("lblAccessPath")->isVisible());
        QVERIFY(Paths()->isVisible());
        QTreeWidgetItem* root = Tree()->topLevelItem(0);
        QCOMPARE(root->text(0), QString("Sim.Plant.1"));
        QVERIFY(root->isExpanded());
        QCOMPARE(ChildTexts(root),
                 (QStringList{"Area1", "Area2", "Signals", "Types", "Quality", "Special"}));
        QCOMPARE(ChildTexts(root->child(0)), QStringList{"CorvalentFakeNodeUniqueName"});
        QVERIFY(QApplication::overrideCursor() == nullptr);
    }

    void theItemHandedInIsOpenedAndSelected() {
        Show("Sim.Plant.1", "Special.PathItem", "com2");
        QCOMPARE(Tree()->currentItem()->text(0), QString("PathItem"));
        QVERIFY(At({"Sim.Plant.1", "Special"})->isExpanded());
        QCOMPARE(ItemText(), QString("Special.PathItem"));
        QCOMPARE(PathEntries(), (QStringList{"com2", "COM1"}));
        QCOMPARE(Paths()->currentText(), QString("com2"));
        QTest::mouseClick(Button("cmdOK"), Qt::LeftButton);
        QVERIFY(!window->Changed());
        QCOMPARE(Tree()->topLevelItemCount(), 0);
    }

    void aLeafAndAnAccessPathAreChosen() {
        Show("Sim.Plant.1", "Signals.Ramp");
        cv::test::Open(Tree(), {"Sim.Plant.1", "Special"});
        cv::test::Click(Tree(), At({"Sim.Plant.1", "Special", "OptionalPath"}));
        QCOMPARE(ItemText(), QString("Special.OptionalPath"));
        QCOMPARE(PathEntries(), (QStringList{"Fast", "Slow"}));
        Paths()->setCurrentIndex(1);
        QTest::mouseClick(Button("cmdOK"), Qt::LeftButton);
        QVERIFY(window->Changed());
        QCOMPARE(window->ItemID(), std::string("Special.OptionalPath"));
        QCOMPARE(window->AccessPath(), std::string("Slow"));
    }

    void foldersOpenOnceAndShowTheirState() {
        Show("Sim.Slow.1");
        const QStringList area{"Sim.Slow.1", "Unit1"};
        const QImage closed = At(area)->icon(0).pixmap(16, 16).toImage();
        bool hourglass = false;
        tp->events.StartTimer(1000, false,
                              [&] { hourglass = QApplication::overrideCursor() != nullptr; });
        const uint32_t before = tp->events.TimeGetTime();
        cv::test::Open(Tree(), area);
        const uint32_t took = tp->events.TimeGetTime() - before;
        QCOMPARE(took, 4u * 6000);
        QVERIFY(hourglass);
        QVERIFY(QApplication::overrideCursor() == nullptr);
        QVERIFY(!tp->busy.Visible());
        QCOMPARE(QString::fromStdString(tp->busy.Shown().back()),
                 QString("Please wait...\r\n\r\nThe OPC Server, \"Sim.Slow.1\", is still busy."));
        QCOMPARE(ChildTexts(At(area)), QStringList{"FIC101"});
        QVERIFY(At(area)->icon(0).pixmap(16, 16).toImage() != closed);

        Tree()->collapseItem(At(area));
        QCOMPARE(At(area)->icon(0).pixmap(16, 16).toImage(), closed);
        Tree()->expandItem(At(area));
        QCOMPARE(tp->events.TimeGetTime() - before, took);
        QCOMPARE(ChildTexts(At(area)), QStringList{"FIC101"});
    }

    void aDoubleClickOnALeafIsOK() {
        Show("Sim.Plant.1");
        cv::test::Open(Tree(), {"Sim.Plant.1", "Signals"});
        cv::test::DoubleClick(Tree(), At({"Sim.Plant.1", "Signals"}));
        QCoreApplication::processEvents();
        QVERIFY(window->isVisible());
        Tree()->expandItem(At({"Sim.Plant.1", "Signals"}));
        cv::test::DoubleClick(Tree(), At({"Sim.Plant.1", "Signals", "Sine"}));
        QTRY_VERIFY(!window->isVisible());
        QVERIFY(window->Changed());
        QCOMPARE(window->ItemID(), std::string("Signals.Sine"));
    }

    void helpOpensTheItemBrowsersTopic() {
        Show("Sim.Plant.1");
        QTest::mouseClick(Button("cmdHelp"), Qt::LeftButton);
        QCOMPARE(tp->help.requests.size(), size_t{1});
        QCOMPARE(tp->help.requests[0].context, 411);
    }

    void doItHandsTheChoiceBackAndDisconnects() {
        std::string item = "Area1.Unit1.FIC101.PV";
        std::string path;
        QTimer::singleShot(0, [] {
            auto* modal = qobject_cast<cv::frmOpcBrowse*>(QApplication::activeModalWidget());
            QVERIFY(modal != nullptr);
            auto* tree = modal->findChild<QTreeWidget*>("tvwItems");
            QCOMPARE(tree->currentItem()->text(0), QString("PV"));
            cv::test::Click(tree, tree->currentItem()->parent()->child(2));
            QTest::mouseClick(modal->findChild<QPushButton*>("cmdOK"), Qt::LeftButton);
        });
        QVERIFY(cv::frmOpcBrowse::DoIt(tp->platform, "Sim.Plant.1", "OPCHOST1", item, path, true,
                                       false));
        QCOMPARE(item, std::string("Area1.Unit1.FIC101.SP"));
        QCOMPARE(path, std::string());
        std::vector<std::string> clients;
        QVERIFY(!tp->plant.ClientNames("OPCHOST1", "Sim.Plant.1", clients));
        QVERIFY(clients.empty());
    }
};

QTEST_MAIN(frmOpcBrowseTest)
#include "frmOpcBrowseTest.moc"
