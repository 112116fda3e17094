#include <gtest/gtest.h>

#include "util/PathText.h"

namespace cv {
namespace {

TEST(PathText, FindsTheFolderOfAPathAndTheLastPositionOfACharacter) {
    EXPECT_EQ(FolderOfPath("C:loop.tun"), "C:");
    EXPECT_EQ(FolderOfPath("loop.tun"), "");
    EXPECT_EQ(FolderOfPath("C:\\a/b"), "C:\\a/");
    std::string folder = "old";
    std::string name = "old";
    SplitPath("C:\\data\\ loop.tun ", folder, name);
    EXPECT_EQ(folder + "|" + name, "C:\\data\\|loop.tun");
    SplitPath("loop.tun", folder, name);
    EXPECT_EQ(folder + "|" + name, "|loop.tun");

    EXPECT_EQ(LastPosOf("a.b.c", ".xyz"), 4);
    EXPECT_EQ(LastPosOf("abc", "x"), 0);
    EXPECT_EQ(LastPosOf("a.b", ""), 0);
    EXPECT_EQ(LastPosOf(std::string(40000, '.'), "."), 0);
}

TEST(PathText, SplitsApplicationAndTopicAndRemovesTheSecondDot) {
    std::string app = "old";
    std::string topic = "old";
    SplitAppTopic(" Excel | Sheet1 ", app, topic);
    EXPECT_EQ(app + "/" + topic, "Excel / Sheet1");
    SplitAppTopic("A|B|C", app, topic);
    EXPECT_EQ(app + "/" + topic, "A/B|C");

    EXPECT_EQ(RemoveSecondDot("12.07.9", true), "12.0709");
    EXPECT_EQ(RemoveSecondDot("12.07.9", false), "12.079");
    EXPECT_EQ(RemoveSecondDot("12.07", true), "12.07");
    EXPECT_EQ(RemoveSecondDot(" 1.2 ", true), "1.2");
    EXPECT_EQ(RemoveSecondDot("1.2.3.4", true), "1.23.4");
}

}  // namespace
}  // namespace cv
