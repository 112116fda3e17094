#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/opc/OPCGroup.h"

namespace cv::platform {

// The groups of a connected server.
class OPCGroups {
  public:
    virtual ~OPCGroups() = default;
    virtual int32_t Count() const = 0;
    virtual ErrorInfo Add(const std::string& sName, std::shared_ptr<OPCGroup>& cGroup) = 0;
    virtual ErrorInfo Remove(const std::string& sName) = 0;
    virtual ErrorInfo RemoveAll() = 0;
};

}  // namespace cv::platform
