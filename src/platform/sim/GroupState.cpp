#include "platform/sim/GroupState.h"

#include <algorithm>

#include "platform/opc/OpcResult.h"
#include "platform/sim/Connection.h"
#include "platform/sim/ErrorTexts.h"
#include "platform/sim/PlantRuntime.h"
#include "platform/sim/ServerInstance.h"

namespace cv::sim {

using namespace platform::OpcResult;

GroupState::GroupState(const std::shared_ptr<Connection>& connection, std::string name)
    : connection_(connection),
      runtime_(connection->SharedRuntime()),
      name_(std::move(name)),
      rate_(std::max<int32_t>(
          kDefaultUpdateRateMs,
          static_cast<int32_t>(connection->Server().Described().minUpdateRateMs))) {}

GroupState::~GroupState() {
    runtime_->Events().StopTimer(timer_);
}

void GroupState::Start() {
    Schedule();
}

void GroupState::End() {
    ended_ = true;
    handler_ = nullptr;
    Schedule();
}

ErrorInfo GroupState::Check() const {
    const auto connection = connection_.lock();
    if (!connection) {
        return ServerError(RPC_E_DISCONNECTED);
    }
    if (const ErrorInfo error = connection->Check()) {
        return error;
    }
    return ended_ ? ServerError(RPC_E_DISCONNECTED) : ErrorInfo{};
}

ErrorInfo GroupState::Call() {
    const auto connection = connection_.lock();
    if (!connection) {
        return ServerError(RPC_E_DISCONNECTED);
    }
    if (const ErrorInfo error = connection->Call()) {
        return error;
    }
    return Check();
}

ErrorInfo GroupState::SetActive(bool active) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (active == active_) {
        return {};
    }
    active_ = active;
    // A group that becomes active sends every active item once.
    for (const auto& item : items_) {
        item->sent = false;
    }
    Schedule();
    return {};
}

ErrorInfo GroupState::SetSubscribed(bool subscribed) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (subscribed && !connection_.lock()->Server().Described().subscribable) {
        return ServerError(SimResult::CONNECT_E_CANNOTCONNECT);
    }
    subscribed_ = subscribed;
    return {};
}

ErrorInfo GroupState::SetUpdateRate(int32_t rate) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (rate < 0) {
        return ServerError(E_INVALIDARG);
    }
    const auto fastest =
        static_cast<int32_t>(connection_.lock()->Server().Described().minUpdateRateMs);
    const int32_t revised = std::max(rate, fastest);
    if (revised != rate_) {
        rate_ = revised;
        Schedule();
    }
    return {};
}

void GroupState::Schedule() {
    runtime_->Events().StopTimer(timer_);
    timer_ = 0;
    if (!active_ || ended_) {
        return;
    }
    const std::weak_ptr<GroupState> weak = weak_from_this();
    const auto tick = [weak] {
        if (const auto group = weak.lock()) {
            group->Tick();
        }
    };
    timer_ = runtime_->Events().StartTimer(static_cast<uint32_t>(rate_), true, tick);
    // The first look comes at once, from the event loop.
    runtime_->Events().Post(tick);
}

void GroupState::Tick() {
    if (!active_ || Check()) {
        return;
    }
    ServerInstance& server = connection_.lock()->Server();
    PlantClock& clock = runtime_->Clock();
    const uint64_t now = clock.NowMs();
    const bool notify = subscribed_ && handler_ &&
                        (!notified_ || now - lastNotifiedMs_ >= static_cast<uint64_t>(rate_));
    platform::DataChangeArgs args;
    for (const auto& item : items_) {
        if (!item->active) {
            continue;
        }
        const ItemRuntime& value = server.Observe(item->item);
        if (!notify || (item->sent && item->sentVersion == value.version)) {
            continue;
        }
        item->sent = true;
        item->sentVersion = value.version;
        args.ClientHandles.Add(item->clientHandle);
        args.ItemValues.Add(value.value);
        args.Qualities.Add(value.quality);
        args.TimeStamps.Add(clock.OleDate(value.stampMs));
    }
    args.NumItems = args.ClientHandles.Count();
    if (args.NumItems == 0) {
        return;
    }
    notified_ = true;
    lastNotifiedMs_ = now;
    // The handler may release this group and its server: keep both alive
    // until it returns.
    const auto self = shared_from_this();
    const auto handler = handler_;
    handler(args);
}

}  // namespace cv::sim
