#include <QtTest>

#include "platform/qt/QtBusyNotice.h"

using cv::qtui::QtBusyNotice;

class QtBusyNoticeTest : public QObject {
    Q_OBJECT

  private slots:
    void showsTheTextUntilHidden() {
        QtBusyNotice notice("Corvalent OPC Test Client");
        notice.Show("Please wait...\r\n\r\nThe OPC Server, \"Sim.Slow\", is still busy.");
        QVERIFY(notice.Window().isVisible());
        auto* label = notice.Window().findChild<QLabel*>("lblBusyText");
        QVERIFY(label != nullptr);
        QCOMPARE(label->text(),
                 QString("Please wait...\n\nThe OPC Server, \"Sim.Slow\", is still busy."));
        QCOMPARE(notice.Window().windowTitle(), QString("Corvalent OPC Test Client"));
        notice.Hide();
        QVERIFY(!notice.Window().isVisible());
    }
};

QTEST_MAIN(QtBusyNoticeTest)
#include "QtBusyNoticeTest.moc"
