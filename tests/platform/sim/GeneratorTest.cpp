#include "platform/sim/Generator.h"

#include <gtest/gtest.h>

#include "platform/fake/VirtualEventLoop.h"
#include "platform/sim/PlantClock.h"

namespace cv::sim {
namespace {

ItemSpec Generated(GeneratorKind kind, uint16_t type = VT_R8) {
    ItemSpec item;
    item.type = type;
    item.generator.kind = kind;
    item.generator.min = 10;
    item.generator.max = 20;
    item.generator.periodMs = 1000;
    return item;
}

TEST(Generator, EachShapeRunsFromMinToMaxOncePerPeriod) {
    struct Case {
        GeneratorKind kind;
        uint64_t atMs;
        double value;
    };
    const Case cases[] = {
        {GeneratorKind::Ramp, 0, 10},      {GeneratorKind::Ramp, 250, 12.5},
        {GeneratorKind::Ramp, 999, 19.99}, {GeneratorKind::Ramp, 1000, 10},
        {GeneratorKind::Sine, 0, 15},      {GeneratorKind::Sine, 250, 20},
        {GeneratorKind::Sine, 750, 10},    {GeneratorKind::Sine, 5000000000ULL, 15},
        {GeneratorKind::Square, 0, 10},    {GeneratorKind::Square, 499, 10},
        {GeneratorKind::Square, 500, 20},  {GeneratorKind::Square, 1000, 10},
    };
    for (const Case& c : cases) {
        EXPECT_NEAR(Generate(Generated(c.kind), c.atMs).value.AsR8(), c.value, 1e-9)
            << static_cast<int>(c.kind) << " at " << c.atMs;
    }
}

TEST(Generator, RandomValuesRepeatForTheSameSeedAndHoldForAPeriod) {
    ItemSpec item = Generated(GeneratorKind::Random);
    const double first = Generate(item, 0).value.AsR8();
    EXPECT_EQ(Generate(item, 999).value.AsR8(), first);
    double low = 20;
    double high = 10;
    for (uint64_t period = 0; period < 200; ++period) {
        const double value = Generate(item, period * 1000).value.AsR8();
        low = std::min(low, value);
        high = std::max(high, value);
    }
    EXPECT_GE(low, 10.0);
    EXPECT_LT(high, 20.0);
    EXPECT_GT(high - low, 5.0) << "spread over the range";
    item.generator.seed = 2;
    EXPECT_NE(Generate(item, 0).value.AsR8(), first);
}

TEST(Generator, StepsCycleThroughValuesAndQualitiesAndNumbersTakeTheItemsType) {
    ItemSpec item = Generated(GeneratorKind::Step, VT_BSTR);
    item.generator.values = {Variant::Str("a"), Variant::Str("b"), Variant::Str("c")};
    item.generator.qualities = {0xC0, 0x14};
    EXPECT_EQ(Generate(item, 2500).value, Variant::Str("c"));
    EXPECT_EQ(Generate(item, 2500).quality, 0xC0);
    EXPECT_EQ(Generate(item, 3000).value, Variant::Str("a"));
    EXPECT_EQ(Generate(item, 3000).quality, 0x14);

    EXPECT_EQ(Generate(Generated(GeneratorKind::Ramp, VT_I2), 250).value, Variant::I2(12));
    EXPECT_EQ(Generate(Generated(GeneratorKind::Square, VT_BOOL), 600).value, Variant::Bool(true));
    EXPECT_EQ(Generate(Generated(GeneratorKind::Ramp, VT_BSTR), 250).value, Variant::Str("12.5"));
}

TEST(PlantClock, CountsOnAcrossTheWrapOfTheMillisecondClock) {
    fake::VirtualEventLoop events(0xFFFFFF00u);
    PlantClock clock(events, 45000.0);
    events.Advance(0x100);
    EXPECT_EQ(clock.NowMs(), 0x100u);
    events.Advance(0x300);
    EXPECT_EQ(clock.NowMs(), 0x400u);
    EXPECT_EQ(events.TimeGetTime(), 0x300u);
    EXPECT_DOUBLE_EQ(clock.OleDate(86400000), 45001.0);
}

}  // namespace
}  // namespace cv::sim
