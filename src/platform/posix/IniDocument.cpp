#include "platform/posix/IniDocument.h"

#include <algorithm>
#include <initializer_list>

#include "platform/AsciiCase.h"

namespace cv::posix {

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view kBlanks = " \t\r\v\f";

std::string_view Trim(std::string_view text) {
    const size_t first = text.find_first_not_of(kBlanks);
    if (first == std::string_view::npos) {
        return {};
    }
    return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

char FirstNonBlank(std::string_view text) {
    const size_t first = text.find_first_not_of(kBlanks);
    return first == std::string_view::npos ? '\0' : text[first];
}

std::optional<std::string_view> HeaderName(std::string_view text) {
    if (FirstNonBlank(text) != '[') {
        return std::nullopt;
    }
    const size_t open = text.find('[');
    const size_t close = text.rfind(']');
    if (close == std::string_view::npos || close < open) {
        return std::nullopt;
    }
    return Trim(text.substr(open + 1, close - open - 1));
}

std::optional<std::string_view> EntryKey(std::string_view text) {
    const size_t equals = text.find('=');
    if (equals == std::string_view::npos || FirstNonBlank(text) == ';' || HeaderName(text)) {
        return std::nullopt;
    }
    return Trim(text.substr(0, equals));
}

// The length of the entry line up to and including "=" and the blanks after it.
size_t ValueStart(std::string_view text) {
    const size_t afterEquals = text.find('=') + 1;
    const size_t start = text.find_first_not_of(kBlanks, afterEquals);
    return start == std::string_view::npos ? text.size() : start;
}

std::string_view Unquote(std::string_view value) {
    if (value.size() >= 2 && (value.front() == '"' || value.front() == '\'') &&
        value.back() == value.front()) {
        return value.substr(1, value.size() - 2);
    }
    return value;
}

std::string Joined(std::initializer_list<std::string_view> parts) {
    std::string text;
    for (const std::string_view part : parts) {
        text += part;
    }
    return text;
}

bool IsBlankLine(std::string_view text) {
    return FirstNonBlank(text) == '\0';
}

bool HasLineBreak(std::string_view text) {
    return text.find_first_of("\r\n") != text.npos;
}

}  // namespace

IniDocument IniDocument::Parse(std::string_view text) {
    IniDocument document;
    if (text.starts_with(kByteOrderMark)) {
        document.byteOrderMark_ = true;
        text.remove_prefix(kByteOrderMark.size());
    }
    bool endSeen = false;
    while (!text.empty()) {
        const size_t newline = text.find('\n');
        if (newline == std::string_view::npos) {
            document.AppendLine(text, LineEnd::None);
            break;
        }
        const bool crlf = newline > 0 && text[newline - 1] == '\r';
        const LineEnd end = crlf ? LineEnd::CrLf : LineEnd::Lf;
        if (!endSeen) {
            document.newLineEnd_ = end;
            endSeen = true;
        }
        document.AppendLine(text.substr(0, crlf ? newline - 1 : newline), end);
        text.remove_prefix(newline + 1);
    }
    for (uint32_t block = 0; block < document.blocks_.size(); ++block) {
        document.IndexKeys(block);
    }
    document.IndexSections();
    return document;
}

void IniDocument::AppendLine(std::string_view text, LineEnd end) {
    if (HeaderName(text)) {
        blocks_.push_back(Block{true, {}, {}});
    }
    blocks_.back().lines.push_back(Line{std::string(text), end});
}

void IniDocument::IndexKeys(uint32_t block) {
    Block& entries = blocks_[block];
    entries.keys.clear();
    for (uint32_t line = 0; line < entries.lines.size(); ++line) {
        if (const auto key = EntryKey(entries.lines[line].text)) {
            entries.keys.try_emplace(AsciiLower(*key), line);
        }
    }
}

void IniDocument::IndexSections() {
    sections_.clear();
    for (uint32_t block = 1; block < blocks_.size(); ++block) {
        sections_[AsciiLower(*HeaderName(blocks_[block].lines.front().text))].push_back(block);
    }
}

std::string IniDocument::Serialise() const {
    std::string text(byteOrderMark_ ? kByteOrderMark : std::string_view());
    for (const Block& block : blocks_) {
        for (const Line& line : block.lines) {
            text += line.text;
            if (line.end == LineEnd::CrLf) {
                text += "\r\n";
            } else if (line.end == LineEnd::Lf) {
                text += '\n';
            }
        }
    }
    return text;
}

const std::vector<uint32_t>* IniDocument::BlocksOf(std::string_view section) const {
    const auto found = sections_.find(AsciiLower(Trim(section)));
    return found == sections_.end() ? nullptr : &found->second;
}

std::optional<std::string> IniDocument::Value(std::string_view section,
                                              std::string_view key) const {
    const auto* blocks = BlocksOf(section);
    if (blocks == nullptr) {
        return std::nullopt;
    }
    const std::string lowerKey = AsciiLower(Trim(key));
    for (const uint32_t block : *blocks) {
        const auto found = blocks_[block].keys.find(lowerKey);
        if (found != blocks_[block].keys.end()) {
            std::string_view text = blocks_[block].lines[found->second].text;
            return std::string(Unquote(Trim(text.substr(text.find('=') + 1))));
        }
    }
    return std::nullopt;
}

bool IniDocument::SetValue(std::string_view section, std::string_view key, std::string_view value) {
    const auto* blocks = BlocksOf(section);
    if (blocks == nullptr) {
        AppendSection(Trim(section), Trim(key), value);
        return true;
    }
    const std::string lowerKey = AsciiLower(Trim(key));
    for (const uint32_t block : *blocks) {
        const auto found = blocks_[block].keys.find(lowerKey);
        if (found != blocks_[block].keys.end()) {
            std::string& text = blocks_[block].lines[found->second].text;
            const size_t start = ValueStart(text);
            if (std::string_view(text).substr(start) == value) {
                return false;
            }
            text.replace(start, std::string::npos, value);
            return true;
        }
    }
    Block& first = blocks_[blocks->front()];
    uint32_t position = static_cast<uint32_t>(first.lines.size());
    while (IsBlankLine(first.lines[position - 1].text)) {
        --position;
    }
    if (first.lines[position - 1].end == LineEnd::None) {
        first.lines[position - 1].end = newLineEnd_;
    }
    first.lines.insert(first.lines.begin() + position, NewLine(Joined({Trim(key), "=", value})));
    first.keys.emplace(lowerKey, position);
    return true;
}

IniDocument::Line IniDocument::NewLine(std::string text) const {
    return Line{std::move(text), newLineEnd_};
}

void IniDocument::EndLastLine() {
    for (auto block = blocks_.rbegin(); block != blocks_.rend(); ++block) {
        if (!block->lines.empty()) {
            if (block->lines.back().end == LineEnd::None) {
                block->lines.back().end = newLineEnd_;
            }
            return;
        }
    }
}

void IniDocument::AppendSection(std::string_view section, std::string_view key,
                                std::string_view value) {
    const auto last = std::find_if(blocks_.rbegin(), blocks_.rend(),
                                   [](const Block& block) { return !block.lines.empty(); });
    if (last != blocks_.rend()) {
        EndLastLine();
        if (!IsBlankLine(last->lines.back().text)) {
            last->lines.push_back(NewLine(""));
        }
    }
    Block block{true, {}, {}};
    block.lines.push_back(NewLine(Joined({"[", section, "]"})));
    block.lines.push_back(NewLine(Joined({key, "=", value})));
    block.keys.emplace(AsciiLower(key), 1);
    blocks_.push_back(std::move(block));
    sections_[AsciiLower(section)].push_back(static_cast<uint32_t>(blocks_.size() - 1));
}

bool IniDocument::EraseKey(std::string_view section, std::string_view key) {
    const auto* blocks = BlocksOf(section);
    if (blocks == nullptr) {
        return false;
    }
    const std::string lowerKey = AsciiLower(Trim(key));
    bool changed = false;
    for (const uint32_t block : *blocks) {
        if (!blocks_[block].keys.contains(lowerKey)) {
            continue;
        }
        std::erase_if(blocks_[block].lines, [&lowerKey](const Line& line) {
            const auto lineKey = EntryKey(line.text);
            return lineKey && AsciiLower(*lineKey) == lowerKey;
        });
        IndexKeys(block);
        changed = true;
    }
    return changed;
}

bool IniDocument::EraseSection(std::string_view section) {
    const auto* blocks = BlocksOf(section);
    if (blocks == nullptr) {
        return false;
    }
    for (auto block = blocks->rbegin(); block != blocks->rend(); ++block) {
        blocks_.erase(blocks_.begin() + *block);
    }
    IndexSections();
    return true;
}

bool IniDocument::IsSectionName(std::string_view section) {
    return !HasLineBreak(section);
}

bool IniDocument::IsKeyName(std::string_view key) {
    const char first = FirstNonBlank(key);
    return !HasLineBreak(key) && key.find('=') == key.npos && first != ';' && first != '[';
}

bool IniDocument::IsValueText(std::string_view value) {
    return !HasLineBreak(value);
}

}  // namespace cv::posix
