#pragma once

#include <memory>

#include "platform/opc/OPCServer.h"
#include "platform/ua/UaConnection.h"
#include "platform/ua/UaGroups.h"

namespace cv::uaopc {

// An OPCServer object of the OPC UA backend: one session with the server at
// an endpoint URL. Releasing it disconnects it; the groups, items and
// browsers it handed out then fail their calls.
class UaServer : public platform::OPCServer {
  public:
    static constexpr const char* kBackendName = "OPC UA";

    explicit UaServer(const std::shared_ptr<UaRuntime>& runtime)
        : connection_(std::make_shared<UaConnection>(runtime)), groups_(connection_) {}
    ~UaServer() override { connection_->Release(); }
    UaServer(const UaServer&) = delete;
    UaServer& operator=(const UaServer&) = delete;

    ErrorInfo ServerName(std::string& sName) const override;
    ErrorInfo ServerNode(std::string& sNode) const override;
    // sProgID is the endpoint URL; the session uses SecurityPolicy None and
    // the host of the URL, whatever host the server advertises.
    ErrorInfo Connect(const std::string& sProgID, const std::string& sNode) override;
    ErrorInfo SetClientName(const std::string& sName) override;
    platform::OPCGroups& OPCGroups() override { return groups_; }
    // Server IDs are the endpoint URLs found by discovery on that computer.
    ErrorInfo GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) override;
    ErrorInfo CreateBrowser(std::shared_ptr<platform::OPCBrowser>& cBrowser) override;
    ErrorInfo GetErrorString(int32_t lError, std::string& sText) override;
    ErrorInfo Disconnect() override;
    void SetShutDownHandler(ShutDownHandler handler) override;
    std::string BackendName() const override { return kBackendName; }

  private:
    std::shared_ptr<UaConnection> connection_;
    UaGroups groups_;
};

}  // namespace cv::uaopc
