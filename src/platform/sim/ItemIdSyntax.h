#pragma once

#include <string_view>

namespace cv::sim {

// The syntax of the plant's item IDs: names joined by single dots, each name
// made of printable characters other than blanks and dots. An ID that breaks
// it is malformed (OPC_E_INVALIDITEMID), not merely unknown.
bool IsWellFormedName(std::string_view name);
bool IsWellFormedItemId(std::string_view itemId);

}  // namespace cv::sim
