#pragma once

#include <cstdint>

#include "ua/services/ServiceHeaders.h"

namespace cv::ua {

enum class SecurityTokenRequestType : int32_t { Issue = 0, Renew = 1 };
enum class MessageSecurityMode : int32_t { Invalid = 0, None = 1, Sign = 2, SignAndEncrypt = 3 };

struct ChannelSecurityToken {
    uint32_t channelId = 0;
    uint32_t tokenId = 0;
    DateTime createdAt;
    // Milliseconds.
    uint32_t revisedLifetime = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.channelId);
        v(s.tokenId);
        v(s.createdAt);
        v(s.revisedLifetime);
    }
};

struct OpenSecureChannelRequest {
    static constexpr uint16_t kEncodingId = 446;
    RequestHeader header;
    uint32_t clientProtocolVersion = 0;
    SecurityTokenRequestType requestType = SecurityTokenRequestType::Issue;
    MessageSecurityMode securityMode = MessageSecurityMode::None;
    ByteString clientNonce;
    uint32_t requestedLifetime = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.clientProtocolVersion);
        v(s.requestType);
        v(s.securityMode);
        v(s.clientNonce);
        v(s.requestedLifetime);
    }
};

struct OpenSecureChannelResponse {
    static constexpr uint16_t kEncodingId = 449;
    ResponseHeader header;
    uint32_t serverProtocolVersion = 0;
    ChannelSecurityToken securityToken;
    ByteString serverNonce;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.serverProtocolVersion);
        v(s.securityToken);
        v(s.serverNonce);
    }
};

struct CloseSecureChannelRequest {
    static constexpr uint16_t kEncodingId = 452;
    RequestHeader header;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
    }
};

}  // namespace cv::ua
