#include <QMessageBox>
#include <QPushButton>
#include <QtTest>

#include "platform/qt/QtModelessMessages.h"

using cv::qtui::QtModelessMessages;

namespace {

QList<QMessageBox*> OpenBoxes() {
    QList<QMessageBox*> boxes;
    for (QWidget* widget : QApplication::topLevelWidgets()) {
        if (auto* box = qobject_cast<QMessageBox*>(widget); box != nullptr && box->isVisible()) {
            boxes.append(box);
        }
    }
    return boxes;
}

}  // namespace

class QtModelessMessagesTest : public QObject {
    Q_OBJECT

  private slots:
    void windowsStayOpenWithoutBlockingUntilClosed() {
        QtModelessMessages messages("Corvalent OPC Test Client");
        const auto first = messages.Launch("Error reading SP", "Line one\r\nLine two", "OK");
        const auto second = messages.Launch("Error reading Trend1", "Other", "OK");
        QVERIFY(first != 0 && second != 0 && first != second);
        QCOMPARE(OpenBoxes().size(), 2);
        QMessageBox* box = OpenBoxes().first();
        QVERIFY(!box->isModal());
        QVERIFY(box->windowTitle().startsWith("Error reading"));
        messages.Close(first);
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        QCOMPARE(OpenBoxes().size(), 1);
        QCOMPARE(OpenBoxes().first()->text(), QString("Other"));
        messages.Close(first);
    }

    void aWindowTheUserClosedIsClosedQuietly() {
        QtModelessMessages messages("Corvalent OPC Test Client");
        const auto id = messages.Launch("Error reading SP", "Text", "OK");
        QMessageBox* box = OpenBoxes().first();
        QCOMPARE(box->buttons().size(), 1);
        QCOMPARE(box->buttons().first()->text(), QString("OK"));
        box->buttons().first()->click();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        QCOMPARE(OpenBoxes().size(), 0);
        messages.Close(id);
    }
};

QTEST_MAIN(QtModelessMessagesTest)
#include "QtModelessMessagesTest.moc"
