#include "platform/fake/VirtualEventLoop.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace cv::fake {
namespace {

TEST(VirtualEventLoop, FiresTimersInDueOrderAndStopsThem) {
    VirtualEventLoop loop(1000);
    std::string fired;
    const auto repeating = loop.StartTimer(30, true, [&] { fired += "r"; });
    loop.StartTimer(50, false, [&] { fired += "o"; });
    loop.StartTimer(10, false, [&] { loop.StartTimer(10, false, [&] { fired += "c"; }); });

    loop.Advance(15);
    EXPECT_EQ(fired, "") << "a timer started in a callback waits for its whole interval";
    loop.Advance(5);
    EXPECT_EQ(fired, "c");
    loop.Advance(80);
    EXPECT_EQ(fired, "crorr");
    EXPECT_EQ(loop.TimeGetTime(), 1100u);

    loop.StopTimer(repeating);
    loop.StopTimer(repeating);
    loop.Advance(100);
    EXPECT_EQ(fired, "crorr");
    EXPECT_EQ(loop.ActiveTimers(), 0);
}

TEST(VirtualEventLoop, ClockWrapsAtTwoToThe32) {
    VirtualEventLoop loop(0xFFFFFFF0u);
    const uint32_t start = loop.TimeGetTime();
    bool fired = false;
    loop.StartTimer(20, false, [&] { fired = true; });
    loop.Advance(32);
    EXPECT_TRUE(fired);
    EXPECT_EQ(loop.TimeGetTime(), 0x10u);
    EXPECT_EQ(loop.TimeGetTime() - start, 32u);
}

TEST(VirtualEventLoop, PostedEventsRunOnDoEventsButNotTheirOwnFollowers) {
    VirtualEventLoop loop;
    int runs = 0;
    loop.Post([&] {
        ++runs;
        loop.Post([&] { ++runs; });
    });
    loop.DoEvents();
    EXPECT_EQ(runs, 1);
    loop.DoEvents();
    EXPECT_EQ(runs, 2);
}

TEST(VirtualEventLoop, WaitUntilRunsTimersUntilDoneOrTheDeadline) {
    VirtualEventLoop loop(100);
    bool answered = false;
    loop.StartTimer(7000, false, [&] { answered = true; });
    EXPECT_TRUE(loop.WaitUntil([&] { return answered; }, 30000));
    EXPECT_EQ(loop.TimeGetTime(), 7100u) << "the clock stops at the event that ended the wait";

    int ticks = 0;
    loop.StartTimer(100, true, [&] { ++ticks; });
    EXPECT_FALSE(loop.WaitUntil([] { return false; }, 1000));
    EXPECT_EQ(loop.TimeGetTime(), 8100u);
    EXPECT_EQ(ticks, 10);

    bool posted = false;
    loop.Post([&] { posted = true; });
    EXPECT_TRUE(loop.WaitUntil([&] { return posted; }, 0));
}

TEST(VirtualEventLoop, AWaitInsideATimerNeverTurnsTheClockBack) {
    VirtualEventLoop loop;
    std::vector<uint32_t> seen;
    loop.StartTimer(10, false, [&] { loop.WaitUntil([] { return false; }, 500); });
    loop.StartTimer(20, false, [&] { seen.push_back(loop.TimeGetTime()); });
    loop.Advance(100);
    EXPECT_EQ(loop.TimeGetTime(), 510u);
    ASSERT_EQ(seen.size(), 1u);
    EXPECT_EQ(seen[0], 20u) << "the other timer ran inside the wait, at its own time";
}

}  // namespace
}  // namespace cv::fake
