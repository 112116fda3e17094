#include "platform/fake/VirtualEventLoop.h"

#include <gtest/gtest.h>

#include <string>

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

}  // namespace
}  // namespace cv::fake
