#include <QComboBox>
#include <QGroupBox>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QtTest>

#include "ui/widgets/FormUtility.h"

class FormUtilityTest : public QObject {
    Q_OBJECT

  private slots:
    void busyDisablesFramesAndButtonsExceptCancel() {
        QWidget form;
        auto* frame = new QGroupBox(&form);
        auto* inFrame = new QLineEdit(frame);
        auto* ok = new QPushButton(&form);
        auto* cancel = new QPushButton(&form);
        cancel->setProperty("Tag", QStringLiteral("Cancel"));
        auto* loose = new QLineEdit(&form);

        cv::SetControlsBusy(11, form);
        QVERIFY(!frame->isEnabled());
        QVERIFY(!inFrame->isEnabled());
        QVERIFY(!ok->isEnabled());
        QVERIFY(cancel->isEnabled());
        QVERIFY(loose->isEnabled());
        QCOMPARE(form.cursor().shape(), Qt::WaitCursor);

        cv::SetControlsBusy(0, form);
        QVERIFY(frame->isEnabled());
        QVERIFY(inFrame->isEnabled());
        QVERIFY(ok->isEnabled());
        QCOMPARE(form.cursor().shape(), Qt::ArrowCursor);
        // A Cancel button is left as it was.
        cancel->setEnabled(false);
        cv::SetControlsBusy(0, form);
        QVERIFY(!cancel->isEnabled());
    }

    void findsExactEntriesOrThePlaceInASortedList() {
        QComboBox combo;
        combo.addItems({"Beta", "alpha", "Alpha"});
        QCOMPARE(cv::FindListEntry(combo, "Alpha"), int16_t{2});
        QCOMPARE(cv::FindListEntry(combo, "ALPHA"), int16_t{-1});
        QListWidget list;
        QCOMPARE(cv::FindListEntry(list, "x"), int16_t{-1});
        list.addItems({"x", "y"});
        QCOMPARE(cv::FindListEntry(list, "y"), int16_t{1});
        QLineEdit notAList("y");
        QCOMPARE(cv::FindListEntry(notAList, "y"), int16_t{-1});
        QCOMPARE(cv::FindListEntry(notAList, "y", 0), int16_t{-1});
        // In a sorted list, the place of the text, ignoring case.
        list.clear();
        list.addItems({"apple", "Cherry", "melon"});
        QCOMPARE(cv::FindListEntry(list, "BANANA", 0), int16_t{1});
        QCOMPARE(cv::FindListEntry(list, "cherry", 0), int16_t{1});
        QCOMPARE(cv::FindListEntry(list, "a", 1), int16_t{0});
        QCOMPARE(cv::FindListEntry(list, "zucchini", 0), int16_t{-1});
    }
};

QTEST_MAIN(FormUtilityTest)
#include "FormUtilityTest.moc"
