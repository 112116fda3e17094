#pragma once

#include <cstdint>
#include <vector>

#include "ua/services/ServiceHeaders.h"
#include "ua/types/DataValue.h"

namespace cv::ua {

class Encoder;
class Decoder;

struct CreateSubscriptionRequest {
    static constexpr uint16_t kEncodingId = 787;
    RequestHeader header;
    double requestedPublishingInterval = 0;
    uint32_t requestedLifetimeCount = 0;
    uint32_t requestedMaxKeepAliveCount = 0;
    uint32_t maxNotificationsPerPublish = 0;
    bool publishingEnabled = true;
    uint8_t priority = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.requestedPublishingInterval);
        v(s.requestedLifetimeCount);
        v(s.requestedMaxKeepAliveCount);
        v(s.maxNotificationsPerPublish);
        v(s.publishingEnabled);
        v(s.priority);
    }
};

struct CreateSubscriptionResponse {
    static constexpr uint16_t kEncodingId = 790;
    ResponseHeader header;
    uint32_t subscriptionId = 0;
    double revisedPublishingInterval = 0;
    uint32_t revisedLifetimeCount = 0;
    uint32_t revisedMaxKeepAliveCount = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.revisedPublishingInterval);
        v(s.revisedLifetimeCount);
        v(s.revisedMaxKeepAliveCount);
    }
};

struct ModifySubscriptionRequest {
    static constexpr uint16_t kEncodingId = 793;
    RequestHeader header;
    uint32_t subscriptionId = 0;
    double requestedPublishingInterval = 0;
    uint32_t requestedLifetimeCount = 0;
    uint32_t requestedMaxKeepAliveCount = 0;
    uint32_t maxNotificationsPerPublish = 0;
    uint8_t priority = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.requestedPublishingInterval);
        v(s.requestedLifetimeCount);
        v(s.requestedMaxKeepAliveCount);
        v(s.maxNotificationsPerPublish);
        v(s.priority);
    }
};

struct ModifySubscriptionResponse {
    static constexpr uint16_t kEncodingId = 796;
    ResponseHeader header;
    double revisedPublishingInterval = 0;
    uint32_t revisedLifetimeCount = 0;
    uint32_t revisedMaxKeepAliveCount = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.revisedPublishingInterval);
        v(s.revisedLifetimeCount);
        v(s.revisedMaxKeepAliveCount);
    }
};

struct DeleteSubscriptionsRequest {
    static constexpr uint16_t kEncodingId = 847;
    RequestHeader header;
    std::vector<uint32_t> subscriptionIds;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionIds);
    }
};

struct DeleteSubscriptionsResponse {
    static constexpr uint16_t kEncodingId = 850;
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

struct SubscriptionAcknowledgement {
    uint32_t subscriptionId = 0;
    uint32_t sequenceNumber = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.subscriptionId);
        v(s.sequenceNumber);
    }
    bool operator==(const SubscriptionAcknowledgement&) const = default;
};

struct MonitoredItemNotification {
    // Not defaulted: a decoded array makes a thousand of these at a time,
    // and a defaulted constructor would have each zero-filled first.
    MonitoredItemNotification() {}
    MonitoredItemNotification(uint32_t handle, DataValue dataValue)
        : clientHandle(handle), value(std::move(dataValue)) {}

    uint32_t clientHandle = 0;
    DataValue value;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.clientHandle);
        v(s.value);
    }
};

struct DataChangeNotification {
    static constexpr uint16_t kEncodingId = 811;
    std::vector<MonitoredItemNotification> monitoredItems;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.monitoredItems);
        v(s.diagnosticInfos);
    }
};

// Bad_Timeout here means the subscription expired on the server.
struct StatusChangeNotification {
    static constexpr uint16_t kEncodingId = 820;
    StatusCode status;
    DiagnosticInfo diagnosticInfo;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.status);
        v(s.diagnosticInfo);
    }
};

// One publish message. Data and status changes are decoded in place; any
// other notification (events) is kept as it came. A message without
// notifications is a keep-alive whose sequence number is the next one due.
struct NotificationMessage {
    uint32_t sequenceNumber = 0;
    DateTime publishTime;
    std::vector<DataChangeNotification> dataChanges;
    std::vector<StatusChangeNotification> statusChanges;
    std::vector<ExtensionObject> otherNotifications;

    bool IsKeepAlive() const {
        return dataChanges.empty() && statusChanges.empty() && otherNotifications.empty();
    }
    static void Visit(const NotificationMessage& s, Encoder& v);
    static void Visit(NotificationMessage& s, Decoder& v);
};

struct PublishRequest {
    static constexpr uint16_t kEncodingId = 826;
    RequestHeader header;
    std::vector<SubscriptionAcknowledgement> subscriptionAcknowledgements;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionAcknowledgements);
    }
};

struct PublishResponse {
    static constexpr uint16_t kEncodingId = 829;
    ResponseHeader header;
    uint32_t subscriptionId = 0;
    std::vector<uint32_t> availableSequenceNumbers;
    bool moreNotifications = false;
    NotificationMessage notificationMessage;
    // One per acknowledgement sent.
    std::vector<StatusCode> results;
    std::vector<DiagnosticInfo> diagnosticInfos;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.availableSequenceNumbers);
        v(s.moreNotifications);
        v(s.notificationMessage);
        v(s.results);
        v(s.diagnosticInfos);
    }
};

struct RepublishRequest {
    static constexpr uint16_t kEncodingId = 832;
    RequestHeader header;
    uint32_t subscriptionId = 0;
    uint32_t retransmitSequenceNumber = 0;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.subscriptionId);
        v(s.retransmitSequenceNumber);
    }
};

struct RepublishResponse {
    static constexpr uint16_t kEncodingId = 835;
    ResponseHeader header;
    NotificationMessage notificationMessage;

    template <class S, class V>
    static void Visit(S& s, V& v) {
        v(s.header);
        v(s.notificationMessage);
    }
};

}  // namespace cv::ua
