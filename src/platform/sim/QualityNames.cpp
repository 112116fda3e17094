#include "platform/sim/QualityNames.h"

#include "platform/AsciiCase.h"

namespace cv::sim {

const std::vector<QualityName>& QualityNames() {
    static const std::vector<QualityName> names = {
        {"good", 0xC0},         {"localOverride", 0xD8}, {"uncertain", 0x40},
        {"lastUsable", 0x44},   {"sensorCal", 0x50},     {"egUnitsExceeded", 0x54},
        {"subNormal", 0x58},    {"bad", 0x00},           {"configError", 0x04},
        {"notConnected", 0x08}, {"deviceFailure", 0x0C}, {"sensorFailure", 0x10},
        {"lastKnown", 0x14},    {"commFailure", 0x18},   {"outOfService", 0x1C},
    };
    return names;
}

std::optional<uint16_t> QualityByName(std::string_view name) {
    for (const QualityName& entry : QualityNames()) {
        if (EqualsIgnoringCase(entry.name, name)) {
            return entry.quality;
        }
    }
    return std::nullopt;
}

std::string QualityNameList() {
    std::string list;
    for (const QualityName& entry : QualityNames()) {
        list += (list.empty() ? "" : ", ") + std::string(entry.name);
    }
    return list;
}

}  // namespace cv::sim
