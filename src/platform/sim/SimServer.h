#pragma once

#include <memory>

#include "platform/opc/OPCServer.h"
#include "platform/sim/Connection.h"
#include "platform/sim/SimGroups.h"

namespace cv::sim {

class PlantRuntime;

// An OPCServer object of the simulated plant. Releasing it disconnects it;
// the groups, items and browsers it handed out then fail their calls.
class SimServer : public platform::OPCServer {
  public:
    explicit SimServer(const std::shared_ptr<PlantRuntime>& runtime);
    ~SimServer() override;
    SimServer(const SimServer&) = delete;
    SimServer& operator=(const SimServer&) = delete;

    ErrorInfo ServerName(std::string& sName) const override;
    ErrorInfo ServerNode(std::string& sNode) const override;
    ErrorInfo Connect(const std::string& sProgID, const std::string& sNode) override;
    ErrorInfo SetClientName(const std::string& sName) override;
    platform::OPCGroups& OPCGroups() override { return groups_; }
    ErrorInfo GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) override;
    ErrorInfo CreateBrowser(std::shared_ptr<platform::OPCBrowser>& cBrowser) override;
    ErrorInfo GetErrorString(int32_t lError, std::string& sText) override;
    ErrorInfo Disconnect() override;
    void SetShutDownHandler(ShutDownHandler handler) override;
    std::string BackendName() const override { return kBackendName; }

    static constexpr const char* kBackendName = "simulated plant";

  private:
    std::shared_ptr<Connection> connection_;
    SimGroups groups_;
};

}  // namespace cv::sim
