#pragma once

#include <cstdint>
#include <functional>
#include <vector>

#include "ua/services/SubscriptionServices.h"
#include "ua/types/Result.h"

namespace cv::ua {

struct SubscriptionSettings {
    double publishingIntervalMs = 1000;
    // Publishing intervals without a Publish request before the server
    // drops the subscription; at least three keep-alive counts.
    uint32_t lifetimeCount = 30;
    // Publishing intervals without changes before a keep-alive message.
    uint32_t maxKeepAliveCount = 10;
    // 0 for no limit.
    uint32_t maxNotificationsPerPublish = 0;
    uint8_t priority = 0;
    bool publishingEnabled = true;
};

struct SubscriptionInfo {
    uint32_t subscriptionId = 0;
    double revisedPublishingIntervalMs = 0;
    uint32_t revisedLifetimeCount = 0;
    uint32_t revisedMaxKeepAliveCount = 0;
};

// Called on the dispatcher's thread. dataChange gets the values of one
// notification, each with the client handle of its monitored item, in the
// order the server sent them; it may move them away. status hears what
// happened to the subscription on its own: Bad_Timeout when it expired on
// the server (it is gone then), Bad_MessageNotAvailable when a missed
// notification could not be fetched again (its values are lost).
struct SubscriptionHandlers {
    std::function<void(std::vector<MonitoredItemNotification>& values)> dataChange;
    std::function<void(uint32_t subscriptionId, const Error& status)> status;
};

}  // namespace cv::ua
