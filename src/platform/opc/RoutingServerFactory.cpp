#include "platform/opc/RoutingServerFactory.h"

#include "platform/opc/RoutingServer.h"

namespace cv::platform {

ErrorInfo RoutingServerFactory::CreateServer(std::unique_ptr<OPCServer>& cServer) {
    std::unique_ptr<OPCServer> plant;
    if (const ErrorInfo error = plant_.CreateServer(plant)) {
        return error;
    }
    cServer = std::make_unique<RoutingServer>(std::move(plant), addressed_);
    return {};
}

}  // namespace cv::platform
