#include "platform/ua/UaConnection.h"

#include <algorithm>
#include <cstdio>

#include "platform/opc/OpcResult.h"
#include "platform/ua/UaGroupState.h"
#include "platform/ua/UaStatusMap.h"
#include "security/SecureConnect.h"
#include "security/UaSecurity.h"
#include "ua/types/StatusCodeTable.h"

namespace cv::uaopc {

namespace {

using namespace platform::OpcResult;

constexpr uint32_t kNamespaceArray = 2255;

}  // namespace

ErrorInfo UaConnection::Connect(const std::string& address, const std::string& node) {
    if (connected_ || released_ || client_) {
        return {E_FAIL, "The server object is connected already."};
    }
    const uint64_t session = ++session_;
    ended_ = false;
    told_ = false;
    endReason_.clear();
    client_ = runtime_->NewClient(runtime_->Options().session);
    client_->SetEventHandler(
        [weak = weak_from_this(), session](ua::ConnectionEvent event, const ua::Error& reason) {
            const auto self = weak.lock();
            if (self && self->session_ == session) {
                self->OnClientEvent(event, reason);
            }
        });
    const auto self = shared_from_this();
    ua::Client& client = *client_;
    std::optional<security::SecureConnect> secure;
    if (security::UaSecurity* run = runtime_->Options().security) {
        secure.emplace(client, run->Services());
    }
    std::optional<ua::Result<ua::SessionInfo>> opened;
    const ErrorInfo waited = Await<ua::SessionInfo>(
        runtime_->CallWait(),
        [self, session] { return self->released_ || self->session_ != session; },
        [&](auto done) {
            if (secure) {
                secure->Connect(address, std::move(done));
            } else {
                client.Connect(address, std::move(done));
            }
        },
        opened);
    if (waited) {
        if (!released_ && session_ == session) {
            client_.reset();
        }
        return waited;
    }
    if (!*opened) {
        client_.reset();
        return {E_FAIL, opened->Failure().text};
    }
    connected_ = true;
    address_ = address;
    node_ = node;
    ReadNamespaces();
    return Check();
}

void UaConnection::ReadNamespaces() {
    std::optional<ua::Result<std::vector<ua::DataValue>>> read;
    const ErrorInfo error = Call<std::vector<ua::DataValue>>(
        [](ua::Client& client, auto done) {
            client.Read({{ua::NodeId(0, kNamespaceArray), ua::attribute::Value, "", {}}}, 0,
                        ua::TimestampsToReturn::Neither, std::move(done));
        },
        read);
    if (error || !*read) {
        return;
    }
    namespaces_.clear();
    for (const ua::Variant& uri : read->Value().at(0).value.ArrayElements()) {
        const std::string* text = uri.Get<std::string>();
        namespaces_.push_back(text ? *text : std::string());
    }
}

void UaConnection::Disconnect() {
    EndGroups();
    CloseClient();
    connected_ = false;
    ++session_;
    address_.clear();
    node_.clear();
    namespaces_.clear();
}

void UaConnection::Release() {
    released_ = true;
    handler_ = nullptr;
    Disconnect();
}

ErrorInfo UaConnection::Check() const {
    if (released_ || !connected_) {
        return Disconnected("The server object is not connected.");
    }
    if (ended_) {
        return Disconnected("The server has gone: " + endReason_);
    }
    return {};
}

void UaConnection::OnClientEvent(ua::ConnectionEvent event, const ua::Error& reason) {
    if (event == ua::ConnectionEvent::ServerShutdown ||
        event == ua::ConnectionEvent::ConnectionLost) {
        End(reason.text);
    }
}

void UaConnection::End(const std::string& reason) {
    if (ended_ || !connected_) {
        return;
    }
    ended_ = true;
    endReason_ = reason;
    EndGroups();
    CloseClient();
    if (told_ || !handler_) {
        return;
    }
    told_ = true;
    // The handler may release the server object: keep this state until it
    // returns.
    const auto self = shared_from_this();
    const auto handler = handler_;
    handler(reason);
}

void UaConnection::CloseClient() {
    if (client_) {
        runtime_->CloseInBackground(std::move(client_));
    }
}

int32_t UaConnection::ResultOf(ua::StatusCode status) {
    const int32_t code = HresultOf(status);
    if (code != 0) {
        statuses_[code] = status.WithoutInfoBits();
    }
    return code;
}

ErrorInfo UaConnection::CallError(const ua::Error& failure) {
    const int32_t code = ResultOf(failure.status);
    return {code != 0 ? code : E_FAIL, failure.text};
}

ErrorInfo UaConnection::ErrorText(int32_t code, std::string& text) const {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    const auto seen = statuses_.find(code);
    const auto status =
        seen != statuses_.end() ? std::optional(seen->second) : StatusOfHresult(code);
    if (status) {
        text = ua::DescribeStatusCode(*status);
        return {};
    }
    if (const auto own = OwnErrorText(code)) {
        text = *own;
        return {};
    }
    char hex[16];
    std::snprintf(hex, sizeof hex, "%08X", static_cast<uint32_t>(code));
    return {E_INVALIDARG, "The server has no text for the error " + std::string(hex) + "."};
}

ErrorInfo UaConnection::AddGroup(const std::string& name, std::shared_ptr<UaGroupState>& group) {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    std::string groupName = name;
    while (groupName.empty()) {
        const std::string candidate = "Group" + std::to_string(nextGroupNumber_++);
        const bool taken = std::any_of(groups_.begin(), groups_.end(),
                                       [&](const auto& g) { return g->Name() == candidate; });
        groupName = taken ? std::string() : candidate;
    }
    const bool duplicate = std::any_of(groups_.begin(), groups_.end(),
                                       [&](const auto& g) { return g->Name() == groupName; });
    if (duplicate) {
        return {OPC_E_DUPLICATENAME, *OwnErrorText(OPC_E_DUPLICATENAME)};
    }
    auto created = std::make_shared<UaGroupState>(shared_from_this(), groupName);
    if (const ErrorInfo error = created->Create()) {
        return error;
    }
    groups_.push_back(created);
    group = std::move(created);
    return {};
}

ErrorInfo UaConnection::RemoveGroup(const std::string& name) {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    const auto found = std::find_if(groups_.begin(), groups_.end(),
                                    [&](const auto& g) { return g->Name() == name; });
    if (found == groups_.end()) {
        return {E_INVALIDARG, "The server has no group \"" + name + "\"."};
    }
    const auto group = *found;
    groups_.erase(found);
    const ErrorInfo error = group->Delete();
    group->End();
    return error;
}

ErrorInfo UaConnection::RemoveAllGroups() {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    std::vector<uint32_t> ids;
    for (const auto& group : groups_) {
        ids.push_back(group->SubscriptionId());
    }
    EndGroups();
    if (ids.empty()) {
        return {};
    }
    std::optional<ua::Result<std::vector<ua::StatusCode>>> deleted;
    return Call<std::vector<ua::StatusCode>>(
        [&ids](ua::Client& client, auto done) { client.DeleteSubscriptions(ids, std::move(done)); },
        deleted);
}

void UaConnection::EndGroups() {
    std::vector<std::shared_ptr<UaGroupState>> groups;
    groups.swap(groups_);
    for (const auto& group : groups) {
        group->End();
    }
}

}  // namespace cv::uaopc
