#include <cfloat>
#include <cmath>

#include <gtest/gtest.h>

#include "support/TestPlatform.h"
#include "util/FloatText.h"
#include "util/TextToNumber.h"

namespace cv {
namespace {

const fake::FixedLocale kPoint = fake::FixedLocale::Point();
const fake::FixedLocale kComma = fake::FixedLocale::Comma();

TEST(FormatFloat, WritesTheShortestTextThatReadsBack) {
    const std::pair<double, const char*> cases[] = {{0.1, "0.1"},
                                                    {1.0 / 3.0, "0.33333334"},
                                                    {-0.0, "0"},
                                                    {1e20, "1E+20"},
                                                    {0.00001, "1E-05"},
                                                    {0.0001, "0.0001"},
                                                    {16777217.0, "16777216"},
                                                    {1e14, "100000000000000"},
                                                    {1e15, "1E+15"},
                                                    {1e-40, "1E-40"}};
    for (const auto& [value, expected] : cases) {
        EXPECT_EQ(FormatFloat(kPoint, value, 4), expected) << value;
    }
    EXPECT_EQ(FormatFloat(kComma, 1234.5, 4), "1234,5");
    EXPECT_EQ(FormatFloat(kComma, 1.0 / 3.0, 7), "0,33333334");
    // Neither neighbour of a tie reads back, so more digits follow.
    EXPECT_EQ(FormatFloat(kPoint, 654322.25, 7), "654322.25");
}

TEST(FormatFloat, TakesDigitsAsTheFewestAndSaturatesBeyondSingleRange) {
    EXPECT_EQ(FormatFloat(kPoint, 0.1, 9), "0.100000001");
    EXPECT_EQ(FormatFloat(kPoint, 0.1, -5), "0.1");
    EXPECT_EQ(FormatFloat(kPoint, 0.1, 50), "0.100000001");
    EXPECT_EQ(FormatFloat(kPoint, 1e39, 4), "3.4028235E+38");
    EXPECT_EQ(FormatFloat(kPoint, INFINITY, 4), "3.4028235E+38");
    EXPECT_EQ(FormatFloat(kComma, -INFINITY, 4), "-3,4028235E+38");
    EXPECT_EQ(FormatFloat(kPoint, NAN, 4), "NaN");
}

TEST(FormatFloat, EveryTextReadsBackThroughTextToSingle) {
    for (const fake::FixedLocale& locale : {kPoint, kComma}) {
        test::TestPlatform t(locale);
        uint32_t seed = 12345;
        for (int i = 0; i < 3000; ++i) {
            seed = seed * 1664525U + 1013904223U;
            const float bits = std::ldexp(1.0F + static_cast<float>(seed % 8388608U) / 8388608.0F,
                                          static_cast<int>(seed >> 24) % 260 - 140);
            const float value = (seed & 1U) != 0 ? -bits : bits;
            const std::string text = FormatFloat(locale, value, 4);
            EXPECT_LE(text.size(), 20U) << text;
            EXPECT_EQ(TextToSingle(t.platform, text), value) << text;
        }
        for (const float value : {FLT_MAX, -FLT_MAX, FLT_MIN, FLT_TRUE_MIN}) {
            EXPECT_EQ(TextToSingle(t.platform, FormatFloat(locale, value, 4)), value);
        }
        EXPECT_TRUE(t.dialogs.Messages().empty());
    }
}

}  // namespace
}  // namespace cv
