#include "platform/ua/UaGroupState.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "platform/opc/OpcResult.h"
#include "platform/ua/UaConnection.h"
#include "platform/ua/UaStatusMap.h"
#include "platform/ua/UaTime.h"
#include "platform/ua/UaValueMap.h"

namespace cv::uaopc {

namespace {

using namespace platform::OpcResult;

int32_t RateOf(double intervalMs) {
    const double max = std::numeric_limits<int32_t>::max();
    return static_cast<int32_t>(std::lround(std::clamp(intervalMs, 0.0, max)));
}

}  // namespace

// Calls that wait work on shared state only: the group object, its items
// object and its server object may all be released meanwhile.

ErrorInfo UaGroupState::Connection(std::shared_ptr<UaConnection>& connection) const {
    connection = connection_.lock();
    if (!connection) {
        return Disconnected();
    }
    if (const ErrorInfo error = connection->Check()) {
        return error;
    }
    return ended_ ? Disconnected("The group has been removed.") : ErrorInfo{};
}

ErrorInfo UaGroupState::Check() const {
    std::shared_ptr<UaConnection> connection;
    return Connection(connection);
}

// The server is asked for a keep-alive every keepAliveMs without changes,
// and to keep the subscription through a break of twice the session
// time-out, so that a resumed session finds it.
ua::SubscriptionSettings UaGroupState::Settings(int32_t rate) const {
    const auto connection = connection_.lock();
    const UaOptions& options = connection->Runtime()->Options();
    const uint32_t interval = static_cast<uint32_t>(std::max(rate, 1));
    ua::SubscriptionSettings settings;
    settings.publishingIntervalMs = rate;
    settings.maxKeepAliveCount = std::max(1u, options.keepAliveMs / interval);
    settings.lifetimeCount = std::max(3 * settings.maxKeepAliveCount,
                                      2 * options.session.requestedSessionTimeoutMs / interval + 1);
    return settings;
}

ErrorInfo UaGroupState::Create() {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    ua::SubscriptionHandlers handlers;
    handlers.dataChange =
        [weak = weak_from_this()](std::vector<ua::MonitoredItemNotification>& values) {
            if (const auto self = weak.lock()) {
                self->OnDataChange(values);
            }
        };
    const ua::SubscriptionSettings settings = Settings(rate_);
    std::optional<ua::Result<ua::SubscriptionInfo>> created;
    if (const ErrorInfo error = connection->Call<ua::SubscriptionInfo>(
            [&](ua::Client& client, auto done) {
                client.CreateSubscription(settings, handlers, std::move(done));
            },
            created)) {
        return error;
    }
    if (!*created) {
        return connection->CallError(created->Failure());
    }
    subscriptionId_ = created->Value().subscriptionId;
    rate_ = RateOf(created->Value().revisedPublishingIntervalMs);
    return {};
}

ErrorInfo UaGroupState::Delete() {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    std::optional<ua::Result<std::vector<ua::StatusCode>>> deleted;
    return connection->Call<std::vector<ua::StatusCode>>(
        [id = subscriptionId_](ua::Client& client, auto done) {
            client.DeleteSubscriptions({id}, std::move(done));
        },
        deleted);
}

void UaGroupState::End() {
    ended_ = true;
    handler_ = nullptr;
}

ErrorInfo UaGroupState::SetActive(bool active) {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    if (active == active_) {
        return {};
    }
    std::vector<uint32_t> ids;
    for (const auto& item : items_) {
        if (item->active) {
            ids.push_back(item->monitoredItemId);
        }
    }
    const auto mode = active ? ua::MonitoringMode::Reporting : ua::MonitoringMode::Disabled;
    if (const ErrorInfo error = ids.empty() ? ErrorInfo{} : SetModes(ids, mode)) {
        return error;
    }
    active_ = active;
    return {};
}

ErrorInfo UaGroupState::SetModes(const std::vector<uint32_t>& monitoredItemIds,
                                 ua::MonitoringMode mode) {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    std::optional<ua::Result<std::vector<ua::StatusCode>>> set;
    if (const ErrorInfo error = connection->Call<std::vector<ua::StatusCode>>(
            [&, id = subscriptionId_](ua::Client& client, auto done) {
                client.SetMonitoringMode(id, mode, monitoredItemIds, std::move(done));
            },
            set)) {
        return error;
    }
    return *set ? Check() : connection->CallError(set->Failure());
}

ErrorInfo UaGroupState::SetSubscribed(bool subscribed) {
    const ErrorInfo error = Check();
    if (!error) {
        subscribed_ = subscribed;
    }
    return error;
}

ErrorInfo UaGroupState::SetUpdateRate(int32_t rate) {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    if (rate < 0) {
        return {E_INVALIDARG, *OwnErrorText(E_INVALIDARG)};
    }
    if (rate == rate_) {
        return {};
    }
    const ua::SubscriptionSettings settings = Settings(rate);
    std::optional<ua::Result<ua::SubscriptionInfo>> modified;
    if (const ErrorInfo error = connection->Call<ua::SubscriptionInfo>(
            [&, id = subscriptionId_](ua::Client& client, auto done) {
                client.ModifySubscription(id, settings, std::move(done));
            },
            modified)) {
        return error;
    }
    if (!*modified) {
        return connection->CallError(modified->Failure());
    }
    rate_ = RateOf(modified->Value().revisedPublishingIntervalMs);
    return ResampleItems();
}

// The items sample at the group's rate.
ErrorInfo UaGroupState::ResampleItems() {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    std::vector<ua::MonitoredItemModifyRequest> changes(items_.size());
    for (size_t k = 0; k < items_.size(); ++k) {
        changes[k].monitoredItemId = items_[k]->monitoredItemId;
        changes[k].requestedParameters.clientHandle =
            static_cast<uint32_t>(items_[k]->serverHandle);
        changes[k].requestedParameters.samplingInterval = rate_;
    }
    if (changes.empty()) {
        return {};
    }
    std::optional<ua::Result<std::vector<ua::MonitoredItemModifyResult>>> modified;
    if (const ErrorInfo error = connection->Call<std::vector<ua::MonitoredItemModifyResult>>(
            [&, id = subscriptionId_](ua::Client& client, auto done) {
                client.ModifyMonitoredItems(id, ua::TimestampsToReturn::Both, changes,
                                            std::move(done));
            },
            modified)) {
        return error;
    }
    return *modified ? ErrorInfo{} : connection->CallError(modified->Failure());
}

ua::MonitoringMode UaGroupState::ModeOf(const UaItemState& item) const {
    return active_ && item.active ? ua::MonitoringMode::Reporting : ua::MonitoringMode::Disabled;
}

void UaGroupState::OnDataChange(std::vector<ua::MonitoredItemNotification>& values) {
    if (ended_ || !active_ || !subscribed_ || !handler_) {
        return;
    }
    platform::DataChangeArgs args;
    for (const ua::MonitoredItemNotification& change : values) {
        const UaItemState* item = Lookup(static_cast<int32_t>(change.clientHandle));
        if (item == nullptr || !item->active) {
            continue;
        }
        args.ClientHandles.Add(item->clientHandle);
        args.ItemValues.Add(ToAutomation(change.value.value));
        args.Qualities.Add(QualityOf(change.value.status));
        args.TimeStamps.Add(TimeStampOf(change.value));
        args.Details.Add(DetailOf(change.value));
    }
    args.NumItems = args.ClientHandles.Count();
    if (args.NumItems == 0) {
        return;
    }
    // The handler may release this group and its server: keep both alive
    // until it returns.
    const auto self = shared_from_this();
    const auto connection = connection_.lock();
    const auto handler = handler_;
    handler(args);
}

}  // namespace cv::uaopc
