#pragma once

#include <cstdint>
#include <string>

#include "platform/ErrorInfo.h"

namespace cv::platform {

// One item of a group. A reference stays safe to hold after the item was
// removed or its server released: its calls then fail.
class OPCItem {
  public:
    virtual ~OPCItem() = default;
    virtual int32_t ServerHandle() const = 0;
    virtual const std::string& ItemID() const = 0;
    virtual ErrorInfo IsActive(bool& bActive) const = 0;
    virtual ErrorInfo SetIsActive(bool bActive) = 0;
};

}  // namespace cv::platform
