#include <QtTest>

#include "platform/qt/QtLocale.h"

using cv::qtui::QtLocale;

class QtLocaleTest : public QObject {
    Q_OBJECT

  private slots:
    void separatorsAndFormatsComeFromTheLocale() {
        const QtLocale us(QLocale(QLocale::English, QLocale::UnitedStates));
        QCOMPARE(us.DecimalSeparator(), std::string("."));
        QCOMPARE(us.GroupingSeparator(), std::string(","));
        QCOMPARE(us.LongTimeFormat(), std::string("h:mm:ss tt"));
        QCOMPARE(us.ShortDateFormat(), std::string("M/d/yy"));
        const QtLocale german(QLocale(QLocale::German, QLocale::Germany));
        QCOMPARE(german.DecimalSeparator(), std::string(","));
        QCOMPARE(german.GroupingSeparator(), std::string("."));
        QCOMPARE(german.LongTimeFormat(), std::string("HH:mm:ss"));
        QCOMPARE(german.ShortDateFormat(), std::string("dd.MM.yy"));
    }

    void convertsQtFormatLetters() {
        // Without an AM/PM marker Qt's h is the 24-hour clock.
        QCOMPARE(QtLocale::ToWindowsFormat("h:mm:ss"), std::string("H:mm:ss"));
        QCOMPARE(QtLocale::ToWindowsFormat("hh:mm:ss AP"), std::string("hh:mm:ss tt"));
        QCOMPARE(QtLocale::ToWindowsFormat("ap h.mm.ss"), std::string("tt h.mm.ss"));
        QCOMPARE(QtLocale::ToWindowsFormat("H:mm:ss a"), std::string("H:mm:ss tt"));
        // Time zone and milliseconds have no Windows letter.
        QCOMPARE(QtLocale::ToWindowsFormat("HH:mm:ss.zzz t"), std::string("HH:mm:ss"));
        // Quoted text passes unchanged, even letters and doubled quotes.
        QCOMPARE(QtLocale::ToWindowsFormat("H 'h' mm 'o''clock'"),
                 std::string("H 'h' mm 'o''clock'"));
        QCOMPARE(QtLocale::ToWindowsFormat("dddd, d. MMMM yyyy"),
                 std::string("dddd, d. MMMM yyyy"));
    }
};

QTEST_GUILESS_MAIN(QtLocaleTest)
#include "QtLocaleTest.moc"
