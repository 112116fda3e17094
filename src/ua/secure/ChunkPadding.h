#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "ua/types/Result.h"

namespace cv::ua {

// The padding of an encrypted chunk. What gets encrypted is
//   sequence header | body | PaddingSize | padding | [ExtraPaddingSize] | signature
// and must be a whole number of plain blocks. PaddingSize is the low byte of
// the padding count and every padding byte repeats it; ExtraPaddingSize, the
// high byte, is there only when the encrypting RSA key has more than 2048
// bits (never for AES).

// How many padding bytes follow PaddingSize when `plain` bytes (sequence
// header and body) come before them.
size_t PaddingCount(size_t plain, size_t signatureBytes, size_t blockBytes, bool extraByte);
// Appends PaddingSize, the padding and ExtraPaddingSize.
void AppendPadding(std::string& chunk, size_t count, bool extraByte);
// For decrypted bytes that end where the signature starts: how many bytes at
// their end are padding (size bytes included), after checking every one.
Result<size_t> PaddingLength(std::string_view plain, bool extraByte);

// The body bytes that fit a chunk of chunkSize whose encrypted part starts at
// sequenceAt: sequence header, body, padding and signature must fit the
// whole blocks there are room for.
size_t EncryptedBodyRoom(size_t chunkSize, size_t sequenceAt, size_t plainBlock, size_t cipherBlock,
                         size_t signatureBytes, bool extraByte);

}  // namespace cv::ua
