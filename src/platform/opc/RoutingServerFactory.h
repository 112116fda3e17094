#pragma once

#include <memory>

#include "platform/opc/OpcServerFactory.h"
#include "platform/opc/ServerBackend.h"

namespace cv::platform {

// The factory the program uses: its server objects send a server ID that
// is an address of the addressed backend (OPC UA endpoint URLs) there, and
// every other ID to the servers of the plant factory (the simulated plant);
// a name the plant does not know may still name a server the addressed
// backend finds on that computer. Listing a computer's servers lists both.
// Both factories must outlive every object handed out.
class RoutingServerFactory : public OpcServerFactory {
  public:
    RoutingServerFactory(OpcServerFactory& plant, ServerBackend& addressed)
        : plant_(plant), addressed_(addressed) {}

    ErrorInfo CreateServer(std::unique_ptr<OPCServer>& cServer) override;

  private:
    OpcServerFactory& plant_;
    ServerBackend& addressed_;
};

}  // namespace cv::platform
