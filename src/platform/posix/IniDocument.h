#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace cv::posix {

// The text of one INI file, held line by line so that a rewrite gives back
// every byte it did not change: comments, blank lines, lines it does not
// understand, a UTF-8 byte order mark and each line's own line end.
//
// Reading the text:
// - Lines end at LF, with or without a CR before it; the last line may have
//   no end. "Blanks" are space, tab, CR, VT and FF.
// - A line whose first non-blank character is "[" and that holds a "]"
//   later is a section header; the name is what lies between the first "["
//   and the last "]", blanks around it removed ("[ Loop 1 ]" names
//   "Loop 1"); text after the "]" is ignored. A "[" without "]" is not a
//   header.
// - A line whose first non-blank character is ";" is a comment.
// - Any other line holding "=" is an entry: the key is the text before the
//   first "=", the value the text after it, both without blanks around them.
//   A value enclosed in one pair of ' or " quotes reads without them. There
//   are no comments after a value: "a=1 ; x" reads as "1 ; x".
// - Every other line (no "=", entries before the first header) is kept but
//   never read or changed.
// - Names match without regard to ASCII case; other bytes match exactly.
// - A section name may head several blocks ("duplicate sections"). Its
//   entries are those of all its blocks, in file order, and the first entry
//   of a key is the one that is read and the one that a write replaces.
//
// Changing the text:
// - Replacing a value keeps the entry line up to and including the "=" and
//   the blanks after it, so "Rate = 5" becomes "Rate = 10".
// - A new key goes into the first block of its section, after the block's
//   last non-blank line, so blank lines that separate sections stay below it.
// - A new section goes at the end of the text, after one blank line when the
//   text does not already end with one: "[Name]" then "key=value".
// - Erasing a key removes every entry of that key in every block of the
//   section; the header stays, even when no entry is left.
// - Erasing a section removes every block of that name: the header and every
//   line up to the next header, comments and blank lines included.
// - New lines end like the first line of the text that has an end; a text
//   without one (such as a new file) gets CR LF. A last line that had no end
//   gets one when a line is added after it. So a new file holds exactly
//   "[Name]\r\nkey=value\r\n", without a byte order mark.
// - Names and values that would read back as something else are refused:
//   line breaks anywhere, a key with "=" or starting with ";" or "[".
//   Names are stored without blanks around them; values exactly as given.
class IniDocument {
  public:
    // An empty text, as a file that does not exist yet.
    IniDocument() = default;

    static IniDocument Parse(std::string_view text);
    std::string Serialise() const;

    // The value of the first entry of key in section; nothing when missing.
    std::optional<std::string> Value(std::string_view section, std::string_view key) const;

    // Each returns true when the text changed.
    bool SetValue(std::string_view section, std::string_view key, std::string_view value);
    bool EraseKey(std::string_view section, std::string_view key);
    bool EraseSection(std::string_view section);

    // Whether a write of these names and value is accepted (see above).
    static bool IsSectionName(std::string_view section);
    static bool IsKeyName(std::string_view key);
    static bool IsValueText(std::string_view value);

  private:
    enum class LineEnd : uint8_t { None, Lf, CrLf };

    struct Line {
        std::string text;
        LineEnd end = LineEnd::None;
    };

    // The lines from one header up to the next (the first block holds the
    // lines before any header and has no name).
    struct Block {
        bool hasHeader = false;
        std::vector<Line> lines;
        // Lower-cased key -> index in lines of its first entry.
        std::unordered_map<std::string, uint32_t> keys;
    };

    void AppendLine(std::string_view text, LineEnd end);
    void IndexKeys(uint32_t block);
    void IndexSections();
    const std::vector<uint32_t>* BlocksOf(std::string_view section) const;
    void EndLastLine();
    Line NewLine(std::string text) const;
    void AppendSection(std::string_view section, std::string_view key, std::string_view value);

    bool byteOrderMark_ = false;
    LineEnd newLineEnd_ = LineEnd::CrLf;
    std::vector<Block> blocks_{Block{}};
    // Lower-cased section name -> its blocks, in file order.
    std::unordered_map<std::string, std::vector<uint32_t>> sections_;
};

}  // namespace cv::posix
