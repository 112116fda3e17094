#include "platform/sim/ItemIdSyntax.h"

#include <algorithm>

namespace cv::sim {

namespace {

bool IsNameCharacter(char c) {
    const auto byte = static_cast<unsigned char>(c);
    return byte > ' ' && byte != 0x7F && c != '.';
}

}  // namespace

bool IsWellFormedName(std::string_view name) {
    return !name.empty() && std::all_of(name.begin(), name.end(), IsNameCharacter);
}

bool IsWellFormedItemId(std::string_view itemId) {
    size_t start = 0;
    while (true) {
        const size_t dot = itemId.find('.', start);
        if (!IsWellFormedName(itemId.substr(start, dot - start))) {
            return false;
        }
        if (dot == std::string_view::npos) {
            return true;
        }
        start = dot + 1;
    }
}

}  // namespace cv::sim
