#pragma once

#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "platform/opc/OPCServer.h"

namespace cv::fake {

class ScriptedOpc;

// A server object of ScriptedOpc, with its group collection.
class ScriptedOpcServer : public platform::OPCServer, public platform::OPCGroups {
  public:
    explicit ScriptedOpcServer(ScriptedOpc& script) : script_(script) {}

    ErrorInfo ServerName(std::string& sName) const override;
    ErrorInfo ServerNode(std::string& sNode) const override;
    ErrorInfo Connect(const std::string& sProgID, const std::string& sNode) override;
    ErrorInfo SetClientName(const std::string& sName) override;
    platform::OPCGroups& OPCGroups() override { return *this; }
    ErrorInfo GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) override;
    ErrorInfo CreateBrowser(std::shared_ptr<platform::OPCBrowser>& cBrowser) override;
    ErrorInfo GetErrorString(int32_t lError, std::string& sText) override;
    ErrorInfo Disconnect() override;
    void SetShutDownHandler(ShutDownHandler handler) override { handler_ = std::move(handler); }

    int32_t Count() const override { return static_cast<int32_t>(groups_.size()); }
    ErrorInfo Add(const std::string& sName, std::shared_ptr<platform::OPCGroup>& cGroup) override;
    ErrorInfo Remove(const std::string& sName) override;
    ErrorInfo RemoveAll() override;

  private:
    ScriptedOpc& script_;
    std::string progId_;
    std::string node_;
    std::vector<std::string> groups_;
    ShutDownHandler handler_;
};

}  // namespace cv::fake
