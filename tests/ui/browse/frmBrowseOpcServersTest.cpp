#include <memory>

#include <QGroupBox>
#include <QLabel>
#include <QPushButton>
#include <QTreeWidget>
#include <QtTest>

#include "browse/OpcServerTree.h"
#include "support/TestPlatform.h"
#include "ui/browse/TreeClicks.h"
#include "ui/browse/frmBrowseOpcServers.h"

using cv::test::ChildTexts;
using cv::test::ItemAt;

class frmBrowseOpcServersTest : public QObject {
    Q_OBJECT

  private:
    std::unique_ptr<cv::test::TestPlatform> tp;
    std::unique_ptr<cv::frmBrowseOpcServers> window;

    void Show(int32_t mode, const std::string& text = "") {
        window = std::make_unique<cv::frmBrowseOpcServers>(tp->platform, text, mode);
        window->show();
        QVERIFY(QTest::qWaitForWindowExposed(window.get()));
    }
    QTreeWidget* Tree() { return window->findChild<QTreeWidget*>("tvwItems"); }
    QString Selection() { return window->findChild<QLabel*>("lblServerID")->text(); }
    QPushButton* Button(const char* name) { return window->findChild<QPushButton*>(name); }
    QTreeWidgetItem* At(const QStringList& path) { return ItemAt(Tree(), path); }
    // Opens the network down to the computers of the domain Plant.
    void OpenPlant() {
        QStringList path{"OPC Servers"};
        for (const char* text : {"Network Neighborhood", "Entire Network", "Plant"}) {
            path << text;
            cv::test::Open(Tree(), path);
        }
    }

  private slots:
    void init() { tp = std::make_unique<cv::test::TestPlatform>(); }
    void cleanup() {
        window.reset();
        tp.reset();
    }

    void captionsAndTheTopFollowTheMode_data() {
        QTest::addColumn<int>("mode");
        QTest::addColumn<QString>("caption");
        QTest::addColumn<QString>("frame");
        QTest::addColumn<QString>("label");
        QTest::addColumn<QStringList>("top");
        QTest::newRow("servers") << 0 << "Browse OPC Servers"
                                 << "Selected Server"
                                 << "\\\\Node\\Server :"
                                 << QStringList{"OPC Servers", "My Computer",
                                                "Network Neighborhood"};
        QTest::newRow("HDA servers")
            << 1 << "Browse OPC HDA Servers"
            << "Selected Server"
            << "\\\\Node\\Server :"
            << QStringList{"OPC HDA Servers", "My Computer", "Network Neighborhood"};
        QTest::newRow("computers") << 2 << "Browse network computers"
                                   << "Selected computer"
                                   << "Computer :" << QStringList{"Network Neighborhood"};
    }
    void captionsAndTheTopFollowTheMode() {
        QFETCH(int, mode);
        Show(mode);
        QFETCH(QString, caption);
        QCOMPARE(window->windowTitle(), caption);
        QFETCH(QString, frame);
        QCOMPARE(window->findChild<QGroupBox*>("fraSelected")->title(), frame);
        QFETCH(QString, label);
        QCOMPARE(window->findChild<QLabel*>("lblSelected")->text(), label);
        QFETCH(QStringList, top);
        QTreeWidgetItem* first = Tree()->topLevelItem(0);
        QCOMPARE(Tree()->topLevelItemCount(), 1);
        QCOMPARE(QStringList{first->text(0)} + (mode == 2 ? QStringList() : ChildTexts(first)),
                 top);
        QCOMPARE(first->isExpanded(), mode != 2);
        QVERIFY(!first->icon(0).isNull());
        QVERIFY(Tree()->selectedItems().isEmpty());
        QCOMPARE(Selection(), QString());
        for (const char* name : {"cmdOK", "cmdCancel", "cmdHelp"}) {
            QVERIFY(Button(name) != nullptr);
        }
    }

    void aLocalServerHandedInIsSelectedAndOKKeepsIt() {
        Show(0, "SIM.SLOW.1");
        QTreeWidgetItem* mine = At({"OPC Servers", "My Computer"});
        QVERIFY(mine->isExpanded());
        QCOMPARE(ChildTexts(mine).size(), 6);
        QCOMPARE(Tree()->currentItem()->text(0), QString("Sim.Slow.1"));
        QCOMPARE(Selection(), QString("SIM.SLOW.1"));
        QTest::mouseClick(Button("cmdOK"), Qt::LeftButton);
        QCOMPARE(window->result(), int(QDialog::Accepted));
        QVERIFY(!window->Chosen());
        // Unloading removed the nodes.
        QCOMPARE(Tree()->topLevelItemCount(), 0);
    }

    void aRemoteServerIsChosenAsNodeAndServer() {
        Show(0, "\\\\OPCHOST1\\Sim.Plant.1");
        QVERIFY(!At({"OPC Servers", "My Computer"})->isExpanded());
        OpenPlant();
        QCOMPARE(ChildTexts(At({"OPC Servers", "Network Neighborhood", "Entire Network", "Plant"})),
                 (QStringList{"Opchost1", "Opchost2", "Secure1", "Field7"}));
        const QStringList host{"OPC Servers", "Network Neighborhood", "Entire Network", "Plant",
                               "Opchost2"};
        cv::test::Open(Tree(), host);
        QCOMPARE(ChildTexts(At(host)), (QStringList{"Sim.Plant.1", "Sim.Shutdown.1"}));
        cv::test::Click(Tree(), At(host + QStringList{"Sim.Shutdown.1"}));
        QCOMPARE(Selection(), QString("\\\\Opchost2\\Sim.Shutdown.1"));
        cv::test::Click(Tree(), At(host));
        // A computer is no choice.
        QCOMPARE(Selection(), QString("\\\\Opchost2\\Sim.Shutdown.1"));
        QTest::mouseClick(Button("cmdOK"), Qt::LeftButton);
        QVERIFY(window->Chosen());
        QCOMPARE(window->ServerText(), std::string("\\\\Opchost2\\Sim.Shutdown.1"));
    }

    void aDoubleClickOnAServerIsOK() {
        Show(0);
        cv::test::Open(Tree(), {"OPC Servers", "My Computer"});
        cv::test::DoubleClick(Tree(), At({"OPC Servers", "My Computer", "Sim.NoBrowse.1"}));
        QTRY_VERIFY(!window->isVisible());
        QVERIFY(window->Chosen());
        QCOMPARE(window->ServerText(), std::string("Sim.NoBrowse.1"));
    }

    void aComputerThatDoesNotAnswerLeavesTheWindowUsableAndEmpty() {
        Show(0);
        OpenPlant();
        const QStringList field7{"OPC Servers", "Network Neighborhood", "Entire Network", "Plant",
                                 "Field7"};
        bool painted = false;
        bool hourglass = false;
        // While the computer keeps the window waiting: it repaints, shows the
        // hourglass and refuses to close.
        tp->events.StartTimer(1000, false, [&] {
            painted = !window->grab().isNull();
            hourglass = QApplication::overrideCursor() != nullptr &&
                        QApplication::overrideCursor()->shape() == Qt::WaitCursor;
            QTest::mouseClick(Button("cmdCancel"), Qt::LeftButton);
            QTest::keyClick(Tree(), Qt::Key_Escape);
        });
        const uint32_t before = tp->events.TimeGetTime();
        cv::test::Open(Tree(), field7);
        QCOMPARE(tp->events.TimeGetTime() - before, 20000u);
        QVERIFY(painted);
        QVERIFY(hourglass);
        QVERIFY(window->isVisible());
        QCOMPARE(QApplication::overrideCursor(), nullptr);
        QCOMPARE(tp->busy.Shown().size(), size_t{1});
        QCOMPARE(At(field7)->childCount(), 0);
        QVERIFY(tp->dialogs.Messages().empty());

        // Nothing is asked again; the window answers at once.
        Tree()->collapseItem(At(field7));
        Tree()->expandItem(At(field7));
        QCOMPARE(tp->events.TimeGetTime() - before, 20000u);
        QTest::mouseClick(Button("cmdCancel"), Qt::LeftButton);
        QVERIFY(!window->isVisible());
    }

    void helpOpensTheServerBrowsersTopic() {
        Show(0);
        QTest::mouseClick(Button("cmdHelp"), Qt::LeftButton);
        QCOMPARE(tp->help.requests.size(), size_t{1});
        QCOMPARE(tp->help.requests[0].context, 407);
    }

    void doItHandsTheChoiceBack() {
        std::string text = "Sim.Plant.1";
        QTimer::singleShot(0, [] {
            auto* modal = qobject_cast<cv::frmBrowseOpcServers*>(QApplication::activeModalWidget());
            QVERIFY(modal != nullptr);
            auto* tree = modal->findChild<QTreeWidget*>("tvwItems");
            cv::test::Click(tree, ItemAt(tree, {"OPC Servers", "My Computer", "Sim.Slow.1"}));
            QTest::mouseClick(modal->findChild<QPushButton*>("cmdOK"), Qt::LeftButton);
        });
        QVERIFY(cv::frmBrowseOpcServers::DoIt(tp->platform, text, cv::BrowseMode::OpcServers));
        QCOMPARE(text, std::string("Sim.Slow.1"));

        QTimer::singleShot(0, [] {
            QTest::mouseClick(QApplication::activeModalWidget()->findChild<QPushButton*>("cmdOK"),
                              Qt::LeftButton);
        });
        QVERIFY(!cv::frmBrowseOpcServers::DoIt(tp->platform, text, cv::BrowseMode::OpcServers));
        QCOMPARE(text, std::string("Sim.Slow.1"));
    }

    void everyPictureIsDrawn() {
        cv::BrowseImages images;
        for (const auto& [name, file] : cv::BrowseImages::Files()) {
            const QIcon icon = images.Image(name);
            QVERIFY2(!icon.isNull(), file);
            for (const int size : {16, 32, 48}) {
                const QPixmap pixmap = icon.pixmap(size, size);
                QCOMPARE(pixmap.width(), size);
                QVERIFY2(!pixmap.toImage().allGray(), file);
            }
        }
        QVERIFY(images.Image("Nothing").isNull());
    }
};

QTEST_MAIN(frmBrowseOpcServersTest)
#include "frmBrowseOpcServersTest.moc"
