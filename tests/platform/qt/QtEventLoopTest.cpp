#include <QtTest>
#include <vector>

#include "platform/qt/QtEventLoop.h"

using cv::qtui::QtEventLoop;

class QtEventLoopTest : public QObject {
    Q_OBJECT

  private slots:
    void postedCallsRunInOrderOnDoEventsAndDieWithTheLoop() {
        QtEventLoop loop;
        std::vector<int> order;
        loop.Post([&] { order.push_back(1); });
        loop.Post([&] {
            order.push_back(2);
            loop.Post([&] { order.push_back(3); });
        });
        QVERIFY(order.empty());
        loop.DoEvents();
        QTRY_COMPARE(order.size(), size_t{3});
        QCOMPARE(order, (std::vector<int>{1, 2, 3}));

        bool ran = false;
        {
            QtEventLoop gone;
            gone.Post([&] { ran = true; });
        }
        QCoreApplication::processEvents();
        QVERIFY(!ran);
    }

    void oneShotTimerFiresOnceAndAStoppedOneNever() {
        QtEventLoop loop;
        const uint32_t start = loop.TimeGetTime();
        int fired = 0;
        bool stoppedFired = false;
        const auto id = loop.StartTimer(1, false, [&] { ++fired; });
        const auto stopped = loop.StartTimer(1, false, [&] { stoppedFired = true; });
        QVERIFY(id > 0 && stopped != id);
        loop.StopTimer(stopped);
        QTRY_COMPARE(fired, 1);
        QCOMPARE(loop.ActiveTimers(), 0);
        loop.StopTimer(id);  // already finished: nothing happens
        QTest::qWait(5);
        QCOMPARE(fired, 1);
        QVERIFY(!stoppedFired);
        QTRY_VERIFY(loop.TimeGetTime() - start >= 2);
    }

    void timersMayStopThemselvesOrStartTheNext() {
        QtEventLoop loop;
        int repeats = 0;
        cv::platform::EventLoop::TimerId id = 0;
        id = loop.StartTimer(1, true, [&] {
            if (++repeats == 3) {
                loop.StopTimer(id);
            }
        });
        int chained = 0;
        std::function<void()> again = [&] {
            if (++chained < 3) {
                loop.StartTimer(0, false, again);
            }
        };
        loop.StartTimer(0, false, again);
        QTRY_COMPARE(repeats, 3);
        QTRY_COMPARE(chained, 3);
        QCOMPARE(loop.ActiveTimers(), 0);
        QTest::qWait(5);
        QCOMPARE(repeats, 3);
    }

    void waitUntilEndsOnAPostedAnswerOrAtItsDeadline() {
        QtEventLoop loop;
        bool answered = false;
        loop.StartTimer(1, false, [&] { loop.Post([&] { answered = true; }); });
        QVERIFY(loop.WaitUntil([&] { return answered; }, 60000));
        QVERIFY(!loop.WaitUntil([] { return false; }, 5));
    }
};

QTEST_GUILESS_MAIN(QtEventLoopTest)
#include "QtEventLoopTest.moc"
