#pragma once

#include <memory>

#include "platform/ErrorInfo.h"
#include "platform/opc/OPCServer.h"

namespace cv::platform {

// Creates server objects; a failure is "the object cannot be created".
class OpcServerFactory {
  public:
    virtual ~OpcServerFactory() = default;
    virtual ErrorInfo CreateServer(std::unique_ptr<OPCServer>& cServer) = 0;
};

}  // namespace cv::platform
