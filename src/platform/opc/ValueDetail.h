#pragma once

#include <cstdint>

namespace cv::platform {

// What a server may tell about one value besides its quality and its time
// stamp. A Data Access server tells neither; an OPC UA server both.
struct ValueDetail {
    // When the value was taken at its source, as an OLE date in local time;
    // 0 when the server sends no such time stamp.
    double sourceTimeStamp = 0;
    // The server's own status code behind the quality (an OPC UA
    // StatusCode without its info bits), which GetErrorString names; 0 when
    // there is none.
    uint32_t status = 0;

    bool operator==(const ValueDetail&) const = default;
};

}  // namespace cv::platform
