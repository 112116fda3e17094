#pragma once

#include <cstdint>

#include "platform/ErrorInfo.h"
#include "platform/opc/OpcResult.h"

namespace cv::ClientErrors {

// The failures the OPC client reports itself, besides the server's own.

// A call needs a server or group the client does not have (never
// connected, offline, or no extra group): the error model's "object
// variable not set".
inline ErrorInfo NoObject() {
    return {91, "Object variable or With block variable not set"};
}

// The client went offline, or away, while it waited for the server.
inline ErrorInfo Disconnected() {
    return {platform::OpcResult::RPC_E_DISCONNECTED,
            "The OPC client went offline while it waited for the OPC Server."};
}

// The channel is not in this client's list.
inline ErrorInfo NotServed() {
    return {platform::OpcResult::OPC_E_INVALIDHANDLE,
            "The channel is not served by this OPC client."};
}

// An item's own error code in a call that succeeded as a whole.
inline ErrorInfo ItemError(int32_t lCode) {
    return {lCode, "The OPC Server reported an error for the item."};
}

// The server's answer holds fewer results than items asked for.
inline ErrorInfo IncompleteAnswer() {
    return {platform::OpcResult::E_FAIL, "The OPC Server's answer does not cover every item."};
}

// The channel was destroyed while the client added it.
inline ErrorInfo ChannelGone() {
    return {platform::OpcResult::E_FAIL, "The channel went away while it was being added."};
}

}  // namespace cv::ClientErrors
