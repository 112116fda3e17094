#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/opc/OPCGroup.h"
#include "platform/opc/OneBased.h"
#include "ua/client/SubscriptionTypes.h"
#include "ua/services/MonitoredItemServices.h"
#include "ua/types/NodeId.h"

namespace cv::uaopc {

class UaConnection;

// One item added to a group: a monitored item whose UA client handle is the
// item's server handle.
struct UaItemState {
    int32_t serverHandle = 0;
    int32_t clientHandle = 0;
    std::string itemId;
    ua::NodeId node;
    uint32_t monitoredItemId = 0;
    bool active = true;
    bool removed = false;
};

// The state behind one OPCGroup object: a subscription whose publishing
// interval is the group's update rate. An item reports (monitoring mode
// Reporting) while it and its group are active, so activating sends the
// current values at once. Notifications go to the handler while the group
// is active and subscribed, from the event loop. Shared with the group's
// items.
class UaGroupState : public std::enable_shared_from_this<UaGroupState> {
  public:
    static constexpr int32_t kDefaultUpdateRateMs = 1000;

    UaGroupState(const std::shared_ptr<UaConnection>& connection, std::string name)
        : connection_(connection), name_(std::move(name)) {}
    UaGroupState(const UaGroupState&) = delete;
    UaGroupState& operator=(const UaGroupState&) = delete;

    const std::string& Name() const { return name_; }
    uint32_t SubscriptionId() const { return subscriptionId_; }
    // Creates the subscription.
    ErrorInfo Create();
    // Deletes the subscription (the group is being removed).
    ErrorInfo Delete();
    // Removed from its server: calls fail and notifications stop.
    void End();

    // Fails when the group cannot carry calls.
    ErrorInfo Check() const;

    bool Active() const { return active_; }
    bool Subscribed() const { return subscribed_; }
    int32_t UpdateRate() const { return rate_; }
    ErrorInfo SetActive(bool active);
    ErrorInfo SetSubscribed(bool subscribed);
    ErrorInfo SetUpdateRate(int32_t rate);
    // An ended group keeps no handler.
    void SetHandler(platform::OPCGroup::DataChangeHandler handler) {
        handler_ = ended_ ? nullptr : std::move(handler);
    }

    // Items (UaGroupState_items.cpp).
    int32_t ItemCount() const { return static_cast<int32_t>(items_.size()); }
    ErrorInfo AddItems(int32_t count, const platform::OneBased<std::string>& itemIds,
                       const platform::OneBased<int32_t>& clientHandles,
                       const platform::OneBased<std::string>& accessPaths,
                       platform::OneBased<int32_t>& serverHandles,
                       platform::OneBased<int32_t>& errors);
    ErrorInfo RemoveItems(int32_t count, const platform::OneBased<int32_t>& serverHandles,
                          platform::OneBased<int32_t>& errors);
    ErrorInfo FindItem(int32_t serverHandle, std::shared_ptr<UaItemState>& item) const;
    ErrorInfo SetItemActive(UaItemState& item, bool active);
    ErrorInfo SyncRead(int16_t source, int32_t count, const platform::OneBased<int32_t>& handles,
                       platform::OneBased<Variant>& values, platform::OneBased<int32_t>& errors,
                       platform::OneBased<int32_t>& qualities,
                       platform::OneBased<double>& timeStamps,
                       platform::OneBased<platform::ValueDetail>& details);
    ErrorInfo SyncWrite(int32_t count, const platform::OneBased<int32_t>& handles,
                        const platform::OneBased<Variant>& values,
                        platform::OneBased<int32_t>& errors);

  private:
    // The connection, when the group can carry calls.
    ErrorInfo Connection(std::shared_ptr<UaConnection>& connection) const;
    ua::SubscriptionSettings Settings(int32_t rate) const;
    ua::MonitoringMode ModeOf(const UaItemState& item) const;
    ErrorInfo SetModes(const std::vector<uint32_t>& monitoredItemIds, ua::MonitoringMode mode);
    ErrorInfo ResampleItems();
    void OnDataChange(std::vector<ua::MonitoredItemNotification>& values);
    UaItemState* Lookup(int32_t serverHandle) const;
    int32_t Prepare(const std::string& itemId, const std::string& accessPath,
                    const std::vector<std::string>& namespaces, ua::NodeId& node) const;

    std::weak_ptr<UaConnection> connection_;
    std::string name_;
    uint32_t subscriptionId_ = 0;
    bool active_ = true;
    bool subscribed_ = false;
    bool ended_ = false;
    int32_t rate_ = kDefaultUpdateRateMs;
    std::vector<std::shared_ptr<UaItemState>> items_;
    std::unordered_map<int32_t, std::shared_ptr<UaItemState>> byHandle_;
    platform::OPCGroup::DataChangeHandler handler_;
};

}  // namespace cv::uaopc
