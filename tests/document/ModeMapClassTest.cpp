#include "document/ModeMapClass.h"

#include <gtest/gtest.h>

namespace cv {
namespace {

TEST(ModeMapClass, KeysAreStrippedAndKeysAndValuesStayUnique) {
    EXPECT_EQ(ModeMapClass::StripDDETerminators("MAN\tUAL"), "MANUAL");
    EXPECT_EQ(ModeMapClass::StripDDETerminators(" A\r B \n"), "A B");
    EXPECT_EQ(ModeMapClass::StripDDETerminators("  cas  cade \x01 "), "cas  cade \x01");
    EXPECT_EQ(ModeMapClass::StripDDETerminators("\r\n\t"), "");

    ModeMapClass map;
    map.AddModeMapItem("AUTO\r\n", "Auto");
    map.AddModeMapItem("AUTO", "Other");
    map.AddModeMapItem("AUT", "Auto");
    map.AddModeMapItem2("MAN", "Manual", 7);
    ASSERT_EQ(map.GetModeMapSize(), 2);
    EXPECT_TRUE(map.KeyExists("AUTO"));
    EXPECT_FALSE(map.KeyExists("AUTO\r\n"));
    EXPECT_EQ(map.GetModeMapValidity("MAN\n"), 7);
    EXPECT_EQ(map.GetModeMapValidity("AUTO"), 0);
    map.ReInitializeModeMap();
    EXPECT_EQ(map.GetModeMapSize(), 0);
}

TEST(ModeMapClass, LookupsAndUpdates) {
    ModeMapClass map;
    map.AddModeMapItem("AUTO", "Auto");
    map.AddModeMapItem("MANUAL", "Manual");
    map.AddModeMapItem("MAN", "Man short");
    EXPECT_EQ(map.GetModeMapValue(" AUTO\r\n"), "Auto");
    EXPECT_EQ(map.GetModeMapValue("auto"), "unknown");
    EXPECT_EQ(map.GetModeMapKey("MANUAL"), "MANUAL");
    EXPECT_EQ(map.GetModeMapKey("nothing"), "unknown");
    EXPECT_EQ(map.GetModeMapValueFromLeftKeySubString("man"), "Manual");  // the first that fits
    EXPECT_EQ(map.GetModeMapValueFromLeftKeySubString("MANUALLY"), "unknown");
    EXPECT_EQ(map.GetModeMapValueFromLeftKeySubString(""), "Auto");
    EXPECT_EQ(map.GetModeMapKeyByPos(0) + map.GetModeMapValueByPos(4), "unknownunknown");

    map.UpdateModeMapKey("A\r\n", "Auto");
    map.UpdateModeMapKey("X", "auto");
    EXPECT_EQ(map.GetModeMapKeyByPos(1), "A");
    map.UpdateModeMapValue("MAN\r\n", "Hand");
    map.UpdateModeMapValue("NONE", "Cascade");
    EXPECT_EQ(map.GetModeMapValue("MAN"), "Hand");
    EXPECT_EQ(map.GetModeMapSize(), 3);
}

}  // namespace
}  // namespace cv
