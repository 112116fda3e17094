#include <gtest/gtest.h>

#include "support/TestPlatform.h"
#include "util/TextToNumber.h"

namespace cv {
namespace {

constexpr int32_t kQuestionStyle = MsgBoxStyle::YesNo + MsgBoxStyle::Question;

std::string Question(const std::string& text) {
    return "Could not convert this entire string to number: " + text +
           "\r\n\r\nContinue showing this message?";
}

TEST(TextToSingle, ReadsRegionalNumbersSilently) {
    test::TestPlatform comma(fake::FixedLocale::Comma());
    EXPECT_EQ(TextToSingle(comma.platform, "1.234,5"), 1234.5F);
    EXPECT_TRUE(comma.dialogs.Messages().empty());
    EXPECT_EQ(comma.run.ConversionWarning.ErrorCount, 0);
    // Under the comma locale the classic rules still read "7.5", with a question.
    EXPECT_EQ(TextToSingle(comma.platform, "7.5"), 7.5F);
    EXPECT_EQ(comma.dialogs.Messages().size(), 1U);
}

TEST(TextToSingle, AsksUntilTheUserSaysNoAndKeepsCounting) {
    test::TestPlatform t;
    t.dialogs.QueueAnswer(MsgBoxResult::Yes);
    EXPECT_EQ(TextToSingle(t.platform, "12,5"), 12.0F);
    ASSERT_EQ(t.dialogs.Messages().size(), 1U);
    EXPECT_EQ(t.dialogs.Last().text, Question("12,5"));
    EXPECT_EQ(t.dialogs.Last().title, "Conversion errors");
    EXPECT_EQ(t.dialogs.Last().style, kQuestionStyle);
    EXPECT_TRUE(t.run.ConversionWarning.ShowWarning);

    t.dialogs.QueueAnswer(MsgBoxResult::Yes);
    EXPECT_EQ(TextToSingle(t.platform, "abc"), 0.0F);
    t.dialogs.QueueAnswer(MsgBoxResult::No);
    EXPECT_EQ(TextToSingle(t.platform, "x"), 0.0F);
    EXPECT_EQ(t.dialogs.Messages().size(), 3U);
    EXPECT_FALSE(t.run.ConversionWarning.ShowWarning);

    EXPECT_EQ(TextToSingle(t.platform, "7 kPa"), 7.0F);
    EXPECT_EQ(t.dialogs.Messages().size(), 3U);
    EXPECT_EQ(t.run.ConversionWarning.ErrorCount, 4);
}

TEST(TextToSingle, StaysQuietWhenSuppressedOrMarked) {
    test::TestPlatform t;
    EXPECT_EQ(TextToSingle(t.platform, "3 apples", true), 3.0F);
    EXPECT_EQ(TextToSingle(t.platform, "5?E2302"), 5.0F);
    EXPECT_TRUE(t.dialogs.Messages().empty());
    EXPECT_EQ(t.run.ConversionWarning.ErrorCount, 2);
    EXPECT_TRUE(t.run.ConversionWarning.ShowWarning);
}

TEST(TextToSingle, GivesTheErrorValueForNumbersBeyondSinglePrecision) {
    test::TestPlatform t;
    EXPECT_EQ(TextToSingle(t.platform, "1e39"), 1E-5F);
    EXPECT_EQ(TextToSingle(t.platform, "-1e400"), 1E-5F);
    EXPECT_EQ(TextToSingle(t.platform, std::string(100000, '9')), 1E-5F);
    EXPECT_EQ(TextToSingle(t.platform, "1e-50"), 0.0F);
    EXPECT_EQ(t.run.ConversionWarning.ErrorCount, 3);
}

TEST(ValToSingle, ReadsTheLeadingNumberWithoutRegionalSettings) {
    const std::pair<const char*, float> cases[] = {
        {"  1615 198th Street N.E.", 1615198.0F},
        {"12,5", 12.0F},
        {"1D2", 100.0F},
        {"&HFFFF", -1.0F},
        {"&h10000", 65536.0F},
        {"&HFFFFFFFF", -1.0F},
        {"&O19", 1.0F},
        {"1e39", 1E-5F},
        {"&H100000000", 1E-5F},
    };
    for (const auto& [text, expected] : cases) {
        EXPECT_EQ(ValToSingle(Variant::Str(text)), expected) << text;
    }
    EXPECT_EQ(ValToSingle(Variant::I2(7)), 7.0F);
    EXPECT_EQ(ValToSingle(Variant::Bool(true)), -1.0F);
    EXPECT_EQ(ValToSingle(Variant::Null()), 1E-5F);
    EXPECT_EQ(ValToSingle(Variant::R8(1e300)), 1E-5F);
    EXPECT_EQ(ValToSingle(Variant::Array(VT_I2, {Variant::I2(1)})), 1E-5F);
}

}  // namespace
}  // namespace cv
