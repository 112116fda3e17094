#pragma once

#include <cstdint>
#include <vector>

#include "ua/services/AttributeServices.h"

namespace cv::ua {

enum class MonitoringMode : int32_t { Disabled = 0, Sampling = 1, Reporting = 2 };

struct MonitoringParameters {
    uint32_t clientHandle = 0;
    // Milliseconds; -1 samples at the publishing interval.
    double samplingInterval = -1;
    ExtensionObject filter;
    uint32_t queueSize = 1;
    bool discardOldest = true;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.clientHandle);
        v(s.samplingInterval);
        v(s.filter);
        v(s.queueSize);
        v(s.discardOldest);
    }
};

struct MonitoredItemCreateRequest {
    ReadValueId itemToMonitor;
    MonitoringMode monitoringMode = MonitoringMode::Reporting;
    MonitoringParameters requestedParameters;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.itemToMonitor);
        v(s.monitoringMode);
        v(s.requestedParameters);
    }
};

struct MonitoredItemCreateResult {
    StatusCode statusCode;
    uint32_t monitoredItemId = 0;
    double revisedSamplingInterval = 0;
    uint32_t revisedQueueSize = 0;
    ExtensionObject filterResult;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.statusCode);
        v(s.monitoredItemId);
        v(s.revisedSamplingInterval);
        v(s.revisedQueueSize);
        v(s.filterResult);
    }
};

struct CreateMonitoredItemsRequest {
    static constexpr uint16_t kEncodingId = 751;
    RequestHeader header;
    uint32_t subscriptionId = 0;
    TimestampsToReturn timestampsToReturn = TimestampsToReturn::Both;
    std::vector<MonitoredItemCreateRequest> itemsToCreate;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.timestampsToReturn);
        v(s.itemsToCreate);
    }
};

struct CreateMonitoredItemsResponse {
    static constexpr uint16_t kEncodingId = 754;
    ResponseHeader header;
    std::vector<MonitoredItemCreateResult> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct MonitoredItemModifyRequest {
    uint32_t monitoredItemId = 0;
    MonitoringParameters requestedParameters;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.monitoredItemId);
        v(s.requestedParameters);
    }
};

struct MonitoredItemModifyResult {
    StatusCode statusCode;
    double revisedSamplingInterval = 0;
    uint32_t revisedQueueSize = 0;
    ExtensionObject filterResult;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.statusCode);
        v(s.revisedSamplingInterval);
        v(s.revisedQueueSize);
        v(s.filterResult);
    }
};

struct ModifyMonitoredItemsRequest {
    static constexpr uint16_t kEncodingId = 763;
    RequestHeader header;
    uint32_t subscriptionId = 0;
    TimestampsToReturn timestampsToReturn = TimestampsToReturn::Both;
    std::vector<MonitoredItemModifyRequest> itemsToModify;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.timestampsToReturn);
        v(s.itemsToModify);
    }
};

struct ModifyMonitoredItemsResponse {
    static constexpr uint16_t kEncodingId = 766;
    ResponseHeader header;
    std::vector<MonitoredItemModifyResult> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct SetMonitoringModeRequest {
    static constexpr uint16_t kEncodingId = 769;
    RequestHeader header;
    uint32_t subscriptionId = 0;
    MonitoringMode monitoringMode = MonitoringMode::Reporting;
    std::vector<uint32_t> monitoredItemIds;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.monitoringMode);
        v(s.monitoredItemIds);
    }
};

struct SetMonitoringModeResponse {
    static constexpr uint16_t kEncodingId = 772;
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

struct DeleteMonitoredItemsRequest {
    static constexpr uint16_t kEncodingId = 781;
    RequestHeader header;
    uint32_t subscriptionId = 0;
    std::vector<uint32_t> monitoredItemIds;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.monitoredItemIds);
    }
};

struct DeleteMonitoredItemsResponse {
    static constexpr uint16_t kEncodingId = 784;
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

}  // namespace cv::ua
