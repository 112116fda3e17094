#include "platform/posix/FileRegistry.h"

#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include <gtest/gtest.h>

#include "platform/posix/RegistryFile.h"
#include "support/TempFolder.h"
#include "support/TestFiles.h"

namespace cv::posix {
namespace {

using namespace platform;
using namespace std::string_literals;
using test::ModeOf;
using test::Slurp;

int Entries(const std::string& sFolder) {
    const std::filesystem::directory_iterator all(sFolder);
    return static_cast<int>(std::distance(begin(all), end(all)));
}

// Creates the key and sets one value, as the settings store does.
int32_t Put(FileRegistry& cRegistry, int32_t lRoot, const std::string& sPath,
            const std::string& sName, int32_t lType, const std::string& sData) {
    RegistryApi::Key key = 0;
    int32_t result = cRegistry.CreateKey(lRoot, sPath, kKeyAllAccess, key);
    if (result == kErrorSuccess) {
        result = cRegistry.SetValue(key, sName, lType, sData);
        cRegistry.CloseKey(key);
    }
    return result;
}

// The value's data, or the error code as text.
std::string Get(FileRegistry& cRegistry, int32_t lRoot, const std::string& sPath,
                const std::string& sName) {
    RegistryApi::Key key = 0;
    int32_t result = cRegistry.OpenKey(lRoot, sPath, kKeyRead, key);
    int32_t type = 0;
    int32_t size = 1000;
    std::string data;
    if (result == kErrorSuccess) {
        result = cRegistry.QueryValue(key, sName, type, data, size);
        cRegistry.CloseKey(key);
    }
    return result == kErrorSuccess ? data : "error " + std::to_string(result);
}

TEST(FileRegistry, StoresTypedValuesUnderKeysMatchedWithoutCase) {
    test::TempFolder folder;
    FileRegistry registry(folder.Path());
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "Software\\App", "v"), "error 2");
    ASSERT_EQ(Put(registry, kHkeyCurrentUser, "Software\\App\\Deep", "Name", kRegSz, "x\0"s), 0);
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "SOFTWARE\\app\\deep", "NAME"), "x\0"s);
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "Software\\App\\Deeper", "Name"), "error 2");
    EXPECT_EQ(Get(registry, kHkeyLocalMachine, "Software\\App\\Deep", "Name"), "error 2");

    RegistryApi::Key key = 0;
    ASSERT_EQ(registry.OpenKey(kHkeyCurrentUser, "software\\APP", kKeyRead, key), 0);
    int32_t type = 0;
    std::string data = "untouched";
    int32_t size = 1;
    EXPECT_EQ(registry.QueryValue(key, "missing", type, data, size), kErrorFileNotFound);
    RegistryApi::Key deep = 0;
    ASSERT_EQ(registry.CreateKey(key, "DEEP", kKeyAllAccess, deep), 0);
    EXPECT_EQ(registry.QueryValue(deep, "name", type, data, size), kErrorMoreData);
    EXPECT_EQ(type, kRegSz);
    EXPECT_EQ(size, 2);
    EXPECT_EQ(data, "untouched");
    EXPECT_EQ(registry.SetValue(key, "n", kRegDword, "1234"), kErrorAccessDenied)
        << "opened for reading only";
    EXPECT_EQ(registry.CloseKey(key), 0);
    EXPECT_EQ(registry.CloseKey(key), kErrorInvalidHandle);
    EXPECT_EQ(registry.QueryValue(key, "name", type, data, size), kErrorInvalidHandle);
    EXPECT_EQ(registry.CloseKey(deep), 0);
    EXPECT_EQ(registry.CloseKey(kHkeyCurrentUser), 0);

    const std::string file = Slurp(folder.File(FileRegistry::kCurrentUserFile));
    EXPECT_NE(file.find("[Software\\App\\Deep]\n\"Name\"=\"x\"\n"), std::string::npos) << file;
}

TEST(FileRegistry, EnumeratesSubKeysInSortedOrderWithTheirFirstCase) {
    test::TempFolder folder;
    FileRegistry registry(folder.Path());
    const std::string longName(255, 'l');
    for (const std::string& name : {"zeta"s, "Alpha"s, "ALPHA\\x"s, "beta"s, longName}) {
        ASSERT_EQ(Put(registry, kHkeyCurrentUser, "List\\" + name, "v", kRegSz, "\0"s), 0);
    }
    RegistryApi::Key list = 0;
    ASSERT_EQ(registry.OpenKey(kHkeyCurrentUser, "list", kKeyRead, list), 0);
    std::string name;
    EXPECT_EQ(registry.EnumKey(list, 2, name, 255), kErrorMoreData) << "no room for the nul";
    const std::tuple<int32_t, int32_t, std::string> rows[] = {{0, 0, "Alpha"},
                                                              {1, 0, "beta"},
                                                              {2, 0, longName},
                                                              {3, 0, "zeta"},
                                                              {4, kErrorNoMoreItems, "zeta"},
                                                              {-1, kErrorNoMoreItems, "zeta"}};
    for (const auto& [index, result, expected] : rows) {
        EXPECT_EQ(registry.EnumKey(list, index, name, 256), result) << index;
        EXPECT_EQ(name, expected) << index;
    }
    EXPECT_EQ(registry.EnumKey(kHkeyCurrentUser, 0, name, 255), 0);
    EXPECT_EQ(name, "List");
    registry.CloseKey(list);
}

TEST(FileRegistry, MachineSettingsAreReadOnlyUnlessAllowed) {
    test::TempFolder folder;
    {
        FileRegistry admin(folder.Path(), FileRegistry::MachineAccess::ReadWrite);
        ASSERT_EQ(Put(admin, kHkeyLocalMachine, "Software\\Shared", "Path", kRegSz, "/x\0"s), 0);
    }
    FileRegistry user(folder.Path());
    EXPECT_EQ(Get(user, kHkeyLocalMachine, "Software\\Shared", "Path"), "/x\0"s);
    RegistryApi::Key key = 0;
    EXPECT_EQ(user.OpenKey(kHkeyLocalMachine, "Software\\Shared", kKeyAllAccess, key),
              kErrorAccessDenied);
    EXPECT_EQ(user.CreateKey(kHkeyLocalMachine, "Software\\Shared", kKeyAllAccess, key),
              kErrorAccessDenied);
    EXPECT_EQ(user.CreateKey(kHkeyLocalMachine, "Software\\New", kKeyRead, key),
              kErrorAccessDenied);
    EXPECT_EQ(user.SetValue(kHkeyLocalMachine, "v", kRegSz, "\0"s), kErrorAccessDenied);
    ASSERT_EQ(user.CreateKey(kHkeyLocalMachine, "Software\\Shared", kKeyRead, key), 0);
    user.CloseKey(key);
    EXPECT_EQ(user.OpenKey(static_cast<int32_t>(0x80000000u), "", kKeyRead, key),
              kErrorInvalidHandle);
    EXPECT_EQ(user.CreateKey(kHkeyCurrentUser, std::string(256, 'n'), kKeyAllAccess, key),
              kErrorInvalidParameter);
}

TEST(FileRegistry, CreatesPrivateFilesOnlyWhenWritingAndOnlyOnChange) {
    test::TempFolder folder;
    const std::string settings = folder.File("config/cvopctestclient");
    FileRegistry registry(settings);
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "A", "v"), "error 2");
    EXPECT_FALSE(std::filesystem::exists(folder.File("config")));

    ASSERT_EQ(Put(registry, kHkeyCurrentUser, "A", "v", kRegDword, "\1\0\0\0"s), 0);
    const std::string file = settings + "/" + FileRegistry::kCurrentUserFile;
    EXPECT_EQ(ModeOf(file), 0600u);
    EXPECT_EQ(Entries(settings), 1);

    const ino_t before = test::InodeOf(file);
    ASSERT_EQ(Put(registry, kHkeyCurrentUser, "a", "V", kRegDword, "\1\0\0\0"s), 0);
    EXPECT_EQ(test::InodeOf(file), before) << "an unchanged value is not written again";
}

// Two writers in one process; RegistryCrash runs them in two.
TEST(FileRegistry, AnOpenHandleWritesOverWhatOthersStoredMeanwhile) {
    test::TempFolder folder;
    FileRegistry first(folder.Path());
    FileRegistry second(folder.Path());
    RegistryApi::Key held = 0;
    ASSERT_EQ(first.CreateKey(kHkeyCurrentUser, "Shared", kKeyAllAccess, held), 0);
    ASSERT_EQ(Put(second, kHkeyCurrentUser, "Shared", "two", kRegSz, "2\0"s), 0);
    ASSERT_EQ(first.SetValue(held, "three", kRegSz, "3\0"s), 0);
    EXPECT_EQ(Get(second, kHkeyCurrentUser, "Shared", "two"), "2\0"s);
    EXPECT_EQ(Get(second, kHkeyCurrentUser, "Shared", "three"), "3\0"s);
    // A key removed by someone else is made again by a write through an old handle.
    std::filesystem::remove(folder.File(FileRegistry::kCurrentUserFile));
    EXPECT_EQ(Get(first, kHkeyCurrentUser, "Shared", "two"), "error 2");
    ASSERT_EQ(first.SetValue(held, "four", kRegSz, "4\0"s), 0);
    EXPECT_EQ(Get(second, kHkeyCurrentUser, "Shared", "four"), "4\0"s);
    first.CloseKey(held);
}

TEST(FileRegistry, KeepsWhatItCanOfADamagedFileAndSetsTheFileAside) {
    test::TempFolder folder;
    const std::string file = folder.File(FileRegistry::kCurrentUserFile);
    const std::string damaged = std::string(RegistryFile::kFirstLine) +
                                "\n[Good]\n\"kept\"=\"yes\"\n[Bad\n\"lost\"=\"no\"\n";
    test::Spill(file, damaged);
    FileRegistry registry(folder.Path());
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "Good", "kept"), "yes\0"s);
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "Good", "kept"), "yes\0"s);
    EXPECT_EQ(Entries(folder.Path()), 1) << "reading sets nothing aside";

    ASSERT_EQ(Put(registry, kHkeyCurrentUser, "Good", "new", kRegSz, "1\0"s), 0);
    EXPECT_EQ(Entries(folder.Path()), 2);
    for (const auto& entry : std::filesystem::directory_iterator(folder.Path())) {
        if (entry.path() != file) {
            EXPECT_EQ(entry.path().string().rfind(file + ".damaged-", 0), 0u);
            EXPECT_EQ(Slurp(entry.path()), damaged);
        }
    }
    bool stillDamaged = true;
    RegistryFile::Parse(Slurp(file), stillDamaged);
    EXPECT_FALSE(stillDamaged);
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "Good", "kept"), "yes\0"s);
    ASSERT_EQ(Put(registry, kHkeyCurrentUser, "Good", "newer", kRegSz, "2\0"s), 0);
    EXPECT_EQ(Entries(folder.Path()), 2) << "a clean file is not set aside";
}

TEST(FileRegistry, NeverReplacesAFileItCannotRead) {
    if (::geteuid() == 0) {
        GTEST_SKIP() << "permissions do not bind root";
    }
    test::TempFolder folder;
    const std::string file = folder.File(FileRegistry::kCurrentUserFile);
    test::Spill(file, std::string(RegistryFile::kFirstLine) + "\n[A]\n\"v\"=\"1\"\n");
    ::chmod(file.c_str(), 0);
    FileRegistry registry(folder.Path());
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "A", "v"), "error 2");
    EXPECT_EQ(Put(registry, kHkeyCurrentUser, "A", "w", kRegSz, "2\0"s), kErrorAccessDenied);
    ::chmod(file.c_str(), 0600);
    EXPECT_EQ(Get(registry, kHkeyCurrentUser, "A", "v"), "1\0"s);
}

}  // namespace
}  // namespace cv::posix
