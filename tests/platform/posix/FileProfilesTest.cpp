#include "platform/posix/FileProfiles.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>

#include "platform/posix/ProfilePath.h"

namespace cv::posix {
namespace {

using namespace std::string_literals;
namespace fs = std::filesystem;

std::string Slurp(const std::string& sPath) {
    std::ifstream file(sPath, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

void Put(const std::string& sPath, const std::string& sText) {
    std::ofstream(sPath, std::ios::binary) << sText;
}

int Mode(const std::string& sPath) {
    struct stat info {};
    ::stat(sPath.c_str(), &info);
    return static_cast<int>(info.st_mode & 0777);
}

class FileProfilesTest : public ::testing::Test {
  protected:
    FileProfilesTest() {
        std::string pattern = (fs::temp_directory_path() / "h5-profiles-XXXXXX").string();
        folder_ = ::mkdtemp(pattern.data());
        config_ = folder_ + "/config/cvopctestclient";
    }
    ~FileProfilesTest() override { fs::remove_all(folder_); }

    std::string Read(FileProfiles& cProfiles, const std::string& sFile, const std::string& sKey,
                     const std::string& sSection = "S") {
        return cProfiles.GetPrivateProfileString(sSection, sKey, "none", 255, sFile);
    }

    std::string folder_;
    std::string config_;
};

TEST_F(FileProfilesTest, BareNamesLiveInTheOwnersSettingsFolder) {
    FileProfiles profiles(config_);
    ASSERT_TRUE(
        profiles.WritePrivateProfileString("Faceplate", "WriteDisabled"s, "1"s, "Corvalen.ini"));
    const std::string file = config_ + "/Corvalen.ini";
    EXPECT_EQ(Slurp(file), "[Faceplate]\r\nWriteDisabled=1\r\n");
    EXPECT_EQ(Mode(file), 0600);
    EXPECT_EQ(Mode(config_), 0700);

    EXPECT_TRUE(profiles.WritePrivateProfileString("Faceplate", "Colour"s, "255"s, "CORVALEN.Ini"));
    EXPECT_EQ(Slurp(file), "[Faceplate]\r\nWriteDisabled=1\r\nColour=255\r\n");
    EXPECT_FALSE(fs::exists(config_ + "/CORVALEN.Ini"));

    const mode_t old = ::umask(022);
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "k"s, "v"s, folder_ + "/plain.ini"));
    ::umask(old);
    EXPECT_EQ(Mode(folder_ + "/plain.ini"), 0644);

    EXPECT_EQ(ProfilePath("", config_), "");
    EXPECT_EQ(ProfilePath("tun\\Unit7.tun", config_), "tun/Unit7.tun");
    EXPECT_EQ(ProfilePath("new.ini", config_), config_ + "/new.ini");
    EXPECT_FALSE(profiles.WritePrivateProfileString("S", "k"s, "v"s, ""));
    EXPECT_EQ(Read(profiles, "", "k"), "none");
}

TEST_F(FileProfilesTest, ReadsLikeTheWindowsFunction) {
    const std::string file = folder_ + "/t.ini";
    Put(file, "[S]\nlong=" + std::string(300, 'x') + "\nnul=ab\0cd\nq=\"  7 \"\n"s);
    FileProfiles profiles(config_);
    EXPECT_EQ(Read(profiles, file, "long"), std::string(254, 'x'));
    EXPECT_EQ(profiles.GetPrivateProfileString("S", "long", "", 5, file), "xxxx");
    EXPECT_EQ(profiles.GetPrivateProfileString("S", "long", "", 0, file), "");
    EXPECT_EQ(Read(profiles, file, "nul"), "ab\0cd"s);
    EXPECT_EQ(Read(profiles, file, "q"), "  7 ");
    EXPECT_EQ(profiles.GetPrivateProfileString("S", "q\0junk"s, "", 255, file), "  7 ");
    EXPECT_EQ(profiles.GetPrivateProfileString("S", "missing", " 12  \t", 255, file), " 12");
    EXPECT_EQ(profiles.GetPrivateProfileString("S", "missing", "abcdef", 4, file), "abc");
    EXPECT_EQ(Read(profiles, folder_ + "/absent.ini", "k"), "none");
    EXPECT_FALSE(fs::exists(folder_ + "/absent.ini"));
}

TEST_F(FileProfilesTest, WritesKeepTheFileAndRefuseWhatCannotReadBack) {
    const std::string file = folder_ + "/t.ini";
    Put(file, "; tuning file\n[S]\na=1\n\n[T]\nb=2\n");
    FileProfiles profiles(config_);
    EXPECT_TRUE(profiles.WritePrivateProfileString("s", "c"s, "3"s, file));
    EXPECT_EQ(Slurp(file), "; tuning file\n[S]\na=1\nc=3\n\n[T]\nb=2\n");
    EXPECT_FALSE(profiles.WritePrivateProfileString("S", "a"s, "1\r\n[T]\r\nb=9"s, file));
    EXPECT_FALSE(profiles.WritePrivateProfileString("S", "a=b"s, "1"s, file));
    EXPECT_FALSE(profiles.WritePrivateProfileString("S\n", "a"s, "1"s, file));
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "d"s, "4\0junk"s, file));
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "a"s, std::nullopt, file));
    EXPECT_TRUE(profiles.WritePrivateProfileString("T", std::nullopt, "ignored"s, file));
    EXPECT_EQ(Slurp(file), "; tuning file\n[S]\nc=3\nd=4\n\n");

    struct stat before {};
    ::stat(file.c_str(), &before);
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "c"s, "3"s, file));
    EXPECT_TRUE(profiles.WritePrivateProfileString("Gone", std::nullopt, std::nullopt, file));
    struct stat after {};
    ::stat(file.c_str(), &after);
    EXPECT_EQ(before.st_ino, after.st_ino) << "a write that changes nothing leaves the file";

    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "k"s, std::nullopt, folder_ + "/new.ini"));
    EXPECT_FALSE(fs::exists(folder_ + "/new.ini"));
    EXPECT_FALSE(profiles.WritePrivateProfileString("S", "k"s, "v"s, folder_ + "/no/such.ini"));
}

TEST_F(FileProfilesTest, SeesEveryChangeToTheFileAtOnce) {
    const std::string file = folder_ + "/t.ini";
    FileProfiles first(config_);
    FileProfiles second(config_);
    EXPECT_EQ(Read(first, file, "k"), "none");
    ASSERT_TRUE(second.WritePrivateProfileString("S", "k"s, "1"s, file));
    EXPECT_EQ(Read(first, file, "k"), "1");
    ASSERT_TRUE(first.WritePrivateProfileString("S", "k"s, "2"s, file));
    EXPECT_EQ(Read(second, file, "k"), "2");

    Put(file, "[S]\nk=edited by hand\n");
    EXPECT_EQ(Read(first, file, "k"), "edited by hand");

    const pid_t child = ::fork();
    if (child == 0) {
        FileProfiles other(config_);
        ::_exit(other.WritePrivateProfileString("S", "k"s, "from child"s, file) ? 0 : 1);
    }
    int status = -1;
    ::waitpid(child, &status, 0);
    ASSERT_EQ(status, 0);
    EXPECT_EQ(Read(first, file, "k"), "from child");
}

TEST_F(FileProfilesTest, ProcessesWritingOneFileKeepEachOthersValues) {
    const std::string file = folder_ + "/shared.ini";
    constexpr int kWriters = 4;
    constexpr int kKeys = 25;
    for (int writer = 0; writer < kWriters; ++writer) {
        if (::fork() == 0) {
            FileProfiles profiles(config_);
            bool ok = true;
            for (int key = 0; key < kKeys; ++key) {
                ok = profiles.WritePrivateProfileString(
                         "W" + std::to_string(key % 3),
                         std::to_string(writer) + "_" + std::to_string(key), "v"s, file) &&
                     ok;
            }
            ::_exit(ok ? 0 : 1);
        }
    }
    for (int writer = 0; writer < kWriters; ++writer) {
        int status = -1;
        ::wait(&status);
        EXPECT_EQ(status, 0);
    }
    FileProfiles profiles(config_);
    for (int writer = 0; writer < kWriters; ++writer) {
        for (int key = 0; key < kKeys; ++key) {
            EXPECT_EQ(Read(profiles, file, std::to_string(writer) + "_" + std::to_string(key),
                           "W" + std::to_string(key % 3)),
                      "v");
        }
    }
}

TEST_F(FileProfilesTest, BatchesStoreOnceAtTheEndAndKeepOthersWrites) {
    const std::string file = folder_ + "/t.ini";
    FileProfiles mine(config_);
    FileProfiles other(config_);
    mine.BeginBatch(file);
    mine.BeginBatch(file);
    EXPECT_TRUE(mine.WritePrivateProfileString("S", "a"s, "1"s, file));
    EXPECT_TRUE(mine.WritePrivateProfileString("S", "b"s, "2"s, file));
    EXPECT_TRUE(mine.WritePrivateProfileString("S", "b"s, std::nullopt, file));
    EXPECT_EQ(Read(mine, file, "a"), "1");
    EXPECT_EQ(Read(mine, file, "b"), "none");
    EXPECT_FALSE(fs::exists(file));

    EXPECT_TRUE(other.WritePrivateProfileString("S", "c"s, "3"s, file));
    EXPECT_EQ(Read(mine, file, "c"), "3");
    EXPECT_EQ(Read(mine, file, "a"), "1");
    EXPECT_TRUE(mine.EndBatch(file));
    EXPECT_EQ(Read(other, file, "a"), "none");
    EXPECT_TRUE(other.WritePrivateProfileString("S", "d"s, "4"s, file));
    EXPECT_TRUE(mine.EndBatch(file));

    EXPECT_EQ(Slurp(file), "[S]\r\nc=3\r\nd=4\r\na=1\r\n");
    EXPECT_FALSE(mine.EndBatch(file));
}

TEST_F(FileProfilesTest, DamagedFilesAreNeverOverwritten) {
    const std::string folderInTheWay = folder_ + "/folder.ini";
    fs::create_directory(folderInTheWay);
    FileProfiles profiles(config_);
    EXPECT_EQ(Read(profiles, folderInTheWay, "k"), "none");
    EXPECT_FALSE(profiles.WritePrivateProfileString("S", "k"s, "v"s, folderInTheWay));
    profiles.BeginBatch(folderInTheWay);
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "k"s, "v"s, folderInTheWay));
    EXPECT_FALSE(profiles.EndBatch(folderInTheWay));
    EXPECT_TRUE(fs::is_directory(folderInTheWay));

    const std::string wide = folder_ + "/wide.ini";
    const std::string utf16 =
        "\xFF\xFE[\0S\0]\0\r\0\n\0k\0=\0"
        "1\0"s;
    Put(wide, utf16);
    EXPECT_EQ(Read(profiles, wide, "k"), "none");
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "k"s, "2"s, wide));
    EXPECT_EQ(Slurp(wide), "[S]\r\nk=2\r\n");
    int asideCount = 0;
    for (const auto& entry : fs::directory_iterator(folder_)) {
        if (entry.path().filename().string().starts_with("wide.ini.damaged-")) {
            ++asideCount;
            EXPECT_EQ(Slurp(entry.path().string()), utf16);
        }
    }
    EXPECT_EQ(asideCount, 1);
}

}  // namespace
}  // namespace cv::posix
