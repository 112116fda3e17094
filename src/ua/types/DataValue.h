#pragma once

#include <cstdint>

#include "ua/types/Variant.h"

namespace cv::ua {

// A value with its status and time stamps. A time stamp of 0 was not sent;
// a status that was not sent is Good.
struct DataValue {
    Variant value;
    StatusCode status;
    DateTime sourceTimestamp;
    DateTime serverTimestamp;
    uint16_t sourcePicoseconds = 0;
    uint16_t serverPicoseconds = 0;

    bool operator==(const DataValue&) const = default;
};

}  // namespace cv::ua
