#pragma once

#include <sys/stat.h>

#include <cstdint>
#include <memory>
#include <string>

#include "platform/posix/UniqueFd.h"

namespace cv::posix {

// Marks one version of a file: the inode that holds it, its size and its
// modification and status-change times in nanoseconds. Our writers always put
// a new inode in place, so every write changes the stamp; a stamp taken while
// reading also keeps that inode open, so the system cannot give its number to
// a later version while the stamp is kept. Comparing two stamps is enough to
// skip re-reading a file that has not changed.
class FileStamp {
  public:
    // A missing file.
    FileStamp() = default;
    static FileStamp OfStat(const struct stat& info, std::shared_ptr<const UniqueFd> pin = {});
    // Follows symbolic links; a path that cannot be examined gives a missing stamp.
    static FileStamp OfPath(const std::string& path);

    bool Exists() const { return exists_; }
    int64_t Size() const { return size_; }
    // Equal when both describe the same version (the pin plays no part).
    bool operator==(const FileStamp& other) const;

  private:
    bool exists_ = false;
    uint64_t device_ = 0;
    uint64_t inode_ = 0;
    int64_t size_ = 0;
    int64_t modifiedNs_ = 0;
    int64_t changedNs_ = 0;
    std::shared_ptr<const UniqueFd> pin_;
};

}  // namespace cv::posix
