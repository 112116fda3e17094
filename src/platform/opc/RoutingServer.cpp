#include "platform/opc/RoutingServer.h"

#include <vector>

#include "platform/opc/OpcResult.h"

namespace cv::platform {

namespace {

ErrorInfo Released() {
    return {OpcResult::RPC_E_DISCONNECTED,
            "The server object was released while the call was under way."};
}

}  // namespace

// Calls that may wait work on the shared state they copied: this object
// may be released meanwhile, and with it the backend's object, whose own
// calls cope with that.

RoutingServer::RoutingServer(std::unique_ptr<OPCServer> plant, ServerBackend& addressed)
    : state_(std::make_shared<State>()), addressed_(addressed) {
    state_->plant = std::move(plant);
    state_->plant->SetShutDownHandler(Forwarder(state_));
}

RoutingServer::~RoutingServer() {
    state_->released = true;
    state_->handler = nullptr;
    state_->connected = nullptr;
    state_->addressed.reset();
    state_->plant.reset();
}

OPCServer::ShutDownHandler RoutingServer::Forwarder(const std::shared_ptr<State>& state) {
    return [weak = std::weak_ptr<State>(state)](const std::string& reason) {
        const auto shared = weak.lock();
        if (shared && !shared->released && shared->handler) {
            const auto handler = shared->handler;
            handler(reason);
        }
    };
}

ErrorInfo RoutingServer::ServerName(std::string& sName) const {
    sName = state_->progId;
    return {};
}

ErrorInfo RoutingServer::ServerNode(std::string& sNode) const {
    sNode = state_->node;
    return {};
}

ErrorInfo RoutingServer::Connect(const std::string& sProgID, const std::string& sNode) {
    const auto state = state_;
    ServerBackend& backend = addressed_;
    if (state->connected) {
        return {OpcResult::E_FAIL, "The server object is connected already."};
    }
    if (backend.Serves(sProgID)) {
        return ConnectAddressed(state, backend, sProgID, sProgID, sNode);
    }
    const ErrorInfo plantError = state->plant->Connect(sProgID, sNode);
    if (state->released) {
        return Released();
    }
    if (!plantError) {
        state->connected = state->plant.get();
        state->progId = sProgID;
        state->node = sNode;
        return {};
    }
    // Not a server of the plant there: perhaps a server of that name is
    // found on that computer.
    if (plantError.Number != OpcResult::E_FAIL &&
        plantError.Number != OpcResult::RPC_S_SERVER_UNAVAILABLE) {
        return plantError;
    }
    const auto address = backend.FindServerNamed(sProgID, sNode);
    if (state->released) {
        return Released();
    }
    return address ? ConnectAddressed(state, backend, *address, sProgID, sNode) : plantError;
}

ErrorInfo RoutingServer::ConnectAddressed(const std::shared_ptr<State>& state,
                                          ServerBackend& backend, const std::string& address,
                                          const std::string& progId, const std::string& node) {
    std::unique_ptr<OPCServer> server;
    if (const ErrorInfo error = backend.CreateServer(server)) {
        return error;
    }
    server->SetShutDownHandler(Forwarder(state));
    OPCServer& target = *server;
    state->addressed = std::move(server);
    const ErrorInfo error = target.Connect(address, node);
    if (state->released) {
        return error ? error : Released();
    }
    if (error) {
        state->addressed.reset();
        return error;
    }
    state->connected = state->addressed.get();
    state->progId = progId;
    state->node = node;
    return {};
}

ErrorInfo RoutingServer::SetClientName(const std::string& sName) {
    return Current().SetClientName(sName);
}

ErrorInfo RoutingServer::GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) {
    const auto state = state_;
    ServerBackend& backend = addressed_;
    Variant plantServers;
    const ErrorInfo plantError = state->plant->GetOPCServers(sNode, plantServers);
    if (state->released) {
        return Released();
    }
    const std::vector<std::string> found = backend.FindServers(sNode.value_or(std::string()));
    if (state->released) {
        return Released();
    }
    if (plantError && found.empty()) {
        return plantError;
    }
    std::vector<Variant> all = plantError ? std::vector<Variant>() : plantServers.Elements();
    for (const std::string& id : found) {
        all.push_back(Variant::Str(id));
    }
    vServers = Variant::Array(VT_BSTR, std::move(all), 1);
    return {};
}

ErrorInfo RoutingServer::CreateBrowser(std::shared_ptr<OPCBrowser>& cBrowser) {
    return Current().CreateBrowser(cBrowser);
}

ErrorInfo RoutingServer::GetErrorString(int32_t lError, std::string& sText) {
    return Current().GetErrorString(lError, sText);
}

ErrorInfo RoutingServer::Disconnect() {
    const auto state = state_;
    const ErrorInfo error = Current().Disconnect();
    state->connected = nullptr;
    state->addressed.reset();
    state->progId.clear();
    state->node.clear();
    return error;
}

void RoutingServer::SetShutDownHandler(ShutDownHandler handler) {
    state_->handler = std::move(handler);
}

std::string RoutingServer::BackendName() const {
    return state_->connected ? state_->connected->BackendName() : std::string();
}

}  // namespace cv::platform
