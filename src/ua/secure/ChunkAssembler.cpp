#include "ua/secure/ChunkAssembler.h"

#include <algorithm>

#include "ua/encoding/Decoder.h"

namespace cv::ua {
namespace {

// Messages whose chunks may arrive interleaved.
constexpr size_t kMaxUnfinishedMessages = 4;
constexpr uint32_t kWrapLimit = 1024;

Error TooLarge(const std::string& what) {
    return Error{status::BadTcpMessageTooLarge, "The server sent a message " + what + "."};
}

}  // namespace

void ChunkAssembler::SetLimits(uint32_t maxMessageSize, uint32_t maxChunkCount,
                               uint32_t maxUnfinishedSize) {
    maxMessageSize_ = maxMessageSize;
    maxChunkCount_ = maxChunkCount;
    maxUnfinishedSize_ = maxUnfinishedSize;
}

void ChunkAssembler::AcceptToken(uint32_t tokenId) {
    if (tokens_.empty() || tokens_.back() != tokenId) {
        tokens_.push_back(tokenId);
    }
    if (tokens_.size() > 2) {
        tokens_.erase(tokens_.begin());
    }
}

void ChunkAssembler::RetireToken(uint32_t tokenId) {
    std::erase(tokens_, tokenId);
}

Result<Done> ChunkAssembler::CheckSequence(uint32_t sequenceNumber) {
    if (lastSequence_) {
        const uint32_t expected = *lastSequence_ + 1;
        const bool wrapped =
            *lastSequence_ > 0xFFFFFFFFu - kWrapLimit && sequenceNumber < kWrapLimit;
        if (sequenceNumber != expected && !wrapped) {
            return Error{status::BadSequenceNumberInvalid,
                         "The server sent chunk number " + std::to_string(sequenceNumber) +
                             " where number " + std::to_string(expected) + " was due."};
        }
    }
    lastSequence_ = sequenceNumber;
    return Done{};
}

Result<ChunkAssembler::Outcome> ChunkAssembler::Add(Frame frame) {
    const FrameHeader& header = frame.header;
    const std::string_view code = MessageKindCode(header.kind);
    Decoder decoder(std::string_view(frame.bytes).substr(kFrameHeaderSize));
    uint32_t channelId = 0;
    decoder(channelId);
    const bool asymmetric = header.kind == MessageKind::Open;
    if (asymmetric) {
        auto read = policy_.ReadAsymmetricHeader(decoder);
        if (!read) {
            return read.Failure();
        }
    } else {
        uint32_t tokenId = 0;
        decoder(tokenId);
        if (decoder.Ok() && std::find(tokens_.begin(), tokens_.end(), tokenId) == tokens_.end()) {
            return Error{status::BadSecureChannelTokenUnknown,
                         "The server sent a " + std::string(code) + " chunk under the token " +
                             std::to_string(tokenId) + ", which is not in force."};
        }
    }
    if (!decoder.Ok()) {
        return Error{status::BadDecodingError, "The server sent a " + std::string(code) +
                                                   " chunk that is too short for its headers."};
    }
    if (channelId_ != 0 && channelId != channelId_) {
        return Error{status::BadTcpSecureChannelUnknown,
                     "The server sent a chunk for the secure channel " + std::to_string(channelId) +
                         "; this channel is " + std::to_string(channelId_) + "."};
    }
    const size_t sequenceAt = kFrameHeaderSize + decoder.Position();
    auto plainEnd = policy_.Unprotect(frame.bytes, sequenceAt, asymmetric);
    if (!plainEnd) {
        return plainEnd.Failure();
    }
    if (plainEnd.Value() < sequenceAt + 8) {
        return Error{status::BadDecodingError, "The server sent a " + std::string(code) +
                                                   " chunk without a sequence header."};
    }
    Decoder sequence(std::string_view(frame.bytes).substr(sequenceAt, 8));
    uint32_t sequenceNumber = 0;
    uint32_t requestId = 0;
    sequence(sequenceNumber);
    sequence(requestId);
    auto checked = CheckSequence(sequenceNumber);
    if (!checked) {
        return checked.Failure();
    }
    const std::string_view body =
        std::string_view(frame.bytes).substr(sequenceAt + 8, plainEnd.Value() - sequenceAt - 8);
    return Collect(header, requestId, body);
}

Result<ChunkAssembler::Outcome> ChunkAssembler::Collect(const FrameHeader& header,
                                                        uint32_t requestId, std::string_view body) {
    Outcome outcome;
    auto found = partials_.find(requestId);
    if (header.chunkType == ChunkType::Abort) {
        if (found != partials_.end()) {
            Take(found);
        }
        ErrorMessage abort;
        Decoder decoder(body);
        decoder(abort);
        outcome.aborted = AbortedMessage{
            requestId, Error{abort.error.code != 0 ? abort.error : status::BadUnexpectedError,
                             "The server gave up on its answer: " +
                                 (abort.reason.empty() ? "no reason given" : abort.reason) + "."}};
        return outcome;
    }
    if (found == partials_.end()) {
        if (partials_.size() >= kMaxUnfinishedMessages) {
            return Error{status::BadTcpInternalError,
                         "The server interleaved more messages than the client accepts."};
        }
        found = partials_.emplace(requestId, Partial{}).first;
    }
    Partial& partial = found->second;
    auto room = CheckRoom(partial, body);
    if (!room) {
        return room.Failure();
    }
    partial.body.append(body);
    ++partial.chunks;
    unfinishedSize_ += body.size();
    if (header.chunkType == ChunkType::Final) {
        outcome.message = SecureMessage{header.kind, requestId, Take(found)};
    }
    return outcome;
}

// Checked before the chunk is added, so no limit is passed even briefly.
Result<Done> ChunkAssembler::CheckRoom(const Partial& partial, std::string_view body) const {
    if (maxChunkCount_ != 0 && partial.chunks >= maxChunkCount_) {
        return TooLarge("in more than " + std::to_string(maxChunkCount_) + " chunks");
    }
    if (maxMessageSize_ != 0 && partial.body.size() + body.size() > maxMessageSize_) {
        return TooLarge("larger than " + std::to_string(maxMessageSize_) + " bytes");
    }
    if (maxUnfinishedSize_ != 0 && unfinishedSize_ + body.size() > maxUnfinishedSize_) {
        return Error{status::BadTcpMessageTooLarge,
                     "The server left " + std::to_string(partials_.size()) +
                         " messages unfinished that together hold more than " +
                         std::to_string(maxUnfinishedSize_) + " bytes."};
    }
    return Done{};
}

std::string ChunkAssembler::Take(std::map<uint32_t, Partial>::iterator partial) {
    std::string body = std::move(partial->second.body);
    unfinishedSize_ -= body.size();
    partials_.erase(partial);
    return body;
}

}  // namespace cv::ua
