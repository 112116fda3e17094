#include "stores/InvariantNumber.h"

#include <clocale>
#include <cmath>
#include <limits>
#include <random>

#include <gtest/gtest.h>

namespace cv {
namespace {

constexpr double kMax = std::numeric_limits<double>::max();

TEST(InvariantNumber, WritesFifteenDigitsWithAPeriodAndNoLeadingZero) {
    EXPECT_EQ(InvariantText(-0.25), "-.25");
    EXPECT_EQ(InvariantText(-0.0), "0");
    EXPECT_EQ(InvariantText(0.1 + 0.2), ".3");
    EXPECT_EQ(InvariantText(99999.99999999999), "100000");
    EXPECT_EQ(InvariantText(123456789012345), "123456789012345");
    EXPECT_EQ(InvariantText(1e15), "1E+15");
    EXPECT_EQ(InvariantText(-1234567890123456), "-1.23456789012346E+15");
    EXPECT_EQ(InvariantText(0.0001), ".0001");
    EXPECT_EQ(InvariantText(0.00001), "1E-05");
    EXPECT_EQ(InvariantText(kMax), "1.79769313486232E+308");
    EXPECT_EQ(InvariantText(-std::numeric_limits<double>::infinity()), "-1.79769313486232E+308");
    EXPECT_EQ(InvariantText(std::numeric_limits<double>::denorm_min()), "4.94065645841247E-324");
    EXPECT_EQ(InvariantText(std::nan("")), "NaN");
    EXPECT_EQ(InvariantText(1234567890123.125), "1234567890123.13");  // ties away from zero
}

TEST(InvariantNumber, ReadsTheLongestNumericPrefixAndStaysFinite) {
    EXPECT_EQ(InvariantNumber(" 12.5abc"), 12.5);
    EXPECT_EQ(InvariantNumber("  -.5"), -0.5);
    EXPECT_EQ(InvariantNumber("1.5E-07x"), 1.5e-7);
    EXPECT_EQ(InvariantNumber("2E"), 2);
    EXPECT_EQ(InvariantNumber("2e-x"), 2);
    EXPECT_EQ(InvariantNumber("1,5"), 1);
    EXPECT_EQ(InvariantNumber("0x10"), 0);
    for (const char* none : {"", "abc", ".", "-", "+.", " e5", "NaN", "inf", "\n5", "--1"}) {
        EXPECT_EQ(InvariantNumber(none), 0) << none;
    }
    EXPECT_FALSE(std::signbit(InvariantNumber("-0.0")));
    // Beyond the double range the number stays finite.
    EXPECT_EQ(InvariantNumber("1e400"), kMax);
    EXPECT_EQ(InvariantNumber("-123456e99999999999999999999"), -kMax);
    EXPECT_EQ(InvariantNumber("1.79769313486232E+308"), kMax);
    EXPECT_EQ(InvariantNumber("1e-400"), 0);
    EXPECT_EQ(InvariantNumber("-0.0001e-99999999999999999"), 0);
    EXPECT_EQ(InvariantNumber("4.94065645841247E-324"), std::numeric_limits<double>::denorm_min());
    const std::string longFraction = "." + std::string(100000, '0') + "1e100010";
    EXPECT_DOUBLE_EQ(InvariantNumber(longFraction), 1e9);
}

TEST(InvariantNumber, TextReadsBackAsTheSameNumber) {
    std::mt19937_64 random(20240229);
    std::uniform_real_distribution<double> mantissa(-10, 10);
    std::uniform_int_distribution<int> exponent(-330, 310);
    for (int i = 0; i < 20000; ++i) {
        const double value = mantissa(random) * std::pow(10.0, exponent(random));
        if (!std::isfinite(value)) {
            continue;
        }
        const std::string text = InvariantText(value);
        const double back = InvariantNumber(text);
        ASSERT_EQ(InvariantText(back), text) << value;
        if (std::fabs(value) >= std::numeric_limits<double>::min()) {
            ASSERT_LE(std::fabs(back - value), std::fabs(value) * 1e-14) << text;
        }
    }
}

TEST(InvariantNumber, IgnoresTheProcessLocale) {
    const std::string previous = std::setlocale(LC_ALL, nullptr);
    if (std::setlocale(LC_ALL, "de_DE.UTF-8") == nullptr &&
        std::setlocale(LC_ALL, "fr_FR.UTF-8") == nullptr) {
        GTEST_SKIP() << "no locale with a decimal comma installed";
    }
    EXPECT_EQ(InvariantText(1234.5), "1234.5");
    EXPECT_EQ(InvariantNumber("1234.5"), 1234.5);
    EXPECT_EQ(InvariantNumber("1234,5"), 1234);
    std::setlocale(LC_ALL, previous.c_str());
}

TEST(InvariantNumber, RoundsToInt32TiesToEvenAndSaturates) {
    EXPECT_EQ(InvariantInt32("-3.5"), -4);
    EXPECT_EQ(InvariantInt32("0.5"), 0);
    EXPECT_EQ(InvariantInt32("2.5000001"), 3);
    EXPECT_EQ(InvariantInt32("2147483647.5"), 2147483647);
    EXPECT_EQ(InvariantInt32("-2147483648.5"), -2147483647 - 1);
    EXPECT_EQ(InvariantInt32("3e9"), 2147483647);
    EXPECT_EQ(InvariantInt32("-1e400"), -2147483647 - 1);
    EXPECT_EQ(InvariantInt32("4503599627370497"), 2147483647);
}

}  // namespace
}  // namespace cv
