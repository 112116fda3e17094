#pragma once

#include <unistd.h>

#include <utility>

namespace cv::posix {

// Owns one open file descriptor and closes it when dropped or replaced.
class UniqueFd {
  public:
    UniqueFd() = default;
    explicit UniqueFd(int iFd) : miFd(iFd) {}
    UniqueFd(UniqueFd&& cOther) noexcept : miFd(std::exchange(cOther.miFd, -1)) {}
    UniqueFd& operator=(UniqueFd&& cOther) noexcept {
        if (this != &cOther) {
            Reset(std::exchange(cOther.miFd, -1));
        }
        return *this;
    }
    UniqueFd(const UniqueFd&) = delete;
    UniqueFd& operator=(const UniqueFd&) = delete;
    ~UniqueFd() { Reset(); }

    int Get() const { return miFd; }
    bool Valid() const { return miFd >= 0; }
    void Reset(int iFd = -1) {
        if (miFd >= 0) {
            ::close(miFd);
        }
        miFd = iFd;
    }

  private:
    int miFd = -1;
};

}  // namespace cv::posix
