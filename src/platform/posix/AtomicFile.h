#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <system_error>

#include "platform/posix/FileStamp.h"
#include "platform/posix/SystemCalls.h"
#include "platform/posix/UniqueFd.h"

namespace cv::posix {

enum class ReadStatus {
    Read,        // the whole file is in Text
    Missing,     // no file (or no folder) at the path
    Unreadable,  // it exists but cannot be read: no permission, a folder, too large, I/O error
};

// The mode of a file this class creates. An existing file always keeps its mode.
enum class NewFileMode {
    OwnerOnly,     // 0600: settings are the user's own
    UmaskDefault,  // 0666 less the process umask, as ordinary programs create files
};

struct FileRead {
    ReadStatus status = ReadStatus::Missing;
    std::string text;
    FileStamp stamp;        // of the version read; missing unless status is Read
    std::error_code error;  // the system's reason for Unreadable
};

// One file that is only ever replaced whole, never torn, and whose
// read-modify-write cycles exclude each other across processes.
//
// Replacing: the new text goes to a temporary file in the same folder
// (".<name>.cv-tmp"), is flushed to disk, and is renamed over the file; the
// folder is flushed too. A reader sees the old or the new text, never a mix,
// and a crash at any moment leaves one of the two. A symbolic link is
// followed: its target is replaced and the link stays.
//
// Locking: an exclusive flock on the file itself, so no lock file is left
// beside it. Because a replace puts a new inode at the path, Lock re-checks
// after acquiring that the locked inode is still the one at the path and
// tries again otherwise; Replace locks the new inode before renaming it into
// place, so the holder keeps the lock without a gap. A missing file is
// created empty to be locked, and removed again on Unlock when nothing was
// written. Temporary files exist only while the lock is held, so a stale one
// left by a crash is simply overwritten by the next writer. Locks are per
// object: two objects of one process on the same file exclude each other too.
//
// Failures: every result is the system's error code (generic category), empty
// for success; nothing throws. A failed Replace leaves the old file as it was
// and no temporary file behind, and releases a lock it took. Interrupted
// calls (EINTR) are repeated and short writes continued. All disk access goes
// through the SystemCalls given, so tests can make any call fail.
class AtomicFile {
  public:
    // Files larger than this are not read (Unreadable, EFBIG).
    static constexpr int64_t kMaxBytes = int64_t{64} << 20;
    // How long Lock waits for another holder before giving up with ETIMEDOUT.
    static constexpr int kLockWaitMs = 10000;

    explicit AtomicFile(std::string path, NewFileMode newMode = NewFileMode::OwnerOnly,
                        SystemCalls& calls = SystemCalls::Real());
    ~AtomicFile();
    AtomicFile(const AtomicFile&) = delete;
    AtomicFile& operator=(const AtomicFile&) = delete;

    const std::string& Path() const { return path_; }

    // The whole file. Needs no lock: writers only ever rename whole files in.
    // While this object holds the lock, reads the locked version.
    [[nodiscard]] FileRead Read() const;
    // The current version's stamp, without reading (one stat). While this
    // object holds the lock: the locked version's stamp, which keeps that
    // version's inode pinned like a stamp from Read.
    [[nodiscard]] FileStamp Stamp() const;

    [[nodiscard]] std::error_code Lock();
    void Unlock();
    bool Locked() const { return lock_.Valid(); }

    // Puts text in place atomically. Takes the lock for the call when not
    // held. Refuses (EACCES) a file the user has made read-only.
    [[nodiscard]] std::error_code Replace(std::string_view text);
    // Keeps a copy of the current file as "<path>.damaged-YYYYMMDD-HHMMSS"
    // (with "-2", "-3", ... when taken), so that a following Replace cannot
    // lose it; asidePath receives the copy's path.
    [[nodiscard]] std::error_code SetAside(std::string& asidePath);

    // Creates folder and its missing parents with mode 0700.
    [[nodiscard]] static std::error_code MakeFolders(const std::string& folder);

  private:
    std::error_code LockTarget(const std::string& target);
    std::error_code OpenForLock(const std::string& target, UniqueFd& fd);
    std::error_code WriteTemporary(std::string_view text, UniqueFd& temp,
                                   std::string& tempPath) const;
    std::error_code CopyTo(const std::string& text, const std::string& asidePath) const;
    void Abandon(UniqueFd& file, const std::string& target);
    int Open(const std::string& path, int flags, mode_t mode = 0) const;
    std::error_code ReadAll(int fd, std::string& out) const;
    std::error_code WriteAll(int fd, std::string_view text) const;
    std::error_code Sync(int fd) const;
    void SyncFolder(const std::string& folder) const;

    std::string path_;
    NewFileMode newMode_;
    SystemCalls& calls_;
    UniqueFd lock_;
    std::string lockedTarget_;
    bool createdEmpty_ = false;
};

}  // namespace cv::posix
