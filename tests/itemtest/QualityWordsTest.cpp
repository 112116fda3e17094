#include <gtest/gtest.h>

#include <string>

#include "itemtest/QualityWords.h"

namespace cv {
namespace {

TEST(QualityWords, NamesEveryQualityItsReasonAndItsLimit) {
    struct Case {
        int32_t quality;
        const char* words;
    };
    const Case cases[] = {
        {0xC0, "good"},
        {0xD8, "good, local override"},
        {0xC1, "good, low limited"},
        {0x40, "uncertain"},
        {0x44, "uncertain, last usable value"},
        {0x50, "uncertain, sensor not accurate"},
        {0x54, "uncertain, engineering units exceeded"},
        {0x5A, "uncertain, sub-normal, high limited"},
        {0x00, "bad"},
        {0x04, "bad, configuration error"},
        {0x08, "bad, not connected"},
        {0x0C, "bad, device failure"},
        {0x10, "bad, sensor failure"},
        {0x14, "bad, last known value"},
        {0x18, "bad, communication failure"},
        {0x1F, "bad, out of service, constant"},
        {0x24, "bad, sub-status 9"},
        {0x80, "not a quality"},
        {0x8C0, "good"},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(QualityWords(c.quality), c.words) << std::hex << c.quality;
    }
}

// A server's text is not trusted: only the name at its head, printable, short.
TEST(QualityWords, AStatusIsNamedByTheHeadOfTheServersText) {
    struct Case {
        std::string text;
        std::string name;
    };
    const Case cases[] = {
        {"Uncertain_SensorNotAccurate: The sensor reading is not accurate.",
         "Uncertain_SensorNotAccurate"},
        {"Bad value: no name", "Bad value: no name"},
        {"Bad_\x1b[31mRed\r\n: x", "Bad_[31mRed: x"},
        {std::string(200, 'N'), std::string(80, 'N')},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(StatusNameOf(c.text), c.name) << c.text;
    }
}

}  // namespace
}  // namespace cv
