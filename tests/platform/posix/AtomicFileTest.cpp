#include "platform/posix/AtomicFile.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include "support/TempFolder.h"

namespace cv::posix {
namespace {

mode_t ModeOf(const std::string& sPath) {
    struct stat info {};
    return ::stat(sPath.c_str(), &info) == 0 ? (info.st_mode & 07777) : 0;
}

std::string Slurp(const std::string& sPath) {
    std::ifstream in(sPath, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

void Spill(const std::string& sPath, const std::string& sText) {
    std::ofstream(sPath, std::ios::binary) << sText;
}

bool RunningAsRoot() {
    return ::geteuid() == 0;
}

TEST(AtomicFile, ReplacesWholeFilesAndStampsEachVersion) {
    test::TempFolder folder;
    AtomicFile file(folder.File("settings"));
    EXPECT_EQ(file.Read().Status, ReadStatus::Missing);
    EXPECT_FALSE(file.Stamp().Exists());

    ASSERT_EQ(file.Replace("first"), 0);
    EXPECT_EQ(ModeOf(file.Path()), 0600u);
    const FileRead first = file.Read();
    EXPECT_EQ(first.Status, ReadStatus::Read);
    EXPECT_EQ(first.Text, "first");
    EXPECT_EQ(first.Stamp, file.Stamp());

    // Same size, written at once: the stamp still tells the versions apart.
    for (char c = 'a'; c < 'f'; ++c) {
        ASSERT_EQ(file.Replace(std::string(5, c)), 0);
        EXPECT_FALSE(first.Stamp == file.Stamp());
    }
    EXPECT_EQ(Slurp(file.Path()), "eeeee");
    EXPECT_FALSE(file.Locked());
    EXPECT_EQ(::access(folder.File(".settings.cv-tmp").c_str(), F_OK), -1);
}

TEST(AtomicFile, KeepsTheModeOfExistingFilesAndHonoursTheChoiceForNewOnes) {
    test::TempFolder folder;
    Spill(folder.File("shared.ini"), "old");
    ::chmod(folder.File("shared.ini").c_str(), 0644);
    ASSERT_EQ(AtomicFile(folder.File("shared.ini")).Replace("new"), 0);
    EXPECT_EQ(ModeOf(folder.File("shared.ini")), 0644u);

    const mode_t previous = ::umask(022);
    EXPECT_EQ(AtomicFile(folder.File("plain.tun"), NewFileMode::UmaskDefault).Replace("x"), 0);
    ::umask(previous);
    EXPECT_EQ(ModeOf(folder.File("plain.tun")), 0644u);
}

TEST(AtomicFile, TellsMissingFromUnreadableAndRefusesReadOnlyFiles) {
    test::TempFolder folder;
    EXPECT_EQ(AtomicFile(folder.File("no/such/file")).Read().Status, ReadStatus::Missing);
    const FileRead asFolder = AtomicFile(folder.Path()).Read();
    EXPECT_EQ(asFolder.Status, ReadStatus::Unreadable);
    EXPECT_EQ(asFolder.Error, EISDIR);
    EXPECT_EQ(AtomicFile(folder.Path()).Replace("x"), EISDIR);
    if (RunningAsRoot()) {
        GTEST_SKIP() << "permissions do not bind root";
    }
    Spill(folder.File("locked"), "keep");
    ::chmod(folder.File("locked").c_str(), 0);
    EXPECT_EQ(AtomicFile(folder.File("locked")).Read().Status, ReadStatus::Unreadable);
    ::chmod(folder.File("locked").c_str(), 0400);
    EXPECT_EQ(AtomicFile(folder.File("locked")).Replace("lost"), EACCES);
    EXPECT_EQ(Slurp(folder.File("locked")), "keep");
}

TEST(AtomicFile, ReplacesTheTargetOfASymbolicLink) {
    test::TempFolder folder;
    Spill(folder.File("real"), "old");
    ASSERT_EQ(::symlink("real", folder.File("link").c_str()), 0);
    ASSERT_EQ(AtomicFile(folder.File("link")).Replace("new"), 0);
    struct stat info {};
    ASSERT_EQ(::lstat(folder.File("link").c_str(), &info), 0);
    EXPECT_TRUE(S_ISLNK(info.st_mode));
    EXPECT_EQ(Slurp(folder.File("real")), "new");
}

TEST(AtomicFile, HoldsTheLockAcrossReplacesAndLeavesNoLockFile) {
    test::TempFolder folder;
    AtomicFile file(folder.File("store"));
    ASSERT_EQ(file.Lock(), 0);
    EXPECT_EQ(Slurp(file.Path()), "");
    file.Unlock();
    EXPECT_EQ(::access(file.Path().c_str(), F_OK), -1) << "nothing written, nothing left";

    ASSERT_EQ(file.Lock(), 0);
    ASSERT_EQ(file.Replace("one"), 0);
    ASSERT_EQ(file.Replace("two"), 0);
    EXPECT_EQ(file.Read().Text, "two");
    // Another holder of the path (another open file, as in another process)
    // cannot take the lock of the version now in place.
    const int other = ::open(file.Path().c_str(), O_RDONLY);
    EXPECT_EQ(::flock(other, LOCK_EX | LOCK_NB), -1);
    EXPECT_EQ(errno, EWOULDBLOCK);
    file.Unlock();
    EXPECT_EQ(::flock(other, LOCK_EX | LOCK_NB), 0);
    ::close(other);
    EXPECT_EQ(Slurp(file.Path()), "two");
}

TEST(AtomicFile, OverwritesATemporaryFileLeftByACrash) {
    test::TempFolder folder;
    Spill(folder.File(".store.cv-tmp"), "half a wri");
    ASSERT_EQ(AtomicFile(folder.File("store")).Replace("whole"), 0);
    EXPECT_EQ(Slurp(folder.File("store")), "whole");
    EXPECT_EQ(::access(folder.File(".store.cv-tmp").c_str(), F_OK), -1);
}

TEST(AtomicFile, SetsDamagedFilesAsideUnderFreshNames) {
    test::TempFolder folder;
    AtomicFile file(folder.File("store"));
    Spill(file.Path(), "\x01junk");
    std::string first;
    std::string second;
    ASSERT_EQ(file.SetAside(first), 0);
    ASSERT_EQ(file.SetAside(second), 0);
    EXPECT_NE(first, second);
    EXPECT_EQ(first.rfind(file.Path() + ".damaged-", 0), 0u);
    EXPECT_EQ(Slurp(first), "\x01junk");
    EXPECT_EQ(Slurp(second), "\x01junk");
    EXPECT_EQ(ModeOf(first), 0600u);
    ASSERT_EQ(file.Replace("clean"), 0);
    EXPECT_EQ(Slurp(first), "\x01junk");
}

TEST(AtomicFile, MakesPrivateFolders) {
    test::TempFolder folder;
    const std::string deep = folder.File("a/b/c");
    ASSERT_EQ(AtomicFile::MakeFolders(deep), 0);
    EXPECT_EQ(ModeOf(deep), 0700u);
    EXPECT_EQ(ModeOf(folder.File("a")), 0700u);
    EXPECT_EQ(AtomicFile::MakeFolders(deep), 0);
    Spill(folder.File("plain"), "");
    EXPECT_EQ(AtomicFile::MakeFolders(folder.File("plain")), ENOTDIR);
}

}  // namespace
}  // namespace cv::posix
