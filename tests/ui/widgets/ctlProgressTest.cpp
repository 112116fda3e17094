#include <QGroupBox>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QVBoxLayout>
#include <QtTest>

#include "itemtest/WaitProgress.h"
#include "stores/RegClass.h"
#include "support/TestPlatform.h"
#include "ui/widgets/FormUtility.h"
#include "ui/widgets/ctlProgress.h"

class ctlProgressTest : public QObject {
    Q_OBJECT

  private slots:
    void showsTheWaitAndItsButtonsChangeIt() {
        cv::test::TestPlatform t;
        cv::WaitProgress progress(t.platform);
        QWidget window;
        auto* frame = new QGroupBox(&window);
        auto* control = new cv::ctlProgress(progress, &window);
        auto* layout = new QVBoxLayout(&window);
        layout->addWidget(frame);
        layout->addWidget(control);
        window.show();
        QVERIFY(!control->isVisible());

        progress.Initialise("Initializing communications.  Please wait...", true,
                            "Software\\Corvalent\\Faceplate", "TimeOut");
        progress.SetVisible(true);
        QVERIFY(control->isVisible());
        auto* shorter = control->findChild<QPushButton*>("cmdButton1");
        auto* longer = control->findChild<QPushButton*>("cmdButton2");
        QCOMPARE(shorter->text(), QString("Shorter wait"));
        QCOMPARE(longer->text(), QString("Longer wait"));
        QCOMPARE(control->findChild<QLabel*>("lblText")->text(),
                 QString("Initializing communications.  Please wait..."));

        t.events.Advance(2500);
        QVERIFY(!progress.TimeUp());
        QCOMPARE(control->findChild<QProgressBar*>("ProgressBar1")->value(), 25);
        QCOMPARE(control->findChild<QLabel*>("lblCompletion")->text(), QString("25 %"));

        // A busy window leaves the wait buttons usable.
        cv::SetControlsBusy(11, window);
        QVERIFY(!frame->isEnabled());
        QVERIFY(longer->isEnabled());
        QTest::mouseClick(longer, Qt::LeftButton);
        QCOMPARE(progress.WaitTime(), 15000);
        QCOMPARE(control->findChild<QLabel*>("lblCompletion")->text(), QString("16 %"));
        cv::RegClass cReg(t.platform.registry);
        cReg.SetMainKey(cv::platform::kHkeyCurrentUser);
        QCOMPARE(cReg.ReadLong("Software\\Corvalent\\Faceplate", "TimeOut", 0, 0, 0), 15000);
        QTest::mouseClick(shorter, Qt::LeftButton);
        QCOMPARE(progress.WaitTime(), 10000);

        progress.SetVisible(false);
        QVERIFY(!control->isVisible());
    }
};

QTEST_MAIN(ctlProgressTest)
#include "ctlProgressTest.moc"
