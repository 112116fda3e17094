#include <cmath>

#include <gtest/gtest.h>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "support/TestPlatform.h"

namespace cv {
namespace {

constexpr auto kEng = RangeType::Engineering;
constexpr auto kInst = RangeType::Instrument;

TEST(ChannelScaling, FlagsFollowTunerKindNumberAndSettings) {
    const struct {
        int32_t tuner, number;
        bool scalePVandCO, scaleSP, abIntegerFile, needs, priorToOutput;
    } cases[] = {
        {9, 1, true, false, false, true, true},    {9, 1, false, true, false, false, false},
        {9, 2, true, false, true, true, false},    {9, 2, true, false, false, true, true},
        {9, 3, true, false, false, false, false},  {9, 3, true, true, true, true, true},
        {9, 3, false, true, false, false, false},  {9, 4, false, false, false, true, true},
        {9, 0, false, false, false, false, false}, {5, 1, false, false, false, true, true},
        {5, 2, false, false, true, true, true},
    };
    for (const auto& c : cases) {
        test::TestPlatform tp;
        TunFile tunFile(tp.platform);
        tunFile.SetTunerType(c.tuner);
        tunFile.General().SetScalePVandCO(c.scalePVandCO);
        tunFile.General().SetScaleSP(c.scaleSP);
        tunFile.General().SetABIntegerFile(c.abIntegerFile);
        Channel channel(tp.platform);
        channel.SetNumber(c.number);
        channel.SetRange(kInst, 4, 20);
        SCOPED_TRACE(testing::Message() << "tuner " << c.tuner << " number " << c.number);
        EXPECT_EQ(channel.NeedsScaling(tunFile), c.needs);
        EXPECT_EQ(channel.ScalePriorToOutput(50), c.priorToOutput ? 12 : 50);
    }
}

// The PV of an OPC tuner that scales PV and CO, on a 4 to 20 instrument range.
struct ScaledPv : testing::Test {
    ScaledPv() {
        tunFile.SetTunerType(9);
        tunFile.General().SetScalePVandCO(true);
        channel.SetNumber(1);
        channel.SetRange(kInst, 4, 20);
    }
    test::TestPlatform tp;
    TunFile tunFile{tp.platform};
    Channel channel{tp.platform};
};

TEST_F(ScaledPv, CurrentValueConvertsOnlyOnceFlagsAreSet) {
    EXPECT_EQ(channel.CurrentValue(), 0);  // offline, flags not yet set
    channel.SetComType(ComTypeCode::Opc);
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::I2(12), 0xC0, 0, false);
    EXPECT_EQ(channel.CurrentValue(), 12);
    ASSERT_TRUE(channel.NeedsScaling(tunFile));
    EXPECT_EQ(channel.CurrentValue(), 50);
    EXPECT_EQ(channel.FormatCurrentValue(), "50.00");
    channel.GoOffline();
    EXPECT_EQ(channel.CurrentValue(), -25);  // raw 0 while offline

    channel.SetRange(kEng, 4, 20);  // equal ranges never scale
    EXPECT_FALSE(channel.NeedsScaling(tunFile));
    channel.SetRange(kInst, 14, 30);  // same slope, shifted
    EXPECT_TRUE(channel.NeedsScaling(tunFile));
}

TEST_F(ScaledPv, NonNumberTextFallsBackWithTheQuestionButNaNAndInfinitiesStay) {
    ASSERT_TRUE(channel.NeedsScaling(tunFile));
    channel.SetExpectANumber(false);
    channel.SetComType(ComTypeCode::Opc);
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::Str("7.5 kPa"), 0xC0, 0, false);
    EXPECT_FLOAT_EQ(channel.CurrentValue(), 7.5);
    ASSERT_EQ(tp.dialogs.Messages().size(), 1u);
    EXPECT_EQ(tp.dialogs.Last().title, "Conversion errors");
    channel.OpcSetRawValue(Variant::R8(1e308), 0xC0, 0, false);  // scaling overflows
    EXPECT_EQ(channel.FormatCurrentValue(), "Infinity");
    channel.OpcSetRawValue(Variant::R8(NAN), 0xC0, 0, false);
    EXPECT_EQ(channel.FormatCurrentValue(), "NaN");
    EXPECT_EQ(tp.dialogs.Messages().size(), 1u);
}

TEST(ChannelScaling, TextValuesFollowTheRegionalSettings) {
    test::TestPlatform comma(fake::FixedLocale::Comma());
    Channel channel(comma.platform);
    channel.SetComType(ComTypeCode::Opc);
    channel.MarkGoingOnline();
    channel.OpcSetRawValue(Variant::Str("12,5"), 0xC0, 0, false);
    ASSERT_TRUE(channel.IsOnline());
    EXPECT_EQ(channel.CurrentValue(), 12.5);
    EXPECT_TRUE(comma.dialogs.Messages().empty());
}

TEST(ChannelScaling, PercentConversionsAndTheirFailures) {
    test::TestPlatform tp;
    Channel channel(tp.platform);
    channel.SetRange(kEng, 200, 100);
    double dResult = 0;
    EXPECT_FALSE(channel.ConvertToPercent(175, dResult));
    EXPECT_EQ(dResult, 25);
    EXPECT_FALSE(channel.ConvertFromPercent(25, dResult));
    EXPECT_EQ(dResult, 175);
    EXPECT_EQ(channel.ConvertToPercent(1e308, dResult).Number, kErrOverflow);
    EXPECT_EQ(channel.ConvertFromPercent(1e308, dResult).Number, kErrOverflow);
    channel.SetRange(kEng, -1e308, 1e308);
    EXPECT_EQ(channel.ConvertToPercent(0, dResult).Number, kErrOverflow);
}

}  // namespace
}  // namespace cv
