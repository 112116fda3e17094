#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "ua/types/Result.h"

namespace cv::ua {

// The kinds of UA-TCP message, from their three-letter header.
enum class MessageKind : uint8_t { Hello, Acknowledge, Error, Open, Message, Close };

// Final, intermediate (more follow) and abort chunks.
enum class ChunkType : char { Final = 'F', Intermediate = 'C', Abort = 'A' };

inline constexpr size_t kFrameHeaderSize = 8;
inline constexpr uint32_t kMinBufferSize = 8192;

struct FrameHeader {
    MessageKind kind = MessageKind::Message;
    ChunkType chunkType = ChunkType::Final;
    // The whole frame, header included.
    uint32_t size = 0;
};

std::string_view MessageKindCode(MessageKind kind);

// Checks the eight header bytes of a frame: a known kind, a known chunk
// type, and a size between the header and maxFrameSize.
Result<FrameHeader> ParseFrameHeader(std::string_view header, uint32_t maxFrameSize);

// A whole frame around body.
std::string MakeFrame(MessageKind kind, ChunkType chunkType, std::string_view body);

struct HelloMessage {
    uint32_t protocolVersion = 0;
    uint32_t receiveBufferSize = 0;
    uint32_t sendBufferSize = 0;
    // 0 for no limit.
    uint32_t maxMessageSize = 0;
    uint32_t maxChunkCount = 0;
    std::string endpointUrl;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.protocolVersion);
        v(s.receiveBufferSize);
        v(s.sendBufferSize);
        v(s.maxMessageSize);
        v(s.maxChunkCount);
        v(s.endpointUrl);
    }
};

struct AcknowledgeMessage {
    uint32_t protocolVersion = 0;
    uint32_t receiveBufferSize = 0;
    uint32_t sendBufferSize = 0;
    uint32_t maxMessageSize = 0;
    uint32_t maxChunkCount = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.protocolVersion);
        v(s.receiveBufferSize);
        v(s.sendBufferSize);
        v(s.maxMessageSize);
        v(s.maxChunkCount);
    }
};

struct ErrorMessage {
    StatusCode error;
    std::string reason;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.error);
        v(s.reason);
    }
};

}  // namespace cv::ua
