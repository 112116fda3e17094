#pragma once

#include <cstdint>
#include <string>

#include "ua/services/DiscoveryServices.h"

namespace cv::ua {

// What the client learnt while opening a session.
struct SessionInfo {
    std::string endpointUrl;
    NodeId sessionId;
    // The server's revised session time-out, kept within 1 s and 1 hour.
    uint32_t revisedSessionTimeoutMs = 0;
    // The endpoint the session uses, as the server describes it.
    EndpointDescription endpoint;
};

// Why a connected client was told something on its own.
enum class ConnectionEvent {
    // The server announced its shutdown; the connection may still work for a
    // moment. The error carries the server's reason.
    ServerShutdown,
    // The connection or the session is gone for good; the error says why.
    ConnectionLost,
    // The connection broke; the client is opening a new one to resume the
    // same session. Calls made meanwhile wait for it. The error says why.
    Interrupted,
    // The session goes on over a new connection; its subscriptions continue
    // and missed notifications are fetched again.
    Resumed,
};

}  // namespace cv::ua
