#pragma once

#include <cstdint>
#include <string>

namespace cv {

// A failure handed back instead of thrown: the error model's number (13 type
// mismatch, 6 overflow, 429 object creation, HRESULTs as signed 32-bit) and
// its description. Number 0 means success.
struct [[nodiscard]] ErrorInfo {
    int32_t Number = 0;
    std::string Description;

    explicit operator bool() const { return Number != 0; }
    bool operator==(const ErrorInfo&) const = default;
};

inline constexpr int32_t kErrOverflow = 6;
inline constexpr int32_t kErrTypeMismatch = 13;

}  // namespace cv
