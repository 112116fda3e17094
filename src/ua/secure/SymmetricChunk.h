#pragma once

#include <cstddef>
#include <string>

#include "ua/secure/PolicyProfile.h"
#include "ua/types/Result.h"

namespace cv::ua {

// The symmetric security of a laid-out MSG or CLO chunk whose sequence
// header starts at sequenceAt. Signing appends HMAC-SHA256 over everything
// before it; encrypting first pads (ChunkPadding.h) and afterwards encrypts
// from the sequence header to the end with AES-CBC (no cipher padding). The
// size in the chunk's header is the final size in both cases.
Result<Done> SealChunk(std::string& chunk, size_t sequenceAt, const SymmetricKeys& keys,
                       bool encrypt);
// The reverse: decrypts, checks the signature and the padding, and gives the
// end of the body.
Result<size_t> OpenChunk(std::string& chunk, size_t sequenceAt, const SymmetricKeys& keys,
                         bool encrypt);

// The size in a chunk's message header.
void SetChunkSize(std::string& chunk, size_t size);

}  // namespace cv::ua
