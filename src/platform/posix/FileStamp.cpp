#include "platform/posix/FileStamp.h"

namespace cv::posix {

namespace {

int64_t Nanoseconds(const struct timespec& tTime) {
    return static_cast<int64_t>(tTime.tv_sec) * 1000000000 + tTime.tv_nsec;
}

}  // namespace

FileStamp FileStamp::OfStat(const struct stat& tInfo, std::shared_ptr<const UniqueFd> cPin) {
    FileStamp stamp;
    stamp.mbExists = true;
    stamp.mlDevice = static_cast<uint64_t>(tInfo.st_dev);
    stamp.mlInode = static_cast<uint64_t>(tInfo.st_ino);
    stamp.mlSize = static_cast<int64_t>(tInfo.st_size);
    stamp.mlModifiedNs = Nanoseconds(tInfo.st_mtim);
    stamp.mlChangedNs = Nanoseconds(tInfo.st_ctim);
    stamp.mcPin = std::move(cPin);
    return stamp;
}

FileStamp FileStamp::OfPath(const std::string& sPath) {
    struct stat info {};
    if (::stat(sPath.c_str(), &info) != 0) {
        return FileStamp();
    }
    return OfStat(info);
}

bool FileStamp::operator==(const FileStamp& cOther) const {
    if (!mbExists || !cOther.mbExists) {
        return mbExists == cOther.mbExists;
    }
    return mlDevice == cOther.mlDevice && mlInode == cOther.mlInode && mlSize == cOther.mlSize &&
           mlModifiedNs == cOther.mlModifiedNs && mlChangedNs == cOther.mlChangedNs;
}

}  // namespace cv::posix
