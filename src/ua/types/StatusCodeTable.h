#pragma once

#include <string>
#include <string_view>

#include "ua/types/StatusCode.h"

namespace cv::ua {

// Names and short texts of the status codes a user may meet. Unknown codes
// are named by their severity and hexadecimal value.
std::string_view StatusCodeName(StatusCode status);
std::string_view StatusCodeText(StatusCode status);
// "Bad_NodeIdUnknown: The node id refers to a node that does not exist."
std::string DescribeStatusCode(StatusCode status);

}  // namespace cv::ua
