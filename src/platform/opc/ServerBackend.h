#pragma once

#include <optional>
#include <string>
#include <vector>

#include "platform/opc/OpcServerFactory.h"

namespace cv::platform {

// A kind of server that names its servers by address (OPC UA: endpoint URLs)
// and finds them on a computer through discovery, beside the servers the
// platform knows by server ID. Finding waits as server calls do; a computer
// that does not answer simply has no servers.
class ServerBackend : public OpcServerFactory {
  public:
    // True for a server ID that is one of this backend's addresses.
    virtual bool Serves(const std::string& sProgID) const = 0;
    // The servers found on a computer (this one when sNode is empty), as
    // server IDs that Connect takes.
    virtual std::vector<std::string> FindServers(const std::string& sNode) = 0;
    // The server ID of the server found on that computer under that name.
    virtual std::optional<std::string> FindServerNamed(const std::string& sName,
                                                       const std::string& sNode) = 0;
};

}  // namespace cv::platform
