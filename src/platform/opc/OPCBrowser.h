#pragma once

#include <cstdint>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/Variant.h"

namespace cv::platform {

// A cursor over a server's item namespace. ShowBranches and ShowLeafs fill
// the list that Count and Item (1-based) read, at the current position.
class OPCBrowser {
  public:
    virtual ~OPCBrowser() = default;
    virtual ErrorInfo ShowBranches() = 0;
    virtual ErrorInfo ShowLeafs() = 0;
    virtual int32_t Count() const = 0;
    virtual ErrorInfo Item(int32_t lIndex, std::string& sName) const = 0;
    virtual ErrorInfo MoveToRoot() = 0;
    virtual ErrorInfo MoveDown(const std::string& sBranch) = 0;
    // The full item ID of a leaf at the current position.
    virtual ErrorInfo GetItemID(const std::string& sLeaf, std::string& sItemID) = 0;
    // An array of texts, or an empty Variant when the item has none.
    virtual ErrorInfo GetAccessPaths(const std::string& sItemID, Variant& vPaths) = 0;
};

}  // namespace cv::platform
