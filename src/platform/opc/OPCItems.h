#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/opc/OPCItem.h"
#include "platform/opc/OneBased.h"

namespace cv::platform {

// The items of one group.
class OPCItems {
  public:
    virtual ~OPCItems() = default;
    virtual int32_t Count() const = 0;
    // Adds lNumItems items (requested data types: none, the server's own).
    // ServerHandles and Errors get one entry per item; an item whose error
    // is not 0 was not added. The result fails only when the call as a whole
    // did.
    virtual ErrorInfo AddItems(int32_t lNumItems, const OneBased<std::string>& ItemIDs,
                               const OneBased<int32_t>& ClientHandles,
                               const OneBased<std::string>& AccessPaths,
                               OneBased<int32_t>& ServerHandles, OneBased<int32_t>& Errors) = 0;
    virtual ErrorInfo GetOPCItem(int32_t lServerHandle, std::shared_ptr<OPCItem>& cItem) = 0;
    virtual ErrorInfo Remove(int32_t lNumItems, const OneBased<int32_t>& ServerHandles,
                             OneBased<int32_t>& Errors) = 0;
};

}  // namespace cv::platform
