#include "platform/NetEnumApi.h"

namespace cv::platform {

namespace {

// Four 32-bit values and four text pointers of a 32-bit process.
constexpr int32_t kFixedPartBytes = 32;

int32_t TextBytes(const std::string& text) {
    return text.empty() ? 0 : static_cast<int32_t>(text.size()) + 1;
}

}  // namespace

int32_t NetResourceRecord::ByteSize() const {
    return kFixedPartBytes + TextBytes(lpLocalName) + TextBytes(lpRemoteName) +
           TextBytes(lpComment) + TextBytes(lpProvider);
}

}  // namespace cv::platform
