#include <algorithm>

#include "platform/AsciiCase.h"
#include "platform/opc/OpcResult.h"
#include "platform/sim/Connection.h"
#include "platform/sim/ErrorTexts.h"
#include "platform/sim/GroupState.h"
#include "platform/sim/ItemIdSyntax.h"
#include "platform/sim/PlantRuntime.h"
#include "platform/sim/QualityNames.h"
#include "platform/sim/ServerInstance.h"

namespace cv::sim {

using namespace platform::OpcResult;
using platform::OneBased;

namespace {

// A count that the arrays of a call do not hold is a bad argument.
bool CountFits(int32_t count, std::initializer_list<int32_t> sizes) {
    return count > 0 &&
           std::all_of(sizes.begin(), sizes.end(), [count](int32_t size) { return size >= count; });
}

bool PathAccepted(const ItemSpec& item, const std::string& path) {
    if (item.accessPaths.empty()) {
        return true;  // the server takes no notice of paths for this item
    }
    if (path.empty()) {
        return !item.pathRequired;
    }
    return std::any_of(item.accessPaths.begin(), item.accessPaths.end(),
                       [&](const std::string& known) { return EqualsIgnoringCase(known, path); });
}

}  // namespace

ErrorInfo GroupState::AddItems(int32_t count, const OneBased<std::string>& itemIds,
                               const OneBased<int32_t>& clientHandles,
                               const OneBased<std::string>& accessPaths,
                               OneBased<int32_t>& serverHandles, OneBased<int32_t>& errors) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (!CountFits(count, {itemIds.Count(), clientHandles.Count()}) ||
        (accessPaths.Count() != 0 && accessPaths.Count() < count)) {
        return ServerError(E_INVALIDARG);
    }
    serverHandles = OneBased<int32_t>::Sized(count);
    errors = OneBased<int32_t>::Sized(count);
    for (int32_t i = 1; i <= count; ++i) {
        const std::string& path = accessPaths.Count() == 0 ? std::string() : accessPaths(i);
        errors(i) = AddOne(itemIds(i), clientHandles(i), path, serverHandles(i));
    }
    return {};
}

int32_t GroupState::AddOne(const std::string& itemId, int32_t clientHandle,
                           const std::string& accessPath, int32_t& serverHandle) {
    if (!IsWellFormedItemId(itemId)) {
        return OPC_E_INVALIDITEMID;
    }
    const auto connection = connection_.lock();
    const ServerSpec& server = connection->Server().Described();
    const ItemSpec* described = server.FindItem(itemId);
    if (described == nullptr) {
        return OPC_E_UNKNOWNITEMID;
    }
    if (!PathAccepted(*described, accessPath)) {
        return OPC_E_UNKNOWNPATH;
    }
    auto item = std::make_shared<GroupItemState>();
    item->serverHandle = connection->NewServerHandle();
    item->clientHandle = clientHandle;
    item->item = server.IndexOf(*described);
    item->itemId = itemId;
    items_.push_back(item);
    byHandle_[item->serverHandle] = item;
    serverHandle = item->serverHandle;
    return 0;
}

ErrorInfo GroupState::RemoveItems(int32_t count, const OneBased<int32_t>& serverHandles,
                                  OneBased<int32_t>& errors) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (!CountFits(count, {serverHandles.Count()})) {
        return ServerError(E_INVALIDARG);
    }
    errors = OneBased<int32_t>::Sized(count);
    for (int32_t i = 1; i <= count; ++i) {
        const auto found = byHandle_.find(serverHandles(i));
        if (found == byHandle_.end()) {
            errors(i) = OPC_E_INVALIDHANDLE;
            continue;
        }
        found->second->removed = true;
        std::erase(items_, found->second);
        byHandle_.erase(found);
    }
    return {};
}

GroupItemState* GroupState::Lookup(int32_t serverHandle) const {
    const auto found = byHandle_.find(serverHandle);
    return found == byHandle_.end() ? nullptr : found->second.get();
}

ErrorInfo GroupState::FindItem(int32_t serverHandle, std::shared_ptr<GroupItemState>& item) const {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    const auto found = byHandle_.find(serverHandle);
    if (found == byHandle_.end()) {
        return ServerError(OPC_E_INVALIDHANDLE);
    }
    item = found->second;
    return {};
}

ErrorInfo GroupState::SetItemActive(GroupItemState& item, bool active) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (item.removed) {
        return ServerError(OPC_E_INVALIDHANDLE);
    }
    if (active && !item.active) {
        item.sent = false;  // an item that becomes active is sent once
    }
    item.active = active;
    return {};
}

ErrorInfo GroupState::SyncRead(int16_t source, int32_t count, const OneBased<int32_t>& handles,
                               OneBased<Variant>& values, OneBased<int32_t>& errors,
                               OneBased<int32_t>& qualities, OneBased<double>& timeStamps) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    const bool device = source == platform::OpcDataSource::Device;
    if ((!device && source != platform::OpcDataSource::Cache) ||
        !CountFits(count, {handles.Count()})) {
        return ServerError(E_INVALIDARG);
    }
    ServerInstance& server = connection_.lock()->Server();
    values = OneBased<Variant>::Sized(count);
    errors = OneBased<int32_t>::Sized(count);
    qualities = OneBased<int32_t>::Sized(count);
    timeStamps = OneBased<double>::Sized(count);
    for (int32_t i = 1; i <= count; ++i) {
        const GroupItemState* item = Lookup(handles(i));
        if (item == nullptr) {
            errors(i) = OPC_E_INVALIDHANDLE;
            continue;
        }
        const ItemRuntime& value = device ? server.Observe(item->item) : server.Last(item->item);
        // The cache of an inactive group or item is not kept up to date.
        const bool stale = !device && (!active_ || !item->active);
        values(i) = value.value;
        qualities(i) = stale ? Quality::OutOfService : value.quality;
        timeStamps(i) = runtime_->Clock().OleDate(value.stampMs);
    }
    return {};
}

ErrorInfo GroupState::SyncWrite(int32_t count, const OneBased<int32_t>& handles,
                                const OneBased<Variant>& values, OneBased<int32_t>& errors) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    if (!CountFits(count, {handles.Count(), values.Count()})) {
        return ServerError(E_INVALIDARG);
    }
    ServerInstance& server = connection_.lock()->Server();
    errors = OneBased<int32_t>::Sized(count);
    for (int32_t i = 1; i <= count; ++i) {
        const GroupItemState* item = Lookup(handles(i));
        errors(i) = item == nullptr ? OPC_E_INVALIDHANDLE : server.Write(item->item, values(i));
    }
    return {};
}

}  // namespace cv::sim
