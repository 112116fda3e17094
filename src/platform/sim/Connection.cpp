#include "platform/sim/Connection.h"

#include <algorithm>

#include "platform/AsciiCase.h"
#include "platform/opc/OpcResult.h"
#include "platform/sim/ErrorTexts.h"
#include "platform/sim/GroupState.h"
#include "platform/sim/PlantRuntime.h"
#include "platform/sim/ServerInstance.h"

namespace cv::sim {

using namespace platform::OpcResult;

ErrorInfo Connection::Connect(const std::string& progId, const std::string& node) {
    if (connected_ || released_) {
        return {E_FAIL, "The server object is connected already."};
    }
    const ComputerSpec* computer = runtime_->ResolveComputer(node);
    if (const ErrorInfo error = runtime_->Reach(computer)) {
        return error;
    }
    const bool registered =
        std::any_of(computer->servers.begin(), computer->servers.end(),
                    [&](const std::string& id) { return EqualsIgnoringCase(id, progId); });
    const ServerSpec* described = registered ? runtime_->Plant().FindServer(progId) : nullptr;
    if (described == nullptr || progId.empty()) {
        return ServerError(E_FAIL);
    }
    if (!described->running) {
        return ServerError(CO_E_SERVER_EXEC_FAILURE);
    }
    const auto server = runtime_->Instance(*computer, *described);
    if (const ErrorInfo error = runtime_->Delay(server->CallDelay())) {
        return error;
    }
    if (connected_ || released_) {
        return ServerError(RPC_E_DISCONNECTED);
    }
    server->Start(server);
    server->Attach(shared_from_this());
    server_ = server;
    progId_ = progId;
    node_ = node;
    connected_ = true;
    endedCode_ = 0;
    ++session_;
    return {};
}

void Connection::Disconnect() {
    EndGroups();
    if (server_) {
        server_->Detach(*this);
    }
    server_.reset();
    connected_ = false;
    progId_.clear();
    node_.clear();
}

void Connection::Release() {
    released_ = true;
    handler_ = nullptr;
    Disconnect();
}

ErrorInfo Connection::Check() const {
    if (!connected_) {
        return ServerError(RPC_E_DISCONNECTED);
    }
    return endedCode_ != 0 ? ServerError(endedCode_) : ErrorInfo{};
}

ErrorInfo Connection::Call() {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    // The server may go while the call waits; keep it for the wait only.
    const auto server = server_;
    if (const ErrorInfo error = runtime_->Delay(server->CallDelay())) {
        return error;
    }
    return Check();
}

ErrorInfo Connection::AddGroup(const std::string& name, std::shared_ptr<GroupState>& group) {
    if (const ErrorInfo error = Call()) {
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
        return ServerError(OPC_E_DUPLICATENAME);
    }
    group = std::make_shared<GroupState>(shared_from_this(), groupName);
    group->Start();
    groups_.push_back(group);
    return {};
}

ErrorInfo Connection::RemoveGroup(const std::string& name) {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    const auto found = std::find_if(groups_.begin(), groups_.end(),
                                    [&](const auto& g) { return g->Name() == name; });
    if (found == groups_.end()) {
        return ServerError(E_INVALIDARG);
    }
    const auto group = *found;
    groups_.erase(found);
    group->End();
    return {};
}

ErrorInfo Connection::RemoveAllGroups() {
    if (const ErrorInfo error = Call()) {
        return error;
    }
    EndGroups();
    return {};
}

void Connection::ServerEnded(int32_t code, const std::string* reason) {
    endedCode_ = code;
    EndGroups();
    if (reason == nullptr || released_) {
        return;
    }
    std::weak_ptr<Connection> weak = weak_from_this();
    runtime_->Events().Post([weak, text = *reason] {
        const auto connection = weak.lock();
        if (connection && !connection->released_ && connection->handler_) {
            const auto handler = connection->handler_;
            handler(text);
        }
    });
}

void Connection::EndGroups() {
    std::vector<std::shared_ptr<GroupState>> groups;
    groups.swap(groups_);
    for (const auto& group : groups) {
        group->End();
    }
}

}  // namespace cv::sim
