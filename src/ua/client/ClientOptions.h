#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "ua/secure/ChannelOptions.h"

namespace cv::ua {

// Runs a completion on the caller's thread (the window thread's event loop
// in the program). Called from the client's I/O thread; it must queue the
// function, never run it at once.
using Dispatcher = std::function<void(std::function<void()>)>;

struct ClientOptions {
    std::string applicationUri = "urn:cvopctestclient:client";
    std::string applicationName = "Corvalent OPC Test Client";
    std::string sessionName = "cvopctestclient";
    // channel.connectTimeoutMs is the one wait for a whole connection, however
    // the server paces its bytes: connecting, Hello and OpenSecureChannel,
    // then CreateSession and ActivateSession (or a discovery request). Each
    // attempt to resume a session has the same wait.
    ChannelOptions channel;
    // Every service request; Publish waits longer (see SubscriptionEngine).
    uint32_t requestTimeoutMs = 10'000;
    uint32_t requestedSessionTimeoutMs = 120'000;
    // How often an idle session reads the server's state (at least three
    // times per session time-out).
    uint32_t keepAliveIntervalMs = 5'000;
    // Publish requests kept at the server while subscriptions exist, at
    // first. One more is kept each time the server has more notifications
    // than it could send or answers a request at once, up to
    // maxPublishRequests (fewer once the server refuses more).
    uint32_t publishRequests = 4;
    uint32_t maxPublishRequests = 100;
    // A connection that breaks is opened again and the session resumed on
    // it, for as long as the server keeps the session (its revised session
    // time-out, counted from the break).
    bool resumeSessions = true;
};

}  // namespace cv::ua
