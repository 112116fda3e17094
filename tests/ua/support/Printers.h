#pragma once

#include <ostream>

#include "ua/types/DataValue.h"
#include "ua/types/NodeIdText.h"

namespace cv::ua {

// Readable values in test failure messages.
inline void PrintTo(const Variant& value, std::ostream* out) {
    *out << "type " << static_cast<int>(value.Type());
    if (value.IsArray()) {
        *out << " array of " << value.ArrayElements().size() << ":";
        for (const Variant& element : value.ArrayElements()) {
            *out << " (";
            PrintTo(element, out);
            *out << ")";
        }
        return;
    }
    std::visit(
        [out](const auto& v) {
            using T = std::decay_t<decltype(v)>;
            if constexpr (std::is_arithmetic_v<T>) {
                *out << " " << +v;
            } else if constexpr (std::is_same_v<T, std::string>) {
                *out << " \"" << v << "\"";
            } else if constexpr (std::is_same_v<T, NodeId>) {
                *out << " " << FormatNodeId(v);
            } else if constexpr (std::is_same_v<T, LocalizedText>) {
                *out << " [" << v.locale << "] " << v.text;
            } else if constexpr (std::is_same_v<T, DateTime>) {
                *out << " ticks " << v.ticks;
            } else if constexpr (std::is_same_v<T, StatusCode>) {
                *out << " status " << std::hex << v.code << std::dec;
            }
        },
        value.Value());
}

}  // namespace cv::ua
