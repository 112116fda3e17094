#include <QtTest>

#include "platform/qt/HelpWindow.h"

using cv::qtui::HelpWindow;

class HelpWindowTest : public QObject {
    Q_OBJECT

  private slots:
    void showsBundledTopicsNamedByContextNumberInOneWindow() {
        HelpWindow help;
        QVERIFY(help.Window() == nullptr);
        help.ShowTopic("/opt/cv/CvOpcTestClient.hlp>StepsSub", 1);
        QTextBrowser* window = help.Window();
        QVERIFY(window != nullptr);
        QVERIFY(window->isVisible());
        QCOMPARE(window->windowTitle(), QStringLiteral("Corvalent OPC Test Client"));
        QVERIFY(window->toPlainText().contains(QStringLiteral("Sample interval")));

        help.ShowTopic("/opt/cv/CvOpcTestClient.hlp>StepsSub", 999);
        QCOMPARE(help.Window(), window);
        QVERIFY(window->toPlainText().contains(QStringLiteral("There is no help for this topic")));

        window->close();
        help.ShowTopic("", 1);
        QCOMPARE(help.Window(), window);
        QVERIFY(window->isVisible());
        QVERIFY(window->toPlainText().contains(QStringLiteral("Test read")));

        QCOMPARE(HelpWindow::TopicPath(407), QStringLiteral(":/help/topic407.html"));
        QVERIFY(QFile::exists(HelpWindow::TopicPath(1)));
    }
};

QTEST_MAIN(HelpWindowTest)
#include "HelpWindowTest.moc"
