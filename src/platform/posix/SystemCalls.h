#pragma once

#include <sys/types.h>

#include <cstddef>

namespace cv::posix {

// The system calls through which AtomicFile reaches the disk. Each behaves
// as the call of its name (a negative result sets errno); tests override
// some of them to fail (EINTR, ENOSPC, EIO, a short write, a refused rename)
// and prove what a failure leaves behind.
class SystemCalls {
  public:
    virtual ~SystemCalls() = default;

    virtual int Open(const char* path, int flags, mode_t mode);
    virtual ssize_t Read(int fd, void* buffer, size_t size);
    virtual ssize_t Write(int fd, const void* data, size_t size);
    virtual int Fsync(int fd);
    virtual int Rename(const char* from, const char* to);
    virtual int Flock(int fd, int operation);

    // The process's own calls, unchanged.
    static SystemCalls& Real();
};

}  // namespace cv::posix
