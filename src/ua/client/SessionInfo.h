#pragma once

#include <string>

#include "ua/services/DiscoveryServices.h"

namespace cv::ua {

// What the client learnt while opening a session.
struct SessionInfo {
    std::string endpointUrl;
    NodeId sessionId;
    double revisedSessionTimeoutMs = 0;
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
};

}  // namespace cv::ua
