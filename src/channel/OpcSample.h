#pragma once

#include <cstdint>

#include "platform/Variant.h"
#include "platform/opc/ValueDetail.h"

namespace cv {

// The last value an OPC server sent a channel, as it came: its quality
// before a last known value is taken as good, and the value itself kept also
// once a bad quality made the channel let go of it.
struct OpcSample {
    // With arrays made lines and texts cut at a zero character.
    Variant value;
    int32_t quality = 0;
    double timeStamp = 0;
    platform::ValueDetail detail;
    // Counts the values the channel received: 0 before the first.
    uint32_t number = 0;
};

}  // namespace cv
