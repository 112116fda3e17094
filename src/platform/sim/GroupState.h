#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/EventLoop.h"
#include "platform/opc/OPCGroup.h"
#include "platform/opc/OneBased.h"

namespace cv::sim {

class Connection;
class PlantRuntime;

// One item added to a group.
struct GroupItemState {
    int32_t serverHandle = 0;
    int32_t clientHandle = 0;
    size_t item = 0;  // position in the server's item list
    std::string itemId;
    bool active = true;
    bool removed = false;
    bool sent = false;  // its value went out in a notification since it became active
    uint64_t sentVersion = 0;
};

// The state behind one OPCGroup object, shared with its items. While active
// it looks at its active items at its update rate; while also subscribed
// and with a handler, it sends those whose value or quality changed since
// its last notification, never more often than its update rate and always
// from the event loop.
class GroupState : public std::enable_shared_from_this<GroupState> {
  public:
    static constexpr int32_t kDefaultUpdateRateMs = 1000;

    GroupState(const std::shared_ptr<Connection>& connection, std::string name);
    ~GroupState();
    GroupState(const GroupState&) = delete;
    GroupState& operator=(const GroupState&) = delete;

    const std::string& Name() const { return name_; }
    // Begins looking at its items when active (new groups are).
    void Start();
    // Removed from its server: calls fail and notifications stop.
    void End();

    // Fails when the group cannot carry calls; Call also takes the server's
    // call time with events running.
    ErrorInfo Check() const;
    ErrorInfo Call();

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

    // Items (GroupState_items.cpp).
    int32_t ItemCount() const { return static_cast<int32_t>(items_.size()); }
    ErrorInfo AddItems(int32_t count, const platform::OneBased<std::string>& itemIds,
                       const platform::OneBased<int32_t>& clientHandles,
                       const platform::OneBased<std::string>& accessPaths,
                       platform::OneBased<int32_t>& serverHandles,
                       platform::OneBased<int32_t>& errors);
    ErrorInfo RemoveItems(int32_t count, const platform::OneBased<int32_t>& serverHandles,
                          platform::OneBased<int32_t>& errors);
    ErrorInfo FindItem(int32_t serverHandle, std::shared_ptr<GroupItemState>& item) const;
    ErrorInfo SetItemActive(GroupItemState& item, bool active);
    ErrorInfo SyncRead(int16_t source, int32_t count, const platform::OneBased<int32_t>& handles,
                       platform::OneBased<Variant>& values, platform::OneBased<int32_t>& errors,
                       platform::OneBased<int32_t>& qualities,
                       platform::OneBased<double>& timeStamps);
    ErrorInfo SyncWrite(int32_t count, const platform::OneBased<int32_t>& handles,
                        const platform::OneBased<Variant>& values,
                        platform::OneBased<int32_t>& errors);

  private:
    void Schedule();
    void Tick();
    GroupItemState* Lookup(int32_t serverHandle) const;
    int32_t AddOne(const std::string& itemId, int32_t clientHandle, const std::string& accessPath,
                   int32_t& serverHandle);

    std::weak_ptr<Connection> connection_;
    std::shared_ptr<PlantRuntime> runtime_;
    std::string name_;
    bool active_ = true;
    bool subscribed_ = false;
    bool ended_ = false;
    int32_t rate_;
    platform::EventLoop::TimerId timer_ = 0;
    bool notified_ = false;
    uint64_t lastNotifiedMs_ = 0;
    std::vector<std::shared_ptr<GroupItemState>> items_;
    std::unordered_map<int32_t, std::shared_ptr<GroupItemState>> byHandle_;
    platform::OPCGroup::DataChangeHandler handler_;
};

}  // namespace cv::sim
