#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "ua/types/NodeId.h"

namespace cv::ua {

// The text form of node ids: "i=2258", "ns=1;s=Plant.FIC101.PV",
// "ns=2;g=72962B91-FA75-4AE6-8D28-B404DC7DAF63", "ns=3;b=AQID" (base64) and
// "nsu=http://example.org/;s=Tank". Namespace 0 is left out when formatting.
// Parsing also takes "-" for "=" ("ns-1;s-Tank"), the form some bridges
// write. A text that is not exactly one of these forms gives nothing.
std::optional<ExpandedNodeId> ParseNodeId(std::string_view sText);
std::string FormatNodeId(const NodeId& node);
std::string FormatNodeId(const ExpandedNodeId& node);

}  // namespace cv::ua
