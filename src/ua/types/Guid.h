#pragma once

#include <array>
#include <compare>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace cv::ua {

// A 16-byte GUID; its text form is "72962B91-FA75-4AE6-8D28-B404DC7DAF63".
struct Guid {
    uint32_t data1 = 0;
    uint16_t data2 = 0;
    uint16_t data3 = 0;
    std::array<uint8_t, 8> data4{};

    auto operator<=>(const Guid&) const = default;

    std::string ToText() const;
    // Accepts upper or lower case hexadecimal, optionally in braces.
    static std::optional<Guid> FromText(std::string_view sText);
};

}  // namespace cv::ua
