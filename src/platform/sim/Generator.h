#pragma once

#include <cstdint>

#include "platform/Variant.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

// What an item shows at a moment of the plant's clock.
struct GeneratedSample {
    Variant value;
    uint16_t quality = 0;
};

// The value and quality of an item whose generator moves with time, at
// elapsedMs since the plant started. Pure: the same moment gives the same
// sample, so tests repeat exactly.
GeneratedSample Generate(const ItemSpec& item, uint64_t elapsedMs);

// The number as a value of a scalar type (integers round halves to even);
// false when it does not fit.
bool NumberAsType(double number, uint16_t type, Variant& value);

}  // namespace cv::sim
