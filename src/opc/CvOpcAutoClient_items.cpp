#include "opc/CvOpcAutoClient.h"

#include <utility>

#include "channel/Channel.h"
#include "opc/ClientErrors.h"
#include "platform/Platform.h"
#include "platform/opc/OpcResult.h"

namespace cv {

using platform::OneBased;

ErrorInfo CvOpcAutoClient::AddChannel(Channel& cChannel) {
    const Watch watch = Watching();
    const auto presence = cChannel.Presence();
    const ItemAddress address{cChannel.ItemName(), cChannel.OpcAccessPath()};
    const int32_t lGroup = cChannel.OpcGroupNumber();
    GroupPtr group;
    if (ErrorInfo error = PrepareGroup(lGroup, group, watch)) {
        return error;
    }
    const int32_t lClientHandle = mcChannels.NewHandle();
    int32_t lServerHandle = 0;
    int32_t lItemError = 0;
    if (ErrorInfo error =
            AddItem(group, address, lClientHandle, lServerHandle, lItemError, watch)) {
        return error;
    }
    if (*presence == nullptr) {
        if (lItemError == 0) {
            DropItem(group, lServerHandle);
        }
        return ClientErrors::ChannelGone();
    }
    cChannel.SetOpcServerHandle(lServerHandle);
    if (lItemError != 0) {
        return ClientErrors::ItemError(lItemError);
    }
    std::shared_ptr<platform::OPCItem> cItem;
    ErrorInfo error =
        ActivateItem(group, lServerHandle, cChannel.OpcIsActive(), address, cItem, watch);
    if (!error && *presence == nullptr) {
        error = ClientErrors::ChannelGone();
    }
    if (error) {
        // An item left behind would carry a handle of no channel into every
        // notification it is part of.
        if (!watch.Ended()) {
            DropItem(group, lServerHandle);
        }
        return error;
    }
    cChannel.SetOpcItem(std::move(cItem));
    cChannel.SetOpcClient(this);
    mcChannels.Add({presence, lClientHandle, lServerHandle, lGroup});
    return {};
}

// The channel's group, created first for group 2, and inactive while items
// are added: Advise wakes it again.
ErrorInfo CvOpcAutoClient::PrepareGroup(int32_t lGroup, GroupPtr& group, const Watch& watch) {
    if (lGroup == 2) {
        if (ErrorInfo error = AddExtraGroup()) {
            return error;
        }
        if (watch.Ended()) {
            return ClientErrors::Disconnected();
        }
    }
    group = Group(lGroup);
    if (!group) {
        return ClientErrors::NoObject();
    }
    const bool bTraced = lGroup != 2;
    if (bTraced) {
        Trace("Read OpcGroup.OPCItems");
        Trace("Read OpcGroup.IsActive");
    }
    bool bActive = false;
    const ErrorInfo read = group->IsActive(bActive);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (read || !bActive) {
        return read;
    }
    if (bTraced) {
        Trace("OpcGroup.IsActive = False");
    }
    const ErrorInfo deactivated = group->SetIsActive(false);
    return watch.Ended() ? ClientErrors::Disconnected() : deactivated;
}

// Adds one item; lItemError is the server's answer for it.
ErrorInfo CvOpcAutoClient::AddItem(const GroupPtr& group, const ItemAddress& address,
                                   int32_t lClientHandle, int32_t& lServerHandle,
                                   int32_t& lItemError, const Watch& watch) {
    OneBased<int32_t> serverHandles;
    OneBased<int32_t> errors;
    const ErrorInfo call = group->OPCItems().AddItems(
        1, OneBased<std::string>({address.itemId}), OneBased<int32_t>{lClientHandle},
        OneBased<std::string>({address.accessPath}), serverHandles, errors);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (call) {
        return call;
    }
    if (serverHandles.Count() < 1 || errors.Count() < 1) {
        return ClientErrors::IncompleteAnswer();
    }
    lServerHandle = serverHandles(1);
    lItemError = errors(1);
    return {};
}

// The item takes the channel's activity; an item that must stay inactive is
// made active all the same when a channel served already reads it.
ErrorInfo CvOpcAutoClient::ActivateItem(const GroupPtr& group, int32_t lServerHandle, bool bActive,
                                        const ItemAddress& address,
                                        std::shared_ptr<platform::OPCItem>& cItem,
                                        const Watch& watch) {
    Trace("OpcItems.GetOpcItem " + std::to_string(lServerHandle));
    ErrorInfo error = group->OPCItems().GetOPCItem(lServerHandle, cItem);
    if (watch.Ended() || error) {
        return watch.Ended() ? ClientErrors::Disconnected() : error;
    }
    if (!cItem) {
        return ClientErrors::NoObject();
    }
    Trace(std::string("OpcItem.IsActive = ") + (bActive ? "True" : "False"));
    error = cItem->SetIsActive(bActive);
    if (watch.Ended() || error) {
        return watch.Ended() ? ClientErrors::Disconnected() : error;
    }
    Trace("Read OpcItem.IsActive");
    bool bNowActive = false;
    error = cItem->IsActive(bNowActive);
    if (watch.Ended() || error || bNowActive || !SharesItemWithServed(address)) {
        return watch.Ended() ? ClientErrors::Disconnected() : error;
    }
    Trace("OpcItem.IsActive = True");
    error = cItem->SetIsActive(true);
    return watch.Ended() ? ClientErrors::Disconnected() : error;
}

bool CvOpcAutoClient::SharesItemWithServed(const ItemAddress& address) const {
    for (const ServedChannels::Entry& entry : mcChannels.InOrder()) {
        const Channel* cServed = entry.Get();
        if (cServed != nullptr && cServed->ItemName() == address.itemId &&
            cServed->OpcAccessPath() == address.accessPath) {
            return true;
        }
    }
    return false;
}

// Takes back an item added for a channel that the client then could not
// serve; a failure is not reported.
void CvOpcAutoClient::DropItem(const GroupPtr& group, int32_t lServerHandle) {
    Trace("OPCItems.Remove 1, " + std::to_string(lServerHandle));
    OneBased<int32_t> errors;
    (void)group->OPCItems().Remove(1, OneBased<int32_t>{lServerHandle}, errors);
}

// Removes the items with these server handles from the group, after making
// it inactive; a failure is not reported.
void CvOpcAutoClient::RemoveGroupItems(Platform& platform, GroupPtr group, int32_t lGroup,
                                       const std::vector<int32_t>& handles) {
    AdviseGroup(platform, group, lGroup, false);
    if (!group) {
        return;
    }
    if (lGroup != 2) {
        Trace(platform, "Read OpcGroup.OPCItems");
    }
    if (handles.empty()) {
        return;
    }
    const auto lCount = static_cast<int32_t>(handles.size());
    Trace(platform,
          "OPCItems.Remove " + std::to_string(lCount) + ", " + std::to_string(handles.front()));
    platform::OneBased<int32_t> errors;
    (void)group->OPCItems().Remove(lCount, platform::OneBased<int32_t>(handles), errors);
}

void CvOpcAutoClient::RemoveExtraGroup() {
    const Watch watch = Watching();
    const GroupPtr group = mcOpcGroup2;
    AdviseGroup(mPlatform, group, 2, false);
    if (watch.Ended()) {
        return;
    }
    RemoveGroupItems(mPlatform, group, 2, mcChannels.ServerHandles(2));
    if (watch.Ended()) {
        return;
    }
    if (const auto server = mcOpcServer) {
        const std::string sName = GroupName(2);
        Trace("Server.OPCGroups.Remove " + sName);
        (void)server->OPCGroups().Remove(sName);  // not reported: the group goes all the same
        if (watch.Ended()) {
            return;
        }
    }
    if (mcOpcGroup2) {
        mcOpcGroup2->SetDataChangeHandler(nullptr);
        mcOpcGroup2.reset();
    }
    for (const ServedChannels::Entry& entry : mcChannels.RemoveGroup(2)) {
        Unlink(entry);
    }
}

// A channel the client no longer serves no longer calls it.
void CvOpcAutoClient::Unlink(const ServedChannels::Entry& entry) {
    Channel* cChannel = entry.Get();
    if (cChannel != nullptr && cChannel->OpcClient() == this) {
        cChannel->SetOpcClient(nullptr);
    }
}

// Everything is taken from the client before the first call waits: a
// notification, the shutdown or another GoOffline meanwhile finds the client
// offline already, and the rest runs on what was taken.
ErrorInfo CvOpcAutoClient::GoOffline() {
    ++mpLife->connection;
    Connection gone{std::exchange(mcOpcServer, nullptr), std::exchange(mcOpcGroup1, nullptr),
                    std::exchange(mcOpcGroup2, nullptr), mcChannels.TakeAll()};
    if (gone.server) {
        gone.server->SetShutDownHandler(nullptr);
    }
    for (const GroupPtr& group : {gone.group1, gone.group2}) {
        if (group) {
            group->SetDataChangeHandler(nullptr);
        }
    }
    for (const ServedChannels::Entry& entry : gone.channels) {
        Unlink(entry);
    }
    return EndConnection(mPlatform, std::move(gone));
}

ErrorInfo CvOpcAutoClient::EndConnection(Platform& platform, Connection gone) {
    if (gone.server) {
        AdviseGroup(platform, gone.group1, 1, false);
        AdviseGroup(platform, gone.group2, 2, false);
        for (const int32_t lGroup : {1, 2}) {
            std::vector<int32_t> handles;
            for (const ServedChannels::Entry& entry : gone.channels) {
                if (entry.group == lGroup) {
                    handles.push_back(entry.serverHandle);
                }
            }
            RemoveGroupItems(platform, lGroup == 2 ? gone.group2 : gone.group1, lGroup, handles);
        }
    }
    for (const ServedChannels::Entry& entry : gone.channels) {
        if (Channel* cChannel = entry.Get()) {
            cChannel->GoOffline();
        }
    }
    if (!gone.server) {
        return {};
    }
    Trace(platform, "Server.OPCGroups.RemoveAll");
    const ErrorInfo removed = gone.server->OPCGroups().RemoveAll();
    Trace(platform, "Server.Disconnect");
    const ErrorInfo disconnected = gone.server->Disconnect();
    return removed ? removed : disconnected;
}

}  // namespace cv
