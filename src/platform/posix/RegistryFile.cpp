#include "platform/posix/RegistryFile.h"

#include <cstdint>

namespace cv::posix {

namespace {

constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view kDwordTag = "dword:";
constexpr std::string_view kHexTag = "hex(";
constexpr const char* kHexDigits = "0123456789abcdef";

bool IsControl(char c) {
    const auto code = static_cast<unsigned char>(c);
    return code < 0x20 || code == 0x7F;
}

bool IsBlank(char c) {
    return c == ' ' || c == '\t';
}

std::string_view Trimmed(std::string_view line) {
    while (!line.empty() && IsBlank(line.front())) {
        line.remove_prefix(1);
    }
    while (!line.empty() && IsBlank(line.back())) {
        line.remove_suffix(1);
    }
    return line;
}

int HexValue(char c) {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    if (c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    if (c >= 'A' && c <= 'F') {
        return c - 'A' + 10;
    }
    return -1;
}

// Two hex digits at pos.
bool ReadHexByte(std::string_view text, size_t pos, char& byte) {
    if (pos + 2 > text.size() || HexValue(text[pos]) < 0 || HexValue(text[pos + 1]) < 0) {
        return false;
    }
    byte = static_cast<char>(HexValue(text[pos]) * 16 + HexValue(text[pos + 1]));
    return true;
}

// 1 to 8 hex digits, the whole of text.
bool ReadHexNumber(std::string_view text, uint32_t& number) {
    if (text.empty() || text.size() > 8) {
        return false;
    }
    number = 0;
    for (const char c : text) {
        if (HexValue(c) < 0) {
            return false;
        }
        number = number * 16 + static_cast<uint32_t>(HexValue(c));
    }
    return true;
}

// A quoted text starting at line[start]; the position after its closing
// quote, or npos when it is malformed.
size_t ReadQuoted(std::string_view line, size_t start, std::string& text) {
    text.clear();
    for (size_t pos = start + 1; pos < line.size(); ++pos) {
        const char c = line[pos];
        if (c == '"') {
            return pos + 1;
        }
        if (IsControl(c)) {
            return std::string_view::npos;
        }
        if (c != '\\') {
            text += c;
            continue;
        }
        const char next = pos + 1 < line.size() ? line[pos + 1] : '\0';
        char escaped = next;
        if (next == 'x' && ReadHexByte(line, pos + 2, escaped)) {
            pos += 2;
        } else if (next != '\\' && next != '"') {
            return std::string_view::npos;
        }
        text += escaped;
        ++pos;
    }
    return std::string_view::npos;
}

bool ReadKeyName(std::string_view escaped, std::string& name) {
    name.clear();
    for (size_t pos = 0; pos < escaped.size(); ++pos) {
        char c = escaped[pos];
        if (IsControl(c) || (c == '%' && !ReadHexByte(escaped, pos + 1, c))) {
            return false;
        }
        pos += escaped[pos] == '%' ? 2 : 0;
        name += c;
    }
    return !name.empty() && name.size() <= RegistryKey::kMaxNameBytes &&
           name.find('\\') == std::string::npos;
}

bool ReadKeyLine(std::string_view line, std::vector<std::string>& path) {
    path.clear();
    if (line.size() < 3 || line.back() != ']') {
        return false;
    }
    std::string_view inner = line.substr(1, line.size() - 2);
    for (;;) {
        const size_t slash = inner.find('\\');
        std::string name;
        if (path.size() == RegistryKey::kMaxDepth || !ReadKeyName(inner.substr(0, slash), name)) {
            return false;
        }
        path.push_back(std::move(name));
        if (slash == std::string_view::npos) {
            return true;
        }
        inner.remove_prefix(slash + 1);
    }
}

bool ReadHexBytes(std::string_view list, std::string& bytes) {
    bytes.clear();
    for (size_t pos = 0; pos < list.size(); pos += 3) {
        char c = 0;
        if (!ReadHexByte(list, pos, c) || (pos + 2 < list.size() && list[pos + 2] != ',') ||
            pos + 3 == list.size()) {
            return false;
        }
        bytes += c;
    }
    return true;
}

bool ReadData(std::string_view data, RegistryValue& value) {
    if (!data.empty() && data.front() == '"') {
        value.type = 1;
        const bool whole = ReadQuoted(data, 0, value.data) == data.size();
        value.data += '\0';
        return whole;
    }
    uint32_t number = 0;
    if (data.substr(0, kDwordTag.size()) == kDwordTag) {
        if (!ReadHexNumber(data.substr(kDwordTag.size()), number)) {
            return false;
        }
        value.type = 4;
        value.data.clear();
        for (int shift = 0; shift < 32; shift += 8) {
            value.data += static_cast<char>((number >> shift) & 0xFF);
        }
        return true;
    }
    const size_t close = data.find("):");
    if (data.substr(0, kHexTag.size()) != kHexTag || close == std::string_view::npos ||
        !ReadHexNumber(data.substr(kHexTag.size(), close - kHexTag.size()), number)) {
        return false;
    }
    value.type = static_cast<int32_t>(number);
    return ReadHexBytes(data.substr(close + 2), value.data);
}

bool ReadValueLine(std::string_view line, std::string& name, RegistryValue& value) {
    size_t pos = 1;
    name.clear();
    if (line.front() == '"') {
        pos = ReadQuoted(line, 0, name);
    }
    while (pos < line.size() && IsBlank(line[pos])) {
        ++pos;
    }
    if (pos >= line.size() || line[pos] != '=' || name.size() > RegistryKey::kMaxValueNameBytes) {
        return false;
    }
    return ReadData(Trimmed(line.substr(pos + 1)), value);
}

std::string_view NextLine(std::string_view& text) {
    const size_t end = text.find('\n');
    std::string_view line = text.substr(0, end);
    text = end == std::string_view::npos ? std::string_view() : text.substr(end + 1);
    if (!line.empty() && line.back() == '\r') {
        line.remove_suffix(1);
    }
    return line;
}

std::string Quoted(std::string_view text) {
    std::string quoted = "\"";
    for (const char c : text) {
        if (IsControl(c)) {
            const auto code = static_cast<unsigned char>(c);
            quoted += "\\x";
            quoted += kHexDigits[code >> 4];
            quoted += kHexDigits[code & 15];
        } else {
            quoted += c == '\\' || c == '"' ? "\\" : "";
            quoted += c;
        }
    }
    return quoted + "\"";
}

std::string EscapedKeyName(std::string_view name) {
    std::string escaped;
    for (const char c : name) {
        if (IsControl(c) || c == '%') {
            const auto code = static_cast<unsigned char>(c);
            escaped += '%';
            escaped += kHexDigits[code >> 4];
            escaped += kHexDigits[code & 15];
        } else {
            escaped += c;
        }
    }
    return escaped;
}

std::string DataText(const RegistryValue& value) {
    if (value.type == 1 && !value.data.empty() && value.data.back() == '\0') {
        return Quoted(std::string_view(value.data).substr(0, value.data.size() - 1));
    }
    std::string text;
    const auto hex = [&text](uint32_t number, int digits) {
        for (int shift = (digits - 1) * 4; shift >= 0; shift -= 4) {
            text += kHexDigits[(number >> shift) & 15];
        }
    };
    if (value.type == 4 && value.data.size() == 4) {
        uint32_t number = 0;
        for (int i = 3; i >= 0; --i) {
            number = (number << 8) | static_cast<unsigned char>(value.data[static_cast<size_t>(i)]);
        }
        text = kDwordTag;
        hex(number, 8);
        return text;
    }
    text = kHexTag;
    const auto type = static_cast<uint32_t>(value.type);
    int digits = 1;
    while (digits < 8 && (type >> (digits * 4)) != 0) {
        ++digits;
    }
    hex(type, digits);
    text += "):";
    for (size_t i = 0; i < value.data.size(); ++i) {
        text += i == 0 ? "" : ",";
        hex(static_cast<unsigned char>(value.data[i]), 2);
    }
    return text;
}

void WriteValues(const RegistryKey& key, std::string& out) {
    for (const auto& [name, value] : key.Values()) {
        out += name.empty() ? "@" : Quoted(name);
        out += "=" + DataText(value) + "\n";
    }
}

void WriteKey(const RegistryKey& key, const std::string& parentPath, std::string& out) {
    const std::string path =
        (parentPath.empty() ? "" : parentPath + "\\") + EscapedKeyName(key.Name());
    if (!key.Values().empty() || key.SubKeyCount() == 0) {
        out += "\n[" + path + "]\n";
        WriteValues(key, out);
    }
    key.ForEachSubKey([&](const RegistryKey& subKey) { WriteKey(subKey, path, out); });
}

}  // namespace

RegistryKey RegistryFile::Parse(std::string_view text, bool& damaged) {
    RegistryKey root;
    damaged = false;
    if (text.empty()) {
        return root;
    }
    if (text.substr(0, kByteOrderMark.size()) == kByteOrderMark) {
        text.remove_prefix(kByteOrderMark.size());
    }
    if (NextLine(text) != kFirstLine) {
        damaged = true;
        return root;
    }
    RegistryKey* current = &root;
    std::vector<std::string> path;
    std::string name;
    RegistryValue value;
    while (!text.empty()) {
        const std::string_view line = Trimmed(NextLine(text));
        if (line.empty() || line.front() == ';') {
            continue;
        }
        if (line.front() == '[') {
            const bool good = ReadKeyLine(line, path);
            current = good ? &root.Make(path) : nullptr;
            damaged = damaged || !good;
        } else if ((line.front() == '"' || line.front() == '@') && current != nullptr) {
            const bool good = ReadValueLine(line, name, value);
            if (good) {
                current->SetValue(name, std::move(value));
            }
            damaged = damaged || !good;
        } else {
            damaged = true;
        }
    }
    return root;
}

std::string RegistryFile::Write(const RegistryKey& root, std::string_view rootName) {
    std::string text = std::string(kFirstLine) + "\n; " + std::string(rootName) + "\n";
    if (!root.Values().empty()) {
        text += "\n";
        WriteValues(root, text);
    }
    root.ForEachSubKey([&](const RegistryKey& subKey) { WriteKey(subKey, "", text); });
    return text;
}

}  // namespace cv::posix
