#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "ua/types/NodeId.h"

namespace cv::uaopc {

// The node an item ID names: its NodeId text ("ns=1;s=Plant.FIC101.PV",
// "i=2258", "nsu=<uri>;s=...", or the "ns-1;s-..." form). Answers 0, or
// OPC_E_INVALIDITEMID for a text that is not a NodeId (the server is not
// asked), OPC_E_UNKNOWNITEMID for a namespace URI the server does not
// have. namespaceUris is the server's namespace
// array (index 0 first).
int32_t NodeOfItemId(const std::string& itemId, const std::vector<std::string>& namespaceUris,
                     ua::NodeId& node);

}  // namespace cv::uaopc
