#include "platform/posix/AtomicFile.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include <filesystem>

#include "support/TempFolder.h"
#include "support/TestFiles.h"

namespace cv::posix {
namespace {

using test::ModeOf;
using test::Slurp;
using test::Spill;
namespace fs = std::filesystem;

TEST(AtomicFile, ReplacesWholeFilesAndStampsEachVersion) {
    test::TempFolder folder;
    Spill(folder.File(".settings.cv-tmp"), "half a write left by a crash");
    AtomicFile file(folder.File("settings"));
    EXPECT_EQ(file.Read().status, ReadStatus::Missing);
    EXPECT_FALSE(file.Stamp().Exists());

    ASSERT_EQ(file.Replace("first"), 0);
    EXPECT_EQ(ModeOf(file.Path()), 0600u);
    const FileRead first = file.Read();
    EXPECT_EQ(first.status, ReadStatus::Read);
    EXPECT_EQ(first.text, "first");
    EXPECT_EQ(first.stamp, file.Stamp());

    // Same size, written at once: the stamp still tells the versions apart.
    for (char c = 'a'; c < 'f'; ++c) {
        ASSERT_EQ(file.Replace(std::string(5, c)), 0);
        EXPECT_FALSE(first.stamp == file.Stamp());
    }
    EXPECT_EQ(Slurp(file.Path()), "eeeee");
    EXPECT_FALSE(file.Locked());
    EXPECT_FALSE(fs::exists(folder.File(".settings.cv-tmp")));
}

TEST(AtomicFile, KeepsTheModeOfExistingFilesAndTheLinksToThem) {
    test::TempFolder folder;
    Spill(folder.File("shared.ini"), "old");
    ::chmod(folder.File("shared.ini").c_str(), 0644);
    ASSERT_EQ(AtomicFile(folder.File("shared.ini")).Replace("new"), 0);
    EXPECT_EQ(ModeOf(folder.File("shared.ini")), 0644u);

    ASSERT_EQ(::symlink("shared.ini", folder.File("link").c_str()), 0);
    ASSERT_EQ(AtomicFile(folder.File("link")).Replace("newer"), 0);
    EXPECT_TRUE(fs::is_symlink(folder.File("link")));
    EXPECT_EQ(Slurp(folder.File("shared.ini")), "newer");
}

TEST(AtomicFile, TellsMissingFromUnreadableAndRefusesReadOnlyFiles) {
    test::TempFolder folder;
    EXPECT_EQ(AtomicFile(folder.File("no/such/file")).Read().status, ReadStatus::Missing);
    const FileRead asFolder = AtomicFile(folder.Path()).Read();
    EXPECT_EQ(asFolder.status, ReadStatus::Unreadable);
    EXPECT_EQ(asFolder.error, EISDIR);
    EXPECT_EQ(AtomicFile(folder.Path()).Replace("x"), EISDIR);
    if (::geteuid() == 0) {
        GTEST_SKIP() << "permissions do not bind root";
    }
    Spill(folder.File("locked"), "keep");
    ::chmod(folder.File("locked").c_str(), 0);
    EXPECT_EQ(AtomicFile(folder.File("locked")).Read().status, ReadStatus::Unreadable);
    ::chmod(folder.File("locked").c_str(), 0400);
    EXPECT_EQ(AtomicFile(folder.File("locked")).Replace("lost"), EACCES);
    EXPECT_EQ(Slurp(folder.File("locked")), "keep");
}

TEST(AtomicFile, HoldsTheLockAcrossReplacesAndLeavesNoLockFile) {
    test::TempFolder folder;
    AtomicFile file(folder.File("store"));
    ASSERT_EQ(file.Lock(), 0);
    EXPECT_EQ(Slurp(file.Path()), "");
    file.Unlock();
    EXPECT_FALSE(fs::exists(file.Path())) << "nothing written, nothing left";

    ASSERT_EQ(file.Lock(), 0);
    ASSERT_EQ(file.Replace("one"), 0);
    ASSERT_EQ(file.Replace("two"), 0);
    EXPECT_EQ(file.Read().text, "two");
    // Another open file, as in another process, cannot lock the version now in place.
    const int other = ::open(file.Path().c_str(), O_RDONLY);
    EXPECT_EQ(::flock(other, LOCK_EX | LOCK_NB), -1);
    EXPECT_EQ(errno, EWOULDBLOCK);
    file.Unlock();
    EXPECT_EQ(::flock(other, LOCK_EX | LOCK_NB), 0);
    ::close(other);
    EXPECT_EQ(Slurp(file.Path()), "two");
}

TEST(AtomicFile, SetsDamagedFilesAsideUnderFreshNamesAndMakesPrivateFolders) {
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
    EXPECT_EQ(ModeOf(first), 0600u);
    ASSERT_EQ(file.Replace("clean"), 0);
    EXPECT_EQ(Slurp(first), "\x01junk");

    ASSERT_EQ(AtomicFile::MakeFolders(folder.File("a/b/c")), 0);
    EXPECT_EQ(ModeOf(folder.File("a/b/c")), 0700u);
    EXPECT_EQ(AtomicFile::MakeFolders(folder.File("a/b/c")), 0);
    EXPECT_EQ(AtomicFile::MakeFolders(file.Path()), ENOTDIR);
}

}  // namespace
}  // namespace cv::posix
