#pragma once

#include <cerrno>
#include <cstddef>
#include <map>

#include "platform/posix/SystemCalls.h"

namespace cv::test {

// The real system calls, except those a test tells to fail: after `skip`
// good calls of one kind, the next `times` fail with an errno value. Writes
// can also be made short: each puts at most `bytes` bytes.
class FaultyCalls : public posix::SystemCalls {
  public:
    enum class Call { Open, Read, Write, Fsync, Rename, Flock };

    void Fail(Call call, int error, int skip = 0, int times = 1) {
        faults_[call] = Fault{error, skip, times};
    }
    void ShortWrites(size_t bytes) { writeLimit_ = bytes; }

    int Open(const char* path, int flags, mode_t mode) override {
        return Failing(Call::Open) ? -1 : SystemCalls::Open(path, flags, mode);
    }
    ssize_t Read(int fd, void* buffer, size_t size) override {
        return Failing(Call::Read) ? -1 : SystemCalls::Read(fd, buffer, size);
    }
    ssize_t Write(int fd, const void* data, size_t size) override {
        if (Failing(Call::Write)) {
            return -1;
        }
        return SystemCalls::Write(fd, data, writeLimit_ < size ? writeLimit_ : size);
    }
    int Fsync(int fd) override { return Failing(Call::Fsync) ? -1 : SystemCalls::Fsync(fd); }
    int Rename(const char* from, const char* to) override {
        return Failing(Call::Rename) ? -1 : SystemCalls::Rename(from, to);
    }
    int Flock(int fd, int operation) override {
        return Failing(Call::Flock) ? -1 : SystemCalls::Flock(fd, operation);
    }

  private:
    struct Fault {
        int error = 0;
        int skip = 0;
        int times = 0;
    };

    bool Failing(Call call) {
        const auto found = faults_.find(call);
        if (found == faults_.end() || found->second.times == 0) {
            return false;
        }
        Fault& fault = found->second;
        if (fault.skip > 0) {
            --fault.skip;
            return false;
        }
        --fault.times;
        errno = fault.error;
        return true;
    }

    std::map<Call, Fault> faults_;
    size_t writeLimit_ = static_cast<size_t>(-1);
};

}  // namespace cv::test
