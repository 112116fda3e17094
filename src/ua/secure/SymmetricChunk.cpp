#include "ua/secure/SymmetricChunk.h"

#include "ua/crypto/Primitives.h"
#include "ua/secure/ChunkPadding.h"

namespace cv::ua {
namespace {

constexpr size_t kSizeAt = 4;

Error BadSignature() {
    return Error{status::BadSecurityChecksFailed,
                 "The signature of a message from the server does not match."};
}

}  // namespace

void SetChunkSize(std::string& chunk, size_t size) {
    for (size_t i = 0; i < 4; ++i) {
        chunk[kSizeAt + i] = static_cast<char>((size >> (8 * i)) & 0xFF);
    }
}

Result<Done> SealChunk(std::string& chunk, size_t sequenceAt, const SymmetricKeys& keys,
                       bool encrypt) {
    if (encrypt) {
        AppendPadding(chunk,
                      PaddingCount(chunk.size() - sequenceAt, kSymmetricSignatureBytes,
                                   kSymmetricBlockBytes, false),
                      false);
    }
    SetChunkSize(chunk, chunk.size() + kSymmetricSignatureBytes);
    chunk += crypto::HmacSha256(keys.signing, chunk);
    if (!encrypt) {
        return Done{};
    }
    auto encrypted =
        crypto::AesCbcEncrypt(keys.encrypting, keys.iv, std::string_view(chunk).substr(sequenceAt));
    if (!encrypted) {
        return encrypted.Failure();
    }
    chunk.replace(sequenceAt, std::string::npos, encrypted.Value());
    return Done{};
}

Result<size_t> OpenChunk(std::string& chunk, size_t sequenceAt, const SymmetricKeys& keys,
                         bool encrypt) {
    if (encrypt) {
        auto plain = crypto::AesCbcDecrypt(keys.encrypting, keys.iv,
                                           std::string_view(chunk).substr(sequenceAt));
        if (!plain) {
            return plain.Failure();
        }
        chunk.replace(sequenceAt, std::string::npos, plain.Value());
    }
    if (chunk.size() < sequenceAt + kSymmetricSignatureBytes) {
        return BadSignature();
    }
    const size_t signedEnd = chunk.size() - kSymmetricSignatureBytes;
    const std::string expected =
        crypto::HmacSha256(keys.signing, std::string_view(chunk).substr(0, signedEnd));
    if (!crypto::SameBytes(expected, std::string_view(chunk).substr(signedEnd))) {
        return BadSignature();
    }
    if (!encrypt) {
        return signedEnd;
    }
    auto padding =
        PaddingLength(std::string_view(chunk).substr(sequenceAt, signedEnd - sequenceAt), false);
    if (!padding) {
        return padding.Failure();
    }
    return signedEnd - padding.Value();
}

}  // namespace cv::ua
