#include <algorithm>

#include "platform/opc/OpcResult.h"
#include "platform/ua/UaConnection.h"
#include "platform/ua/UaGroupState.h"
#include "platform/ua/UaItemId.h"
#include "platform/ua/UaStatusMap.h"
#include "platform/ua/UaTime.h"
#include "platform/ua/UaValueMap.h"

namespace cv::uaopc {

using namespace platform::OpcResult;
using platform::OneBased;

namespace {

// A count that the arrays of a call do not hold is a bad argument.
bool CountFits(int32_t count, std::initializer_list<int32_t> sizes) {
    return count > 0 &&
           std::all_of(sizes.begin(), sizes.end(), [count](int32_t size) { return size >= count; });
}

ErrorInfo BadArgument() {
    return {E_INVALIDARG, *OwnErrorText(E_INVALIDARG)};
}

}  // namespace

int32_t UaGroupState::Prepare(const std::string& itemId, const std::string& accessPath,
                              const std::vector<std::string>& namespaces, ua::NodeId& node) const {
    const int32_t error = NodeOfItemId(itemId, namespaces, node);
    if (error != 0) {
        return error;
    }
    return accessPath.empty() ? 0 : OPC_E_UNKNOWNPATH;
}

ErrorInfo UaGroupState::AddItems(int32_t count, const OneBased<std::string>& itemIds,
                                 const OneBased<int32_t>& clientHandles,
                                 const OneBased<std::string>& accessPaths,
                                 OneBased<int32_t>& serverHandles, OneBased<int32_t>& errors) {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    if (!CountFits(count, {itemIds.Count(), clientHandles.Count()}) ||
        (accessPaths.Count() != 0 && accessPaths.Count() < count)) {
        return BadArgument();
    }
    serverHandles = OneBased<int32_t>::Sized(count);
    errors = OneBased<int32_t>::Sized(count);
    std::vector<std::pair<int32_t, std::shared_ptr<UaItemState>>> added;
    std::vector<ua::MonitoredItemCreateRequest> requests;
    for (int32_t i = 1; i <= count; ++i) {
        auto item = std::make_shared<UaItemState>();
        const std::string& path = accessPaths.Count() == 0 ? std::string() : accessPaths(i);
        errors(i) = Prepare(itemIds(i), path, connection->NamespaceUris(), item->node);
        if (errors(i) != 0) {
            continue;
        }
        item->serverHandle = connection->NewServerHandle();
        item->clientHandle = clientHandles(i);
        item->itemId = itemIds(i);
        ua::MonitoredItemCreateRequest request;
        request.itemToMonitor.nodeId = item->node;
        request.monitoringMode = ModeOf(*item);
        request.requestedParameters.clientHandle = static_cast<uint32_t>(item->serverHandle);
        request.requestedParameters.samplingInterval = rate_;
        requests.push_back(std::move(request));
        added.emplace_back(i, std::move(item));
    }
    if (requests.empty()) {
        return {};
    }
    std::optional<ua::Result<std::vector<ua::MonitoredItemCreateResult>>> created;
    if (const ErrorInfo error = connection->Call<std::vector<ua::MonitoredItemCreateResult>>(
            [&, id = subscriptionId_](ua::Client& client, auto done) {
                client.CreateMonitoredItems(id, ua::TimestampsToReturn::Both, requests,
                                            std::move(done));
            },
            created)) {
        return error;
    }
    if (!*created) {
        return connection->CallError(created->Failure());
    }
    for (size_t k = 0; k < added.size(); ++k) {
        const auto& [i, item] = added[k];
        const ua::MonitoredItemCreateResult& result = created->Value()[k];
        errors(i) = connection->ResultOf(result.statusCode);
        if (errors(i) != 0) {
            continue;
        }
        item->monitoredItemId = result.monitoredItemId;
        items_.push_back(item);
        byHandle_[item->serverHandle] = item;
        serverHandles(i) = item->serverHandle;
    }
    return Check();
}

ErrorInfo UaGroupState::RemoveItems(int32_t count, const OneBased<int32_t>& serverHandles,
                                    OneBased<int32_t>& errors) {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    if (!CountFits(count, {serverHandles.Count()})) {
        return BadArgument();
    }
    errors = OneBased<int32_t>::Sized(count);
    std::vector<std::shared_ptr<UaItemState>> removing;
    std::vector<uint32_t> ids;
    for (int32_t i = 1; i <= count; ++i) {
        const auto found = byHandle_.find(serverHandles(i));
        if (found == byHandle_.end()) {
            errors(i) = OPC_E_INVALIDHANDLE;
            continue;
        }
        removing.push_back(found->second);
        ids.push_back(found->second->monitoredItemId);
    }
    if (!ids.empty()) {
        std::optional<ua::Result<std::vector<ua::StatusCode>>> deleted;
        if (const ErrorInfo error = connection->Call<std::vector<ua::StatusCode>>(
                [&, id = subscriptionId_](ua::Client& client, auto done) {
                    client.DeleteMonitoredItems(id, ids, std::move(done));
                },
                deleted)) {
            return error;
        }
    }
    for (const auto& item : removing) {
        item->removed = true;
        std::erase(items_, item);
        byHandle_.erase(item->serverHandle);
    }
    return {};
}

UaItemState* UaGroupState::Lookup(int32_t serverHandle) const {
    const auto found = byHandle_.find(serverHandle);
    return found == byHandle_.end() ? nullptr : found->second.get();
}

ErrorInfo UaGroupState::FindItem(int32_t serverHandle, std::shared_ptr<UaItemState>& item) const {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    const auto found = byHandle_.find(serverHandle);
    if (found == byHandle_.end()) {
        return {OPC_E_INVALIDHANDLE, *OwnErrorText(OPC_E_INVALIDHANDLE)};
    }
    item = found->second;
    return {};
}

ErrorInfo UaGroupState::SetItemActive(UaItemState& item, bool active) {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    if (item.removed) {
        return {OPC_E_INVALIDHANDLE, *OwnErrorText(OPC_E_INVALIDHANDLE)};
    }
    if (active == item.active) {
        return {};
    }
    // Only an active group's items report; the others wait for the group.
    if (active_) {
        const auto mode = active ? ua::MonitoringMode::Reporting : ua::MonitoringMode::Disabled;
        if (const ErrorInfo error = SetModes({item.monitoredItemId}, mode)) {
            return error;
        }
    }
    item.active = active;
    return {};
}

ErrorInfo UaGroupState::SyncRead(int16_t source, int32_t count, const OneBased<int32_t>& handles,
                                 OneBased<Variant>& values, OneBased<int32_t>& errors,
                                 OneBased<int32_t>& qualities, OneBased<double>& timeStamps,
                                 OneBased<platform::ValueDetail>& details) {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    const bool device = source == platform::OpcDataSource::Device;
    if ((!device && source != platform::OpcDataSource::Cache) ||
        !CountFits(count, {handles.Count()})) {
        return BadArgument();
    }
    values = OneBased<Variant>::Sized(count);
    errors = OneBased<int32_t>::Sized(count);
    qualities = OneBased<int32_t>::Sized(count);
    timeStamps = OneBased<double>::Sized(count);
    details = OneBased<platform::ValueDetail>::Sized(count);
    std::vector<int32_t> positions;
    std::vector<ua::ReadValueId> nodes;
    for (int32_t i = 1; i <= count; ++i) {
        const UaItemState* item = Lookup(handles(i));
        if (item == nullptr) {
            errors(i) = OPC_E_INVALIDHANDLE;
            continue;
        }
        positions.push_back(i);
        nodes.push_back({item->node, ua::attribute::Value, "", {}});
    }
    if (nodes.empty()) {
        return {};
    }
    // A device read asks the source now; a cache read takes a value as old
    // as the group's rate.
    const double maxAge = device ? 0.0 : static_cast<double>(rate_);
    std::optional<ua::Result<std::vector<ua::DataValue>>> read;
    if (const ErrorInfo error = connection->Call<std::vector<ua::DataValue>>(
            [&](ua::Client& client, auto done) {
                client.Read(nodes, maxAge, ua::TimestampsToReturn::Both, std::move(done));
            },
            read, true)) {
        return error;
    }
    if (!*read) {
        return connection->CallError(read->Failure());
    }
    for (size_t k = 0; k < positions.size(); ++k) {
        const int32_t i = positions[k];
        const ua::DataValue& value = read->Value()[k];
        if (IsOperationError(value.status)) {
            errors(i) = connection->ResultOf(value.status);
            continue;
        }
        values(i) = ToAutomation(value.value);
        qualities(i) = QualityOf(value.status);
        timeStamps(i) = TimeStampOf(value);
        details(i) = DetailOf(value);
    }
    return {};
}

ErrorInfo UaGroupState::SyncWrite(int32_t count, const OneBased<int32_t>& handles,
                                  const OneBased<Variant>& values, OneBased<int32_t>& errors) {
    std::shared_ptr<UaConnection> connection;
    if (const ErrorInfo error = Connection(connection)) {
        return error;
    }
    if (!CountFits(count, {handles.Count(), values.Count()})) {
        return BadArgument();
    }
    errors = OneBased<int32_t>::Sized(count);
    std::vector<int32_t> positions;
    std::vector<std::pair<ua::NodeId, ua::Variant>> writes;
    for (int32_t i = 1; i <= count; ++i) {
        const UaItemState* item = Lookup(handles(i));
        if (item == nullptr) {
            errors(i) = OPC_E_INVALIDHANDLE;
            continue;
        }
        positions.push_back(i);
        writes.emplace_back(item->node, FromAutomation(values(i)));
    }
    if (writes.empty()) {
        return {};
    }
    std::optional<ua::Result<std::vector<ua::StatusCode>>> written;
    if (const ErrorInfo error = connection->Call<std::vector<ua::StatusCode>>(
            [&](ua::Client& client, auto done) { client.WriteValues(writes, std::move(done)); },
            written)) {
        return error;
    }
    if (!*written) {
        return connection->CallError(written->Failure());
    }
    for (size_t k = 0; k < positions.size(); ++k) {
        errors(positions[k]) = connection->ResultOf(written->Value()[k]);
    }
    return {};
}

}  // namespace cv::uaopc
