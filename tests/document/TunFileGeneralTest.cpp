#include "document/TunFileGeneral.h"

#include <gtest/gtest.h>

#include "support/TestPlatform.h"

namespace cv {
namespace {

TEST(TunFileGeneral, SampleIntervalIsQuantisedHalvesToEven) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    struct Case {
        double typed;
        int32_t milliseconds;
    };
    // Each assignment starts from 5000 ms so a refusal shows as 5000.
    const Case cases[] = {{0.0249, 25},   {0.0174, 5000}, {0.02, 20},    {61.004, 61000},
                          {61.006, 5000}, {1.125, 1120},  {1.375, 1380}, {0.0125, 5000},
                          {0.0375, 40},   {0.0625, 60},   {0.1875, 190}, {0.9975, 1000},
                          {0.9999, 1000}, {2.5, 2500},    {-0.5, 5000},  {1e300, 5000}};
    for (const Case& c : cases) {
        general.SetSIinSec(5.0);
        general.SetSIinSec(c.typed);
        EXPECT_EQ(general.SIinMSec(), c.milliseconds) << "typed " << c.typed;
    }
    general.SetSIinSec(0.035);
    EXPECT_DOUBLE_EQ(general.SIinSec(), 0.035);
    EXPECT_TRUE(tp.dialogs.Messages().empty());
}

TEST(TunFileGeneral, ValidateSIWritesBackTheQuantisedValue) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    std::string message = "untouched";
    double si = 0.0174;
    EXPECT_FALSE(general.ValidateSI(si, message));
    EXPECT_DOUBLE_EQ(si, 0.015);
    EXPECT_EQ(message, "Please enter a sample interval in the range 0.02 to 61 seconds.");

    message = "untouched";
    si = 61.0;
    EXPECT_TRUE(general.ValidateSI(si, message));
    EXPECT_EQ(message, "untouched");
    si = 0.0125;  // 2.5 steps of 5 ms: down to the even 2
    EXPECT_FALSE(general.ValidateSI(si, message));
    EXPECT_DOUBLE_EQ(si, 0.01);
    si = 1.005;  // just below 100.5 steps in binary
    EXPECT_TRUE(general.ValidateSI(si, message));
    EXPECT_DOUBLE_EQ(si, 1.0);
}

TEST(TunFileGeneral, RangeMessageUsesTheUsersDecimalSeparator) {
    test::TestPlatform tp(fake::FixedLocale::Comma());
    TunFileGeneral general(tp.platform);
    std::string message;
    double si = 100.0;
    EXPECT_FALSE(general.ValidateSI(si, message));
    EXPECT_EQ(message, "Please enter a sample interval in the range 0,02 to 61 seconds.");
}

TEST(TunFileGeneral, DDETimeoutNeverBelowFifty) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    general.SetDDETimeout(49);
    EXPECT_EQ(general.DDETimeout(), 50);
    general.SetDDETimeout(200);
    general.SetDDETimeout(-5);
    EXPECT_EQ(general.DDETimeout(), 200);
}

TEST(TunFileGeneral, ModeTableGrowsAndShrinksWithinBounds) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    general.SetMode(4, "CAS", "Cascade");
    ASSERT_EQ(general.ModeCount(), 4);
    EXPECT_EQ(general.ModeKey(3), "");
    EXPECT_EQ(general.ModeValue(3), "");
    EXPECT_FALSE(general.ModeAuto(3));
    EXPECT_EQ(general.ModeKey(4), "CAS");
    general.SetModeAuto(4, true);

    for (int32_t ignored : {1, 21, 0, -3}) {
        general.SetModeCount(ignored);
    }
    general.SetMode(21, "X", "Y");
    general.SetMode(0, "X", "Y");
    EXPECT_EQ(general.ModeCount(), 4);

    general.SetModeCount(20);
    EXPECT_EQ(general.ModeValue(4), "Cascade");
    EXPECT_TRUE(general.ModeAuto(4));
    general.SetModeCount(3);
    EXPECT_EQ(general.ModeKey(4), "ModeKey?");
    EXPECT_EQ(general.ModeValue(4), "ModeValue?");
    EXPECT_FALSE(general.ModeAuto(4));
    general.SetModeCount(4);
    EXPECT_EQ(general.ModeKey(4), "");
    EXPECT_EQ(general.ModeKey(0), "ModeKey?");
    EXPECT_EQ(general.ModeValue(-1), "ModeValue?");
}

TEST(TunFileGeneral, RowsOneAndTwoChangeOnlyTheirKeys) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    general.SetMode(2, "MAN", "Hand");
    general.SetMode(1, "AUT", "Automatic");
    general.SetModeAuto(1, false);
    general.SetModeAuto(2, true);
    EXPECT_EQ(general.ManualModeDetect(), "MAN");
    EXPECT_EQ(general.ModeValue(2), "Manual");
    EXPECT_EQ(general.AutoModeDetect(), "AUT");
    EXPECT_EQ(general.ModeValue(1), "Auto");
    EXPECT_TRUE(general.ModeAuto(1));
    EXPECT_FALSE(general.ModeAuto(2));

    general.SetAutoModeDetect("A");
    general.SetManualModeDetect("M");
    EXPECT_EQ(general.ModeKey(1), "A");
    EXPECT_EQ(general.ModeKey(2), "M");
}

TEST(TunFileGeneral, FillModeMapTakesRowsInOrder) {
    test::TestPlatform tp;
    TunFileGeneral general(tp.platform);
    general.SetMode(3, "CAS\r\n", "Cascade");
    general.SetMode(4, "", "");
    general.SetMode(5, "", "");
    ModeMapClass map = general.FillModeMap();
    ASSERT_EQ(map.GetModeMapSize(), 4);
    EXPECT_EQ(map.GetModeMapKeyByPos(1), "Auto");
    EXPECT_EQ(map.GetModeMapValue("Manual"), "Manual");
    EXPECT_EQ(map.GetModeMapValue("CAS"), "Cascade");
    EXPECT_EQ(map.GetModeMapKeyByPos(4), "");
}

}  // namespace
}  // namespace cv
