#include "platform/OleDate.h"

#include <cmath>

#include <gtest/gtest.h>

namespace cv {
namespace {

OleDateParts Parts(int32_t y, int32_t mo, int32_t d, int32_t h = 0, int32_t mi = 0, int32_t s = 0) {
    return {y, mo, d, h, mi, s, 0};
}

TEST(OleDate, MapsDaysAndFractionsBothSidesOfTheEpoch) {
    EXPECT_EQ(OleDateToParts(0.0), Parts(1899, 12, 30));
    EXPECT_EQ(OleDateToParts(36526.0), Parts(2000, 1, 1));
    EXPECT_EQ(OleDateToParts(2.5), Parts(1900, 1, 1, 12));
    EXPECT_EQ(OleDateToParts(-1.25), Parts(1899, 12, 29, 6));
    EXPECT_EQ(OleDateToParts(-0.5), Parts(1899, 12, 30, 12));
    EXPECT_EQ(OleDateFromParts(Parts(1899, 12, 29, 6)), -1.25);
    EXPECT_EQ(OleDateFromParts(Parts(1899, 12, 29, 18)), -1.75);
    EXPECT_EQ(OleDateFromParts(Parts(2000, 1, 1, 6)), 36526.25);
    for (const double date : {45000.123456, -700.9, 1.0 / 3.0, 2958465.5}) {
        EXPECT_NEAR(*OleDateFromParts(*OleDateToParts(date)), date, 1e-8) << date;
    }
}

TEST(OleDate, KeepsToTheLibrarysRange) {
    EXPECT_EQ(OleDateToParts(kOleDateMin), Parts(100, 1, 1));
    EXPECT_EQ(OleDateToParts(kOleDateMax), Parts(9999, 12, 31));
    EXPECT_FALSE(OleDateToParts(kOleDateMax + 1.0));
    EXPECT_FALSE(OleDateToParts(kOleDateMin - 1.0));
    EXPECT_FALSE(OleDateToParts(std::nan("")));
    EXPECT_FALSE(OleDateInRange(1e300));
    EXPECT_FALSE(OleDateFromParts(Parts(2023, 2, 29)));
    EXPECT_TRUE(OleDateFromParts(Parts(2024, 2, 29)));
    EXPECT_FALSE(OleDateFromParts(Parts(2023, 13, 1)));
    EXPECT_FALSE(OleDateFromParts(Parts(2023, 1, 1, 24)));
    EXPECT_FALSE(OleDateFromParts(Parts(99, 1, 1)));
}

}  // namespace
}  // namespace cv
