#include "platform/posix/AtomicFile.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <chrono>
#include <ctime>
#include <thread>

namespace cv::posix {

namespace {

constexpr int kMaxLinkHops = 40;

std::string FolderOf(const std::string& path) {
    const auto slash = path.rfind('/');
    if (slash == std::string::npos) {
        return ".";
    }
    return slash == 0 ? "/" : path.substr(0, slash);
}

std::string NameOf(const std::string& path) {
    const auto slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

// Follows symbolic links (dangling ones too) to the path that really holds
// the file, so that replacing it keeps the links.
std::string ResolveTarget(const std::string& path) {
    std::string target = path;
    for (int hop = 0; hop < kMaxLinkHops; ++hop) {
        struct stat info {};
        if (::lstat(target.c_str(), &info) != 0 || !S_ISLNK(info.st_mode)) {
            return target;
        }
        std::array<char, 4096> link{};
        const ssize_t length = ::readlink(target.c_str(), link.data(), link.size());
        if (length <= 0 || static_cast<size_t>(length) >= link.size()) {
            return target;
        }
        const std::string text(link.data(), static_cast<size_t>(length));
        target = text.front() == '/' ? text : FolderOf(target) + "/" + text;
    }
    return target;
}

int ReadDescriptor(int fd, std::string& out) {
    struct stat info {};
    if (::fstat(fd, &info) != 0) {
        return errno;
    }
    if (S_ISDIR(info.st_mode)) {
        return EISDIR;
    }
    std::string text;
    text.reserve(static_cast<size_t>(std::clamp<int64_t>(info.st_size, 0, AtomicFile::kMaxBytes)));
    std::array<char, 65536> block{};
    for (;;) {
        const ssize_t got = ::read(fd, block.data(), block.size());
        if (got < 0 && errno == EINTR) {
            continue;
        }
        if (got < 0) {
            return errno;
        }
        if (got == 0) {
            break;
        }
        if (static_cast<int64_t>(text.size()) + got > AtomicFile::kMaxBytes) {
            return EFBIG;
        }
        text.append(block.data(), static_cast<size_t>(got));
    }
    out = std::move(text);
    return 0;
}

int WriteAll(int fd, std::string_view text) {
    while (!text.empty()) {
        const ssize_t put = ::write(fd, text.data(), text.size());
        if (put < 0 && errno == EINTR) {
            continue;
        }
        if (put < 0) {
            return errno;
        }
        text.remove_prefix(static_cast<size_t>(put));
    }
    return 0;
}

// Makes a rename in the folder durable; file systems that cannot do this
// still keep the rename atomic, so a failure here is not an error.
void SyncFolder(const std::string& folder) {
    const UniqueFd handle(::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (handle.Valid()) {
        ::fsync(handle.Get());
    }
}

bool SameInode(int fd, const std::string& path) {
    struct stat held {};
    struct stat current {};
    return ::fstat(fd, &held) == 0 && ::stat(path.c_str(), &current) == 0 &&
           held.st_dev == current.st_dev && held.st_ino == current.st_ino;
}

std::string TimeTag() {
    const std::time_t now = std::time(nullptr);
    std::tm local{};
    ::localtime_r(&now, &local);
    std::array<char, 32> text{};
    const size_t length = std::strftime(text.data(), text.size(), "%Y%m%d-%H%M%S", &local);
    return std::string(text.data(), length);
}

}  // namespace

AtomicFile::AtomicFile(std::string path, NewFileMode newMode)
    : path_(std::move(path)), newMode_(newMode) {}

AtomicFile::~AtomicFile() {
    Unlock();
}

FileRead AtomicFile::Read() const {
    FileRead result;
    const std::string& path = Locked() ? lockedTarget_ : path_;
    auto file = std::make_shared<UniqueFd>(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
    if (!file->Valid()) {
        result.error = errno;
        const bool missing = result.error == ENOENT || result.error == ENOTDIR;
        result.status = missing ? ReadStatus::Missing : ReadStatus::Unreadable;
        return result;
    }
    struct stat info {};
    result.error =
        ::fstat(file->Get(), &info) == 0 ? ReadDescriptor(file->Get(), result.text) : errno;
    if (result.error != 0) {
        result.status = ReadStatus::Unreadable;
        result.text.clear();
        return result;
    }
    result.status = ReadStatus::Read;
    result.stamp = FileStamp::OfStat(info, std::move(file));
    return result;
}

FileStamp AtomicFile::Stamp() const {
    if (!Locked()) {
        return FileStamp::OfPath(path_);
    }
    auto pin =
        std::make_shared<UniqueFd>(::open(lockedTarget_.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
    struct stat info {};
    if (!pin->Valid() || ::fstat(pin->Get(), &info) != 0) {
        return FileStamp::OfPath(lockedTarget_);
    }
    return FileStamp::OfStat(info, std::move(pin));
}

int AtomicFile::Lock() {
    if (Locked()) {
        return 0;
    }
    return LockTarget(ResolveTarget(path_));
}

int AtomicFile::LockTarget(const std::string& target) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(kLockWaitMs);
    for (;;) {
        UniqueFd file;
        const int error = OpenForLock(target, file);
        if (error != 0) {
            return error;
        }
        int pauseMs = 1;
        while (::flock(file.Get(), LOCK_EX | LOCK_NB) != 0) {
            if (errno == EINTR) {
                continue;
            }
            if (errno != EWOULDBLOCK) {
                return errno;
            }
            if (std::chrono::steady_clock::now() >= deadline) {
                return ETIMEDOUT;
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(pauseMs));
            pauseMs = std::min(pauseMs * 2, 50);
        }
        if (SameInode(file.Get(), target)) {
            lock_ = std::move(file);
            lockedTarget_ = target;
            return 0;
        }
    }
}

int AtomicFile::OpenForLock(const std::string& target, UniqueFd& fd) {
    const mode_t mode = newMode_ == NewFileMode::OwnerOnly ? 0600 : 0666;
    for (;;) {
        fd.Reset(::open(target.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
        if (fd.Valid()) {
            createdEmpty_ = false;
            struct stat info {};
            return ::fstat(fd.Get(), &info) != 0 ? errno : S_ISDIR(info.st_mode) ? EISDIR : 0;
        }
        if (errno != ENOENT) {
            return errno;
        }
        fd.Reset(::open(target.c_str(), O_RDONLY | O_CREAT | O_EXCL | O_CLOEXEC | O_NOCTTY, mode));
        if (fd.Valid()) {
            createdEmpty_ = true;
            return 0;
        }
        if (errno != EEXIST) {
            return errno;
        }
    }
}

void AtomicFile::Unlock() {
    if (!Locked()) {
        return;
    }
    struct stat info {};
    if (createdEmpty_ && ::fstat(lock_.Get(), &info) == 0 && info.st_size == 0 &&
        SameInode(lock_.Get(), lockedTarget_)) {
        ::unlink(lockedTarget_.c_str());
    }
    lock_.Reset();
    lockedTarget_.clear();
    createdEmpty_ = false;
}

int AtomicFile::Replace(std::string_view text) {
    const bool ownLock = !Locked();
    int error = Lock();
    if (error != 0) {
        return error;
    }
    UniqueFd temp;
    std::string tempPath;
    if (::access(lockedTarget_.c_str(), W_OK) != 0) {
        error = errno;
    } else {
        error = WriteTemporary(text, temp, tempPath);
    }
    if (error == 0 && (::flock(temp.Get(), LOCK_EX | LOCK_NB) != 0 ||
                       ::rename(tempPath.c_str(), lockedTarget_.c_str()) != 0)) {
        error = errno;
        ::unlink(tempPath.c_str());
    }
    if (error == 0) {
        SyncFolder(FolderOf(lockedTarget_));
        lock_ = std::move(temp);
        createdEmpty_ = false;
    }
    if (ownLock) {
        Unlock();
    }
    return error;
}

int AtomicFile::WriteTemporary(std::string_view text, UniqueFd& temp, std::string& tempPath) const {
    tempPath = FolderOf(lockedTarget_) + "/." + NameOf(lockedTarget_) + ".cv-tmp";
    ::unlink(tempPath.c_str());
    temp.Reset(::open(tempPath.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (!temp.Valid()) {
        return errno;
    }
    struct stat held {};
    int error = ::fstat(lock_.Get(), &held) != 0 ? errno : 0;
    if (error == 0 && ::fchmod(temp.Get(), held.st_mode & 07777) != 0) {
        error = errno;
    }
    if (error == 0) {
        error = WriteAll(temp.Get(), text);
    }
    if (error == 0 && ::fsync(temp.Get()) != 0) {
        error = errno;
    }
    if (error != 0) {
        temp.Reset();
        ::unlink(tempPath.c_str());
    }
    return error;
}

int AtomicFile::SetAside(std::string& asidePath) {
    const bool ownLock = !Locked();
    int error = Lock();
    if (error != 0) {
        return error;
    }
    const FileRead current = Read();
    error = current.status == ReadStatus::Read ? 0 : current.error;
    const std::string base = lockedTarget_ + ".damaged-" + TimeTag();
    for (int attempt = 1; error == 0; ++attempt) {
        const std::string candidate = attempt == 1 ? base : base + "-" + std::to_string(attempt);
        error = CopyTo(current.text, candidate);
        if (error == 0) {
            asidePath = candidate;
            break;
        }
        error = error == EEXIST && attempt < 1000 ? 0 : error;
    }
    if (ownLock) {
        Unlock();
    }
    return error;
}

int AtomicFile::CopyTo(const std::string& text, const std::string& asidePath) const {
    const UniqueFd copy(::open(asidePath.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
    if (!copy.Valid()) {
        return errno;
    }
    int error = WriteAll(copy.Get(), text);
    if (error == 0 && ::fsync(copy.Get()) != 0) {
        error = errno;
    }
    if (error != 0) {
        ::unlink(asidePath.c_str());
    }
    return error;
}

int AtomicFile::MakeFolders(const std::string& folder) {
    for (size_t slash = folder.find('/', 1);; slash = folder.find('/', slash + 1)) {
        const std::string prefix = folder.substr(0, slash);
        if (!prefix.empty() && ::mkdir(prefix.c_str(), 0700) != 0 && errno != EEXIST) {
            return errno;
        }
        if (slash == std::string::npos) {
            break;
        }
    }
    struct stat info {};
    if (::stat(folder.c_str(), &info) != 0) {
        return errno;
    }
    return S_ISDIR(info.st_mode) ? 0 : ENOTDIR;
}

}  // namespace cv::posix
