#include "platform/posix/AtomicFile.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <filesystem>
#include <tuple>

#include <gtest/gtest.h>

#include "support/FaultyCalls.h"
#include "support/TempFolder.h"
#include "support/TestFiles.h"

namespace cv::posix {
namespace {

using test::FaultyCalls;
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

    ASSERT_EQ(file.Replace("first"), std::error_code());
    EXPECT_EQ(ModeOf(file.Path()), 0600u);
    const FileRead first = file.Read();
    EXPECT_EQ(first.status, ReadStatus::Read);
    EXPECT_EQ(first.text, "first");
    EXPECT_EQ(first.stamp, file.Stamp());

    // Same size, written at once: the stamp still tells the versions apart.
    for (char c = 'a'; c < 'f'; ++c) {
        ASSERT_EQ(file.Replace(std::string(5, c)), std::error_code());
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
    ASSERT_EQ(AtomicFile(folder.File("shared.ini")).Replace("new"), std::error_code());
    EXPECT_EQ(ModeOf(folder.File("shared.ini")), 0644u);

    ASSERT_EQ(::symlink("shared.ini", folder.File("link").c_str()), 0);
    ASSERT_EQ(AtomicFile(folder.File("link")).Replace("newer"), std::error_code());
    EXPECT_TRUE(fs::is_symlink(folder.File("link")));
    EXPECT_EQ(Slurp(folder.File("shared.ini")), "newer");
}

TEST(AtomicFile, TellsMissingFromUnreadableAndRefusesReadOnlyFiles) {
    test::TempFolder folder;
    EXPECT_EQ(AtomicFile(folder.File("no/such/file")).Read().status, ReadStatus::Missing);
    const FileRead asFolder = AtomicFile(folder.Path()).Read();
    EXPECT_EQ(asFolder.status, ReadStatus::Unreadable);
    EXPECT_EQ(asFolder.error, std::errc::is_a_directory);
    EXPECT_EQ(AtomicFile(folder.Path()).Replace("x"), std::errc::is_a_directory);
    if (::geteuid() == 0) {
        GTEST_SKIP() << "permissions do not bind root";
    }
    Spill(folder.File("locked"), "keep");
    ::chmod(folder.File("locked").c_str(), 0);
    EXPECT_EQ(AtomicFile(folder.File("locked")).Read().status, ReadStatus::Unreadable);
    ::chmod(folder.File("locked").c_str(), 0400);
    EXPECT_EQ(AtomicFile(folder.File("locked")).Replace("lost"), std::errc::permission_denied);
    EXPECT_EQ(Slurp(folder.File("locked")), "keep");
}

TEST(AtomicFile, HoldsTheLockAcrossReplacesAndLeavesNoLockFile) {
    test::TempFolder folder;
    AtomicFile file(folder.File("store"));
    ASSERT_EQ(file.Lock(), std::error_code());
    EXPECT_EQ(Slurp(file.Path()), "");
    file.Unlock();
    EXPECT_FALSE(fs::exists(file.Path())) << "nothing written, nothing left";

    ASSERT_EQ(file.Lock(), std::error_code());
    ASSERT_EQ(file.Replace("one"), std::error_code());
    ASSERT_EQ(file.Replace("two"), std::error_code());
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
    ASSERT_EQ(file.SetAside(first), std::error_code());
    ASSERT_EQ(file.SetAside(second), std::error_code());
    EXPECT_NE(first, second);
    EXPECT_EQ(first.rfind(file.Path() + ".damaged-", 0), 0u);
    EXPECT_EQ(Slurp(first), "\x01junk");
    EXPECT_EQ(ModeOf(first), 0600u);
    ASSERT_EQ(file.Replace("clean"), std::error_code());
    EXPECT_EQ(Slurp(first), "\x01junk");

    ASSERT_EQ(AtomicFile::MakeFolders(folder.File("a/b/c")), std::error_code());
    EXPECT_EQ(ModeOf(folder.File("a/b/c")), 0700u);
    EXPECT_EQ(AtomicFile::MakeFolders(folder.File("a/b/c")), std::error_code());
    EXPECT_EQ(AtomicFile::MakeFolders(file.Path()), std::errc::not_a_directory);
}

// Whether another open file, as in another process, can take the lock now.
bool LockIsFree(const std::string& path) {
    const UniqueFd other(::open(path.c_str(), O_RDONLY));
    return other.Valid() && ::flock(other.Get(), LOCK_EX | LOCK_NB) == 0;
}

// A replace that fails at any system call keeps the old file (or no file),
// leaves no temporary file, releases its lock and hands the error back;
// interrupted calls are repeated and short writes continued.
TEST(AtomicFile, AFailedReplaceKeepsTheOldFileAndTellsWhy) {
    using Call = FaultyCalls::Call;
    struct Row {
        const char* what;
        Call call;
        int error, skip, times;
        size_t writeLimit;
        std::errc expected;  // std::errc() for success
    };
    const Row rows[] = {
        {"full disk", Call::Write, ENOSPC, 0, 1, 1 << 20, std::errc::no_space_on_device},
        {"write error", Call::Write, EIO, 0, 1, 1 << 20, std::errc::io_error},
        {"short write, then full", Call::Write, ENOSPC, 2, 1, 2, std::errc::no_space_on_device},
        {"flush error", Call::Fsync, EIO, 0, 1, 1 << 20, std::errc::io_error},
        {"refused rename", Call::Rename, EBUSY, 0, 1, 1 << 20, std::errc::device_or_resource_busy},
        {"no temporary file", Call::Open, ENOSPC, 1, 1, 1 << 20, std::errc::no_space_on_device},
        {"no lock", Call::Flock, ENOLCK, 0, 1, 1 << 20, std::errc::no_lock_available},
        {"interrupted writes", Call::Write, EINTR, 0, 3, 1 << 20, std::errc()},
        {"short writes", Call::Write, 0, 0, 0, 2, std::errc()},
        {"interrupted open", Call::Open, EINTR, 1, 2, 1 << 20, std::errc()},
        {"interrupted flush", Call::Fsync, EINTR, 0, 1, 1 << 20, std::errc()},
        {"interrupted lock", Call::Flock, EINTR, 0, 1, 1 << 20, std::errc()},
        {"folder not flushed", Call::Fsync, EIO, 1, 1, 1 << 20, std::errc()},
    };
    for (const bool existing : {true, false}) {
        for (const Row& row : rows) {
            SCOPED_TRACE(std::string(row.what) + (existing ? ", old file" : ", new file"));
            test::TempFolder folder;
            const std::string path = folder.File("settings");
            if (existing) {
                Spill(path, "old text");
            }
            FaultyCalls calls;
            calls.Fail(row.call, row.error, row.skip, row.times);
            calls.ShortWrites(row.writeLimit);
            AtomicFile file(path, NewFileMode::OwnerOnly, calls);
            const bool replaced = row.expected == std::errc();
            EXPECT_EQ(file.Replace("new text"),
                      replaced ? std::error_code() : std::make_error_code(row.expected));
            EXPECT_EQ(Slurp(path), replaced ? "new text" : existing ? "old text" : "");
            EXPECT_EQ(fs::exists(path), replaced || existing);
            EXPECT_FALSE(fs::exists(folder.File(".settings.cv-tmp")));
            EXPECT_FALSE(file.Locked());
            EXPECT_TRUE(!fs::exists(path) || LockIsFree(path));
        }
    }
}

TEST(AtomicFile, ReadsThroughInterruptionsAndReportsReadErrors) {
    test::TempFolder folder;
    Spill(folder.File("settings"), "text");
    FaultyCalls calls;
    AtomicFile file(folder.File("settings"), NewFileMode::OwnerOnly, calls);
    calls.Fail(FaultyCalls::Call::Read, EINTR, 0, 2);
    EXPECT_EQ(file.Read().text, "text");
    calls.Fail(FaultyCalls::Call::Read, EIO);
    const FileRead failed = file.Read();
    EXPECT_EQ(std::tuple(failed.status, failed.text), std::tuple(ReadStatus::Unreadable, ""));
    EXPECT_EQ(failed.error, std::errc::io_error);
}

}  // namespace
}  // namespace cv::posix
