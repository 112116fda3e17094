#include "platform/ServerCallWait.h"

#include <gtest/gtest.h>

#include "platform/TraceLog.h"
#include "platform/fake/RecordingBusyNotice.h"
#include "platform/fake/VirtualEventLoop.h"
#include "platform/opc/OpcResult.h"

namespace cv::platform {
namespace {

struct ServerCallWaitTest : ::testing::Test {
    fake::VirtualEventLoop events;
    fake::RecordingBusyNotice notice;
    ServerCallWait wait{events, notice};

    // A call that the server answers after ms.
    std::function<bool()> AnsweredAfter(uint32_t ms) {
        auto answered = std::make_shared<bool>(false);
        events.StartTimer(ms, false, [answered] { *answered = true; });
        return [answered] { return *answered; };
    }
};

TEST_F(ServerCallWaitTest, TheNoticeShowsOnlyForCallsPendingPastTheBusyTimeout) {
    wait.SetBusyText("Please wait... busy");
    EXPECT_FALSE(wait.Wait(AnsweredAfter(4999)));
    EXPECT_TRUE(notice.Shown().empty());

    bool visibleDuringCall = false;
    events.StartTimer(6000, false, [&] { visibleDuringCall = notice.Visible(); });
    EXPECT_FALSE(wait.Wait(AnsweredAfter(8000)));
    EXPECT_TRUE(visibleDuringCall);
    EXPECT_FALSE(notice.Visible());
    EXPECT_EQ(notice.Shown(), std::vector<std::string>{"Please wait... busy"});
}

TEST_F(ServerCallWaitTest, ACallPastTheLimitFailsAndEventsRanMeanwhile) {
    int notifications = 0;
    events.StartTimer(1000, true, [&] { ++notifications; });
    const uint32_t start = events.TimeGetTime();
    const ErrorInfo error = wait.Wait([] { return false; });
    EXPECT_EQ(error.Number, OpcResult::RPC_E_TIMEOUT);
    EXPECT_EQ(error.Description, "The OPC Server did not answer within 30 seconds.");
    EXPECT_EQ(events.TimeGetTime() - start, ServerCallWait::kDefaultCallLimitMs);
    EXPECT_EQ(notifications, 30);
    EXPECT_FALSE(notice.Visible());
}

TEST_F(ServerCallWaitTest, NestedWaitsShareOneNotice) {
    bool innerDone = false;
    events.StartTimer(6000, false, [&] {
        EXPECT_FALSE(wait.Wait(AnsweredAfter(7000)));
        EXPECT_TRUE(notice.Visible()) << "the outer call is still pending";
        innerDone = true;
    });
    EXPECT_FALSE(wait.Wait([&] { return innerDone; }));
    EXPECT_EQ(notice.Shown().size(), 1u);
    EXPECT_FALSE(notice.Visible());
}

TEST(TraceLog, KeepsTheNewestEntriesUpToItsCapacity) {
    TraceLog log(3);
    for (uint32_t i = 1; i <= 5; ++i) {
        log.Add(i, "label " + std::to_string(i));
    }
    ASSERT_EQ(log.Entries().size(), 3u);
    EXPECT_EQ(log.Entries().front(), (TraceLog::Entry{3, "label 3"}));
    EXPECT_EQ(log.Entries().back(), (TraceLog::Entry{5, "label 5"}));
}

}  // namespace
}  // namespace cv::platform
