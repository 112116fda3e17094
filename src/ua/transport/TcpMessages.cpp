#include "ua/transport/TcpMessages.h"

#include <array>
#include <cstring>

namespace cv::ua {
namespace {

constexpr std::array<std::string_view, 6> kCodes = {"HEL", "ACK", "ERR", "OPN", "MSG", "CLO"};

std::string Printable(std::string_view bytes) {
    std::string text;
    for (const char c : bytes) {
        text += (c >= 0x20 && c < 0x7F) ? c : '?';
    }
    return text;
}

}  // namespace

std::string_view MessageKindCode(MessageKind kind) {
    return kCodes[static_cast<size_t>(kind)];
}

Result<FrameHeader> ParseFrameHeader(std::string_view header, uint32_t maxFrameSize) {
    FrameHeader frame;
    const std::string_view code = header.substr(0, 3);
    size_t kind = 0;
    while (kind < kCodes.size() && kCodes[kind] != code) {
        ++kind;
    }
    if (kind == kCodes.size()) {
        return Error{status::BadTcpMessageTypeInvalid,
                     "The server sent a message of the unknown type \"" + Printable(code) + "\"."};
    }
    frame.kind = static_cast<MessageKind>(kind);
    const char chunk = header[3];
    if (chunk != 'F' && chunk != 'C' && chunk != 'A') {
        return Error{status::BadTcpMessageTypeInvalid,
                     "The server sent a " + std::string(code) +
                         " message with the unknown chunk type \"" +
                         Printable(header.substr(3, 1)) + "\"."};
    }
    frame.chunkType = static_cast<ChunkType>(chunk);
    std::memcpy(&frame.size, header.data() + 4, 4);
    if (frame.size < kFrameHeaderSize) {
        return Error{status::BadTcpMessageTypeInvalid,
                     "The server sent a " + std::string(code) + " message whose size (" +
                         std::to_string(frame.size) + " bytes) is smaller than its header."};
    }
    if (frame.size > maxFrameSize) {
        return Error{status::BadTcpMessageTooLarge, "The server sent a " + std::string(code) +
                                                        " chunk of " + std::to_string(frame.size) +
                                                        " bytes; the agreed limit is " +
                                                        std::to_string(maxFrameSize) + " bytes."};
    }
    return frame;
}

std::string MakeFrame(MessageKind kind, ChunkType chunkType, std::string_view body) {
    std::string frame(MessageKindCode(kind));
    frame += static_cast<char>(chunkType);
    const auto size = static_cast<uint32_t>(kFrameHeaderSize + body.size());
    frame.append(reinterpret_cast<const char*>(&size), 4);
    frame.append(body);
    return frame;
}

}  // namespace cv::ua
