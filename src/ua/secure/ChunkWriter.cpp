#include "ua/secure/ChunkWriter.h"

#include "ua/encoding/Encoder.h"

namespace cv::ua {
namespace {

// Sequence numbers wrap to a small number before they reach the top.
constexpr uint32_t kLastSequenceBeforeWrap = 0xFFFFFFFFu - 1024;

}  // namespace

std::string ChunkWriter::Headers(MessageKind kind, uint32_t channelId, uint32_t tokenId) const {
    std::string headers(kFrameHeaderSize, '\0');
    Encoder encoder(headers);
    encoder(channelId);
    if (kind == MessageKind::Open) {
        policy_.WriteAsymmetricHeader(encoder);
    } else {
        encoder(tokenId);
    }
    return headers;
}

uint32_t ChunkWriter::NextSequenceNumber() {
    lastSequence_ = lastSequence_ >= kLastSequenceBeforeWrap ? 1 : lastSequence_ + 1;
    return lastSequence_;
}

Result<std::vector<std::string>> ChunkWriter::Write(MessageKind kind, uint32_t channelId,
                                                    uint32_t tokenId, uint32_t requestId,
                                                    std::string_view body) {
    const std::string headers = Headers(kind, channelId, tokenId);
    const size_t sequenceAt = headers.size();
    const bool asymmetric = kind == MessageKind::Open;
    const size_t room = policy_.BodyRoom(limits_.chunkSize, sequenceAt + 8, asymmetric);
    if (room == 0) {
        return Error{status::BadTcpInternalError,
                     "The server's buffer is too small to hold the security headers."};
    }
    const size_t chunkCount = body.empty() ? 1 : (body.size() + room - 1) / room;
    if ((limits_.maxMessageSize != 0 && body.size() > limits_.maxMessageSize) ||
        (limits_.maxChunkCount != 0 && chunkCount > limits_.maxChunkCount)) {
        return Error{status::BadRequestTooLarge, "The request of " + std::to_string(body.size()) +
                                                     " bytes is larger than the server accepts."};
    }
    std::vector<std::string> chunks;
    chunks.reserve(chunkCount);
    for (size_t i = 0; i < chunkCount; ++i) {
        std::string chunk = headers;
        Encoder encoder(chunk);
        encoder(NextSequenceNumber());
        encoder(requestId);
        chunk.append(body.substr(i * room, room));
        const char type = i + 1 == chunkCount ? 'F' : 'C';
        const std::string_view code = MessageKindCode(kind);
        chunk.replace(0, 4, std::string(code) + type);
        encoder.PatchUInt32(4, static_cast<uint32_t>(chunk.size()));
        auto secured = policy_.Protect(chunk, sequenceAt, asymmetric);
        if (!secured) {
            return secured.Failure();
        }
        chunks.push_back(std::move(chunk));
    }
    return chunks;
}

}  // namespace cv::ua
