#include <gtest/gtest.h>

#include <optional>
#include <string>

#include "itemtest/IsoTimeText.h"
#include "platform/OleDate.h"

namespace cv {
namespace {

double Date(int32_t month, int32_t millisecond) {
    return OleDateFromParts({2025, month, 1, 8, 0, 1, millisecond}).value_or(0);
}

TEST(IsoTimeText, MillisecondsAndTheZone) {
    struct Case {
        double date;
        std::optional<int32_t> offset;
        std::string text;
    };
    const Case cases[] = {
        {Date(1, 250), 60, "2025-01-01T08:00:01.250+01:00"},
        {Date(1, 0), 0, "2025-01-01T08:00:01.000Z"},
        {Date(7, 999), -330, "2025-07-01T08:00:01.999-05:30"},
        {Date(7, 5), std::nullopt, "2025-07-01T08:00:01.005"},
        {kOleDateMax + 2, 0, ""},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(IsoTimeText(c.date, c.offset), c.text) << c.text;
    }
}

}  // namespace
}  // namespace cv
