#pragma once

#include <cstdint>
#include <optional>

#include "ua/client/ClientOptions.h"

namespace cv::security {
class UaSecurity;
}

namespace cv::uaopc {

// The environment variable that sets the discovery port (a number from 1 to
// 65535), ahead of the user's setting.
inline constexpr const char* kDiscoveryPortVariable = "CVOPCTESTCLIENT_UA_DISCOVERY_PORT";
inline constexpr uint16_t kDefaultDiscoveryPort = 4840;

// How the OPC UA backend talks to servers.
struct UaOptions {
    // Sessions: a connection that breaks is resumed for as long as the
    // server keeps the session (30 s asked for); the server's state is read
    // every second, so an announced shutdown is heard at once.
    ua::ClientOptions session = [] {
        ua::ClientOptions options;
        options.requestedSessionTimeoutMs = 30'000;
        options.keepAliveIntervalMs = 1'000;
        return options;
    }();
    // Discovery asks FindServers at opc.tcp://<computer>:<discoveryPort>;
    // 0 turns it off. A computer that has not answered within
    // discoveryTimeoutMs has no servers.
    uint16_t discoveryPort = kDefaultDiscoveryPort;
    uint32_t discoveryTimeoutMs = 3'000;
    // References asked for per Browse; the rest come through BrowseNext.
    uint32_t browseBatch = 1'000;
    // A subscription sends a keep-alive after this long without changes.
    uint32_t keepAliveMs = 10'000;
    // The run's security: each server is connected as the user chose for it
    // (by default the most secure way it offers). Null: plain connections
    // without security. Must outlive the backend's objects.
    security::UaSecurity* security = nullptr;
};

// A port number from its text ("4841"); nothing for anything else.
std::optional<uint16_t> PortFromText(const char* text);

}  // namespace cv::uaopc
