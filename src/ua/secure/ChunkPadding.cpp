#include "ua/secure/ChunkPadding.h"

namespace cv::ua {
namespace {

constexpr size_t kSequenceHeaderBytes = 8;

Error BadPadding() {
    return Error{status::BadSecurityChecksFailed,
                 "The server sent an encrypted chunk whose padding is broken."};
}

}  // namespace

size_t PaddingCount(size_t plain, size_t signatureBytes, size_t blockBytes, bool extraByte) {
    const size_t fixed = plain + 1 + (extraByte ? 1 : 0) + signatureBytes;
    return (blockBytes - fixed % blockBytes) % blockBytes;
}

void AppendPadding(std::string& chunk, size_t count, bool extraByte) {
    const char low = static_cast<char>(count & 0xFF);
    chunk.push_back(low);
    chunk.append(count, low);
    if (extraByte) {
        chunk.push_back(static_cast<char>((count >> 8) & 0xFF));
    }
}

Result<size_t> PaddingLength(std::string_view plain, bool extraByte) {
    const size_t sizeBytes = extraByte ? 2 : 1;
    if (plain.size() < sizeBytes) {
        return BadPadding();
    }
    const auto byteAt = [&plain](size_t fromEnd) {
        return static_cast<unsigned char>(plain[plain.size() - fromEnd]);
    };
    const unsigned char low = extraByte ? byteAt(2) : byteAt(1);
    const size_t count = (extraByte ? size_t{byteAt(1)} << 8 : 0) | low;
    if (count + sizeBytes > plain.size()) {
        return BadPadding();
    }
    const std::string_view padding = plain.substr(plain.size() - sizeBytes - count, count);
    for (const char byte : padding) {
        if (static_cast<unsigned char>(byte) != low) {
            return BadPadding();
        }
    }
    return count + sizeBytes;
}

size_t EncryptedBodyRoom(size_t chunkSize, size_t sequenceAt, size_t plainBlock, size_t cipherBlock,
                         size_t signatureBytes, bool extraByte) {
    if (chunkSize <= sequenceAt || cipherBlock == 0) {
        return 0;
    }
    const size_t plain = (chunkSize - sequenceAt) / cipherBlock * plainBlock;
    const size_t fixed = kSequenceHeaderBytes + 1 + (extraByte ? 1 : 0) + signatureBytes;
    return plain > fixed ? plain - fixed : 0;
}

}  // namespace cv::ua
