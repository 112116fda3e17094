#include "platform/posix/FileProfiles.h"

#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <string>

#include <gtest/gtest.h>

#include "platform/posix/ProfilePath.h"
#include "support/FaultyCalls.h"
#include "support/TempFolder.h"
#include "support/TestFiles.h"

namespace cv::posix {
namespace {

using namespace std::string_literals;
using test::Slurp;
using test::Spill;
namespace fs = std::filesystem;

class FileProfilesTest : public ::testing::Test {
  protected:
    std::string Read(FileProfiles& cProfiles, const std::string& sFile, const std::string& sKey,
                     const std::string& sSection = "S") {
        return cProfiles.GetPrivateProfileString(sSection, sKey, "none", 255, sFile);
    }

    test::TempFolder folder_;
    const std::string config_ = folder_.File("config/cvopctestclient");
    const std::string file_ = folder_.File("t.ini");
    FileProfiles profiles_{config_};
};

TEST_F(FileProfilesTest, BareNamesLiveInTheOwnersSettingsFolder) {
    ASSERT_TRUE(
        profiles_.WritePrivateProfileString("Faceplate", "WriteDisabled"s, "1"s, "Corvalen.ini"));
    const std::string file = config_ + "/Corvalen.ini";
    EXPECT_EQ(Slurp(file), "[Faceplate]\r\nWriteDisabled=1\r\n");
    EXPECT_EQ(test::ModeOf(file), 0600u);

    EXPECT_TRUE(
        profiles_.WritePrivateProfileString("Faceplate", "Colour"s, "255"s, "CORVALEN.Ini"));
    EXPECT_EQ(Slurp(file), "[Faceplate]\r\nWriteDisabled=1\r\nColour=255\r\n");
    EXPECT_FALSE(fs::exists(config_ + "/CORVALEN.Ini"));

    const mode_t old = ::umask(022);
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "k"s, "v"s, file_));
    ::umask(old);
    EXPECT_EQ(test::ModeOf(file_), 0644u);

    EXPECT_EQ(ProfilePath("", config_), "");
    EXPECT_EQ(ProfilePath("tun\\Unit7.tun", config_), "tun/Unit7.tun");
    EXPECT_EQ(ProfilePath("new.ini", config_), config_ + "/new.ini");
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S", "k"s, "v"s, ""));
    EXPECT_EQ(Read(profiles_, "", "k"), "none");
}

TEST_F(FileProfilesTest, ReadsLikeTheWindowsFunction) {
    Spill(file_, "[S]\nlong=" + std::string(300, 'x') + "\nnul=ab\0cd\nq=\"  7 \"\n"s);
    EXPECT_EQ(Read(profiles_, file_, "long"), std::string(254, 'x'));
    EXPECT_EQ(profiles_.GetPrivateProfileString("S", "long", "", 5, file_), "xxxx");
    EXPECT_EQ(profiles_.GetPrivateProfileString("S", "long", "", 0, file_), "");
    EXPECT_EQ(Read(profiles_, file_, "nul"), "ab\0cd"s);
    EXPECT_EQ(Read(profiles_, file_, "q"), "  7 ");
    EXPECT_EQ(profiles_.GetPrivateProfileString("S", "q\0junk"s, "", 255, file_), "  7 ");
    EXPECT_EQ(profiles_.GetPrivateProfileString("S", "missing", " 12  \t", 255, file_), " 12");
    EXPECT_EQ(profiles_.GetPrivateProfileString("S", "missing", "abcdef", 4, file_), "abc");
    EXPECT_EQ(Read(profiles_, folder_.File("absent.ini"), "k"), "none");
    EXPECT_FALSE(fs::exists(folder_.File("absent.ini")));
}

TEST_F(FileProfilesTest, WritesKeepTheFileAndRefuseWhatCannotReadBack) {
    Spill(file_, "; tuning file\n[S]\na=1\n\n[T]\nb=2\n");
    EXPECT_TRUE(profiles_.WritePrivateProfileString("s", "c"s, "3"s, file_));
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S", "a"s, "1\r\n[T]\r\nb=9"s, file_));
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S", "a=b"s, "1"s, file_));
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S\n", "a"s, "1"s, file_));
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "d"s, "4\0junk"s, file_));
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "a"s, std::nullopt, file_));
    EXPECT_TRUE(profiles_.WritePrivateProfileString("T", std::nullopt, "ignored"s, file_));
    EXPECT_EQ(Slurp(file_), "; tuning file\n[S]\nc=3\nd=4\n\n");

    const ino_t before = test::InodeOf(file_);
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "c"s, "3"s, file_));
    EXPECT_TRUE(profiles_.WritePrivateProfileString("Gone", std::nullopt, std::nullopt, file_));
    EXPECT_EQ(test::InodeOf(file_), before) << "a write that changes nothing leaves the file";

    const std::string absent = folder_.File("new.ini");
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "k"s, std::nullopt, absent));
    EXPECT_FALSE(fs::exists(absent));
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S", "k"s, "v"s, folder_.File("no/a.ini")));
}

TEST_F(FileProfilesTest, SeesEveryChangeToTheFileAtOnce) {
    FileProfiles second(config_);
    EXPECT_EQ(Read(profiles_, file_, "k"), "none");
    ASSERT_TRUE(second.WritePrivateProfileString("S", "k"s, "1"s, file_));
    EXPECT_EQ(Read(profiles_, file_, "k"), "1");
    ASSERT_TRUE(profiles_.WritePrivateProfileString("S", "k"s, "2"s, file_));
    EXPECT_EQ(Read(second, file_, "k"), "2");
    Spill(file_, "[S]\nk=edited by hand\n");
    EXPECT_EQ(Read(profiles_, file_, "k"), "edited by hand");
}

TEST_F(FileProfilesTest, ProcessesWritingOneFileKeepEachOthersValues) {
    constexpr int kWriters = 4;
    constexpr int kKeys = 25;
    const auto key = [](int iWriter, int iKey) {
        return std::to_string(iWriter) + "_" + std::to_string(iKey);
    };
    EXPECT_EQ(Read(profiles_, file_, "0_0", "W0"), "none");
    for (int writer = 0; writer < kWriters; ++writer) {
        if (::fork() == 0) {
            FileProfiles profiles(config_);
            bool ok = true;
            for (int k = 0; k < kKeys; ++k) {
                ok = profiles.WritePrivateProfileString("W" + std::to_string(k % 3), key(writer, k),
                                                        "v"s, file_) &&
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
    for (int writer = 0; writer < kWriters; ++writer) {
        for (int k = 0; k < kKeys; ++k) {
            EXPECT_EQ(Read(profiles_, file_, key(writer, k), "W" + std::to_string(k % 3)), "v");
        }
    }
}

TEST_F(FileProfilesTest, BatchesStoreOnceAtTheEndAndKeepOthersWrites) {
    FileProfiles other(config_);
    profiles_.BeginBatch(file_);
    profiles_.BeginBatch(file_);
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "a"s, "1"s, file_));
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "b"s, "2"s, file_));
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "b"s, std::nullopt, file_));
    EXPECT_EQ(Read(profiles_, file_, "a"), "1");
    EXPECT_EQ(Read(profiles_, file_, "b"), "none");
    EXPECT_FALSE(fs::exists(file_));

    EXPECT_TRUE(other.WritePrivateProfileString("S", "c"s, "3"s, file_));
    EXPECT_EQ(Read(profiles_, file_, "c"), "3");
    EXPECT_EQ(Read(profiles_, file_, "a"), "1");
    EXPECT_TRUE(profiles_.EndBatch(file_));
    EXPECT_EQ(Read(other, file_, "a"), "none");
    EXPECT_TRUE(other.WritePrivateProfileString("S", "d"s, "4"s, file_));
    EXPECT_TRUE(profiles_.EndBatch(file_));

    EXPECT_EQ(Slurp(file_), "[S]\r\nc=3\r\nd=4\r\na=1\r\n");
    EXPECT_FALSE(profiles_.EndBatch(file_));

    // A batch with a write the file refuses stores none of its writes.
    profiles_.BeginBatch(file_);
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "e"s, "5"s, file_));
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S", "f"s, "two\nlines"s, file_));
    EXPECT_FALSE(profiles_.EndBatch(file_));
    EXPECT_EQ(Read(profiles_, file_, "e"), "none");
    EXPECT_EQ(Slurp(file_), "[S]\r\nc=3\r\nd=4\r\na=1\r\n");
}

TEST_F(FileProfilesTest, AWriteTheDiskRefusesFailsAndKeepsTheFile) {
    Spill(file_, "[S]\r\na=1\r\n");
    test::FaultyCalls calls;
    FileProfiles profiles(config_, calls);
    calls.Fail(test::FaultyCalls::Call::Write, ENOSPC);
    EXPECT_FALSE(profiles.WritePrivateProfileString("S", "a"s, "2"s, file_));
    EXPECT_EQ(Read(profiles, file_, "a"), "1");
    profiles.BeginBatch(file_);
    EXPECT_TRUE(profiles.WritePrivateProfileString("S", "b"s, "3"s, file_));
    calls.Fail(test::FaultyCalls::Call::Rename, EIO);
    EXPECT_FALSE(profiles.EndBatch(file_));
    EXPECT_EQ(Read(profiles, file_, "b"), "none");
    EXPECT_EQ(Slurp(file_), "[S]\r\na=1\r\n");
}

TEST_F(FileProfilesTest, DamagedFilesAreNeverOverwritten) {
    const std::string folderInTheWay = folder_.File("folder.ini");
    fs::create_directory(folderInTheWay);
    EXPECT_EQ(Read(profiles_, folderInTheWay, "k"), "none");
    EXPECT_FALSE(profiles_.WritePrivateProfileString("S", "k"s, "v"s, folderInTheWay));
    profiles_.BeginBatch(folderInTheWay);
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "k"s, "v"s, folderInTheWay));
    EXPECT_FALSE(profiles_.EndBatch(folderInTheWay));
    EXPECT_TRUE(fs::is_directory(folderInTheWay));

    const std::string utf16 = "\xFF\xFE[\0S\0]\0\r\0\n\0k\0=\0001\0"s;
    Spill(file_, utf16);
    EXPECT_EQ(Read(profiles_, file_, "k"), "none");
    EXPECT_TRUE(profiles_.WritePrivateProfileString("S", "k"s, "2"s, file_));
    EXPECT_EQ(Slurp(file_), "[S]\r\nk=2\r\n");
    int asideCount = 0;
    for (const auto& entry : fs::directory_iterator(folder_.Path())) {
        if (entry.path().string().starts_with(file_ + ".damaged-")) {
            ++asideCount;
            EXPECT_EQ(Slurp(entry.path().string()), utf16);
        }
    }
    EXPECT_EQ(asideCount, 1);
}

}  // namespace
}  // namespace cv::posix
