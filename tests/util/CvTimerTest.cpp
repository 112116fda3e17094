#include <gtest/gtest.h>

#include <cstdint>

#include "platform/fake/VirtualEventLoop.h"
#include "util/CvTimer.h"

namespace cv {
namespace {

// The same 10 s wait read in steps, starting where the clock crosses
// nothing, 2^31 and the wrap at 2^32: every reading is exact.
class CvTimerAcross : public testing::TestWithParam<uint32_t> {};

TEST_P(CvTimerAcross, CountsTrueTimeOverTheClocksBoundaries) {
    fake::VirtualEventLoop events(GetParam());
    CvTimer timer(events);
    timer.InitializeNow(10000);
    struct Step {
        uint32_t advance;
        int32_t percent;
        bool up;
    };
    const Step steps[] = {{999, 9, false},   {1, 10, false}, {1500, 25, false},
                          {7499, 99, false}, {1, 100, true}, {2000, 120, true}};
    int32_t total = 0;
    for (const Step& step : steps) {
        events.Advance(step.advance);
        total += static_cast<int32_t>(step.advance);
        EXPECT_EQ(timer.PerCentElapsed(), step.percent) << total;
        EXPECT_EQ(timer.TimeUp(), step.up) << total;
        EXPECT_EQ(timer.TimeSinceInitialize(), total);
    }
}

INSTANTIATE_TEST_SUITE_P(Start, CvTimerAcross,
                         testing::Values(0u, 0x7FFFFFFFu - 1000u, 0x7FFFFFFFu, 0xFFFFFFFFu - 1000u,
                                         0xFFFFFFFFu));

TEST(CvTimer, WaitTimeChangesKeepTheCountAndReinitialisingRestartsIt) {
    fake::VirtualEventLoop events;
    CvTimer timer(events);
    EXPECT_EQ(timer.WaitTime(), 0);
    timer.InitializeNow(10000);
    events.Advance(6000);
    EXPECT_EQ(timer.PerCentElapsed(), 60);
    timer.ChangeWaitTimeBy(5000);
    EXPECT_EQ(timer.PerCentElapsed(), 40);
    timer.ChangeWaitTimeBy(-10000);
    EXPECT_TRUE(timer.TimeUp());
    timer.InitializeNow(timer.WaitTime());
    EXPECT_EQ(timer.TimeSinceInitialize(), 0);
    EXPECT_FALSE(timer.TimeUp());
}

TEST(CvTimer, ANonPositiveOrHugeWaitNeverDividesByZeroNorOverflows) {
    fake::VirtualEventLoop events;
    CvTimer timer(events);
    for (const int32_t wait : {0, -5000}) {
        timer.InitializeNow(wait);
        EXPECT_TRUE(timer.TimeUp());
        EXPECT_EQ(timer.PerCentElapsed(), 100);
    }
    timer.InitializeNow(INT32_MAX);
    timer.ChangeWaitTimeBy(5000);
    EXPECT_EQ(timer.WaitTime(), INT32_MAX);
    events.Advance(0x7FFFFFFFu);
    events.Advance(0x7FFFFFFFu);
    EXPECT_EQ(timer.TimeSinceInitialize(), INT32_MAX);
    EXPECT_EQ(timer.PerCentElapsed(), 100);
    EXPECT_TRUE(timer.TimeUp());
}

}  // namespace
}  // namespace cv
