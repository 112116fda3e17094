#include "platform/posix/IniDocument.h"

#include <algorithm>
#include <initializer_list>

#include "platform/AsciiCase.h"

namespace cv::posix {

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view kBlanks = " \t\r\v\f";

std::string_view Trim(std::string_view sText) {
    const size_t first = sText.find_first_not_of(kBlanks);
    if (first == std::string_view::npos) {
        return {};
    }
    return sText.substr(first, sText.find_last_not_of(kBlanks) - first + 1);
}

char FirstNonBlank(std::string_view sText) {
    const size_t first = sText.find_first_not_of(kBlanks);
    return first == std::string_view::npos ? '\0' : sText[first];
}

std::optional<std::string_view> HeaderName(std::string_view sText) {
    if (FirstNonBlank(sText) != '[') {
        return std::nullopt;
    }
    const size_t open = sText.find('[');
    const size_t close = sText.rfind(']');
    if (close == std::string_view::npos || close < open) {
        return std::nullopt;
    }
    return Trim(sText.substr(open + 1, close - open - 1));
}

std::optional<std::string_view> EntryKey(std::string_view sText) {
    const size_t equals = sText.find('=');
    if (equals == std::string_view::npos || FirstNonBlank(sText) == ';' || HeaderName(sText)) {
        return std::nullopt;
    }
    return Trim(sText.substr(0, equals));
}

// The length of the entry line up to and including "=" and the blanks after it.
size_t ValueStart(std::string_view sText) {
    const size_t afterEquals = sText.find('=') + 1;
    const size_t start = sText.find_first_not_of(kBlanks, afterEquals);
    return start == std::string_view::npos ? sText.size() : start;
}

std::string_view Unquote(std::string_view sValue) {
    if (sValue.size() >= 2 && (sValue.front() == '"' || sValue.front() == '\'') &&
        sValue.back() == sValue.front()) {
        return sValue.substr(1, sValue.size() - 2);
    }
    return sValue;
}

std::string Joined(std::initializer_list<std::string_view> cParts) {
    std::string text;
    for (const std::string_view part : cParts) {
        text += part;
    }
    return text;
}

bool IsBlankLine(std::string_view sText) {
    return FirstNonBlank(sText) == '\0';
}

bool HasLineBreak(std::string_view sText) {
    return sText.find_first_of("\r\n") != sText.npos;
}

}  // namespace

IniDocument IniDocument::Parse(std::string_view sText) {
    IniDocument document;
    if (sText.starts_with(kByteOrderMark)) {
        document.mbByteOrderMark = true;
        sText.remove_prefix(kByteOrderMark.size());
    }
    bool endSeen = false;
    while (!sText.empty()) {
        const size_t newline = sText.find('\n');
        if (newline == std::string_view::npos) {
            document.AppendLine(sText, LineEnd::None);
            break;
        }
        const bool crlf = newline > 0 && sText[newline - 1] == '\r';
        const LineEnd end = crlf ? LineEnd::CrLf : LineEnd::Lf;
        if (!endSeen) {
            document.meNewLineEnd = end;
            endSeen = true;
        }
        document.AppendLine(sText.substr(0, crlf ? newline - 1 : newline), end);
        sText.remove_prefix(newline + 1);
    }
    for (uint32_t block = 0; block < document.mcBlocks.size(); ++block) {
        document.IndexKeys(block);
    }
    document.IndexSections();
    return document;
}

void IniDocument::AppendLine(std::string_view sText, LineEnd eEnd) {
    if (HeaderName(sText)) {
        mcBlocks.push_back(Block{true, {}, {}});
    }
    mcBlocks.back().lines.push_back(Line{std::string(sText), eEnd});
}

void IniDocument::IndexKeys(uint32_t lBlock) {
    Block& entries = mcBlocks[lBlock];
    entries.keys.clear();
    for (uint32_t line = 0; line < entries.lines.size(); ++line) {
        if (const auto key = EntryKey(entries.lines[line].text)) {
            entries.keys.try_emplace(AsciiLower(*key), line);
        }
    }
}

void IniDocument::IndexSections() {
    mcSections.clear();
    for (uint32_t block = 1; block < mcBlocks.size(); ++block) {
        mcSections[AsciiLower(*HeaderName(mcBlocks[block].lines.front().text))].push_back(block);
    }
}

std::string IniDocument::Serialise() const {
    std::string text(mbByteOrderMark ? kByteOrderMark : std::string_view());
    for (const Block& block : mcBlocks) {
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

const std::vector<uint32_t>* IniDocument::BlocksOf(std::string_view sSection) const {
    const auto found = mcSections.find(AsciiLower(Trim(sSection)));
    return found == mcSections.end() ? nullptr : &found->second;
}

std::optional<std::string> IniDocument::Value(std::string_view sSection,
                                              std::string_view sKey) const {
    const auto* blocks = BlocksOf(sSection);
    if (blocks == nullptr) {
        return std::nullopt;
    }
    const std::string lowerKey = AsciiLower(Trim(sKey));
    for (const uint32_t block : *blocks) {
        const auto found = mcBlocks[block].keys.find(lowerKey);
        if (found != mcBlocks[block].keys.end()) {
            std::string_view text = mcBlocks[block].lines[found->second].text;
            return std::string(Unquote(Trim(text.substr(text.find('=') + 1))));
        }
    }
    return std::nullopt;
}

bool IniDocument::SetValue(std::string_view sSection, std::string_view sKey,
                           std::string_view sValue) {
    const auto* blocks = BlocksOf(sSection);
    if (blocks == nullptr) {
        AppendSection(Trim(sSection), Trim(sKey), sValue);
        return true;
    }
    const std::string lowerKey = AsciiLower(Trim(sKey));
    for (const uint32_t block : *blocks) {
        const auto found = mcBlocks[block].keys.find(lowerKey);
        if (found != mcBlocks[block].keys.end()) {
            std::string& text = mcBlocks[block].lines[found->second].text;
            const size_t start = ValueStart(text);
            if (std::string_view(text).substr(start) == sValue) {
                return false;
            }
            text.replace(start, std::string::npos, sValue);
            return true;
        }
    }
    Block& first = mcBlocks[blocks->front()];
    uint32_t position = static_cast<uint32_t>(first.lines.size());
    while (IsBlankLine(first.lines[position - 1].text)) {
        --position;
    }
    if (first.lines[position - 1].end == LineEnd::None) {
        first.lines[position - 1].end = meNewLineEnd;
    }
    first.lines.insert(first.lines.begin() + position, NewLine(Joined({Trim(sKey), "=", sValue})));
    first.keys.emplace(lowerKey, position);
    return true;
}

IniDocument::Line IniDocument::NewLine(std::string sText) const {
    return Line{std::move(sText), meNewLineEnd};
}

void IniDocument::EndLastLine() {
    for (auto block = mcBlocks.rbegin(); block != mcBlocks.rend(); ++block) {
        if (!block->lines.empty()) {
            if (block->lines.back().end == LineEnd::None) {
                block->lines.back().end = meNewLineEnd;
            }
            return;
        }
    }
}

void IniDocument::AppendSection(std::string_view sSection, std::string_view sKey,
                                std::string_view sValue) {
    const auto last = std::find_if(mcBlocks.rbegin(), mcBlocks.rend(),
                                   [](const Block& block) { return !block.lines.empty(); });
    if (last != mcBlocks.rend()) {
        EndLastLine();
        if (!IsBlankLine(last->lines.back().text)) {
            last->lines.push_back(NewLine(""));
        }
    }
    Block block{true, {}, {}};
    block.lines.push_back(NewLine(Joined({"[", sSection, "]"})));
    block.lines.push_back(NewLine(Joined({sKey, "=", sValue})));
    block.keys.emplace(AsciiLower(sKey), 1);
    mcBlocks.push_back(std::move(block));
    mcSections[AsciiLower(sSection)].push_back(static_cast<uint32_t>(mcBlocks.size() - 1));
}

bool IniDocument::EraseKey(std::string_view sSection, std::string_view sKey) {
    const auto* blocks = BlocksOf(sSection);
    if (blocks == nullptr) {
        return false;
    }
    const std::string lowerKey = AsciiLower(Trim(sKey));
    bool changed = false;
    for (const uint32_t block : *blocks) {
        if (!mcBlocks[block].keys.contains(lowerKey)) {
            continue;
        }
        std::erase_if(mcBlocks[block].lines, [&lowerKey](const Line& line) {
            const auto lineKey = EntryKey(line.text);
            return lineKey && AsciiLower(*lineKey) == lowerKey;
        });
        IndexKeys(block);
        changed = true;
    }
    return changed;
}

bool IniDocument::EraseSection(std::string_view sSection) {
    const auto* blocks = BlocksOf(sSection);
    if (blocks == nullptr) {
        return false;
    }
    for (auto block = blocks->rbegin(); block != blocks->rend(); ++block) {
        mcBlocks.erase(mcBlocks.begin() + *block);
    }
    IndexSections();
    return true;
}

bool IniDocument::IsSectionName(std::string_view sSection) {
    return !HasLineBreak(sSection);
}

bool IniDocument::IsKeyName(std::string_view sKey) {
    const char first = FirstNonBlank(sKey);
    return !HasLineBreak(sKey) && sKey.find('=') == sKey.npos && first != ';' && first != '[';
}

bool IniDocument::IsValueText(std::string_view sValue) {
    return !HasLineBreak(sValue);
}

}  // namespace cv::posix
