#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "ua/types/BuiltinTypes.h"

namespace cv::ua {

struct RequestHeader {
    NodeId authenticationToken;
    DateTime timestamp;
    uint32_t requestHandle = 0;
    uint32_t returnDiagnostics = 0;
    std::string auditEntryId;
    // How long the client waits, in milliseconds; 0 for no hint.
    uint32_t timeoutHint = 0;
    ExtensionObject additionalHeader;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.authenticationToken);
        v(s.timestamp);
        v(s.requestHandle);
        v(s.returnDiagnostics);
        v(s.auditEntryId);
        v(s.timeoutHint);
        v(s.additionalHeader);
    }
};

struct ResponseHeader {
    DateTime timestamp;
    uint32_t requestHandle = 0;
    StatusCode serviceResult;
    DiagnosticInfo serviceDiagnostics;
    std::vector<std::string> stringTable;
    ExtensionObject additionalHeader;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.timestamp);
        v(s.requestHandle);
        v(s.serviceResult);
        v(s.serviceDiagnostics);
        v(s.stringTable);
        v(s.additionalHeader);
    }
};

// The answer a server gives instead of a response when a whole request fails.
struct ServiceFault {
    static constexpr uint16_t kEncodingId = 397;
    ResponseHeader header;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
    }
};

}  // namespace cv::ua
