#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "ua/encoding/DecodeLimits.h"
#include "ua/secure/SecurityPolicy.h"
#include "ua/transport/FrameReader.h"

namespace cv::ua {

// A whole message put together from its chunks.
struct SecureMessage {
    MessageKind kind = MessageKind::Message;
    uint32_t requestId = 0;
    std::string body;
};

// A request whose answer the server gave up on (an abort chunk).
struct AbortedMessage {
    uint32_t requestId = 0;
    Error error;
};

// Checks the received OPN, MSG and CLO chunks of a secure channel (channel
// id, security token, unbroken sequence numbers, limits) and joins the
// chunks of each message. Any error it returns breaks the channel.
class ChunkAssembler {
  public:
    struct Outcome {
        std::optional<SecureMessage> message;
        std::optional<AbortedMessage> aborted;
    };

    explicit ChunkAssembler(SecurityPolicy& policy) : policy_(policy) {}

    // 0 for no limit. maxUnfinishedSize bounds what all messages still
    // waiting for chunks hold together.
    void SetLimits(uint32_t maxMessageSize, uint32_t maxChunkCount, uint32_t maxUnfinishedSize);
    // Chunks must carry this channel id once it is known.
    void SetChannelId(uint32_t channelId) { channelId_ = channelId; }
    // The tokens whose MSG and CLO chunks are accepted: the one in force and
    // the one it replaced.
    void AcceptToken(uint32_t tokenId);
    void RetireToken(uint32_t tokenId);

    Result<Outcome> Add(Frame frame);

  private:
    struct Partial {
        std::string body;
        uint32_t chunks = 0;
    };

    Result<Done> CheckSequence(uint32_t sequenceNumber);
    Result<Outcome> Collect(const FrameHeader& header, uint32_t requestId, std::string_view body);
    Result<Done> CheckRoom(const Partial& partial, std::string_view body) const;
    // Removes an unfinished message and gives its body.
    std::string Take(std::map<uint32_t, Partial>::iterator partial);

    SecurityPolicy& policy_;
    uint32_t maxMessageSize_ = 0;
    uint32_t maxChunkCount_ = 0;
    uint32_t maxUnfinishedSize_ = 0;
    // The bytes all unfinished messages hold.
    uint64_t unfinishedSize_ = 0;
    uint32_t channelId_ = 0;
    std::vector<uint32_t> tokens_;
    std::optional<uint32_t> lastSequence_;
    std::map<uint32_t, Partial> partials_;
};

}  // namespace cv::ua
