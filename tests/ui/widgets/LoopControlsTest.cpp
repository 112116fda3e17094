#include <QComboBox>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QtTest>

#include "document/LoopClass.h"
#include "support/TestPlatform.h"
#include "ui/widgets/LoopControls.h"

class LoopControlsTest : public QObject {
    Q_OBJECT

  private slots:
    void zeroPAndIShowNotApplicable() {
        cv::test::TestPlatform tp(cv::fake::FixedLocale::Comma());
        cv::LoopClass loop(tp.platform);
        loop.SetCurrentI(0.25);
        loop.SetCurrentF(1234.5);
        QLineEdit p;
        QLabel i;
        QLineEdit d("old");
        QLabel f;
        cv::ShowCurrentPIDF(loop, tp.locale, &p, &i, &d, &f);
        QCOMPARE(p.text(), QStringLiteral("N/A"));
        QCOMPARE(i.text(), QStringLiteral("0,25"));
        QCOMPARE(d.text(), QStringLiteral("0"));
        QCOMPARE(f.text(), QStringLiteral("1234,5"));

        loop.SetCurrentP(-2.0);
        cv::ShowCurrentPIDF(loop, tp.locale, &p, nullptr, nullptr, nullptr);
        QCOMPARE(p.text(), QStringLiteral("-2"));
    }

    void filterUnitPositionsAreTheCodes() {
        cv::test::TestPlatform tp;
        cv::LoopClass loop(tp.platform);
        QComboBox combo;
        combo.addItem("stale");
        cv::FillFilterUnitsCombo(combo);
        QCOMPARE(combo.count(), 4);
        for (int code = 0; code < combo.count(); ++code) {
            loop.SetFilterUnits(combo.itemText(code).toStdString());
            QCOMPARE(loop.FilterUnitsLong(), code);
        }
        QListWidget list;
        cv::FillFilterUnitsCombo(list);
        cv::FillFilterUnitsCombo(list);
        QCOMPARE(list.count(), 4);
        QCOMPARE(list.item(3)->text(), QStringLiteral("Hertz"));
    }
};

QTEST_MAIN(LoopControlsTest)
#include "LoopControlsTest.moc"
