#include "platform/RegionalNumber.h"

#include <gtest/gtest.h>

#include "platform/fake/FixedLocale.h"

namespace cv {
namespace {

const fake::FixedLocale kPoint = fake::FixedLocale::Point();
const fake::FixedLocale kComma = fake::FixedLocale::Comma();

double ReadDouble(const std::string& text, const platform::Locale& locale = kPoint) {
    double value = -999;
    EXPECT_FALSE(RegionalNumber::ReadDouble(text, locale, value)) << text;
    return value;
}

int32_t ErrorOf(const std::string& text, const platform::Locale& locale = kPoint) {
    double value = 0;
    return RegionalNumber::ReadDouble(text, locale, value).Number;
}

TEST(RegionalNumber, ReadsSignsBlanksGroupsAndExponentsWithTheRegionalSeparators) {
    EXPECT_EQ(ReadDouble("7.5"), 7.5);
    EXPECT_EQ(ReadDouble(" \t-1,234.5 "), -1234.5);
    EXPECT_EQ(ReadDouble("1,234,567"), 1234567);
    EXPECT_EQ(ReadDouble("(12)"), -12);
    EXPECT_EQ(ReadDouble("5-"), -5);
    EXPECT_EQ(ReadDouble("+3e2"), 300);
    EXPECT_EQ(ReadDouble("1.5E-3"), 0.0015);
    EXPECT_EQ(ReadDouble(".5"), 0.5);
    EXPECT_EQ(ReadDouble("5."), 5);
    EXPECT_EQ(ReadDouble("-0"), 0);
    EXPECT_EQ(ReadDouble("007"), 7);
    EXPECT_EQ(ReadDouble("7,5", kComma), 7.5);
    EXPECT_EQ(ReadDouble("1.234,5", kComma), 1234.5);
    EXPECT_EQ(ReadDouble("1.234", kComma), 1234);
}

TEST(RegionalNumber, RejectsTextThatIsNotWhollyANumber) {
    for (const char* text : {"12,5", "1,23", "1234,567", "12,", "", "  ", "abc", "1e", "1e+", "(5",
                             "5)", "--5", "1.2.3", "5 5", ".", "-", "7 kPa"}) {
        EXPECT_EQ(ErrorOf(text), kErrTypeMismatch) << text;
    }
    EXPECT_EQ(ErrorOf("7.5", kComma), kErrTypeMismatch);
}

TEST(RegionalNumber, ReadsHexadecimalAndOctalAsBitPatterns) {
    RegionalNumber number;
    int16_t i2 = 0;
    int32_t i4 = 0;
    ASSERT_FALSE(RegionalNumber::Read("&HFFFF", kPoint, number));
    EXPECT_FALSE(number.ToI2(i2));
    EXPECT_EQ(i2, -1);
    EXPECT_FALSE(number.ToI4(i4));
    EXPECT_EQ(i4, 65535);
    ASSERT_FALSE(RegionalNumber::Read("&hffffffff", kPoint, number));
    EXPECT_EQ(number.ToI2(i2).Number, kErrOverflow);
    EXPECT_FALSE(number.ToI4(i4));
    EXPECT_EQ(i4, -1);
    EXPECT_EQ(ReadDouble("&HFFFFFFFF"), -1);
    EXPECT_EQ(ReadDouble("&O17"), 15);
    EXPECT_EQ(ReadDouble(" -&H10 "), -16);
    EXPECT_EQ(ErrorOf("&O8"), kErrTypeMismatch);
    EXPECT_EQ(ErrorOf("&H"), kErrTypeMismatch);
    EXPECT_EQ(ErrorOf("&H1FFFFFFFFFFFFFFFF"), kErrOverflow);
    EXPECT_EQ(ErrorOf("&H100000000"), kErrOverflow);
}

TEST(RegionalNumber, RoundsIntegersHalfToEven) {
    const std::pair<const char*, int32_t> cases[] = {
        {"2.5", 2},  {"3.5", 4}, {"-2.5", -2},  {"2.5000001", 3}, {"0.5", 0},
        {"0.05", 0}, {"1.5", 2}, {"1e3", 1000}, {"25e-1", 2},     {"-32768.5", -32768}};
    for (const auto& [text, expected] : cases) {
        RegionalNumber number;
        int16_t value = 0;
        ASSERT_FALSE(RegionalNumber::Read(text, kPoint, number));
        EXPECT_FALSE(number.ToI2(value)) << text;
        EXPECT_EQ(value, expected) << text;
    }
    RegionalNumber number;
    int16_t i2 = 0;
    int32_t i4 = 0;
    ASSERT_FALSE(RegionalNumber::Read("32767.5", kPoint, number));
    EXPECT_EQ(number.ToI2(i2).Number, kErrOverflow);
    ASSERT_FALSE(RegionalNumber::Read("1e30", kPoint, number));
    EXPECT_EQ(number.ToI4(i4).Number, kErrOverflow);
}

TEST(RegionalNumber, HandlesHugeAndTinyNumbersWithoutHanging) {
    float single = -1;
    EXPECT_EQ(RegionalNumber::ReadSingle("1e39", kPoint, single).Number, kErrOverflow);
    EXPECT_FALSE(RegionalNumber::ReadSingle("1e-50", kPoint, single));
    EXPECT_EQ(single, 0.0F);
    EXPECT_FALSE(RegionalNumber::ReadSingle("3.4028235E+38", kPoint, single));
    EXPECT_EQ(single, 3.4028235E+38F);
    EXPECT_EQ(ReadDouble("1e39"), 1e39);
    EXPECT_EQ(ReadDouble("1e-400"), 0);
    EXPECT_EQ(ReadDouble("0e999999999999"), 0);
    EXPECT_EQ(ErrorOf("1e400"), kErrOverflow);
    EXPECT_EQ(ErrorOf("1e999999999999999999999"), kErrOverflow);
    EXPECT_EQ(ErrorOf(std::string(5000, '9')), kErrOverflow);
}

}  // namespace
}  // namespace cv
