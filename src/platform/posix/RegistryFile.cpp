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

std::string_view Trimmed(std::string_view sLine) {
    while (!sLine.empty() && IsBlank(sLine.front())) {
        sLine.remove_prefix(1);
    }
    while (!sLine.empty() && IsBlank(sLine.back())) {
        sLine.remove_suffix(1);
    }
    return sLine;
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

// Two hex digits at lPos.
bool ReadHexByte(std::string_view sText, size_t lPos, char& cByte) {
    if (lPos + 2 > sText.size() || HexValue(sText[lPos]) < 0 || HexValue(sText[lPos + 1]) < 0) {
        return false;
    }
    cByte = static_cast<char>(HexValue(sText[lPos]) * 16 + HexValue(sText[lPos + 1]));
    return true;
}

// 1 to 8 hex digits, the whole of sText.
bool ReadHexNumber(std::string_view sText, uint32_t& lNumber) {
    if (sText.empty() || sText.size() > 8) {
        return false;
    }
    lNumber = 0;
    for (const char c : sText) {
        if (HexValue(c) < 0) {
            return false;
        }
        lNumber = lNumber * 16 + static_cast<uint32_t>(HexValue(c));
    }
    return true;
}

// A quoted text starting at sLine[lPos]; the position after its closing
// quote, or npos when it is malformed.
size_t ReadQuoted(std::string_view sLine, size_t lPos, std::string& sText) {
    sText.clear();
    for (size_t pos = lPos + 1; pos < sLine.size(); ++pos) {
        const char c = sLine[pos];
        if (c == '"') {
            return pos + 1;
        }
        if (IsControl(c)) {
            return std::string_view::npos;
        }
        if (c != '\\') {
            sText += c;
            continue;
        }
        const char next = pos + 1 < sLine.size() ? sLine[pos + 1] : '\0';
        char escaped = next;
        if (next == 'x' && ReadHexByte(sLine, pos + 2, escaped)) {
            pos += 2;
        } else if (next != '\\' && next != '"') {
            return std::string_view::npos;
        }
        sText += escaped;
        ++pos;
    }
    return std::string_view::npos;
}

bool ReadKeyName(std::string_view sEscaped, std::string& sName) {
    sName.clear();
    for (size_t pos = 0; pos < sEscaped.size(); ++pos) {
        char c = sEscaped[pos];
        if (IsControl(c) || (c == '%' && !ReadHexByte(sEscaped, pos + 1, c))) {
            return false;
        }
        pos += sEscaped[pos] == '%' ? 2 : 0;
        sName += c;
    }
    return !sName.empty() && sName.size() <= RegistryKey::kMaxNameBytes &&
           sName.find('\\') == std::string::npos;
}

bool ReadKeyLine(std::string_view sLine, std::vector<std::string>& vPath) {
    vPath.clear();
    if (sLine.size() < 3 || sLine.back() != ']') {
        return false;
    }
    std::string_view inner = sLine.substr(1, sLine.size() - 2);
    for (;;) {
        const size_t slash = inner.find('\\');
        std::string name;
        if (vPath.size() == RegistryKey::kMaxDepth || !ReadKeyName(inner.substr(0, slash), name)) {
            return false;
        }
        vPath.push_back(std::move(name));
        if (slash == std::string_view::npos) {
            return true;
        }
        inner.remove_prefix(slash + 1);
    }
}

bool ReadHexBytes(std::string_view sList, std::string& sBytes) {
    sBytes.clear();
    for (size_t pos = 0; pos < sList.size(); pos += 3) {
        char c = 0;
        if (!ReadHexByte(sList, pos, c) || (pos + 2 < sList.size() && sList[pos + 2] != ',') ||
            pos + 3 == sList.size()) {
            return false;
        }
        sBytes += c;
    }
    return true;
}

bool ReadData(std::string_view sData, RegistryValue& cValue) {
    if (!sData.empty() && sData.front() == '"') {
        cValue.Type = 1;
        const bool whole = ReadQuoted(sData, 0, cValue.Data) == sData.size();
        cValue.Data += '\0';
        return whole;
    }
    uint32_t number = 0;
    if (sData.substr(0, kDwordTag.size()) == kDwordTag) {
        if (!ReadHexNumber(sData.substr(kDwordTag.size()), number)) {
            return false;
        }
        cValue.Type = 4;
        cValue.Data.clear();
        for (int shift = 0; shift < 32; shift += 8) {
            cValue.Data += static_cast<char>((number >> shift) & 0xFF);
        }
        return true;
    }
    const size_t close = sData.find("):");
    if (sData.substr(0, kHexTag.size()) != kHexTag || close == std::string_view::npos ||
        !ReadHexNumber(sData.substr(kHexTag.size(), close - kHexTag.size()), number)) {
        return false;
    }
    cValue.Type = static_cast<int32_t>(number);
    return ReadHexBytes(sData.substr(close + 2), cValue.Data);
}

bool ReadValueLine(std::string_view sLine, std::string& sName, RegistryValue& cValue) {
    size_t pos = 1;
    sName.clear();
    if (sLine.front() == '"') {
        pos = ReadQuoted(sLine, 0, sName);
    }
    while (pos < sLine.size() && IsBlank(sLine[pos])) {
        ++pos;
    }
    if (pos >= sLine.size() || sLine[pos] != '=' ||
        sName.size() > RegistryKey::kMaxValueNameBytes) {
        return false;
    }
    return ReadData(Trimmed(sLine.substr(pos + 1)), cValue);
}

std::string_view NextLine(std::string_view& sText) {
    const size_t end = sText.find('\n');
    std::string_view line = sText.substr(0, end);
    sText = end == std::string_view::npos ? std::string_view() : sText.substr(end + 1);
    if (!line.empty() && line.back() == '\r') {
        line.remove_suffix(1);
    }
    return line;
}

std::string Quoted(std::string_view sText) {
    std::string quoted = "\"";
    for (const char c : sText) {
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

std::string EscapedKeyName(std::string_view sName) {
    std::string escaped;
    for (const char c : sName) {
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

std::string DataText(const RegistryValue& cValue) {
    if (cValue.Type == 1 && !cValue.Data.empty() && cValue.Data.back() == '\0') {
        return Quoted(std::string_view(cValue.Data).substr(0, cValue.Data.size() - 1));
    }
    std::string text;
    const auto hex = [&text](uint32_t lNumber, int iDigits) {
        for (int shift = (iDigits - 1) * 4; shift >= 0; shift -= 4) {
            text += kHexDigits[(lNumber >> shift) & 15];
        }
    };
    if (cValue.Type == 4 && cValue.Data.size() == 4) {
        uint32_t number = 0;
        for (int i = 3; i >= 0; --i) {
            number =
                (number << 8) | static_cast<unsigned char>(cValue.Data[static_cast<size_t>(i)]);
        }
        text = kDwordTag;
        hex(number, 8);
        return text;
    }
    text = kHexTag;
    const auto type = static_cast<uint32_t>(cValue.Type);
    int digits = 1;
    while (digits < 8 && (type >> (digits * 4)) != 0) {
        ++digits;
    }
    hex(type, digits);
    text += "):";
    for (size_t i = 0; i < cValue.Data.size(); ++i) {
        text += i == 0 ? "" : ",";
        hex(static_cast<unsigned char>(cValue.Data[i]), 2);
    }
    return text;
}

void WriteValues(const RegistryKey& cKey, std::string& sOut) {
    for (const auto& [name, value] : cKey.Values()) {
        sOut += name.empty() ? "@" : Quoted(name);
        sOut += "=" + DataText(value) + "\n";
    }
}

void WriteKey(const RegistryKey& cKey, const std::string& sParentPath, std::string& sOut) {
    const std::string path =
        (sParentPath.empty() ? "" : sParentPath + "\\") + EscapedKeyName(cKey.Name());
    if (!cKey.Values().empty() || cKey.SubKeyCount() == 0) {
        sOut += "\n[" + path + "]\n";
        WriteValues(cKey, sOut);
    }
    cKey.ForEachSubKey([&](const RegistryKey& cSubKey) { WriteKey(cSubKey, path, sOut); });
}

}  // namespace

RegistryKey RegistryFile::Parse(std::string_view sText, bool& bDamaged) {
    RegistryKey root;
    bDamaged = false;
    if (sText.empty()) {
        return root;
    }
    if (sText.substr(0, kByteOrderMark.size()) == kByteOrderMark) {
        sText.remove_prefix(kByteOrderMark.size());
    }
    if (NextLine(sText) != kFirstLine) {
        bDamaged = true;
        return root;
    }
    RegistryKey* current = &root;
    std::vector<std::string> path;
    std::string name;
    RegistryValue value;
    while (!sText.empty()) {
        const std::string_view line = Trimmed(NextLine(sText));
        if (line.empty() || line.front() == ';') {
            continue;
        }
        if (line.front() == '[') {
            const bool good = ReadKeyLine(line, path);
            current = good ? &root.Make(path) : nullptr;
            bDamaged = bDamaged || !good;
        } else if ((line.front() == '"' || line.front() == '@') && current != nullptr) {
            const bool good = ReadValueLine(line, name, value);
            if (good) {
                current->SetValue(name, std::move(value));
            }
            bDamaged = bDamaged || !good;
        } else {
            bDamaged = true;
        }
    }
    return root;
}

std::string RegistryFile::Write(const RegistryKey& cRoot, std::string_view sRootName) {
    std::string text = std::string(kFirstLine) + "\n; " + std::string(sRootName) + "\n";
    if (!cRoot.Values().empty()) {
        text += "\n";
        WriteValues(cRoot, text);
    }
    cRoot.ForEachSubKey([&](const RegistryKey& cSubKey) { WriteKey(cSubKey, "", text); });
    return text;
}

}  // namespace cv::posix
