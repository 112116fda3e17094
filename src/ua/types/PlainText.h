#pragma once

#include <string>
#include <string_view>

namespace cv::ua {

enum class TextLines {
    One,   // line breaks and tabs become spaces
    Many,  // '\n' and '\t' stay; other breaks become spaces
};

// A text from a server, made harmless to show on a terminal or in a window:
// control characters go (C0, DEL, and C1 as raw bytes or as UTF-8, so no
// escape sequence survives), and so do the marks that reorder text on
// screen (bidirectional embeddings, overrides, isolates and marks). Bytes
// that are no well-formed UTF-8 each become '?'.
std::string PlainText(std::string_view text, TextLines lines = TextLines::One);

}  // namespace cv::ua
