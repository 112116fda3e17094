#include "platform/posix/SteadyEventLoop.h"

#include <gtest/gtest.h>

#include <thread>

namespace cv::posix {
namespace {

TEST(SteadyEventLoop, AnEventPostedFromAnotherThreadEndsTheWait) {
    SteadyEventLoop loop;
    bool done = false;
    std::thread other([&] { loop.Post([&] { done = true; }); });
    EXPECT_TRUE(loop.WaitUntil([&] { return done; }, 60000));
    other.join();
}

TEST(SteadyEventLoop, TimersFireInsideWaitsAndStoppedOnesNever) {
    SteadyEventLoop loop;
    int repeats = 0;
    bool stoppedFired = false;
    const auto stopped = loop.StartTimer(1, false, [&] { stoppedFired = true; });
    loop.StopTimer(stopped);
    loop.StartTimer(0, true, [&] { ++repeats; });
    EXPECT_TRUE(loop.WaitUntil([&] { return repeats >= 3; }, 60000));
    EXPECT_FALSE(stoppedFired);
}

TEST(SteadyEventLoop, AWaitWithNothingToDoEndsAtItsDeadline) {
    SteadyEventLoop loop;
    EXPECT_FALSE(loop.WaitUntil([] { return false; }, 5));
    int runs = 0;
    loop.Post([&] {
        ++runs;
        loop.Post([&] { ++runs; });
    });
    loop.DoEvents();
    EXPECT_EQ(runs, 1) << "an event posted by an event waits for the next turn";
}

}  // namespace
}  // namespace cv::posix
