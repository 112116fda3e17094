#include <QtTest>
#include <vector>

#include "platform/qt/QtEventLoop.h"

using cv::qtui::QtEventLoop;

class QtEventLoopTest : public QObject {
    Q_OBJECT

  private slots:
    void postedCallsRunInOrderOnDoEvents() {
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
    }

    void postedCallsDieWithTheLoop() {
        bool ran = false;
        {
            QtEventLoop loop;
            loop.Post([&] { ran = true; });
        }
        QCoreApplication::processEvents();
        QVERIFY(!ran);
    }

    void clockMovesForward() {
        QtEventLoop loop;
        const uint32_t start = loop.TimeGetTime();
        QTRY_VERIFY(loop.TimeGetTime() - start >= 2);
    }

    void oneShotTimerFiresOnceAndIsGone() {
        QtEventLoop loop;
        int fired = 0;
        const auto id = loop.StartTimer(1, false, [&] { ++fired; });
        QVERIFY(id > 0);
        QTRY_COMPARE(fired, 1);
        QCOMPARE(loop.ActiveTimers(), 0);
        loop.StopTimer(id);  // already finished: nothing happens
        QTest::qWait(5);
        QCOMPARE(fired, 1);
    }

    void repeatingTimerRunsUntilItStopsItself() {
        QtEventLoop loop;
        int fired = 0;
        cv::platform::EventLoop::TimerId id = 0;
        id = loop.StartTimer(1, true, [&] {
            if (++fired == 3) {
                loop.StopTimer(id);
            }
        });
        QTRY_COMPARE(fired, 3);
        QCOMPARE(loop.ActiveTimers(), 0);
        QTest::qWait(5);
        QCOMPARE(fired, 3);
    }

    void oneShotCallbackMayStartTheNextTimer() {
        QtEventLoop loop;
        int fired = 0;
        std::function<void()> again = [&] {
            if (++fired < 3) {
                loop.StartTimer(0, false, again);
            }
        };
        loop.StartTimer(0, false, again);
        QTRY_COMPARE(fired, 3);
        QCOMPARE(loop.ActiveTimers(), 0);
    }

    void stoppedTimerNeverFires() {
        QtEventLoop loop;
        bool fired = false;
        const auto id = loop.StartTimer(1, false, [&] { fired = true; });
        const auto other = loop.StartTimer(1, false, [] {});
        QVERIFY(other != id);
        loop.StopTimer(id);
        QTRY_COMPARE(loop.ActiveTimers(), 0);
        QTest::qWait(5);
        QVERIFY(!fired);
    }
};

QTEST_GUILESS_MAIN(QtEventLoopTest)
#include "QtEventLoopTest.moc"
