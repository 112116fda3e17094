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

std::error_code LastError() {
    return {errno, std::generic_category()};
}

std::error_code ErrorOf(std::errc code) {
    return std::make_error_code(code);
}

// Repeats a call that a signal interrupted.
template <typename Call>
auto Retrying(Call call) {
    for (;;) {
        const auto result = call();
        if (result >= 0 || errno != EINTR) {
            return result;
        }
    }
}

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

AtomicFile::AtomicFile(std::string path, NewFileMode newMode, SystemCalls& calls)
    : path_(std::move(path)), newMode_(newMode), calls_(calls) {}

AtomicFile::~AtomicFile() {
    Unlock();
}

int AtomicFile::Open(const std::string& path, int flags, mode_t mode) const {
    return Retrying([&] { return calls_.Open(path.c_str(), flags, mode); });
}

std::error_code AtomicFile::ReadAll(int fd, std::string& out) const {
    struct stat info {};
    if (::fstat(fd, &info) != 0) {
        return LastError();
    }
    if (S_ISDIR(info.st_mode)) {
        return ErrorOf(std::errc::is_a_directory);
    }
    std::string text;
    text.reserve(static_cast<size_t>(std::clamp<int64_t>(info.st_size, 0, kMaxBytes)));
    std::array<char, 65536> block{};
    for (;;) {
        const ssize_t got = Retrying([&] { return calls_.Read(fd, block.data(), block.size()); });
        if (got < 0) {
            return LastError();
        }
        if (got == 0) {
            break;
        }
        if (static_cast<int64_t>(text.size()) + got > kMaxBytes) {
            return ErrorOf(std::errc::file_too_large);
        }
        text.append(block.data(), static_cast<size_t>(got));
    }
    out = std::move(text);
    return {};
}

std::error_code AtomicFile::WriteAll(int fd, std::string_view text) const {
    while (!text.empty()) {
        const ssize_t put = Retrying([&] { return calls_.Write(fd, text.data(), text.size()); });
        if (put < 0) {
            return LastError();
        }
        text.remove_prefix(static_cast<size_t>(put));
    }
    return {};
}

std::error_code AtomicFile::Sync(int fd) const {
    return Retrying([&] { return calls_.Fsync(fd); }) != 0 ? LastError() : std::error_code();
}

// Makes a rename in the folder durable; file systems that cannot do this
// still keep the rename atomic, so a failure here is not an error.
void AtomicFile::SyncFolder(const std::string& folder) const {
    const UniqueFd handle(Open(folder, O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (handle.Valid()) {
        static_cast<void>(Sync(handle.Get()));
    }
}

FileRead AtomicFile::Read() const {
    FileRead result;
    const std::string& path = Locked() ? lockedTarget_ : path_;
    auto file = std::make_shared<UniqueFd>(Open(path, O_RDONLY | O_CLOEXEC | O_NOCTTY));
    if (!file->Valid()) {
        result.error = LastError();
        const bool missing = result.error == std::errc::no_such_file_or_directory ||
                             result.error == std::errc::not_a_directory;
        result.status = missing ? ReadStatus::Missing : ReadStatus::Unreadable;
        return result;
    }
    struct stat info {};
    result.error =
        ::fstat(file->Get(), &info) == 0 ? ReadAll(file->Get(), result.text) : LastError();
    if (result.error) {
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
    auto pin = std::make_shared<UniqueFd>(Open(lockedTarget_, O_RDONLY | O_CLOEXEC | O_NOCTTY));
    struct stat info {};
    if (!pin->Valid() || ::fstat(pin->Get(), &info) != 0) {
        return FileStamp::OfPath(lockedTarget_);
    }
    return FileStamp::OfStat(info, std::move(pin));
}

std::error_code AtomicFile::Lock() {
    if (Locked()) {
        return {};
    }
    return LockTarget(ResolveTarget(path_));
}

std::error_code AtomicFile::LockTarget(const std::string& target) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(kLockWaitMs);
    for (;;) {
        UniqueFd file;
        if (const std::error_code error = OpenForLock(target, file)) {
            return error;
        }
        int pauseMs = 1;
        while (Retrying([&] { return calls_.Flock(file.Get(), LOCK_EX | LOCK_NB); }) != 0) {
            if (errno != EWOULDBLOCK) {
                const std::error_code error = LastError();
                Abandon(file, target);
                return error;
            }
            if (std::chrono::steady_clock::now() >= deadline) {
                Abandon(file, target);
                return ErrorOf(std::errc::timed_out);
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(pauseMs));
            pauseMs = std::min(pauseMs * 2, 50);
        }
        if (SameInode(file.Get(), target)) {
            lock_ = std::move(file);
            lockedTarget_ = target;
            return {};
        }
    }
}

// A file created empty only to be locked goes again when nothing was
// written to it.
void AtomicFile::Abandon(UniqueFd& file, const std::string& target) {
    struct stat info {};
    if (createdEmpty_ && ::fstat(file.Get(), &info) == 0 && info.st_size == 0 &&
        SameInode(file.Get(), target)) {
        ::unlink(target.c_str());
    }
    file.Reset();
    createdEmpty_ = false;
}

std::error_code AtomicFile::OpenForLock(const std::string& target, UniqueFd& fd) {
    const mode_t mode = newMode_ == NewFileMode::OwnerOnly ? 0600 : 0666;
    for (;;) {
        fd.Reset(Open(target, O_RDONLY | O_CLOEXEC | O_NOCTTY));
        if (fd.Valid()) {
            createdEmpty_ = false;
            struct stat info {};
            if (::fstat(fd.Get(), &info) != 0) {
                return LastError();
            }
            return S_ISDIR(info.st_mode) ? ErrorOf(std::errc::is_a_directory) : std::error_code();
        }
        if (errno != ENOENT) {
            return LastError();
        }
        fd.Reset(Open(target, O_RDONLY | O_CREAT | O_EXCL | O_CLOEXEC | O_NOCTTY, mode));
        if (fd.Valid()) {
            createdEmpty_ = true;
            return {};
        }
        if (errno != EEXIST) {
            return LastError();
        }
    }
}

void AtomicFile::Unlock() {
    if (Locked()) {
        Abandon(lock_, lockedTarget_);
        lockedTarget_.clear();
    }
}

std::error_code AtomicFile::Replace(std::string_view text) {
    const bool ownLock = !Locked();
    std::error_code error = Lock();
    if (error) {
        return error;
    }
    UniqueFd temp;
    std::string tempPath;
    if (::access(lockedTarget_.c_str(), W_OK) != 0) {
        error = LastError();
    } else {
        error = WriteTemporary(text, temp, tempPath);
    }
    if (!error && (Retrying([&] { return calls_.Flock(temp.Get(), LOCK_EX | LOCK_NB); }) != 0 ||
                   calls_.Rename(tempPath.c_str(), lockedTarget_.c_str()) != 0)) {
        error = LastError();
        ::unlink(tempPath.c_str());
    }
    if (!error) {
        SyncFolder(FolderOf(lockedTarget_));
        lock_ = std::move(temp);
        createdEmpty_ = false;
    }
    if (ownLock) {
        Unlock();
    }
    return error;
}

std::error_code AtomicFile::WriteTemporary(std::string_view text, UniqueFd& temp,
                                           std::string& tempPath) const {
    tempPath = FolderOf(lockedTarget_) + "/." + NameOf(lockedTarget_) + ".cv-tmp";
    ::unlink(tempPath.c_str());
    temp.Reset(Open(tempPath, O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (!temp.Valid()) {
        return LastError();
    }
    struct stat held {};
    std::error_code error = ::fstat(lock_.Get(), &held) != 0 ? LastError() : std::error_code();
    if (!error && ::fchmod(temp.Get(), held.st_mode & 07777) != 0) {
        error = LastError();
    }
    if (!error) {
        error = WriteAll(temp.Get(), text);
    }
    if (!error) {
        error = Sync(temp.Get());
    }
    if (error) {
        temp.Reset();
        ::unlink(tempPath.c_str());
    }
    return error;
}

std::error_code AtomicFile::SetAside(std::string& asidePath) {
    const bool ownLock = !Locked();
    std::error_code error = Lock();
    if (error) {
        return error;
    }
    const FileRead current = Read();
    error = current.status == ReadStatus::Read ? std::error_code() : current.error;
    const std::string base = lockedTarget_ + ".damaged-" + TimeTag();
    for (int attempt = 1; !error; ++attempt) {
        const std::string candidate = attempt == 1 ? base : base + "-" + std::to_string(attempt);
        error = CopyTo(current.text, candidate);
        if (!error) {
            asidePath = candidate;
            break;
        }
        if (error == std::errc::file_exists && attempt < 1000) {
            error.clear();
        }
    }
    if (ownLock) {
        Unlock();
    }
    return error;
}

std::error_code AtomicFile::CopyTo(const std::string& text, const std::string& asidePath) const {
    const UniqueFd copy(Open(asidePath, O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
    if (!copy.Valid()) {
        return LastError();
    }
    std::error_code error = WriteAll(copy.Get(), text);
    if (!error) {
        error = Sync(copy.Get());
    }
    if (error) {
        ::unlink(asidePath.c_str());
    }
    return error;
}

std::error_code AtomicFile::MakeFolders(const std::string& folder) {
    for (size_t slash = folder.find('/', 1);; slash = folder.find('/', slash + 1)) {
        const std::string prefix = folder.substr(0, slash);
        if (!prefix.empty() && ::mkdir(prefix.c_str(), 0700) != 0 && errno != EEXIST) {
            return LastError();
        }
        if (slash == std::string::npos) {
            break;
        }
    }
    struct stat info {};
    if (::stat(folder.c_str(), &info) != 0) {
        return LastError();
    }
    return S_ISDIR(info.st_mode) ? std::error_code() : ErrorOf(std::errc::not_a_directory);
}

}  // namespace cv::posix
