#pragma once

#include <cstdint>

namespace cv::ua {

// What one decoded message may hold. Every length is checked against these
// and against the bytes left, and every block of memory the decoded values
// take is charged against maxAllocation before it is allocated, so a hostile
// message costs at most maxAllocation bytes of memory.
struct DecodeLimits {
    uint32_t maxStringLength = 16u << 20;
    uint32_t maxArrayLength = 1u << 20;
    // Variants in variants, data values in variants, diagnostics in diagnostics.
    uint32_t maxDepth = 16;
    // The memory the decoded values of one message may take together: their
    // strings, arrays and nested values.
    uint64_t maxAllocation = 256ull << 20;
};

}  // namespace cv::ua
