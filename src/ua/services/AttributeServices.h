#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "ua/services/ServiceHeaders.h"
#include "ua/types/DataValue.h"

namespace cv::ua {

enum class TimestampsToReturn : int32_t { Source = 0, Server = 1, Both = 2, Neither = 3 };

namespace attribute {
inline constexpr uint32_t NodeClass = 2;
inline constexpr uint32_t BrowseName = 3;
inline constexpr uint32_t DisplayName = 4;
inline constexpr uint32_t Value = 13;
inline constexpr uint32_t DataType = 14;
inline constexpr uint32_t ValueRank = 15;
inline constexpr uint32_t AccessLevel = 17;
inline constexpr uint32_t UserAccessLevel = 18;
}  // namespace attribute

struct ReadValueId {
    NodeId nodeId;
    uint32_t attributeId = attribute::Value;
    std::string indexRange;
    QualifiedName dataEncoding;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.nodeId);
        v(s.attributeId);
        v(s.indexRange);
        v(s.dataEncoding);
    }
};

struct ReadRequest {
    static constexpr uint16_t kEncodingId = 631;
    RequestHeader header;
    // Milliseconds; 0 makes the server ask the device.
    double maxAge = 0;
    TimestampsToReturn timestampsToReturn = TimestampsToReturn::Both;
    std::vector<ReadValueId> nodesToRead;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.maxAge);
        v(s.timestampsToReturn);
        v(s.nodesToRead);
    }
};

struct ReadResponse {
    static constexpr uint16_t kEncodingId = 634;
    ResponseHeader header;
    std::vector<DataValue> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct WriteValue {
    NodeId nodeId;
    uint32_t attributeId = attribute::Value;
    std::string indexRange;
    DataValue value;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.nodeId);
        v(s.attributeId);
        v(s.indexRange);
        v(s.value);
    }
};

struct WriteRequest {
    static constexpr uint16_t kEncodingId = 673;
    RequestHeader header;
    std::vector<WriteValue> nodesToWrite;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.nodesToWrite);
    }
};

struct WriteResponse {
    static constexpr uint16_t kEncodingId = 676;
    ResponseHeader header;
    std::vector<StatusCode> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

// The EURange and InstrumentRange of an analog item.
struct Range {
    static constexpr uint16_t kEncodingId = 886;
    double low = 0;
    double high = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.low);
        v(s.high);
    }
};

// The EngineeringUnits of an analog item.
struct EUInformation {
    static constexpr uint16_t kEncodingId = 889;
    std::string namespaceUri;
    int32_t unitId = 0;
    LocalizedText displayName;
    LocalizedText description;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.namespaceUri);
        v(s.unitId);
        v(s.displayName);
        v(s.description);
    }
};

}  // namespace cv::ua
