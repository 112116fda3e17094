#include <gtest/gtest.h>

#include <cmath>

#include "channel/Channel.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr auto kEng = RangeType::Engineering;
constexpr auto kInst = RangeType::Instrument;
constexpr auto kDisplay = RangeType::Display;
const auto kUnknownRange = static_cast<RangeType>(7);

// Brings an OPC channel online with a good value.
void Receive(Channel& channel, double dValue) {
    channel.SetComType(ComTypeCode::Opc);
    channel.OpcSetRawValue(Variant::R8(dValue), 0xC0, 0, false);
}

TEST(ChannelRanges, NewChannelHoldsItsInitialValues) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    EXPECT_EQ(channel.ScaleFactor(), 1);
    EXPECT_EQ(channel.ScaleOffset(), 0);
    EXPECT_EQ(channel.DisplayMax(), 100);
    EXPECT_EQ(channel.DecimalPlaces(), 2);
    EXPECT_EQ(channel.LineColor(), 65280);
    EXPECT_TRUE(channel.ExpectANumber());
    EXPECT_EQ(channel.ComType(), ComTypeCode::Dde);
    EXPECT_EQ(channel.DdeAppTopic(), "|");
    EXPECT_EQ(channel.OpcRawValueVarType(), 0);  // null
    EXPECT_EQ(channel.RawValue(), Variant::I2(0));
}

TEST(ChannelRanges, EqualOrNonFiniteLimitsBecomeZeroToHundred) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    channel.SetRange(kInst, 4, 20);
    channel.SetRange(kEng, 5, 5);
    EXPECT_EQ(channel.EngMin(), 0);
    EXPECT_EQ(channel.EngMax(), 100);
    EXPECT_EQ(channel.ScaleFactor(), 6.25);
    channel.SetRange(kInst, NAN, 20);
    EXPECT_EQ(channel.InstMin(), 0);
    EXPECT_EQ(channel.InstMax(), 100);
    EXPECT_EQ(channel.ScaleFactor(), 1);
    channel.SetRange(kUnknownRange, 1, 2);
    EXPECT_EQ(channel.GetRangeValue(kUnknownRange, 0), 0);
    EXPECT_EQ(channel.GetRangeValue(kEng, 2), 0);
}

TEST(ChannelRanges, ScaleFactorsFollowBothRangesIncludingInverted) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    channel.SetRange(kInst, 4, 20);
    EXPECT_EQ(channel.ScaleFactor(), 6.25);
    EXPECT_EQ(channel.ScaleOffset(), -25);
    channel.SetRange(kEng, 100, 0);
    EXPECT_EQ(channel.ScaleFactor(), -6.25);
    EXPECT_EQ(channel.ScaleOffset(), 125);
    double dSpan = 0;
    EXPECT_FALSE(channel.SpanValue(kEng, dSpan));
    EXPECT_EQ(dSpan, -100);
    EXPECT_FALSE(channel.SpanValue(kUnknownRange, dSpan));
    EXPECT_EQ(dSpan, 100);
    channel.SetRange(kDisplay, 10, 5);  // not refused here, only by ValidateRange
    EXPECT_EQ(channel.DisplayMin(), 10);
    EXPECT_EQ(channel.ScaleOffset(), 125);
    channel.CopyEngRangeToInstRange();
    EXPECT_EQ(channel.ScaleFactor(), 1);
    EXPECT_EQ(channel.ScaleOffset(), 0);
    channel.SetRange(kEng, -1e308, 1e308);
    EXPECT_EQ(channel.SpanValue(kEng, dSpan).Number, kErrOverflow);
}

TEST(ChannelRanges, ValidateRangeNamesTheRange) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
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

TEST(ChannelRanges, CopyRangeValuesLeavesTheDisplayRange) {
    test::TestPlatform tp;
    Channel source(tp.platform);
    source.SetRange(kEng, -50, 50);
    source.SetRange(kInst, 4, 20);
    source.SetRange(kDisplay, 1, 2);
    Channel target(tp.platform);
    target.CopyRangeValuesFrom(source);
    EXPECT_EQ(target.EngMin(), -50);
    EXPECT_EQ(target.InstMin(), 4);
    EXPECT_EQ(target.ScaleFactor(), 6.25);
    EXPECT_EQ(target.DisplayMax(), 100);
}

TEST(ChannelRanges, DefaultDisplaySpanWidensInFivePercentSteps) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    Receive(channel, 50);
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(true, 0, 0));
    EXPECT_EQ(channel.DisplayMin(), 40);
    EXPECT_EQ(channel.DisplayMax(), 65);
    Receive(channel, 80);  // widens downwards first; stops once 25 wide
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(true, 0, 0));
    EXPECT_EQ(channel.DisplayMin(), 70);
    EXPECT_EQ(channel.DisplayMax(), 95);
    // Given limits are framed; the high one moves up a step.
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(false, 10, 90));
    EXPECT_EQ(channel.DisplayMin(), 10);
    EXPECT_EQ(channel.DisplayMax(), 95);
    // Values far above the range end at its top quarter.
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(false, 1e30f, 1e30f));
    EXPECT_EQ(channel.DisplayMin(), 75);
    EXPECT_EQ(channel.DisplayMax(), 100);
    channel.SetRange(kEng, 200, 400);
    EXPECT_FALSE(channel.SetDefaultDisplaySpan(false, 300, 310));
    EXPECT_EQ(channel.DisplayMin(), 290);
    EXPECT_EQ(channel.DisplayMax(), 340);
    EXPECT_EQ(channel.SetDefaultDisplaySpan(false, INFINITY, 1).Number, kErrOverflow);
    EXPECT_EQ(channel.DisplayMax(), 340);
}

}  // namespace
}  // namespace cv
