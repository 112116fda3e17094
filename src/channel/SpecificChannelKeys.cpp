#include "channel/SpecificChannelKeys.h"

#include <array>
#include <cstddef>

namespace cv {

namespace {

// By specific channel type 1 to 12. A write channel shares its read
// channel's key unless the file asks for unique write locations.
constexpr std::array<SpecificChannelKeys, 12> kKeys{{
    {"_item_PB", nullptr, "P", "Proportional", false},
    {"_item_Integral", nullptr, "I", "Integral", false},
    {"_item_Derivative", nullptr, "D", "Derivative", false},
    {"_item_ControllerMode", nullptr, "mode", "Controller Mode", false},
    {"_item_CO", "Send_CO", "Output", "Controller Output", false},
    {"_item_SP", "Send_SP", "SP", "Loop Setpoint", false},
    {"_item_PB", "Send_PB", "P", "P value", false},
    {"_item_Integral", "Send_Integral", "I", "I value", false},
    {"_item_Derivative", "Send_Derivative", "D", "D value", false},
    {"_item_ControllerMode", "Send_mode", "mode", "Controller Mode", false},
    {"_item_Filter", nullptr, "", "Filter", true},
    {"_item_Filter", "Send_Filter", "", "F value", true},
}};

}  // namespace

const SpecificChannelKeys* FindSpecificChannelKeys(int32_t lType) {
    if (lType < 1 || lType > static_cast<int32_t>(kKeys.size())) {
        return nullptr;
    }
    return &kKeys[static_cast<std::size_t>(lType - 1)];
}

}  // namespace cv
