#include "ua/types/PlainText.h"

#include <array>

namespace cv::ua {
namespace {

// The length of the UTF-8 sequence text starts with, and its code point in
// point; 0 for bytes that are no well-formed UTF-8 (overlong forms,
// surrogates and values past U+10FFFF included).
size_t Decode(std::string_view text, char32_t& point) {
    const auto byte = [text](size_t i) { return static_cast<unsigned char>(text[i]); };
    const unsigned char lead = byte(0);
    const size_t length = lead < 0x80                    ? 1
                          : lead >= 0xC2 && lead <= 0xDF ? 2
                          : lead >= 0xE0 && lead <= 0xEF ? 3
                          : lead >= 0xF0 && lead <= 0xF4 ? 4
                                                         : 0;
    if (length == 0 || text.size() < length) {
        return 0;
    }
    point = length == 1 ? lead : lead & (0x7F >> length);
    for (size_t i = 1; i < length; ++i) {
        if ((byte(i) & 0xC0) != 0x80) {
            return 0;
        }
        point = (point << 6) | (byte(i) & 0x3F);
    }
    constexpr std::array<char32_t, 5> kLeast = {0, 0, 0x80, 0x800, 0x10000};
    const bool valid =
        point >= kLeast[length] && point <= 0x10FFFF && (point < 0xD800 || point > 0xDFFF);
    return valid ? length : 0;
}

bool IsBreak(char32_t point) {
    return (point >= '\t' && point <= '\r') || point == 0x85 || point == 0x2028 || point == 0x2029;
}

bool IsControl(char32_t point) {
    return point < 0x20 || (point >= 0x7F && point <= 0x9F);
}

bool IsDirectionMark(char32_t point) {
    return point == 0x061C || point == 0x200E || point == 0x200F ||
           (point >= 0x202A && point <= 0x202E) || (point >= 0x2066 && point <= 0x2069);
}

}  // namespace

std::string PlainText(std::string_view text, TextLines lines) {
    std::string plain;
    plain.reserve(text.size());
    while (!text.empty()) {
        char32_t point = 0;
        const size_t length = Decode(text, point);
        if (length == 0) {
            plain += '?';
            text.remove_prefix(1);
            continue;
        }
        if (lines == TextLines::Many && (point == '\n' || point == '\t')) {
            plain += static_cast<char>(point);
        } else if (IsBreak(point)) {
            plain += ' ';
        } else if (!IsControl(point) && !IsDirectionMark(point)) {
            plain.append(text.substr(0, length));
        }
        text.remove_prefix(length);
    }
    return plain;
}

}  // namespace cv::ua
