#include "platform/posix/FileStamp.h"

namespace cv::posix {

namespace {

int64_t Nanoseconds(const struct timespec& time) {
    return static_cast<int64_t>(time.tv_sec) * 1000000000 + time.tv_nsec;
}

}  // namespace

FileStamp FileStamp::OfStat(const struct stat& info, std::shared_ptr<const UniqueFd> pin) {
    FileStamp stamp;
    stamp.exists_ = true;
    stamp.device_ = static_cast<uint64_t>(info.st_dev);
    stamp.inode_ = static_cast<uint64_t>(info.st_ino);
    stamp.size_ = static_cast<int64_t>(info.st_size);
    stamp.modifiedNs_ = Nanoseconds(info.st_mtim);
    stamp.changedNs_ = Nanoseconds(info.st_ctim);
    stamp.pin_ = std::move(pin);
    return stamp;
}

FileStamp FileStamp::OfPath(const std::string& path) {
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0) {
        return FileStamp();
    }
    return OfStat(info);
}

bool FileStamp::operator==(const FileStamp& other) const {
    if (!exists_ || !other.exists_) {
        return exists_ == other.exists_;
    }
    return device_ == other.device_ && inode_ == other.inode_ && size_ == other.size_ &&
           modifiedNs_ == other.modifiedNs_ && changedNs_ == other.changedNs_;
}

}  // namespace cv::posix
