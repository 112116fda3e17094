#include <QApplication>
#include <QLabel>
#include <QPushButton>
#include <QtTest>

#include "support/TestPlatform.h"
#include "ui/widgets/ModelessMessageForms.h"
#include "ui/widgets/msgForm2.h"

class ModelessMessageFormsTest : public QObject {
    Q_OBJECT

  private:
    static QList<cv::msgForm2*> Open() {
        QList<cv::msgForm2*> open;
        for (QWidget* widget : QApplication::topLevelWidgets()) {
            if (auto* form = qobject_cast<cv::msgForm2*>(widget); form && form->isVisible()) {
                open << form;
            }
        }
        return open;
    }

  private slots:
    void windowsOpenWithoutWaitingAndCloseByButtonOrOwner() {
        cv::test::TestPlatform t;
        cv::ModelessMessageForms forms;
        QCOMPARE(forms.Launch("Error reading PV", "No value", "OK"), 0);  // no platform yet
        forms.SetPlatform(t.platform);
        const auto first = forms.Launch("Error reading PV", "No value", "OK");
        const auto second = forms.Launch("Error reading CO", "Bad", "OK");
        QVERIFY(first > 0 && second > first);
        QCOMPARE(Open().size(), 2);
        for (cv::msgForm2* form : Open()) {
            QVERIFY(!form->isModal());
            if (form->windowTitle() == "Error reading PV") {
                QTest::mouseClick(form->findChild<QPushButton*>("cmdButton1"), Qt::LeftButton);
            }
        }
        QCoreApplication::processEvents();
        QCOMPARE(Open().size(), 1);
        forms.Close(first);  // closed by its button already
        forms.Close(second);
        QCoreApplication::processEvents();
        QVERIFY(Open().isEmpty());
    }
};

QTEST_MAIN(ModelessMessageFormsTest)
#include "ModelessMessageFormsTest.moc"
