#include "platform/ua/UaItemId.h"

#include <algorithm>

#include "platform/opc/OpcResult.h"
#include "ua/types/NodeIdText.h"

namespace cv::uaopc {

int32_t NodeOfItemId(const std::string& itemId, const std::vector<std::string>& namespaceUris,
                     ua::NodeId& node) {
    const auto parsed = ua::ParseNodeId(itemId);
    if (!parsed) {
        return platform::OpcResult::OPC_E_INVALIDITEMID;
    }
    node = parsed->nodeId;
    if (parsed->namespaceUri.empty()) {
        return 0;
    }
    const auto found = std::find(namespaceUris.begin(), namespaceUris.end(), parsed->namespaceUri);
    if (found == namespaceUris.end()) {
        return platform::OpcResult::OPC_E_UNKNOWNITEMID;
    }
    node.namespaceIndex = static_cast<uint16_t>(found - namespaceUris.begin());
    return 0;
}

}  // namespace cv::uaopc
