#include "stores/RegClass.h"

#include <set>

#include <gtest/gtest.h>

#include "platform/posix/FileRegistry.h"
#include "support/TempFolder.h"

namespace cv {
namespace {

using namespace platform;
using namespace std::string_literals;

constexpr const char* kSection = "Software\\Corvalent\\TestClient";

// The registry in a temporary folder, counting the keys left open.
class WatchedRegistry : public posix::FileRegistry {
  public:
    using FileRegistry::FileRegistry;

    int32_t OpenKey(Key hKey, const std::string& sSubKey, int32_t lAccess, Key& hResult) override {
        const int32_t result = FileRegistry::OpenKey(hKey, sSubKey, lAccess, hResult);
        return Opened(result, hResult);
    }
    int32_t CreateKey(Key hKey, const std::string& sSubKey, int32_t lAccess,
                      Key& hResult) override {
        const int32_t result = FileRegistry::CreateKey(hKey, sSubKey, lAccess, hResult);
        return Opened(result, hResult);
    }
    int32_t CloseKey(Key hKey) override {
        mvOpen.erase(hKey);
        return FileRegistry::CloseKey(hKey);
    }

    // The value as stored: type and bytes, or "missing".
    std::string Raw(int32_t lRoot, const std::string& sPath, const std::string& sName) {
        Key key = 0;
        int32_t type = 0;
        int32_t size = 1 << 20;
        std::string data;
        if (FileRegistry::OpenKey(lRoot, sPath, kKeyRead, key) != 0) {
            return "missing";
        }
        const int32_t result = QueryValue(key, sName, type, data, size);
        FileRegistry::CloseKey(key);
        return result == 0 ? std::to_string(type) + ":" + data : "missing";
    }

    size_t OpenKeys() const { return mvOpen.size(); }

  private:
    int32_t Opened(int32_t lResult, Key hKey) {
        if (lResult == 0) {
            mvOpen.insert(hKey);
        }
        return lResult;
    }

    std::set<Key> mvOpen;
};

class RegClassTest : public ::testing::Test {
  protected:
    RegClassTest() { mcStore.SetMainKey(kHkeyCurrentUser); }
    void TearDown() override { EXPECT_EQ(mcRegistry.OpenKeys(), 0u) << "a key was left open"; }

    test::TempFolder mcFolder;
    WatchedRegistry mcRegistry{mcFolder.Path()};
    RegClass mcStore{mcRegistry};
};

TEST_F(RegClassTest, LongsClampOnlyWhenTheRangeIsGiven) {
    EXPECT_EQ(mcStore.WriteLong(kSection, "Neg", -7), 0);
    EXPECT_EQ(mcRegistry.Raw(kHkeyCurrentUser, kSection, "Neg"), "4:\xf9\xff\xff\xff"s);
    EXPECT_EQ(mcStore.ReadLong(kSection, "Neg", 5, 0, 0), -7);
    mcStore.WriteLong(kSection, "Big", 50);
    EXPECT_EQ(mcStore.ReadLong(kSection, "Big", 5, 1, 10), 10);
    EXPECT_EQ(mcStore.ReadLong(kSection, "Neg", 5, 1, 10), 1);
    EXPECT_EQ(mcStore.ErrorReply(), 0);
    EXPECT_EQ(mcStore.ReadLong(kSection, "Missing", 99, 1, 10), 10);
    EXPECT_EQ(mcStore.ErrorReply(), kErrorFileNotFound);
    EXPECT_EQ(mcStore.ReadLong(kSection, "Big", 0, 7, 7), 50) << "min = max means no clamping";
}

TEST_F(RegClassTest, StringsStopAtTheirFirstNulAndFitIn255Bytes) {
    EXPECT_EQ(mcStore.ReadString(kSection, "S", "dflt"), "dflt");
    EXPECT_EQ(mcStore.WriteString(kSection, "S", "text"), 0);
    EXPECT_EQ(mcRegistry.Raw(kHkeyCurrentUser, kSection, "S"), "1:text\0"s);
    mcStore.WriteString(kSection, "Nul", "before\0after"s);
    EXPECT_EQ(mcStore.ReadString(kSection, "Nul", "dflt"), "before");
    mcStore.WriteString(kSection, "Fits", std::string(254, 'f'));
    EXPECT_EQ(mcStore.ReadString(kSection, "Fits", "dflt"), std::string(254, 'f'));
    mcStore.WriteString(kSection, "TooLong", std::string(255, 'f'));
    EXPECT_EQ(mcStore.ReadString(kSection, "TooLong", "dflt"), "dflt");
    EXPECT_EQ(mcStore.ErrorReply(), kErrorMoreData);
    mcStore.WriteString(kSection, "Empty", "");
    EXPECT_EQ(mcStore.ReadString(kSection, "Empty", "dflt"), "");
}

TEST_F(RegClassTest, AValueOfAnotherTypeGivesTheDefaultNotItsBytes) {
    mcStore.WriteLong(kSection, "Long", 0x00343231);
    EXPECT_EQ(mcStore.ReadString(kSection, "Long", "dflt"), "dflt");
    EXPECT_EQ(mcStore.ErrorReply(), kErrorInvalidData);
    mcStore.WriteString(kSection, "Short", "7");
    EXPECT_EQ(mcStore.ReadLong(kSection, "Short", 3, 0, 0), 3);
    EXPECT_EQ(mcStore.ErrorReply(), kErrorInvalidData);
    mcStore.WriteString(kSection, "Text", "12345678");
    EXPECT_EQ(mcStore.ReadLong(kSection, "Text", 3, 0, 0), 3);
    EXPECT_EQ(mcStore.ErrorReply(), kErrorMoreData);
    RegistryApi::Key key = 0;
    mcRegistry.CreateKey(kHkeyCurrentUser, kSection, kKeyAllAccess, key);
    mcRegistry.SetValue(key, "Expand", kRegExpandSz, "%HOME%\0"s);
    mcRegistry.CloseKey(key);
    EXPECT_EQ(mcStore.ReadString(kSection, "Expand", "dflt"), "%HOME%");
}

TEST_F(RegClassTest, BooleansAreTheTexts1And0) {
    EXPECT_EQ(mcStore.WriteBoolean(kSection, "True", true), 0);
    EXPECT_EQ(mcRegistry.Raw(kHkeyCurrentUser, kSection, "True"), "1:1\0"s);
    mcStore.WriteBoolean(kSection, "False", false);
    EXPECT_EQ(mcRegistry.Raw(kHkeyCurrentUser, kSection, "False"), "1:0\0"s);
    mcStore.WriteString(kSection, "Minus", "-1");
    for (const bool dflt : {true, false}) {
        EXPECT_TRUE(mcStore.ReadBoolean(kSection, "True", dflt));
        EXPECT_TRUE(mcStore.ReadBoolean(kSection, "Minus", dflt));
        EXPECT_FALSE(mcStore.ReadBoolean(kSection, "False", dflt));
        EXPECT_EQ(mcStore.ReadBoolean(kSection, "Missing", dflt), dflt);
        for (const char* other : {"true", " 1", "", "2", "1 "}) {
            mcStore.WriteString(kSection, "Other", other);
            EXPECT_EQ(mcStore.ReadBoolean(kSection, "Other", dflt), dflt) << other;
        }
    }
}

TEST_F(RegClassTest, DoublesAreInvariantText) {
    EXPECT_EQ(mcStore.WriteDouble(kSection, "Half", 0.5), 0);
    EXPECT_EQ(mcRegistry.Raw(kHkeyCurrentUser, kSection, "Half"), "1:.5\0"s);
    EXPECT_EQ(mcStore.ReadDouble(kSection, "Half", 1), 0.5);
    EXPECT_EQ(mcStore.ReadDouble(kSection, "Missing", 1.0 / 3), 1.0 / 3);
    mcStore.WriteLong(kSection, "Dword", 5);
    EXPECT_EQ(mcStore.ReadDouble(kSection, "Dword", 2.5), 2.5);
}

TEST_F(RegClassTest, WritesCreateTheWholePathAndHonourTheRootsRights) {
    ASSERT_EQ(mcStore.WriteString("A\\B\\C", "v", "x"), 0);

    RegClass machine(mcRegistry);
    EXPECT_EQ(machine.WriteLong(kSection, "v", 1), kErrorAccessDenied);
    EXPECT_EQ(machine.ErrorReply(), kErrorAccessDenied);
    EXPECT_EQ(machine.ReadString("A\\B\\C", "v", "dflt"), "dflt");
    machine.SetMainKey(kHkeyCurrentUser);
    EXPECT_EQ(machine.ReadString("A\\B\\C", "v", "dflt"), "x");

    // Machine keys are listed without asking for the write access a user lacks.
    {
        posix::FileRegistry admin(mcFolder.Path(), posix::FileRegistry::MachineAccess::ReadWrite);
        ASSERT_EQ(RegClass(admin).WriteString("Software\\Vendor\\Product", "Path", "/opt"), 0);
    }
    machine.SetMainKey(kHkeyLocalMachine);
    machine.SetNumberEnumKeys(1);
    machine.SetEnumKey(1, "Software\\Vendor");
    std::string name;
    EXPECT_TRUE(machine.EnumKey(1, name));
    EXPECT_EQ(name, "Product");
}

TEST_F(RegClassTest, EnumerationSlotsAreIndependentCursors) {
    for (const char* name : {"Zulu", "alpha", "Mike"}) {
        mcStore.WriteLong("List\\"s + name, "v", 1);
    }
    mcStore.SetNumberEnumKeys(2);
    mcStore.SetEnumKey(1, "List");
    mcStore.SetEnumKey(2, "LIST");
    std::string one;
    std::string two;
    EXPECT_TRUE(mcStore.EnumKey(1, one));
    EXPECT_TRUE(mcStore.EnumKey(1, one));
    EXPECT_TRUE(mcStore.EnumKey(2, two));
    EXPECT_EQ(one, "Mike");
    EXPECT_EQ(two, "alpha");
    EXPECT_TRUE(mcStore.EnumKey(1, one));
    EXPECT_EQ(one, "Zulu");
    EXPECT_FALSE(mcStore.EnumKey(1, one));
    EXPECT_EQ(one, "Zulu");
    EXPECT_EQ(mcStore.ErrorReply(), kErrorNoMoreItems);
    mcStore.SetEnumKey(1, "List");
    EXPECT_TRUE(mcStore.EnumKey(1, one));
    EXPECT_EQ(one, "alpha");

    mcStore.SetEnumKey(2, "List\\Nothing here");
    EXPECT_FALSE(mcStore.EnumKey(2, two));
    EXPECT_EQ(mcStore.ErrorReply(), kErrorFileNotFound);
    EXPECT_EQ(two, "alpha");

    mcStore.SetNumberEnumKeys(1);
    mcStore.SetEnumKey(1, "List");
    for (const int32_t wrong : {0, 2, -1, 1 << 30}) {
        mcStore.SetEnumKey(wrong, "List");
        EXPECT_EQ(mcStore.ErrorReply(), kErrorInvalidParameter);
        EXPECT_FALSE(mcStore.EnumKey(wrong, two)) << wrong;
        EXPECT_EQ(mcStore.ErrorReply(), kErrorInvalidParameter);
    }
    EXPECT_TRUE(mcStore.EnumKey(1, one));
    EXPECT_EQ(one, "alpha") << "a wrong index leaves the good slots alone";
    mcStore.SetNumberEnumKeys(-3);
    EXPECT_FALSE(mcStore.EnumKey(1, one));
    mcStore.SetNumberEnumKeys(1 << 30);
    EXPECT_TRUE(mcStore.EnumKey(RegClass::kMaxEnumSlots, one));
    EXPECT_EQ(one, "List");
}

}  // namespace
}  // namespace cv
