#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace cv::ua {

// Standard base64 with padding, as opaque node ids are written in text.
std::string Base64Encode(std::string_view bytes);
// Nothing for a text that is not canonical base64.
std::optional<std::string> Base64Decode(std::string_view sText);

}  // namespace cv::ua
