#pragma once

#include <memory>
#include <string>

#include "platform/opc/OPCServer.h"
#include "platform/opc/ServerBackend.h"

namespace cv::platform {

// A server object of RoutingServerFactory. Unconnected it is the plant's
// server object (and lists the servers of both backends); Connect decides
// which backend's object carries it from then on. Its ServerName and
// ServerNode are the texts Connect was given.
class RoutingServer : public OPCServer {
  public:
    RoutingServer(std::unique_ptr<OPCServer> plant, ServerBackend& addressed);
    ~RoutingServer() override;
    RoutingServer(const RoutingServer&) = delete;
    RoutingServer& operator=(const RoutingServer&) = delete;

    ErrorInfo ServerName(std::string& sName) const override;
    ErrorInfo ServerNode(std::string& sNode) const override;
    ErrorInfo Connect(const std::string& sProgID, const std::string& sNode) override;
    ErrorInfo SetClientName(const std::string& sName) override;
    platform::OPCGroups& OPCGroups() override { return Current().OPCGroups(); }
    ErrorInfo GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) override;
    ErrorInfo CreateBrowser(std::shared_ptr<OPCBrowser>& cBrowser) override;
    ErrorInfo GetErrorString(int32_t lError, std::string& sText) override;
    ErrorInfo Disconnect() override;
    void SetShutDownHandler(ShutDownHandler handler) override;
    std::string BackendName() const override;

  private:
    // Shared with the calls under way: an event handler may release this
    // object while one waits.
    struct State {
        std::unique_ptr<OPCServer> plant;
        // Made by Connect for a server of the addressed backend.
        std::unique_ptr<OPCServer> addressed;
        // The object that took the Connect.
        OPCServer* connected = nullptr;
        std::string progId;
        std::string node;
        ShutDownHandler handler;
        bool released = false;
    };

    OPCServer& Current() const { return state_->connected ? *state_->connected : *state_->plant; }
    static ErrorInfo ConnectAddressed(const std::shared_ptr<State>& state, ServerBackend& backend,
                                      const std::string& address, const std::string& progId,
                                      const std::string& node);
    static ShutDownHandler Forwarder(const std::shared_ptr<State>& state);

    std::shared_ptr<State> state_;
    ServerBackend& addressed_;
};

}  // namespace cv::platform
