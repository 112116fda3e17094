#pragma once

#include <sys/stat.h>

#include <fstream>
#include <sstream>
#include <string>

namespace cv::test {

// Reads and writes files directly, past the classes under test.
inline std::string Slurp(const std::string& sPath) {
    std::ifstream in(sPath, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

inline void Spill(const std::string& sPath, const std::string& sText) {
    std::ofstream(sPath, std::ios::binary) << sText;
}

// The permission bits, 0 when there is no such file.
inline mode_t ModeOf(const std::string& sPath) {
    struct stat info {};
    return ::stat(sPath.c_str(), &info) == 0 ? (info.st_mode & 07777) : 0;
}

// Tells whether a file was replaced: a replace puts a new inode at the path.
inline ino_t InodeOf(const std::string& sPath) {
    struct stat info {};
    return ::stat(sPath.c_str(), &info) == 0 ? info.st_ino : 0;
}

}  // namespace cv::test
