#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cv::sim {

// The OPC quality words a plant file may name instead of giving the number:
// good, local override, each uncertain and bad reason, last known.
struct QualityName {
    const char* name;
    uint16_t quality;
};

const std::vector<QualityName>& QualityNames();
// The quality of a name in any letter case; nothing for an unknown name.
std::optional<uint16_t> QualityByName(std::string_view name);
// "good, localOverride, ..." for messages.
std::string QualityNameList();

namespace Quality {
inline constexpr uint16_t OutOfService = 0x1C;
}  // namespace Quality

}  // namespace cv::sim
