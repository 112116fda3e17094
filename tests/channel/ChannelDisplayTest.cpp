#include <cmath>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "channel/FixedPoint.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

TEST(ChannelDisplay, InvalidWritesKeepTheOldValueAndFormatsFollowTheLocale) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    channel.SetDecimalPlaces(6);
    channel.SetDecimalPlaces(-1);
    channel.SetLineWidth(0);
    channel.SetLineWidth(5);
    EXPECT_EQ(channel.DecimalPlaces(), 2);
    EXPECT_EQ(channel.LineWidth(), 2);
    std::string sMessage;
    EXPECT_FALSE(channel.ValidateDecimalPlaces(6, sMessage));
    EXPECT_EQ(sMessage, "Number of decimal places must be in range 0 to 5.");
    EXPECT_FALSE(channel.ValidateLineWidth(5, sMessage));
    EXPECT_EQ(sMessage, "Line width must be in range 1 to 4.");
    channel.SetEngUnits("kPa");
    EXPECT_EQ(channel.EngUnitsBrackets(), "(kPa)");

    EXPECT_EQ(channel.FormatDecPt(0.5), "0.50");
    channel.SetDecimalPlaces(1);
    EXPECT_EQ(channel.FormatDecPt(-1234.5), "-1234.5");
    test::TestPlatform comma(fake::FixedLocale::Comma());
    Channel german(comma.platform);
    EXPECT_EQ(german.FormatDecPt(0.5), "0,50");
    german.SetDecimalPlaces(1);
    EXPECT_EQ(german.FormatDecPt(-1234.5), "-1234,5");
}

TEST(ChannelDisplay, DefaultDecPtFollowsTheLargerLimit) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    const struct {
        double min, max;
        int32_t places;
    } cases[] = {{-1500, 10, 0}, {0, 1000.001, 0}, {0, 1000, 1}, {-100.5, 0, 1}, {0, 100, 2},
                 {0, 10.01, 2},  {0, 10, 3},       {0, 1.01, 3}, {0, 1, 4},      {-0.5, 0.5, 4}};
    for (const auto& c : cases) {
        channel.SetRange(RangeType::Engineering, c.min, c.max);
        channel.DefaultDecPt();
        EXPECT_EQ(channel.DecimalPlaces(), c.places) << c.min << " to " << c.max;
    }
}

TEST(FixedPoint, RoundsHalfAwayFromZeroAndKeepsOutlandishInputsShort) {
    EXPECT_EQ(FormatFixedPoint(-0.125, 2, "."), "-0.13");
    EXPECT_EQ(FormatFixedPoint(2.675, 2, "."), "2.68");
    EXPECT_EQ(FormatFixedPoint(9.9996, 3, "."), "10.000");
    EXPECT_EQ(FormatFixedPoint(-0.001, 2, "."), "0.00");
    EXPECT_EQ(FormatFixedPoint(0.000012345, 5, ","), "0,00001");
    EXPECT_EQ(FormatFixedPoint(123456789.25, 1, "."), "123456789.3");
    EXPECT_EQ(FormatFixedPoint(1.5, -7, "."), "2");
    EXPECT_EQ(FormatFixedPoint(1.5, 2147483647, "."), "1.500000000000000");
    EXPECT_EQ(FormatFixedPoint(1e20, 2, ","), "1,00E+20");
    EXPECT_EQ(FormatFixedPoint(-1e300, 1, "."), "-1.0E+300");
    EXPECT_EQ(FormatFixedPoint(-2.5e15, 0, "."), "-3E+15");  // exact binary ties too
    EXPECT_EQ(FormatFixedPoint(1.25e15, 1, ","), "1,3E+15");
    EXPECT_EQ(FormatFixedPoint(1234567890123.125, 2, "."), "1234567890123.13");
    EXPECT_EQ(FormatFixedPoint(NAN, 2, "."), "NaN");
    EXPECT_EQ(FormatFixedPoint(-INFINITY, 2, "."), "-Infinity");
    EXPECT_LE(FormatFixedPoint(-999999999999999.0, kMaxFixedPlaces, ".").size(), 40u);
}

}  // namespace
}  // namespace cv
