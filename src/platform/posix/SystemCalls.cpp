#include "platform/posix/SystemCalls.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <cstdio>

namespace cv::posix {

int SystemCalls::Open(const char* path, int flags, mode_t mode) {
    return ::open(path, flags, mode);
}

ssize_t SystemCalls::Read(int fd, void* buffer, size_t size) {
    return ::read(fd, buffer, size);
}

ssize_t SystemCalls::Write(int fd, const void* data, size_t size) {
    return ::write(fd, data, size);
}

int SystemCalls::Fsync(int fd) {
    return ::fsync(fd);
}

int SystemCalls::Rename(const char* from, const char* to) {
    return ::rename(from, to);
}

int SystemCalls::Flock(int fd, int operation) {
    return ::flock(fd, operation);
}

SystemCalls& SystemCalls::Real() {
    static SystemCalls real;
    return real;
}

}  // namespace cv::posix
