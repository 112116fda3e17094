#include <gtest/gtest.h>

#include "ua/types/PlainText.h"

namespace cv::ua {
namespace {

struct Case {
    const char* name;
    std::string text;
    std::string oneLine;
    std::string lines;
};

TEST(PlainText, KeepsWhatIsPrintableAndDropsEveryControl) {
    const std::vector<Case> cases = {
        {"plain text and UTF-8 stay", "Pump 1 \xc3\xa9t\xc3\xa9 \xe2\x82\xac \xf0\x9f\x94\xa7",
         "Pump 1 \xc3\xa9t\xc3\xa9 \xe2\x82\xac \xf0\x9f\x94\xa7",
         "Pump 1 \xc3\xa9t\xc3\xa9 \xe2\x82\xac \xf0\x9f\x94\xa7"},
        {"title, clear screen and a fake value line",
         "late\x1b]0;owned\x07\x1b[2J\n12:00:00\t42.5\tgood", "late]0;owned[2J 12:00:00 42.5 good",
         "late]0;owned[2J\n12:00:00\t42.5\tgood"},
        {"carriage return, vertical tab, form feed", "a\rb\vc\fd", "a b c d", "a b c d"},
        {"NUL, BEL, backspace, DEL", std::string("a\0b\a\bc\x7f", 7), "abc", "abc"},
        {"C1 controls as UTF-8 (CSI, NEL)",
         "a\xc2\x9b"
         "31mb\xc2\x85"
         "c",
         "a31mb c", "a31mb c"},
        {"C1 controls as raw bytes",
         "a\x9b"
         "31m\x84",
         "a?31m?", "a?31m?"},
        {"bidirectional overrides, isolates and marks",
         "exe.\xe2\x80\xae"
         "fdp\xe2\x80\xac \xe2\x81\xa6x\xe2\x81\xa9 \xe2\x80\x8fy\xd8\x9c",
         "exe.fdp x y", "exe.fdp x y"},
        {"line and paragraph separators",
         "a\xe2\x80\xa8"
         "b\xe2\x80\xa9"
         "c",
         "a b c", "a b c"},
        {"malformed UTF-8: overlong, surrogate, cut short, past U+10FFFF",
         "\xc0\xaf|\xed\xa0\x80|\xe2\x82|\xf4\x90\x80\x80", "??|???|??|????", "??|???|??|????"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        EXPECT_EQ(PlainText(c.text), c.oneLine);
        EXPECT_EQ(PlainText(c.text, TextLines::Many), c.lines);
    }
}

}  // namespace
}  // namespace cv::ua
