#include <cmath>
#include <tuple>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr auto kEng = RangeType::Engineering;
constexpr auto kInst = RangeType::Instrument;
constexpr auto kDisplay = RangeType::Display;
const auto kUnknownRange = static_cast<RangeType>(7);

struct ChannelRanges : testing::Test {
    auto Scale() const { return std::tuple(channel.ScaleFactor(), channel.ScaleOffset()); }
    auto DisplayLimits() const { return std::tuple(channel.DisplayMin(), channel.DisplayMax()); }
    test::TestPlatform tp;
    Channel channel{tp.platform};
};

TEST_F(ChannelRanges, EqualOrNonFiniteLimitsBecomeZeroToHundredAndValidateNamesTheRange) {
    EXPECT_EQ(channel.RawValue(), Variant::I2(0));  // a new channel's value
    channel.SetRange(kInst, 4, 20);
    channel.SetRange(kEng, 5, 5);
    EXPECT_EQ(std::tuple(channel.EngMin(), channel.EngMax(), channel.ScaleFactor()),
              std::tuple(0, 100, 6.25));
    channel.SetRange(kInst, NAN, 20);
    EXPECT_EQ(std::tuple(channel.InstMin(), channel.InstMax(), channel.ScaleFactor()),
              std::tuple(0, 100, 1));
    channel.SetRange(kUnknownRange, 1, 2);
    EXPECT_EQ(channel.GetRangeValue(kUnknownRange, 0), 0);
    EXPECT_EQ(channel.GetRangeValue(kEng, 2), 0);

    std::string sMessage = "untouched";
    EXPECT_TRUE(channel.ValidateRange(kEng, 10, 5, sMessage));
    EXPECT_EQ(sMessage, "untouched");
    EXPECT_FALSE(channel.ValidateRange(kDisplay, 10, 5, sMessage));
    EXPECT_EQ(sMessage, "Display minimum must be less than display maximum.");
    EXPECT_FALSE(channel.ValidateRange(kInst, 3, 3, sMessage));
    EXPECT_EQ(sMessage, "Instrument range values cannot be equal.");
    sMessage = "Spare";
    EXPECT_FALSE(channel.ValidateRange(kUnknownRange, 3, 3, sMessage));
    EXPECT_EQ(sMessage, "Spare range values cannot be equal.");
}

TEST_F(ChannelRanges, ScaleFactorsFollowBothRangesIncludingInverted) {
    channel.SetRange(kInst, 4, 20);
    EXPECT_EQ(Scale(), std::tuple(6.25, -25));
    channel.SetRange(kEng, 100, 0);
    EXPECT_EQ(Scale(), std::tuple(-6.25, 125));
    double dSpan = 0;
    EXPECT_FALSE(channel.SpanValue(kEng, dSpan));
    EXPECT_EQ(dSpan, -100);
    EXPECT_FALSE(channel.SpanValue(kUnknownRange, dSpan));
    EXPECT_EQ(dSpan, 100);
    channel.SetRange(kDisplay, 10, 5);  // not refused here, only by ValidateRange
    EXPECT_EQ(channel.DisplayMin(), 10);
    EXPECT_EQ(channel.ScaleOffset(), 125);

    Channel target(tp.platform);  // takes both ranges, not the display range
    target.CopyRangeValuesFrom(channel);
    EXPECT_EQ(
        std::tuple(target.EngMin(), target.InstMin(), target.ScaleFactor(), target.DisplayMax()),
        std::tuple(100, 4, -6.25, 100));
    channel.CopyEngRangeToInstRange();
    EXPECT_EQ(Scale(), std::tuple(1, 0));
    channel.SetRange(kEng, -1e308, 1e308);
    EXPECT_EQ(channel.SpanValue(kEng, dSpan).Number, kErrOverflow);
}

TEST_F(ChannelRanges, DefaultDisplaySpanWidensInFivePercentSteps) {
    channel.SetComType(ComTypeCode::Opc);
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::R8(50), 0xC0, 0, false);
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(true, 0, 0));
    EXPECT_EQ(DisplayLimits(), std::tuple(40, 65));
    channel.OpcSetRawValue(Variant::R8(80), 0xC0, 0, false);  // widens downwards first
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(true, 0, 0));  // and stops once 25 wide
    EXPECT_EQ(DisplayLimits(), std::tuple(70, 95));
    // Given limits are framed; the high one moves up a step.
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(false, 10, 90));
    EXPECT_EQ(DisplayLimits(), std::tuple(10, 95));
    // Values far above the range end at its top quarter.
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(false, 1e30f, 1e30f));
    EXPECT_EQ(DisplayLimits(), std::tuple(75, 100));
    channel.SetRange(kEng, 200, 400);
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(false, 300, 310));
    EXPECT_EQ(DisplayLimits(), std::tuple(290, 340));
    EXPECT_EQ(channel.SetDefaultDisplaySpan(false, INFINITY, 1).Number, kErrOverflow);
    EXPECT_EQ(channel.DisplayMax(), 340);
}

}  // namespace
}  // namespace cv
