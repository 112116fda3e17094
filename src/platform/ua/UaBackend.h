#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ServerCallWait.h"
#include "platform/opc/ServerBackend.h"
#include "platform/ua/UaOptions.h"

namespace cv::uaopc {

class UaRuntime;

// OPC UA servers behind the automation interface: server IDs are endpoint
// URLs (opc.tcp://host:port/path), and a computer's servers are found with
// FindServers at its discovery port. Calls wait through the given
// ServerCallWait (events run, busy notice, call limit); completions,
// notifications and shutdowns come from its event loop. The event loop and
// the call wait must outlive every object handed out; the backend itself
// may go first.
class UaBackend : public platform::ServerBackend {
  public:
    explicit UaBackend(platform::ServerCallWait& wait, UaOptions options = {});

    ErrorInfo CreateServer(std::unique_ptr<platform::OPCServer>& cServer) override;
    bool Serves(const std::string& sProgID) const override { return IsEndpointUrl(sProgID); }
    std::vector<std::string> FindServers(const std::string& sNode) override;
    // Application names match without regard to case.
    std::optional<std::string> FindServerNamed(const std::string& sName,
                                               const std::string& sNode) override;

    // True for a text of the form opc.tcp://host[:port][/path].
    static bool IsEndpointUrl(const std::string& text);

  private:
    std::shared_ptr<UaRuntime> runtime_;
};

}  // namespace cv::uaopc
