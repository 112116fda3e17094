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

std::string FolderOf(const std::string& sPath) {
    const auto slash = sPath.rfind('/');
    if (slash == std::string::npos) {
        return ".";
    }
    return slash == 0 ? "/" : sPath.substr(0, slash);
}

std::string NameOf(const std::string& sPath) {
    const auto slash = sPath.rfind('/');
    return slash == std::string::npos ? sPath : sPath.substr(slash + 1);
}

// Follows symbolic links (dangling ones too) to the path that really holds
// the file, so that replacing it keeps the links.
std::string ResolveTarget(const std::string& sPath) {
    std::string target = sPath;
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

int ReadDescriptor(int iFd, std::string& sText) {
    struct stat info {};
    if (::fstat(iFd, &info) != 0) {
        return errno;
    }
    if (S_ISDIR(info.st_mode)) {
        return EISDIR;
    }
    std::string text;
    text.reserve(static_cast<size_t>(std::clamp<int64_t>(info.st_size, 0, AtomicFile::kMaxBytes)));
    std::array<char, 65536> block{};
    for (;;) {
        const ssize_t got = ::read(iFd, block.data(), block.size());
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
    sText = std::move(text);
    return 0;
}

int WriteAll(int iFd, std::string_view sText) {
    while (!sText.empty()) {
        const ssize_t put = ::write(iFd, sText.data(), sText.size());
        if (put < 0 && errno == EINTR) {
            continue;
        }
        if (put < 0) {
            return errno;
        }
        sText.remove_prefix(static_cast<size_t>(put));
    }
    return 0;
}

// Makes a rename in the folder durable; file systems that cannot do this
// still keep the rename atomic, so a failure here is not an error.
void SyncFolder(const std::string& sFolder) {
    const UniqueFd folder(::open(sFolder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (folder.Valid()) {
        ::fsync(folder.Get());
    }
}

bool SameInode(int iFd, const std::string& sPath) {
    struct stat held {};
    struct stat current {};
    return ::fstat(iFd, &held) == 0 && ::stat(sPath.c_str(), &current) == 0 &&
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

AtomicFile::AtomicFile(std::string sPath, NewFileMode eNewMode)
    : msPath(std::move(sPath)), meNewMode(eNewMode) {}

AtomicFile::~AtomicFile() {
    Unlock();
}

FileRead AtomicFile::Read() const {
    FileRead result;
    const std::string& path = Locked() ? msLockedTarget : msPath;
    auto file = std::make_shared<UniqueFd>(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
    if (!file->Valid()) {
        result.Error = errno;
        const bool missing = result.Error == ENOENT || result.Error == ENOTDIR;
        result.Status = missing ? ReadStatus::Missing : ReadStatus::Unreadable;
        return result;
    }
    struct stat info {};
    result.Error =
        ::fstat(file->Get(), &info) == 0 ? ReadDescriptor(file->Get(), result.Text) : errno;
    if (result.Error != 0) {
        result.Status = ReadStatus::Unreadable;
        result.Text.clear();
        return result;
    }
    result.Status = ReadStatus::Read;
    result.Stamp = FileStamp::OfStat(info, std::move(file));
    return result;
}

FileStamp AtomicFile::Stamp() const {
    if (!Locked()) {
        return FileStamp::OfPath(msPath);
    }
    auto pin =
        std::make_shared<UniqueFd>(::open(msLockedTarget.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
    struct stat info {};
    if (!pin->Valid() || ::fstat(pin->Get(), &info) != 0) {
        return FileStamp::OfPath(msLockedTarget);
    }
    return FileStamp::OfStat(info, std::move(pin));
}

int AtomicFile::Lock() {
    if (Locked()) {
        return 0;
    }
    return LockTarget(ResolveTarget(msPath));
}

int AtomicFile::LockTarget(const std::string& sTarget) {
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(kLockWaitMs);
    for (;;) {
        UniqueFd file;
        const int error = OpenForLock(sTarget, file);
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
        if (SameInode(file.Get(), sTarget)) {
            mcLock = std::move(file);
            msLockedTarget = sTarget;
            return 0;
        }
    }
}

int AtomicFile::OpenForLock(const std::string& sTarget, UniqueFd& cFd) {
    const mode_t mode = meNewMode == NewFileMode::OwnerOnly ? 0600 : 0666;
    for (;;) {
        cFd.Reset(::open(sTarget.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY));
        if (cFd.Valid()) {
            mbCreatedEmpty = false;
            struct stat info {};
            return ::fstat(cFd.Get(), &info) != 0 ? errno : S_ISDIR(info.st_mode) ? EISDIR : 0;
        }
        if (errno != ENOENT) {
            return errno;
        }
        cFd.Reset(
            ::open(sTarget.c_str(), O_RDONLY | O_CREAT | O_EXCL | O_CLOEXEC | O_NOCTTY, mode));
        if (cFd.Valid()) {
            mbCreatedEmpty = true;
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
    if (mbCreatedEmpty && ::fstat(mcLock.Get(), &info) == 0 && info.st_size == 0 &&
        SameInode(mcLock.Get(), msLockedTarget)) {
        ::unlink(msLockedTarget.c_str());
    }
    mcLock.Reset();
    msLockedTarget.clear();
    mbCreatedEmpty = false;
}

int AtomicFile::Replace(std::string_view sText) {
    const bool ownLock = !Locked();
    int error = Lock();
    if (error != 0) {
        return error;
    }
    UniqueFd temp;
    std::string tempPath;
    if (::access(msLockedTarget.c_str(), W_OK) != 0) {
        error = errno;
    } else {
        error = WriteTemporary(sText, temp, tempPath);
    }
    if (error == 0 && (::flock(temp.Get(), LOCK_EX | LOCK_NB) != 0 ||
                       ::rename(tempPath.c_str(), msLockedTarget.c_str()) != 0)) {
        error = errno;
        ::unlink(tempPath.c_str());
    }
    if (error == 0) {
        SyncFolder(FolderOf(msLockedTarget));
        mcLock = std::move(temp);
        mbCreatedEmpty = false;
    }
    if (ownLock) {
        Unlock();
    }
    return error;
}

int AtomicFile::WriteTemporary(std::string_view sText, UniqueFd& cTemp,
                               std::string& sTempPath) const {
    sTempPath = FolderOf(msLockedTarget) + "/." + NameOf(msLockedTarget) + ".cv-tmp";
    ::unlink(sTempPath.c_str());
    cTemp.Reset(
        ::open(sTempPath.c_str(), O_RDWR | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600));
    if (!cTemp.Valid()) {
        return errno;
    }
    struct stat held {};
    int error = ::fstat(mcLock.Get(), &held) != 0 ? errno : 0;
    if (error == 0 && ::fchmod(cTemp.Get(), held.st_mode & 07777) != 0) {
        error = errno;
    }
    if (error == 0) {
        error = WriteAll(cTemp.Get(), sText);
    }
    if (error == 0 && ::fsync(cTemp.Get()) != 0) {
        error = errno;
    }
    if (error != 0) {
        cTemp.Reset();
        ::unlink(sTempPath.c_str());
    }
    return error;
}

int AtomicFile::SetAside(std::string& sAsidePath) {
    const bool ownLock = !Locked();
    int error = Lock();
    if (error != 0) {
        return error;
    }
    const FileRead current = Read();
    error = current.Status == ReadStatus::Read ? 0 : current.Error;
    const std::string base = msLockedTarget + ".damaged-" + TimeTag();
    for (int attempt = 1; error == 0; ++attempt) {
        const std::string candidate = attempt == 1 ? base : base + "-" + std::to_string(attempt);
        error = CopyTo(current.Text, candidate);
        if (error == 0) {
            sAsidePath = candidate;
            break;
        }
        error = error == EEXIST && attempt < 1000 ? 0 : error;
    }
    if (ownLock) {
        Unlock();
    }
    return error;
}

int AtomicFile::CopyTo(const std::string& sText, const std::string& sAsidePath) const {
    const UniqueFd copy(::open(sAsidePath.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0600));
    if (!copy.Valid()) {
        return errno;
    }
    int error = WriteAll(copy.Get(), sText);
    if (error == 0 && ::fsync(copy.Get()) != 0) {
        error = errno;
    }
    if (error != 0) {
        ::unlink(sAsidePath.c_str());
    }
    return error;
}

int AtomicFile::MakeFolders(const std::string& sFolder) {
    for (size_t slash = sFolder.find('/', 1);; slash = sFolder.find('/', slash + 1)) {
        const std::string prefix = sFolder.substr(0, slash);
        if (!prefix.empty() && ::mkdir(prefix.c_str(), 0700) != 0 && errno != EEXIST) {
            return errno;
        }
        if (slash == std::string::npos) {
            break;
        }
    }
    struct stat info {};
    if (::stat(sFolder.c_str(), &info) != 0) {
        return errno;
    }
    return S_ISDIR(info.st_mode) ? 0 : ENOTDIR;
}

}  // namespace cv::posix
